#include "CMPIWarranty.h"

#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIWarranty = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource WarrantyAdapterTraits::traceSource{loggerCMPIWarranty, "CMPIWarranty.cpp"};

using W = Warranty;

/** The properties, in the order in which instances are filled. */
const std::array<PropertyRow<W>, 9> WarrantyAdapterTraits::properties{{
    readOnly<W, &W::getCaption>("Caption"),
    readOnly<W, &W::getDescription>("Description"),
    readOnly<W, &W::getInstanceID>("InstanceID"),
    readOnly<W, &W::getElementName>("ElementName"),
    readOnly<W, &W::getConfigurationName>("ConfigurationName"),
    readOnly<W, &W::getChangeableType>("ChangeableType"),
    modifiable<W, &W::getCommencementDate, &W::setCommencementDate, ValueForm::dateTime>("WarrantyStartDate"),
    modifiable<W, &W::getDuration, &W::setDuration>("WarrantyDuration"),
    modifiable<W, &W::getWarrantor, &W::setWarrantor>("Warrantor"),
}};

template class ElementAdapter<CMPIWarranty, WarrantyAdapterTraits>;
template class RecordAdapter<WarrantyAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
