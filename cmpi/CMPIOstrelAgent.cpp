#include "CMPIOstrelAgent.h"

#include "LoggerNames.h"
#include "ProductAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIOstrelAgent = LoggerNames::kept(LoggerNames::provider);

const TraceUnit AgentClass::unit{loggerCMPIOstrelAgent, "CMPIOstrelAgent.cpp"};

using A = OstrelAgent;

const std::array<KeyRow<A>, 5> AgentClass::keys{{
    key<A, &A::getName>("Name"),
    key<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    key<A, &A::getProductName>("ProductName"),
    key<A, &A::getVendor>("Vendor"),
    key<A, &A::getVersion>("Version"),
}};

/** The order of the keys is not that of the types. */
const std::array<KeyFilter<A>, 5> AgentClass::filters{{
    {"Name", A::FILTER_NAME},
    {"IdentifyingNumber", A::FILTER_IDENTIFYING_NUMBER},
    {"ProductName", A::FILTER_PRODUCT_NAME},
    {"Version", A::FILTER_VERSION},
    {"Vendor", A::FILTER_VENDOR},
}};

const std::array<PropertyRow<A>, 9> AgentClass::properties{{
    filled<A, &A::getCaption>("Caption"),
    filled<A, &A::getDescription>("Description"),
    filled<A, &A::getBuildNumber>("BuildNumber"),
    filled<A, &A::getStatus>("Status"),
    filled<A, &A::getName>("Name"),
    filled<A, &A::getProductName>("ProductName"),
    filled<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    filled<A, &A::getVendor>("Vendor"),
    filled<A, &A::getVersion>("Version"),
}};

template class ElementAdapter<AgentClass>;
template class ProductAdapter<AgentClass>;

}  // namespace KO::LeaseWarrantyProvider
