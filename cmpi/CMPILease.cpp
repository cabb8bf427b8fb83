#include "CMPILease.h"

#include "LoggerNames.h"
#include "RecordAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPILease(LoggerNames::provider);

const TraceUnit LeaseClass::unit{loggerCMPILease, "CMPILease.cpp"};

using L = Lease;

/** In the order in which an instance is filled. */
const std::array<PropertyRow<L>, 18> LeaseClass::properties{{
    property<L, &L::getCaption>("Caption"),
    property<L, &L::getDescription>("Description"),
    property<L, &L::getInstanceID>("InstanceID"),
    property<L, &L::getElementName>("ElementName"),
    property<L, &L::getConfigurationName>("ConfigurationName"),
    property<L, &L::getChangeableType>("ChangeableType"),
    property<L, &L::getLessor, &L::setLessor>("Lessor"),
    dateTimeProperty<L, &L::getBaseTermCommencementDate, &L::setBaseTermCommencementDate>("BaseTermCommencementDate"),
    property<L, &L::getLeaseTerm, &L::setLeaseTerm>("LeaseTerm"),
    property<L, &L::getEarlyTerminationOption, &L::setEarlyTerminationOption>("EarlyTerminationOption"),
    property<L, &L::getFixedPricePurchaseOption, &L::setFixedPricePurchaseOption>("FixedPricePurchaseOption"),
    property<L, &L::getRenewalOption, &L::setRenewalOption>("RenewalOption"),
    property<L, &L::getBargainRenewalOption, &L::setBargainRenewalOption>("BargainRenewalOption"),
    property<L, &L::getBaseRent, &L::setBaseRent>("BaseRent"),
    property<L, &L::getFairMarketRental, &L::setFairMarketRental>("FairMarketRental"),
    property<L, &L::getFairMarketValue, &L::setFairMarketValue>("FairMarketValue"),
    property<L, &L::getTerminationValue, &L::setTerminationValue>("TerminationValue"),
    property<L, &L::getNetMonthlyLeaseRateFactor, &L::setNetMonthlyLeaseRateFactor>("NetMonthlyLeaseRateFactor"),
}};

template class RecordAdapter<LeaseClass>;

}  // namespace KO::LeaseWarrantyProvider
