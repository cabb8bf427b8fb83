#include "CMPIOstrelAgent.h"

#include "ProductAdapterImpl.h"

namespace KO::LeaseWarrantyProvider {

std::string loggerCMPIOstrelAgent = LoggerNames::loggerName(LoggerNames::provider);

const TraceSource AgentAdapterTraits::traceSource{loggerCMPIOstrelAgent, "CMPIOstrelAgent.cpp"};

using A = OstrelAgent;

const std::array<KeyRow<A>, 5> AgentAdapterTraits::keys{{
    key<A, &A::getName>("Name"),
    key<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    key<A, &A::getProductName>("ProductName"),
    key<A, &A::getVendor>("Vendor"),
    key<A, &A::getVersion>("Version"),
}};

/** The order differs from that of the filter types. */
const std::array<KeyFilter<A>, 5> AgentAdapterTraits::filters{{
    {"Name", A::FILTER_NAME},
    {"IdentifyingNumber", A::FILTER_IDENTIFYING_NUMBER},
    {"ProductName", A::FILTER_PRODUCT_NAME},
    {"Version", A::FILTER_VERSION},
    {"Vendor", A::FILTER_VENDOR},
}};

const std::array<PropertyRow<A>, 9> AgentAdapterTraits::properties{{
    readOnly<A, &A::getCaption>("Caption"),
    readOnly<A, &A::getDescription>("Description"),
    readOnly<A, &A::getBuildNumber>("BuildNumber"),
    readOnly<A, &A::getStatus>("Status"),
    readOnly<A, &A::getName>("Name"),
    readOnly<A, &A::getProductName>("ProductName"),
    readOnly<A, &A::getIdentifyingNumber>("IdentifyingNumber"),
    readOnly<A, &A::getVendor>("Vendor"),
    readOnly<A, &A::getVersion>("Version"),
}};

template class ElementAdapter<CMPIOstrelAgent, AgentAdapterTraits>;
template class ProductAdapter<AgentAdapterTraits>;

}  // namespace KO::LeaseWarrantyProvider
