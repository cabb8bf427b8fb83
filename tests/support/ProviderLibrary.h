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
 * A provider library in this process, called as an object manager calls it.
 *
 * Loading it calls nothing. The factories are called, with the broker's handle, when an interface is first needed, or
 * by create...MI(), which tells all of it and may be called again. Every operation is a request of its own, with the
 * context entries below; what the provider makes in it is freed at its end. The library is closed in the end;
 * cleanup is called only by the test. Neither the library nor the broker may go while a call is running.
 */
class ProviderLibrary {
public:
    /**
     * @param file of the library
     * @param itsName of the provider: the prefix of its factories
     * @throws cimhost::LibraryError when it cannot be loaded
     */
    ProviderLibrary(const std::string& file, std::string itsName, RecordingBroker& itsBroker,
                    int flags = RTLD_NOW | RTLD_LOCAL);

    /** A function of the library by name; null when it has none. */
    template <class Function>
    Function* function(const std::string& functionName) const {
        return library->function<Function>(functionName);
    }

    /** @name Factories
     * Call the factory with a broker, null context and this status, which a factory may leave as it is. The answer
     * takes the place of the interface so far. @throws cimhost::LibraryError when the library has no such factory
     */
    ///@{
    CMPIInstanceMI* createInstanceMI(const CMPIBroker* handle, CMPIStatus* rc);
    CMPIAssociationMI* createAssociationMI(const CMPIBroker* handle, CMPIStatus* rc);
    ///@}

    /** The interfaces; each factory is called once, at the first need. */
    CMPIInstanceMI* instanceMI();
    CMPIAssociationMI* associationMI();

    /** The context of the calls to come. From the start: CMPIInvocationFlags 0, CMPIPrincipal "tester". */
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
     * Any other call, such as one with null arguments, as a request of its own.
     * @param body called with a cimhost::RequestScope& (which makes objects from plain values), const CMPIContext*
     *             and const CMPIResult*; answers the provider's CMPIStatus
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
