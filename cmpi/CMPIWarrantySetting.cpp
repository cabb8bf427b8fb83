#include "CMPIWarrantySetting.h"

#include "LoggerNames.h"
#include "SettingAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIWarrantySetting = LoggerNames::kept(LoggerNames::provider);

const TraceUnit WarrantySettingClass::unit{loggerCMPIWarrantySetting, "CMPIWarrantySetting.cpp"};

template class SettingAdapter<WarrantySettingClass>;

}  // namespace KO::LeaseWarrantyProvider
