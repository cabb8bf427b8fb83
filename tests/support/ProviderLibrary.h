#pragma once

#include <cmpift.h>

#include <memory>
#include <string>
#include <utility>

#include "broker/Broker.h"
#include "operations/LoadedLibrary.h"
#include "operations/RequestRunner.h"
#include "support/Outcome.h"
#include "support/RecordingBroker.h"

namespace testsupport {

/**
 * A provider library in this process, called as by an object manager.
 *
 * Constructing it only loads the library. The first use of an interface calls its factory, with the broker's handle;
 * create...MI() calls it again. Each operation is a separate request with the context entries below, at the end of
 * which the provider's objects are freed. The destructor closes the library without cleanup. The library and the broker
 * must outlive all calls.
 */
class ProviderLibrary {
public:
    /**
     * @param itsName prefix of the provider's factories
     * @throws cimhost::LibraryError if the library cannot be loaded
     */
    ProviderLibrary(const std::string& file, std::string itsName, RecordingBroker& itsBroker,
                    int flags = RTLD_NOW | RTLD_LOCAL);

    /** A function of the library by name; null if it has none. */
    template <class Function>
    Function* function(const std::string& functionName) const {
        return library->function<Function>(functionName);
    }

    /** @name Factories
     * Call the factory with a broker, a null context and this status. The result replaces the current interface.
     * @throws cimhost::LibraryError if the library has no such factory
     */
    ///@{
    CMPIInstanceMI* createInstanceMI(const CMPIBroker* handle, CMPIStatus* rc);
    CMPIAssociationMI* createAssociationMI(const CMPIBroker* handle, CMPIStatus* rc);
    ///@}

    /** The interfaces. The first call calls the factory. */
    CMPIInstanceMI* instanceMI();
    CMPIAssociationMI* associationMI();

    /** Sets the context of the following calls. The default is CMPIInvocationFlags 0 and CMPIPrincipal "tester". */
    void setContext(cimhost::ContextEntries entries) { context = std::move(entries); }

    /** @name Operations */
    ///@{
    Outcome perform(cimhost::Request request);
    Outcome enumerateInstances(const cimhost::ObjectPath& path, const cimhost::PropertyList& properties = {}) {
        return perform(cimhost::Request::enumerateInstances(path, properties));
    }
    Outcome enumerateInstanceNames(const cimhost::ObjectPath& path) {
        return perform(cimhost::Request::enumerateInstanceNames(path));
    }
    Outcome getInstance(const cimhost::ObjectPath& path, const cimhost::PropertyList& properties = {}) {
        return perform(cimhost::Request::getInstance(path, properties));
    }
    Outcome createInstance(const cimhost::ObjectPath& path, const cimhost::Instance& instance) {
        return perform(cimhost::Request::createInstance(path, instance));
    }
    Outcome modifyInstance(const cimhost::ObjectPath& path, const cimhost::Instance& instance,
                           const cimhost::PropertyList& properties = {}) {
        return perform(cimhost::Request::modifyInstance(path, instance, properties));
    }
    Outcome deleteInstance(const cimhost::ObjectPath& path) { return perform(cimhost::Request::deleteInstance(path)); }
    Outcome execQuery(const cimhost::ObjectPath& path, const std::string& language, const std::string& query) {
        return perform(cimhost::Request::execQuery(path, language, query));
    }
    Outcome associators(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter,
                        const cimhost::PropertyList& properties = {}) {
        return perform(cimhost::Request::associators(path, filter, properties));
    }
    Outcome associatorNames(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter) {
        return perform(cimhost::Request::associatorNames(path, filter));
    }
    Outcome references(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter,
                       const cimhost::PropertyList& properties = {}) {
        return perform(cimhost::Request::references(path, filter, properties));
    }
    Outcome referenceNames(const cimhost::ObjectPath& path, const cimhost::AssociationFilter& filter) {
        return perform(cimhost::Request::referenceNames(path, filter));
    }
    Outcome cleanupInstanceMI(bool terminating);
    Outcome cleanupAssociationMI(bool terminating);
    ///@}

    /**
     * Makes any other call, such as one with null arguments, as a separate request.
     * @param body called with a cimhost::RequestScope& (which creates objects from plain values), const CMPIContext*
     *             and const CMPIResult*; returns the provider's CMPIStatus
     */
    template <class Body>
    Outcome call(Body&& body) {
        return outcomeOf(cimhost::runCall(broker.broker(), context, std::forward<Body>(body)));
    }

private:
    std::string name;
    RecordingBroker& broker;
    std::unique_ptr<cimhost::LoadedLibrary> library;
    CMPIInstanceMI* instances = nullptr;
    CMPIAssociationMI* associations = nullptr;
    cimhost::ContextEntries context;
};

}  // namespace testsupport
