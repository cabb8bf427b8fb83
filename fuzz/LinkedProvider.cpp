#include "SystemUnderTest.h"
#include "gate/session/ProviderConnection.h"

// The gate as the system under test. The provider is linked into the fuzzer, too: loading it only destroys its tables
// and reads them again.

extern "C" {
CMPIInstanceMI* LeaseAndWarrantyGate_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyGate_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIInstanceMI* LeaseAndWarrantyProvider_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
CMPIAssociationMI* LeaseAndWarrantyProvider_Create_AssociationMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*);
}

fuzz::Interfaces fuzz::openInterfaces(const CMPIBroker* broker) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return {LeaseAndWarrantyGate_Create_InstanceMI(broker, nullptr, &status),
            LeaseAndWarrantyGate_Create_AssociationMI(broker, nullptr, &status)};
}

namespace gate {

void ProviderLibrary::load() {
    fuzz::SystemUnderTest::restart();
    handle = this;
}

void ProviderLibrary::unload() {
    handle = nullptr;
    interfaces = {};
}

void ProviderLibrary::createInterfaces(const CMPIBroker* broker) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    interfaces = {LeaseAndWarrantyProvider_Create_InstanceMI(broker, nullptr, &status),
                  LeaseAndWarrantyProvider_Create_AssociationMI(broker, nullptr, &status)};
}

}  // namespace gate
