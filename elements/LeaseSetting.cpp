#include "LeaseSetting.h"

#include "LoggerNames.h"
#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseSetting = LoggerNames::kept(LoggerNames::provider);

const TraceUnit LeaseSettingElement::unit{loggerLeaseSetting, "LeaseSetting.cpp"};

template class SettingElement<LeaseSettingElement>;

}  // namespace KO::LeaseWarrantyProvider
