#include "gate/session/ProviderLibrary.h"

#include "Subject.h"

// The gate's access to a provider that is linked into the fuzzer: its tables come and go as if it were loaded.

extern "C" {
CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

namespace gate {

void ProviderLibrary::load() {
    fuzz::Subject::restart();
    handle = this;
}

bool ProviderLibrary::unload() {
    handle = nullptr;
    return true;
}

CMPIInstanceMI* ProviderLibrary::createInstanceMI(const CMPIBroker* broker) const {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status);
}

CMPIAssociationMI* ProviderLibrary::createAssociationMI(const CMPIBroker* broker) const {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status);
}

}  // namespace gate
