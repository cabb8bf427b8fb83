#include "broker/Broker.h"
#include "broker/Convert.h"
#include "broker/ErrorTranslation.h"
#include "broker/FunctionTables.h"

// CMPIBrokerFT: attaches threads, and passes the requests of providers to UpCalls.

namespace cimhost {
namespace {

/** The entries of the caller's context; none if it is null. */
const ContextEntries& entriesOf(const CMPIContext* context) {
    static const ContextEntries none;
    return context == nullptr ? none : argument(context);
}

/** Performs a request in the caller's context. @throws Failure with the status of the response if it is not OK */
Response performed(Broker& broker, const CMPIContext* context, Request request) {
    request.context = entriesOf(context);
    Response response = broker.upCalls().perform(std::move(request));
    if (!response.ok()) {
        throw Failure(std::move(response.status));
    }
    return response;
}

template <class Kind>
CMPIEnumeration* enumerationOf(Broker& broker, CMPIType type, std::vector<Kind> values) {
    EnumerationContent content{{type, {}}, 0};
    content.elements.reserve(values.size());
    for (Kind& value : values) {
        content.elements.emplace_back(std::make_shared<const Kind>(std::move(value)));
    }
    return broker.arena().make<CMPIEnumeration>(std::move(content));
}

/** Performs the request that makeRequest() returns. @return its results, instances or paths */
template <class MakeRequest>
CMPIEnumeration* enumerated(const CMPIBroker* handle, const CMPIContext* context, CMPIStatus* rc,
                            MakeRequest makeRequest) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        Request request = makeRequest();
        const bool arePaths = returnsPaths(request.operation);
        Response response = performed(broker, context, std::move(request));
        return arePaths ? enumerationOf(broker, CMPI_ref, std::move(response.paths))
                        : enumerationOf(broker, CMPI_instance, std::move(response.instances));
    });
}

/** The first result of a response. @throws Failure with CMPI_RC_ERR_FAILED if there is none */
template <class Kind>
Kind firstOf(std::vector<Kind>& results) {
    if (results.empty()) {
        throw Failure(CMPI_RC_ERR_FAILED, "The object manager returned no result.");
    }
    return std::move(results.front());
}

CMPIContext* prepareAttachThread(const CMPIBroker* handle, const CMPIContext* context) {
    return guarded<CMPIContext*>(nullptr, nullptr,
                                 [&] { return Broker::of(handle).prepareThread(entriesOf(context)); });
}

CMPIStatus attachThread(const CMPIBroker* handle, const CMPIContext* context) {
    return guarded([&] {
        if (!Broker::of(handle).attachThread(context)) {
            throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
        }
    });
}

CMPIStatus detachThread(const CMPIBroker* handle, const CMPIContext* context) {
    return guarded([&] {
        if (!Broker::of(handle).detachThread(context)) {
            throw Failure(CMPI_RC_ERR_INVALID_HANDLE);
        }
    });
}

CMPIStatus deliverIndication(const CMPIBroker* handle, const CMPIContext*, const char*, const CMPIInstance*) {
    return guarded([&] {
        Broker::of(handle);
        throw Failure(CMPI_RC_ERR_NOT_SUPPORTED, "Indications are not supported by this object manager.");
    });
}

CMPIEnumeration* enumerateInstanceNames(const CMPIBroker* handle, const CMPIContext* context,
                                        const CMPIObjectPath* path, CMPIStatus* rc) {
    return enumerated(handle, context, rc, [&] { return Request::enumerateInstanceNames(argument(path)); });
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                    const char** properties, CMPIStatus* rc) {
    return enumerated(handle, context, rc,
                      [&] { return Request::enumerateInstances(argument(path), propertyListFrom(properties)); });
}

CMPIInstance* getInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                          const char** properties, CMPIStatus* rc) {
    return guarded<CMPIInstance*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        Response response =
            performed(broker, context, Request::getInstance(argument(path), propertyListFrom(properties)));
        return broker.arena().make<CMPIInstance>({firstOf(response.instances)});
    });
}

CMPIObjectPath* createInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                               const CMPIInstance* instance, CMPIStatus* rc) {
    return guarded<CMPIObjectPath*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        Response response =
            performed(broker, context, Request::createInstance(argument(path), *argument(instance).value));
        return broker.arena().make<CMPIObjectPath>(firstOf(response.paths));
    });
}

CMPIStatus modifyInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char** properties) {
    return guarded([&] {
        Broker& broker = Broker::of(handle);
        performed(broker, context,
                  Request::modifyInstance(argument(path), *argument(instance).value, propertyListFrom(properties)));
    });
}

CMPIStatus deleteInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path) {
    return guarded([&] {
        Broker& broker = Broker::of(handle);
        performed(broker, context, Request::deleteInstance(argument(path)));
    });
}

CMPIEnumeration* execQuery(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                           const char* query, const char* language, CMPIStatus* rc) {
    return enumerated(handle, context, rc,
                      [&] { return Request::execQuery(argument(path), argument(language), argument(query)); });
}

CMPIEnumeration* associators(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                             const char* associationClass, const char* resultClass, const char* role,
                             const char* resultRole, const char** properties, CMPIStatus* rc) {
    return enumerated(handle, context, rc, [&] {
        return Request::associators(argument(path),
                                    {optionalString(associationClass), optionalString(resultClass),
                                     optionalString(role), optionalString(resultRole)},
                                    propertyListFrom(properties));
    });
}

CMPIEnumeration* associatorNames(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                 const char* associationClass, const char* resultClass, const char* role,
                                 const char* resultRole, CMPIStatus* rc) {
    return enumerated(handle, context, rc, [&] {
        return Request::associatorNames(argument(path), {optionalString(associationClass), optionalString(resultClass),
                                                         optionalString(role), optionalString(resultRole)});
    });
}

CMPIEnumeration* references(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                            const char* resultClass, const char* role, const char** properties, CMPIStatus* rc) {
    return enumerated(handle, context, rc, [&] {
        return Request::references(argument(path), {{}, optionalString(resultClass), optionalString(role), {}},
                                   propertyListFrom(properties));
    });
}

CMPIEnumeration* referenceNames(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                const char* resultClass, const char* role, CMPIStatus* rc) {
    return enumerated(handle, context, rc, [&] {
        return Request::referenceNames(argument(path), {{}, optionalString(resultClass), optionalString(role), {}});
    });
}

CMPIData invokeMethod(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                      const char* method, const CMPIArgs* input, CMPIArgs* output, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        Broker& broker = Broker::of(handle);
        static const std::vector<NamedValue> none;
        const auto& parameters = input == nullptr ? none : argument(input);
        Response response =
            performed(broker, context, Request::invokeMethod(argument(path), argument(method), parameters));
        if (output != nullptr) {
            argument(output) = std::move(response.output);
        }
        return dataFrom(response.value, broker.arena());
    });
}

CMPIStatus setProperty(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                       const char* name, const CMPIValue* value, CMPIType type) {
    return guarded([&] {
        Broker& broker = Broker::of(handle);
        performed(broker, context, Request::setProperty(argument(path), argument(name), valueFrom(value, type)));
    });
}

CMPIData getProperty(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path, const char* name,
                     CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        Broker& broker = Broker::of(handle);
        const Response response = performed(broker, context, Request::getProperty(argument(path), argument(name)));
        return dataFrom(response.value, broker.arena());
    });
}

constexpr unsigned int capabilities =
    CMPI_MB_BasicRead | CMPI_MB_BasicWrite | CMPI_MB_InstanceManipulation | CMPI_MB_AssociationTraversal;

}  // namespace

const CMPIBrokerFT brokerTable{capabilities, tableVersion,       "cimhost",         prepareAttachThread,
                               attachThread, detachThread,       deliverIndication, enumerateInstanceNames,
                               getInstance,  createInstance,     modifyInstance,    deleteInstance,
                               execQuery,    enumerateInstances, associators,       associatorNames,
                               references,   referenceNames,     invokeMethod,      setProperty,
                               getProperty};

}  // namespace cimhost
