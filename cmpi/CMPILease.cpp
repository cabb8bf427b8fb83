#include "CMPILease.h"

#include "LoggerNames.h"
#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILease = LoggerNames::kept(LoggerNames::provider);

const TraceUnit LeaseClass::unit{loggerCMPILease, "CMPILease.cpp"};

using L = Lease;

/** In the order in which an instance is filled. */
const std::array<PropertyRow<L>, 18> LeaseClass::properties{{
    filled<L, &L::getCaption>("Caption"),
    filled<L, &L::getDescription>("Description"),
    filled<L, &L::getInstanceID>("InstanceID"),
    filled<L, &L::getElementName>("ElementName"),
    filled<L, &L::getConfigurationName>("ConfigurationName"),
    filled<L, &L::getChangeableType>("ChangeableType"),
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

template class ElementAdapter<LeaseClass>;
template class RecordAdapter<LeaseClass>;

}  // namespace KO::LeaseWarrantyProvider
