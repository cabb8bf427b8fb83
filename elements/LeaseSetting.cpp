#include "LeaseSetting.h"

#include "LoggerNames.h"
#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseSetting(LoggerNames::provider);

namespace {

const TraceUnit unit{loggerLeaseSetting, "LeaseSetting.cpp"};

}  // namespace

LeaseSetting::LeaseSetting() {
    traceMethod(at(unit));
}

LeaseSetting::~LeaseSetting() noexcept(false) {
    traceMethod(at(unit));
}

Moniker LeaseSetting::getLeaseMoniker(Moniker& computerMoniker) {
    // No exit line here, unlike everywhere else.
    traceLine(at(unit, Level::error), MT_ENTERING, label::monikerComputer, &computerMoniker);
    const CallSite site = at(unit);
    return throwingOnlyDeclared([&] { return elementMoniker(site, instrumentation, element, computerMoniker); });
}

Moniker LeaseSetting::getComputerMoniker(Moniker& leaseMoniker) {
    const Traced traced(at(unit, Level::error), label::monikerLease, &leaseMoniker);
    const CallSite site = at(unit);
    return throwingOnlyDeclared([&] { return computerMoniker(site, instrumentation, leaseMoniker); });
}

}  // namespace KO::LeaseWarrantyProvider
