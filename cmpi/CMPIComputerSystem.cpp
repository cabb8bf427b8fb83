#include "CMPIComputerSystem.h"

#include <cmpift.h>

#include <utility>

#include "KO/Exceptions.h"
#include "Trace.h"
#include "cim/CmpiAccess.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILAWComputerSystem = LoggerNames::loggerName(LoggerNames::provider);

namespace {

const TraceSource traceSource{loggerCMPILAWComputerSystem, "CMPIComputerSystem.cpp"};

}  // namespace

CMPILAWComputerSystem::CMPILAWComputerSystem(const CMPIBroker* requestBroker, const CMPIContext* requestContext,
                                             std::string requestNameSpace)
    : broker(requestBroker), context(requestContext), nameSpace(std::move(requestNameSpace)) {
    traceMethod(at(traceSource));
}

CMPILAWComputerSystem::~CMPILAWComputerSystem() {
    traceMethod(at(traceSource));
}

bool CMPILAWComputerSystem::hasNext() const {
    return cim::ask<&CMPIEnumerationFT::hasNext>(enumeration).value == 1;
}

/** Makes the enumeration's next instance current. On failure, keeps the current one. */
bool CMPILAWComputerSystem::takeNext() {
    const auto next = cim::ask<&CMPIEnumerationFT::getNext>(enumeration);
    if (next.isOk()) {
        current = cim::elementInstance(next.value);
    }
    return next.isOk();
}

void CMPILAWComputerSystem::setObjectPath(const CMPIObjectPath* path) {
    const Traced traced(at(traceSource, Level::error), label::objectPath, path);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    if (path != nullptr) {
        enumeration = broker->bft->enumerateInstances(broker, context, path, nullptr, &status);
    }
    if (status.rc != CMPI_RC_OK || !hasNext() || !takeNext()) {
        fail<ProviderException>(at(traceSource), "Could not obtain an instance of Computer System");
    }
}

CMPILAWComputerSystem::operator bool() {
    const Traced traced(at(traceSource));
    return hasNext();
}

void CMPILAWComputerSystem::operator++() {
    const Traced traced(at(traceSource));
    current = nullptr;
    takeNext();
}

CMPIObjectPath* CMPILAWComputerSystem::getObjectPath() {
    const Traced traced(at(traceSource));
    const auto path = cim::ask<&CMPIInstanceFT::getObjectPath>(current);
    return path.isOk() ? path.value : nullptr;
}

CMPIInstance* CMPILAWComputerSystem::getCMPIInstance(const char** properties) {
    const Traced traced(at(traceSource, Level::error), label::properties, properties);
    return current;
}

}  // namespace KO::LeaseWarrantyProvider
