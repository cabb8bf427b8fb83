#include "support/ProviderLibrary.h"

#include "operations/LoadedLibrary.h"
#include "support/Values.h"

namespace testsupport {
namespace {

using cimhost::Request;

template <class Interface>
Interface* callFactory(const cimhost::LoadedLibrary& library, const std::string& symbol, const CMPIBroker* handle,
                       CMPIStatus* rc) {
    auto* factory = library.function<Interface*(const CMPIBroker*, const CMPIContext*, CMPIStatus*)>(symbol);
    if (factory == nullptr) {
        throw cimhost::LibraryError(library.file().string() + " has no function " + symbol);
    }
    return factory(handle, nullptr, rc);
}

}  // namespace

ProviderLibrary::ProviderLibrary(const std::string& file, std::string itsName, RecordingBroker& itsBroker, int flags)
    : name(std::move(itsName)),
      broker(itsBroker),
      library(std::make_unique<cimhost::LoadedLibrary>(file, flags)),
      context{named(CMPIInvocationFlags, uint32(0)), named(CMPIPrincipal, text("tester"))} {}

CMPIInstanceMI* ProviderLibrary::createInstanceMI(const CMPIBroker* handle, CMPIStatus* rc) {
    instances = callFactory<CMPIInstanceMI>(*library, name + "_Create_InstanceMI", handle, rc);
    return instances;
}

CMPIAssociationMI* ProviderLibrary::createAssociationMI(const CMPIBroker* handle, CMPIStatus* rc) {
    associations = callFactory<CMPIAssociationMI>(*library, name + "_Create_AssociationMI", handle, rc);
    return associations;
}

CMPIInstanceMI* ProviderLibrary::instanceMI() {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return instances == nullptr ? createInstanceMI(broker.handle(), &status) : instances;
}

CMPIAssociationMI* ProviderLibrary::associationMI() {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    return associations == nullptr ? createAssociationMI(broker.handle(), &status) : associations;
}

Outcome ProviderLibrary::perform(Request request) {
    request.context = context;
    return outcomeOf(cimhost::isAssociationOperation(request.operation)
                         ? runRequest(broker.broker(), associationMI(), std::move(request))
                         : runRequest(broker.broker(), instanceMI(), std::move(request)));
}

Outcome ProviderLibrary::cleanupInstanceMI(bool terminating) {
    CMPIInstanceMI* interface = instanceMI();
    return call([&](cimhost::RequestScope&, const CMPIContext* itsContext, const CMPIResult*) {
        return interface->ft->cleanup(interface, itsContext, terminating ? 1 : 0);
    });
}

Outcome ProviderLibrary::cleanupAssociationMI(bool terminating) {
    CMPIAssociationMI* interface = associationMI();
    return call([&](cimhost::RequestScope&, const CMPIContext* itsContext, const CMPIResult*) {
        return interface->ft->cleanup(interface, itsContext, terminating ? 1 : 0);
    });
}

}  // namespace testsupport
