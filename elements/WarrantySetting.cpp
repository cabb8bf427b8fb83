#include "WarrantySetting.h"

#include "LoggerNames.h"
#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarrantySetting(LoggerNames::provider);

namespace {

const TraceUnit unit{loggerWarrantySetting, "WarrantySetting.cpp"};

}  // namespace

WarrantySetting::WarrantySetting() {
    traceMethod(at(unit));
}

WarrantySetting::~WarrantySetting() noexcept(false) {
    traceMethod(at(unit));
}

Moniker WarrantySetting::getWarrantyMoniker(Moniker& computerMoniker) {
    const Traced traced(at(unit, Level::error), label::monikerComputer, &computerMoniker);
    const CallSite site = at(unit);
    return throwingOnlyDeclared([&] { return elementMoniker(site, instrumentation, element, computerMoniker); });
}

Moniker WarrantySetting::getComputerMoniker(Moniker& warrantyMoniker) {
    const Traced traced(at(unit, Level::error), label::monikerWarranty, &warrantyMoniker);
    const CallSite site = at(unit);
    return throwingOnlyDeclared([&] { return computerMoniker(site, instrumentation, warrantyMoniker); });
}

}  // namespace KO::LeaseWarrantyProvider
