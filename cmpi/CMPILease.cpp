#include "CMPILease.h"

#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILease = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource LeaseAdapterTraits::traceSource{loggerCMPILease, "CMPILease.cpp"};

using L = Lease;

/** The properties, in the order in which instances are filled. */
const std::array<PropertyRow<L>, 18> LeaseAdapterTraits::properties{{
    readOnly<L, &L::getCaption>("Caption"),
    readOnly<L, &L::getDescription>("Description"),
    readOnly<L, &L::getInstanceID>("InstanceID"),
    readOnly<L, &L::getElementName>("ElementName"),
    readOnly<L, &L::getConfigurationName>("ConfigurationName"),
    readOnly<L, &L::getChangeableType>("ChangeableType"),
    modifiable<L, &L::getLessor, &L::setLessor>("Lessor"),
    modifiable<L, &L::getBaseTermCommencementDate, &L::setBaseTermCommencementDate, ValueForm::dateTime>(
        "BaseTermCommencementDate"),
    modifiable<L, &L::getLeaseTerm, &L::setLeaseTerm>("LeaseTerm"),
    modifiable<L, &L::getEarlyTerminationOption, &L::setEarlyTerminationOption>("EarlyTerminationOption"),
    modifiable<L, &L::getFixedPricePurchaseOption, &L::setFixedPricePurchaseOption>("FixedPricePurchaseOption"),
    modifiable<L, &L::getRenewalOption, &L::setRenewalOption>("RenewalOption"),
    modifiable<L, &L::getBargainRenewalOption, &L::setBargainRenewalOption>("BargainRenewalOption"),
    modifiable<L, &L::getBaseRent, &L::setBaseRent>("BaseRent"),
    modifiable<L, &L::getFairMarketRental, &L::setFairMarketRental>("FairMarketRental"),
    modifiable<L, &L::getFairMarketValue, &L::setFairMarketValue>("FairMarketValue"),
    modifiable<L, &L::getTerminationValue, &L::setTerminationValue>("TerminationValue"),
    modifiable<L, &L::getNetMonthlyLeaseRateFactor, &L::setNetMonthlyLeaseRateFactor>("NetMonthlyLeaseRateFactor"),
}};

template class ElementAdapter<CMPILease, LeaseAdapterTraits>;
template class RecordAdapter<LeaseAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
