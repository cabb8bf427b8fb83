#include "AssociationModel.h"

#include <algorithm>
#include <array>

#include "Target.h"
#include "cim/Names.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"
#include "support/Values.h"

namespace fuzz {

namespace {

using cimhost::ObjectPath;
using cimhost::Operation;

constexpr const char* computerRole = "Antecedent";
constexpr const char* elementRole = "Dependent";
constexpr const char* placeOfComputer = "/system/computer";
constexpr std::size_t oneComputer = 0;
constexpr std::size_t twoComputers = 2;  // one has no name; with this kind and the next, requests may fail

struct Association {
    const char* name;
    const Store& (*store)();
};

constexpr std::array associationClasses{Association{"VELKO_LeaseSetting", leaseStore},
                                        Association{"VELKO_WarrantySetting", warrantyStore}};

/** The paths of an association and of its two ends. */
struct AssociationPair {
    ObjectPath computer;
    ObjectPath element;
    ObjectPath association;

    AssociationPair(const Association& itsAssociation, const std::string& nameSpace)
        : computer{"", nameSpace, "VELKO_ComputerSystem", {{"Name", testsupport::text("testhost")}}},
          element{
              "", nameSpace, itsAssociation.store().className, {{"InstanceID", testsupport::text(placeOfComputer)}}},
          association{
              "",
              nameSpace,
              itsAssociation.name,
              {{computerRole, testsupport::reference(computer)}, {elementRole, testsupport::reference(element)}}} {}
};

const testsupport::ModelRecord* findElement(const Association& association, const Snapshot& stored) {
    const Records& records = stored.of(association.store());
    const auto found = std::find_if(records.begin(), records.end(),
                                    [](const auto& record) { return record.front() == placeOfComputer; });
    return found == records.end() ? nullptr : &*found;
}

bool admits(const std::optional<std::string>& filter, const std::string& name) {
    return !filter || filter->empty() || cim::sameName(*filter, name);
}

bool isPathOf(const ObjectPath& sent, const ObjectPath& path) {
    return cim::sameName(sent.className, path.className) && sent.keys.size() == 1 &&
           keyString(sent, path.keys.front().name.string().c_str()) ==
               keyString(path, path.keys.front().name.string().c_str());
}

/** The result of a traversal from one end to the other; none if the request does not ask for it. */
std::optional<ObjectPath> resultOf(const Call& call, const AssociationPair& pair, bool isFromComputer) {
    const cimhost::AssociationFilter& filter = call.request.filter;
    const ObjectPath& source = isFromComputer ? pair.computer : pair.element;
    const ObjectPath& target = isFromComputer ? pair.element : pair.computer;
    const bool isReference = cimhost::isReferenceOperation(call.request.operation);
    const bool isAdmitted = isReference ? admits(filter.resultClass, pair.association.className)
                                        : admits(filter.associationClass, pair.association.className) &&
                                              admits(filter.resultClass, target.className) &&
                                              admits(filter.resultRole, isFromComputer ? elementRole : computerRole);
    if (!isAdmitted || !admits(filter.role, isFromComputer ? computerRole : elementRole) ||
        !isPathOf(call.request.path, source)) {
        return std::nullopt;
    }
    return isReference ? pair.association : target;
}

std::vector<std::string> expectedPaths(const Call& call, const Snapshot& stored, std::size_t computers) {
    std::vector<std::string> paths;
    for (const Association& association : associationClasses) {
        if (computers != oneComputer || findElement(association, stored) == nullptr) {
            continue;
        }
        const AssociationPair pair(association, call.request.path.nameSpace);
        if (!cimhost::isAssociationOperation(call.request.operation)) {
            if (cim::sameName(call.request.path.className, association.name)) {
                paths.push_back(cimhost::formatObjectPath(pair.association));
            }
            continue;
        }
        for (const bool isFromComputer : {true, false}) {
            if (const auto result = resultOf(call, pair, isFromComputer)) {
                paths.push_back(cimhost::formatObjectPath(*result));
            }
        }
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

/** Checks the values of an association, which are its keys, or of a record. */
void requireValues(const Call& call, const cimhost::Instance& instance, const Snapshot& stored) {
    for (const Association& association : associationClasses) {
        const Store& store = association.store();
        if (instance.path.className == store.className) {
            const testsupport::RecordModel model(store.fields());
            require(model.shownFields(instance) == shownRecord(model, call, *findElement(association, stored)),
                    "an associated instance has the values of its record");
        } else if (instance.path.className == association.name) {
            requireSame(cimhost::formatObjectPath({"", instance.path.nameSpace, association.name, instance.properties}),
                        cimhost::formatObjectPath(instance.path), "properties of an association");
        }
    }
}

/** Whether a request begins at an instance that may have associations, so that the request must succeed. */
bool isTraversal(const Call& call) {
    return std::any_of(std::begin(associationClasses), std::end(associationClasses), [&](const Association& each) {
        const AssociationPair pair(each, "root/cimv2");
        return isPathOf(call.request.path, pair.computer) || isPathOf(call.request.path, pair.element);
    });
}

bool isEnumeration(const Call& call) {
    return !call.event && call.request.operation <= Operation::enumerateInstanceNames &&
           std::any_of(std::begin(associationClasses), std::end(associationClasses),
                       [&](const Association& each) { return cim::sameName(call.request.path.className, each.name); });
}

/** A name for a filter; none in half of the cases. */
std::optional<std::string> nextFilter(Bytes& bytes) {
    constexpr std::array names{computerRole,        elementRole,      "VELKO_LeaseSetting",   "VELKO_WarrantySetting",
                               "VELKO_Lease",       "VELKO_Warranty", "VELKO_ComputerSystem", "dependent",
                               "velko_leaseSETTING"};
    const std::size_t choice = bytes.byte();
    return choice < 0x80 ? std::nullopt : std::optional<std::string>(names[choice % names.size()]);
}

}  // namespace

Call nextTraversal(Bytes& bytes) {
    constexpr std::array operations{Operation::associators, Operation::associatorNames, Operation::references,
                                    Operation::referenceNames};
    Call call;
    call.request.operation = bytes.pick(operations);
    const AssociationPair pair(bytes.pick(associationClasses), "root/cimv2");
    call.request.path = bytes.below(2) == 0 ? pair.computer : pair.element;
    cimhost::AssociationFilter& filter = call.request.filter;
    for (auto* name : {&filter.associationClass, &filter.resultClass, &filter.role, &filter.resultRole}) {
        *name = nextFilter(bytes);
    }
    return call;
}

void requireAssociations(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& stored,
                         std::size_t computers) {
    const bool isAssociation = !call.event && cimhost::isAssociationOperation(call.request.operation);
    if (!isAssociation && !isEnumeration(call)) {
        return;
    }
    if (response.status.rc != CMPI_RC_OK) {
        require(computers >= twoComputers || (isAssociation && !isTraversal(call)),
                "associations are found: " + response.status.message);
        return;
    }
    std::vector<std::string> paths;
    const auto instances = cimhost::eventsOf<cimhost::Instance>(response.events);
    for (const cimhost::Instance& instance : instances) {
        paths.push_back(cimhost::formatObjectPath(instance.path));
    }
    for (const ObjectPath& path : cimhost::eventsOf<ObjectPath>(response.events)) {
        paths.push_back(cimhost::formatObjectPath(path));
    }
    std::sort(paths.begin(), paths.end());
    require(paths == expectedPaths(call, stored, computers), "the associations are those of the computer");
    for (const cimhost::Instance& instance : instances) {
        requireValues(call, instance, stored);
    }
}

}  // namespace fuzz
