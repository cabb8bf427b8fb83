#include "CMPIWarranty.h"

#include "LoggerNames.h"
#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIWarranty = LoggerNames::kept(LoggerNames::provider);

const TraceUnit WarrantyClass::unit{loggerCMPIWarranty, "CMPIWarranty.cpp"};

using W = Warranty;

/** In the order in which an instance is filled. */
const std::array<PropertyRow<W>, 9> WarrantyClass::properties{{
    filled<W, &W::getCaption>("Caption"),
    filled<W, &W::getDescription>("Description"),
    filled<W, &W::getInstanceID>("InstanceID"),
    filled<W, &W::getElementName>("ElementName"),
    filled<W, &W::getConfigurationName>("ConfigurationName"),
    filled<W, &W::getChangeableType>("ChangeableType"),
    modifiable<W, &W::getCommencementDate, &W::setCommencementDate, ValueForm::dateTime>("WarrantyStartDate"),
    modifiable<W, &W::getDuration, &W::setDuration>("WarrantyDuration"),
    modifiable<W, &W::getWarrantor, &W::setWarrantor>("Warrantor"),
}};

template class ElementAdapter<WarrantyClass>;
template class RecordAdapter<WarrantyClass>;

}  // namespace KO::LeaseWarrantyProvider
