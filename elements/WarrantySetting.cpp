#include "WarrantySetting.h"

#include "LoggerNames.h"
#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerWarrantySetting = LoggerNames::kept(LoggerNames::provider);

const TraceUnit WarrantySettingElement::unit{loggerWarrantySetting, "WarrantySetting.cpp"};

template class SettingElement<WarrantySettingElement>;

}  // namespace KO::LeaseWarrantyProvider
