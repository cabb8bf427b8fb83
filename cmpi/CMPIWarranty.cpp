#include "CMPIWarranty.h"

#include "LoggerNames.h"
#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIWarranty(LoggerNames::provider);

const TraceUnit WarrantyClass::unit{loggerCMPIWarranty, "CMPIWarranty.cpp"};

using W = Warranty;

/** In the order in which an instance is filled. */
const std::array<PropertyRow<W>, 9> WarrantyClass::properties{{
    property<W, &W::getCaption>("Caption"),
    property<W, &W::getDescription>("Description"),
    property<W, &W::getInstanceID>("InstanceID"),
    property<W, &W::getElementName>("ElementName"),
    property<W, &W::getConfigurationName>("ConfigurationName"),
    property<W, &W::getChangeableType>("ChangeableType"),
    dateTimeProperty<W, &W::getCommencementDate, &W::setCommencementDate>("WarrantyStartDate"),
    property<W, &W::getDuration, &W::setDuration>("WarrantyDuration"),
    property<W, &W::getWarrantor, &W::setWarrantor>("Warrantor"),
}};

template class RecordAdapter<WarrantyClass>;

}  // namespace KO::LeaseWarrantyProvider
