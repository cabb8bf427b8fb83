#include "CMPIWarrantySetting.h"

#include "SettingAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIWarrantySetting = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource WarrantySettingAdapterTraits::traceSource{loggerCMPIWarrantySetting, "CMPIWarrantySetting.cpp"};

template class SettingAdapter<WarrantySettingAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
