#include <algorithm>
#include <string>

#include "LeaseAndWarrantyProvider.h"
#include "ProviderModel.h"
#include "Target.h"
#include "Trace.h"
#include "cim/Names.h"
#include "model/Request.h"
#include "provider/LogDouble.h"
#include "schema/MofWriter.h"
#include "support/AssetModel.h"
#include "support/Values.h"

// Sequences of calls to the provider's function tables: responses, tables and files match a model of the provider.
// Requests for associations and the agent's identity change nothing. All responses are the same with and without
// tracing, although tracing makes the provider find records in a different way.

fuzz::Interfaces fuzz::openInterfaces(const CMPIBroker* broker) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return {LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status),
            LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status)};
}

namespace {

using namespace fuzz;
using cimhost::Operation;

constexpr std::size_t mostCalls = 40;
constexpr std::size_t mostRecords = 40;

bool isOneOf(const std::string& name, std::initializer_list<const char*> names) {
    return std::any_of(names.begin(), names.end(), [&](const char* each) { return cim::sameName(each, name); });
}

bool isSetting(const std::string& className) {
    return isOneOf(className, {"VELKO_LeaseSetting", "VELKO_WarrantySetting"});
}

/** The response to a call that does not depend on records and asset data. */
Expectation other(int rc) {
    return {rc, 0, rc != CMPI_RC_OK, {}};
}

std::string described(const cimhost::ObjectPath& path) {
    std::string description = path.nameSpace + ":" + path.className;
    for (const cimhost::NamedValue& key : path.keys) {
        description += "," + key.name.string() + "=" + cimhost::formatMof(key.value);
    }
    return description;
}

std::string described(const cimhost::Instance& instance) {
    std::string description = described(instance.path);
    for (const cimhost::NamedValue& property : instance.properties) {
        const bool isNow = property.name == "LocalDateTime";
        description += ";" + property.name.string() + (isNow ? "" : "=" + cimhost::formatMof(property.value));
    }
    return description;
}

std::string described(const cimhost::ProviderResponse& response) {
    std::string description = std::to_string(response.status.rc);
    for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(response.events)) {
        description += "\n" + described(instance);
    }
    for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(response.events)) {
        description += "\n" + described(path);
    }
    return description;
}

/** Performs a sequence of calls with the provider and the model. */
class TestCase {
public:
    explicit TestCase(Bytes& bytes) : provider(bytes.byte()) {}

    void perform(const Call& call) {
        const Expectation expected = expect(call);
        logDouble::records.clear();
        const cimhost::ProviderResponse response = provider.perform(call);
        allResponses += described(response) + "\n";
        try {
            requireResponse(call, expected, response);
            leases.requireAgreement();
            warranties.requireAgreement();
            asset.requireAgreement();
        } catch (const Violation& violation) {
            throw Violation(violation.what() + ("\nafter " + describe(call)));
        }
    }

    /** Replaces a record file while the library is unloaded. */
    void replaceFile(Bytes& bytes) {
        ExpectedRecords& records = bytes.below(2) == 0 ? leases : warranties;
        std::string content = std::to_string(bytes.below(5)) + "\n";
        for (std::size_t word = bytes.below(32); word > 0; --word) {
            content += nextString(bytes) + "\n";
        }
        records.replaceFile(content);
        perform({Event::restart});
    }

    const std::string& responses() const { return allResponses; }

    bool isLarge() const { return std::max(leases.size(), warranties.size()) > mostRecords; }

private:
    Expectation expect(const Call& call) {
        if (call.event == Event::restart) {
            leases.restart();
            warranties.restart();
        }
        if (call.event) {
            return {};
        }
        switch (call.request.operation) {
            case Operation::execQuery:
            case Operation::references:
            case Operation::referenceNames:
                return other(CMPI_RC_ERR_NOT_SUPPORTED);
            case Operation::associators:
            case Operation::associatorNames:
                return other(isSetting(call.request.filter.associationClass.value_or("")) ? CMPI_RC_OK
                                                                                          : CMPI_RC_ERR_INVALID_CLASS);
            default:
                return expectOfClass(call);
        }
    }

    Expectation expectOfClass(const Call& call) {
        const std::string& name = call.request.path.className;
        const bool isRead = call.isRead();
        if (cim::sameName(name, "VELKO_Lease")) {
            return leases.apply(call);
        }
        if (cim::sameName(name, "VELKO_Warranty")) {
            return warranties.apply(call);
        }
        if (cim::sameName(name, "VELKO_AssetIDDetails") && (isRead || call.performs(Operation::modifyInstance))) {
            return asset.apply(call);
        }
        if (isSetting(name) && call.performs(Operation::getInstance)) {
            return other(CMPI_RC_ERR_NOT_SUPPORTED);
        }
        const bool isServed = isRead && (isSetting(name) || cim::sameName(name, "VELKO_OstrelAgent"));
        return other(isServed ? CMPI_RC_OK : CMPI_RC_ERR_INVALID_CLASS);
    }

    void requireResponse(const Call& call, const Expectation& expected,
                         const cimhost::ProviderResponse& response) const {
        require(!response.threw, "the provider does not throw: " + response.status.message);
        require(!response.hasMessage, "a status has no message");
        requireSame(response.status.rc, expected.rc, "status");
        if (!expected.isKnown) {
            require(response.doneCount() <= 1, "returnDone is called at most once");
            return;
        }
        requireSame(response.doneCount(), expected.done, "calls of returnDone");
        const auto found = shownBy(call, response);
        require(found == expected.shown, "the response has the instances" + difference(found, expected.shown));
    }

    /** Describes the first difference. */
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

    /** Converts a response for the comparison with an expectation. */
    std::vector<std::vector<std::string>> shownBy(const Call& call, const cimhost::ProviderResponse& response) const {
        std::vector<std::vector<std::string>> shown;
        const Store* store = storeOf(call.request.path.className);
        const testsupport::RecordModel model(store == nullptr ? testsupport::ModelFields{} : store->fields());
        for (const auto& instance : cimhost::eventsOf<cimhost::Instance>(response.events)) {
            require(instance.path.nameSpace == call.request.path.nameSpace,
                    "an instance is in the request's namespace");
            const bool isAsset = cim::sameName(call.request.path.className, "VELKO_AssetIDDetails");
            shown.push_back(isAsset ? testsupport::shownAsset(instance) : model.shownFields(instance));
        }
        for (const auto& path : cimhost::eventsOf<cimhost::ObjectPath>(response.events)) {
            require(path.nameSpace == call.request.path.nameSpace, "a path is in the request's namespace");
            shown.emplace_back();
            for (const cimhost::NamedValue& key : store == nullptr ? std::vector<cimhost::NamedValue>{} : path.keys) {
                shown.back().push_back(key.name.string() + "=" + cimhost::formatMof(key.value));
            }
        }
        return shown;
    }

    SystemUnderTest provider;
    std::string allResponses{};
    ExpectedRecords leases{leaseStore()};
    ExpectedRecords warranties{warrantyStore()};
    ExpectedAsset asset{};
};

/** Runs a sequence and returns its responses. */
std::string run(Bytes bytes, int tracedLevel) {
    logDouble::admittedLevel = tracedLevel;
    TestCase test(bytes);
    for (std::size_t calls = 0; calls < mostCalls && !bytes.isAtEnd() && !test.isLarge(); ++calls) {
        if (bytes.below(16) == 0) {
            test.replaceFile(bytes);
        } else {
            test.perform(nextCall(bytes));
        }
    }
    return test.responses();
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Bytes bytes(data, size);
    const std::string traced = run(bytes, KO::Level::flow);
    requireSame(run(bytes, 0), traced, "responses without and with tracing");
    return 0;
}
