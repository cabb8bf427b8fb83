#include "CMPILeaseSetting.h"

#include "LoggerNames.h"
#include "SettingAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILeaseSetting = LoggerNames::kept(LoggerNames::provider);

const TraceUnit LeaseSettingClass::unit{loggerCMPILeaseSetting, "CMPILeaseSetting.cpp"};

template class SettingAdapter<LeaseSettingClass>;

}  // namespace KO::LeaseWarrantyProvider
