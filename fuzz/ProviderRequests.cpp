#include "ProviderModel.h"
#include "Target.h"

#include "LeaseAndWarrantyProvider.h"
#include "cim/Names.h"
#include "model/Request.h"
#include "schema/MofWriter.h"
#include "support/AssetModel.h"
#include "support/Values.h"

#include <algorithm>
#include <string>

// Sequences of calls through the provider's function tables: each is answered, and leaves tables and files, as a model
// of the provider says. Associations and the agent's identity change nothing.

fuzz::Interfaces fuzz::openInterfaces(const CMPIBroker* broker) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return {LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status),
            LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status)};
}

namespace {

using namespace fuzz;
using cim::sameName;

constexpr std::size_t mostCalls = 40;
constexpr std::size_t mostRecords = 40;

bool isOneOf(const std::string& name, std::initializer_list<const char*> names) {
    return std::any_of(names.begin(), names.end(), [&](const char* each) { return cim::sameName(each, name); });
}

bool isSetting(const std::string& className) {
    return isOneOf(className, {"VELKO_LeaseSetting", "VELKO_WarrantySetting"});
}

/** What is answered without a look at records and asset data. */
Expectation other(int rc) {
    return {rc, 0, rc != CMPI_RC_OK, {}};
}

/** The provider and the model of it. */
class Trial {
public:
    explicit Trial(Bytes& bytes) : subject(bytes.byte()) {}

    void make(const Call& call) {
        const Expectation expected = expect(call);
        const cimhost::ProviderResponse answer = subject.make(call);
        try {
            requireAnswer(call, expected, answer);
            leases.requireAgreement();
            warranties.requireAgreement();
            asset.requireAgreement();
        } catch (const Violation& violation) {
            throw Violation(violation.what() + ("\nafter " + toText(call)));
        }
    }

    /** Files that somebody else wrote while the library was away. */
    void replaceFile(Bytes& bytes) {
        RecordSide& side = bytes.below(2) == 0 ? leases : warranties;
        std::string content = std::to_string(bytes.below(5)) + "\n";
        for (std::size_t word = bytes.below(32); word > 0; --word) {
            content += nextText(bytes) + "\n";
        }
        side.replaceFile(content);
        make({Action::restart});
    }

    bool isLarge() const { return std::max(leases.size(), warranties.size()) > mostRecords; }

private:
    Expectation expect(const Call& call) {
        switch (call.action) {
            case Action::restart:
                leases.restart();
                warranties.restart();
                return {};
            case Action::cleanup:
            case Action::associationCleanup:
                return {};
            case Action::execQuery:
            case Action::references:
            case Action::referenceNames:
                return other(CMPI_RC_ERR_NOT_SUPPORTED);
            case Action::associators:
            case Action::associatorNames:
                return other(isSetting(call.filter.associationClass.value_or("")) ? CMPI_RC_OK
                                                                                  : CMPI_RC_ERR_INVALID_CLASS);
            default:
                return expectOfClass(call);
        }
    }

    Expectation expectOfClass(const Call& call) {
        const std::string& name = call.path.className;
        const bool isRead = call.action <= Action::getInstance;
        if (cim::sameName(name, "VELKO_Lease")) {
            return leases.apply(call);
        }
        if (cim::sameName(name, "VELKO_Warranty")) {
            return warranties.apply(call);
        }
        if (cim::sameName(name, "VELKO_AssetIDDetails") && (isRead || call.action == Action::modifyInstance)) {
            return asset.apply(call);
        }
        if (isSetting(name) && call.action == Action::getInstance) {
            return other(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        const bool isServed = isRead && (isSetting(name) || cim::sameName(name, "VELKO_OstrelAgent"));
        return other(isServed ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_CLASS);
    }

    void requireAnswer(const Call& call, const Expectation& expected, const cimhost::ProviderResponse& answer) const {
        require(!answer.threw, "no exception leaves the provider: " + answer.status.message);
        require(!answer.hasMessage, "a status has no message");
        requireSame(answer.status.rc, expected.rc, "status");
        if (!expected.isKnown) {
            require(answer.doneCount() <= 1, "an answer is ended once");
            return;
        }
        requireSame(answer.doneCount(), expected.done, "how often the answer is ended");
        const auto found = shownBy(call, answer);
        require(found == expected.shown, "the answer has the instances" + difference(found, expected.shown));
    }

    /** The first values that are not the same, for whoever looks for the reason. */
    static std::string difference(const std::vector<std::vector<std::string>>& found,
                                  const std::vector<std::vector<std::string>>& expected) {
        for (std::size_t index = 0; index < std::min(found.size(), expected.size()); ++index) {
            for (std::size_t field = 0; field < std::min(found[index].size(), expected[index].size()); ++field) {
                if (found[index][field] != expected[index][field]) {
                    return "\nfound: " + found[index][field] + "\nexpected: " + expected[index][field];
                }
            }
        }
        return {};
    }

    /** The answer in the expectation's form. */
    std::vector<std::vector<std::string>> shownBy(const Call& call, const cimhost::ProviderResponse& answer) const {
        std::vector<std::vector<std::string>> shown;
        const Store* store = storeOf(call.path.className);
        const testsupport::RecordModel model(store == nullptr ? testsupport::ModelFields{} : store->fields());
        for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(answer.events)) {
            require(instance.path.nameSpace == call.path.nameSpace, "an instance is in the request's namespace");
            const bool isAsset = cim::sameName(call.path.className, "VELKO_AssetIDDetails");
            shown.push_back(isAsset ? testsupport::shownAsset(instance) : model.shownFields(instance));
        }
        for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(answer.events)) {
            require(path.nameSpace == call.path.nameSpace, "a path is in the request's namespace");
            shown.emplace_back();
            for (const cimhost::NamedValue& key : store == nullptr ? std::vector<cimhost::NamedValue>{} : path.keys) {
                shown.back().push_back(key.name + "=" + cimhost::formatMof(key.value));
            }
        }
        return shown;
    }

    Subject subject;
    RecordSide leases{leaseStore()};
    RecordSide warranties{warrantyStore()};
    AssetSide asset{};
};

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Bytes bytes(data, size);
    Trial trial(bytes);
    for (std::size_t calls = 0; calls < mostCalls && !bytes.isUsedUp() && !trial.isLarge(); ++calls) {
        if (bytes.below(16) == 0) {
            trial.replaceFile(bytes);
        } else {
            trial.make(nextCall(bytes));
        }
    }
    return 0;
}
