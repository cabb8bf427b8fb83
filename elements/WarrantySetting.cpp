#include "WarrantySetting.h"

#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarrantySetting = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource WarrantySettingElementTraits::traceSource{loggerWarrantySetting, "WarrantySetting.cpp"};

template class SettingElement<WarrantySettingElementTraits>;

}  // namespace KO::LeaseWarrantyProvider
