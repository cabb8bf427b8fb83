#include <algorithm>
#include <utility>

#include "Baseline.h"
#include "BaselineCalls.h"

namespace bench {

namespace {

struct AssociationBaseline final : Baseline {
    AssociationBaseline(const CMPIBroker* itsBroker, std::vector<LeaseRow> itsLeases)
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

void returnTo(const CMPIResult* result, const CMPIInstance* instance) {
    result->ft->returnInstance(result, instance);
}

void returnTo(const CMPIResult* result, const CMPIObjectPath* path) {
    result->ft->returnObjectPath(result, path);
}

/** Enumerates the computers of the object manager. */
CMPIEnumeration* computers(const AssociationBaseline& baseline, const CMPIContext* context, const char* nameSpace) {
    const CMPIObjectPath* path = newPath(baseline.broker, nameSpace, names::computerClass);
    return baseline.broker->bft->enumerateInstances(baseline.broker, context, path, nullptr, nullptr);
}

/** Returns the lease of the computer with this path. @param make returns the lease's path or instance */
template <class Make>
void returnLease(const AssociationBaseline& baseline, const CMPIResult* result, const CMPIObjectPath* path, Make make) {
    const std::string wanted = stringKey(path, "Name") == names::computer ? names::computerNode : "";
    const auto lease = std::find_if(baseline.leases.begin(), baseline.leases.end(),
                                    [&](const LeaseRow& row) { return row.instanceId == wanted; });
    if (lease != baseline.leases.end()) {
        returnTo(result, make(baseline.broker, nameSpaceOf(path), *lease));
    }
}

/** Returns all computers except the last, as the provider does. @param convert returns the instance or its path */
template <class Convert>
void returnComputers(const AssociationBaseline& baseline, const CMPIContext* context, const CMPIResult* result,
                     const CMPIObjectPath* path, Convert convert) {
    CMPIEnumeration* found = computers(baseline, context, nameSpaceOf(path));
    CMPIInstance* computer = found->ft->getNext(found, nullptr).value.inst;
    while (found->ft->hasNext(found, nullptr) != 0) {
        returnTo(result, convert(computer));
        computer = found->ft->getNext(found, nullptr).value.inst;
    }
}

bool startsAtComputer(const CMPIObjectPath* path) {
    return std::string(characters(path->ft->getClassName(path, nullptr))) == names::computerClass;
}

const AssociationBaseline& baselineOf(const CMPIAssociationMI* mi) {
    return *static_cast<const AssociationBaseline*>(mi->hdl);
}

CMPIStatus associators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                       const CMPIObjectPath* path, const char*, const char*, const char*, const char*, const char**) {
    if (startsAtComputer(path)) {
        returnLease(baselineOf(mi), result, path, &instanceOf<LeaseRow>);
    } else {
        returnComputers(baselineOf(mi), context, result, path, [](CMPIInstance* computer) { return computer; });
    }
    result->ft->returnDone(result);
    return success;
}

CMPIStatus associatorNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                           const CMPIObjectPath* path, const char*, const char*, const char*, const char*) {
    if (startsAtComputer(path)) {
        returnLease(baselineOf(mi), result, path, &pathOf<LeaseRow>);
    } else {
        returnComputers(baselineOf(mi), context, result, path,
                        [](CMPIInstance* computer) { return computer->ft->getObjectPath(computer, nullptr); });
    }
    result->ft->returnDone(result);
    return success;
}

/** Returns the association of the first computer with each lease. */
CMPIStatus enumInstanceNames(CMPIInstanceMI* mi, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* path) {
    const AssociationBaseline& baseline = *static_cast<const AssociationBaseline*>(mi->hdl);
    const char* nameSpace = nameSpaceOf(path);
    CMPIEnumeration* found = computers(baseline, context, nameSpace);
    CMPIInstance* computer = found->ft->getNext(found, nullptr).value.inst;
    for (const LeaseRow& lease : baseline.leases) {
        CMPIObjectPath* association = newPath(baseline.broker, nameSpace, names::leaseSettingClass);
        addKey(association, "Antecedent", computer->ft->getObjectPath(computer, nullptr));
        addKey(association, "Dependent", pathOf(baseline.broker, nameSpace, lease));
        returnTo(result, association);
    }
    result->ft->returnDone(result);
    return success;
}

CMPIInstanceMIFT AssociationBaseline::instanceTable{
    CMPIVersion200, CMPIVersion200, "instanceBaseline", nullptr, enumInstanceNames, nullptr, nullptr, nullptr, nullptr,
    nullptr,        nullptr};

CMPIAssociationMIFT AssociationBaseline::associationTable{
    CMPIVersion200, CMPIVersion200, "associationBaseline", nullptr, associators, associatorNames, nullptr, nullptr};

}  // namespace

std::unique_ptr<Baseline> makeAssociationBaseline(const CMPIBroker* broker, std::vector<LeaseRow> leases) {
    return std::make_unique<AssociationBaseline>(broker, std::move(leases));
}

}  // namespace bench
