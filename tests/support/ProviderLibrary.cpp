#include "support/ProviderLibrary.h"

#include "operations/LibraryError.h"
#include "support/Values.h"

namespace testsupport {
namespace {

using cimhost::Operation;
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

Outcome ProviderLibrary::runInstance(Request request) {
    request.context = context;
    return outcomeOf(runRequest(broker.broker(), instanceMI(), request));
}

Outcome ProviderLibrary::runAssociation(Request request) {
    request.context = context;
    return outcomeOf(runRequest(broker.broker(), associationMI(), request));
}

Outcome ProviderLibrary::enumerateInstances(const cimhost::ObjectPath& path, const cimhost::PropertyList& properties) {
    return runInstance({Operation::enumerateInstances, path, properties, {}, {}, {}});
}

Outcome ProviderLibrary::enumerateInstanceNames(const cimhost::ObjectPath& path) {
    return runInstance({Operation::enumerateInstanceNames, path, {}, {}, {}, {}});
}

Outcome ProviderLibrary::getInstance(const cimhost::ObjectPath& path, const cimhost::PropertyList& properties) {
    return runInstance({Operation::getInstance, path, properties, {}, {}, {}});
}

Outcome ProviderLibrary::createInstance(const cimhost::ObjectPath& path, const cimhost::Instance& instance) {
    return runInstance({Operation::createInstance, path, {}, instance, {}, {}});
}

Outcome ProviderLibrary::modifyInstance(const cimhost::ObjectPath& path, const cimhost::Instance& instance,
                                        const cimhost::PropertyList& properties) {
    return runInstance({Operation::modifyInstance, path, properties, instance, {}, {}});
}

Outcome ProviderLibrary::deleteInstance(const cimhost::ObjectPath& path) {
    return runInstance({Operation::deleteInstance, path, {}, {}, {}, {}});
}

Outcome ProviderLibrary::execQuery(const cimhost::ObjectPath& path, const std::string& language,
                                   const std::string& query) {
    CMPIInstanceMI* interface = instanceMI();
    return call([&](cimhost::RequestScope& scope, const CMPIContext* itsContext, const CMPIResult* result) {
        return interface->ft->execQuery(interface, itsContext, result, scope.objectPath(path), language.c_str(),
                                        query.c_str());
    });
}

Outcome ProviderLibrary::associators(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter,
                                     const cimhost::PropertyList& properties) {
    return runAssociation({Operation::associators, path, properties, {}, filter, {}});
}

Outcome ProviderLibrary::associatorNames(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter) {
    return runAssociation({Operation::associatorNames, path, {}, {}, filter, {}});
}

Outcome ProviderLibrary::references(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter,
                                    const cimhost::PropertyList& properties) {
    return runAssociation({Operation::references, path, properties, {}, filter, {}});
}

Outcome ProviderLibrary::referenceNames(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter) {
    return runAssociation({Operation::referenceNames, path, {}, {}, filter, {}});
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
