#include "CMPILeaseSetting.h"

#include "SettingAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILeaseSetting = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource LeaseSettingAdapterTraits::traceSource{loggerCMPILeaseSetting, "CMPILeaseSetting.cpp"};

template class SettingAdapter<LeaseSettingAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
