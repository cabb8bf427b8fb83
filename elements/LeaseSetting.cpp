#include "LeaseSetting.h"

#include "SettingElementImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerLeaseSetting = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource LeaseSettingElementTraits::traceSource{loggerLeaseSetting, "LeaseSetting.cpp"};

template class SettingElement<LeaseSettingElementTraits>;

}  // namespace KO::LeaseWarrantyProvider
