#include "Floor.h"
#include "FloorCalls.h"

#include <algorithm>
#include <utility>

namespace bench {

namespace {

constexpr const char* computerClass = "VELKO_ComputerSystem";
constexpr const char* associationClass = "VELKO_LeaseSetting";

struct AssociationFloor final : Floor {
    AssociationFloor(const CMPIBroker* itsBroker, std::vector<LeaseRow> itsLeases)
        : broker(itsBroker), leases(std::move(itsLeases)) {}

    Interfaces interfaces() override { return {&instances, &associations}; }

    const CMPIBroker* broker;
    std::vector<LeaseRow> leases;
    CMPIInstanceMI instances{this, &instanceTable};
    CMPIAssociationMI associations{this, &associationTable};

    static CMPIInstanceMIFT instanceTable;
    static CMPIAssociationMIFT associationTable;
};

constexpr CMPIStatus success{CMPI_RC_OK, nullptr};

void give(const CMPIResult* result, const CMPIInstance* instance) {
    result->ft->returnInstance(result, instance);
}

void give(const CMPIResult* result, const CMPIObjectPath* path) {
    result->ft->returnObjectPath(result, path);
}

/** The computers' instances, from the object manager. */
CMPIEnumeration* computers(const AssociationFloor& floor, const CMPIContext* context, const char* nameSpace) {
    const CMPIObjectPath* path = newPath(floor.broker, nameSpace, computerClass);
    return floor.broker->bft->enumerateInstances(floor.broker, context, path, nullptr, nullptr);
}

/** Gives the lease of the computer that the path names. @param make makes what is given of it */
template <class Make>
void giveLease(const AssociationFloor& floor, const CMPIResult* result, const CMPIObjectPath* path, Make make) {
    const std::string wanted = textKey(path, "Name") == names::computer ? names::computerNode : "";
    const auto lease = std::find_if(floor.leases.begin(), floor.leases.end(),
                                    [&](const LeaseRow& row) { return row.instanceId == wanted; });
    if (lease != floor.leases.end()) {
        give(result, make(floor.broker, nameSpaceOf(path), *lease));
    }
}

/** Gives all computers but the last, as the provider does. @param take takes what is given of an instance */
template <class Take>
void giveComputers(const AssociationFloor& floor, const CMPIContext* context, const CMPIResult* result,
                   const CMPIObjectPath* path, Take take) {
    CMPIEnumeration* found = computers(floor, context, nameSpaceOf(path));
    CMPIInstance* computer = found->ft->getNext(found, nullptr).value.inst;
    while (found->ft->hasNext(found, nullptr) != 0) {
        give(result, take(computer));
        computer = found->ft->getNext(found, nullptr).value.inst;
    }
}

bool startsAtComputer(const CMPIObjectPath* path) {
    return std::string(characters(path->ft->getClassName(path, nullptr))) == computerClass;
}

const AssociationFloor& floorOf(const CMPIAssociationMI* mi) {
    return *static_cast<const AssociationFloor*>(mi->hdl);
}

CMPIStatus associators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char*, const char*, const char*, const char*, const char**) {
    if (startsAtComputer(path)) {
        giveLease(floorOf(mi), result, path, &instanceOf<LeaseRow>);
    } else {
        giveComputers(floorOf(mi), context, result, path, [](CMPIInstance* computer) { return computer; });
    }
    result->ft->returnDone(result);
    return success;
}

CMPIStatus associatorNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char*, const char*, const char*) {
    if (startsAtComputer(path)) {
        giveLease(floorOf(mi), result, path, &pathOf<LeaseRow>);
    } else {
        giveComputers(floorOf(mi), context, result, path,
                      [](CMPIInstance* computer) { return computer->ft->getObjectPath(computer, nullptr); });
    }
    result->ft->returnDone(result);
    return success;
}

/** The first computer with each lease. */
CMPIStatus enumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    const AssociationFloor& floor = *static_cast<const AssociationFloor*>(mi->hdl);
    const char* nameSpace = nameSpaceOf(path);
    CMPIEnumeration* found = computers(floor, context, nameSpace);
    CMPIInstance* computer = found->ft->getNext(found, nullptr).value.inst;
    for (const LeaseRow& lease : floor.leases) {
        CMPIObjectPath* association = newPath(floor.broker, nameSpace, associationClass);
        addKey(association, "Antecedent", computer->ft->getObjectPath(computer, nullptr));
        addKey(association, "Dependent", pathOf(floor.broker, nameSpace, lease));
        give(result, association);
    }
    result->ft->returnDone(result);
    return success;
}

CMPIInstanceMIFT AssociationFloor::instanceTable{CMPIVersion200,    CMPIVersion200, "instanceFloor", nullptr,
                                                 enumInstanceNames, nullptr,        nullptr,         nullptr,
                                                 nullptr,           nullptr,        nullptr};

CMPIAssociationMIFT AssociationFloor::associationTable{
    CMPIVersion200, CMPIVersion200, "associationFloor", nullptr, associators, associatorNames, nullptr, nullptr};

}  // namespace

std::unique_ptr<Floor> makeAssociationFloor(const CMPIBroker* broker, std::vector<LeaseRow> leases) {
    return std::make_unique<AssociationFloor>(broker, std::move(leases));
}

}  // namespace bench
