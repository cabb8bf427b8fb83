#include "broker/Boundary.h"
#include "broker/Broker.h"
#include "broker/Convert.h"
#include "broker/PropertyLists.h"
#include "broker/Tables.h"

// CMPIBrokerFT: what providers ask the object manager for. Each function hands plain values to UpCalls.

namespace cimhost {
namespace {

template <class T>
T taken(Answer<T> answer) {
    if (!answer.ok()) {
        throw Failure(std::move(answer.status));
    }
    return std::move(answer.value);
}

void require(const Status& status) {
    if (!status.ok()) {
        throw Failure(status);
    }
}

/** The entries of the caller's context; none for a caller that has no context. */
const ContextEntries& entriesOf(const CMPIContext* context) {
    static const ContextEntries none;
    return context == nullptr ? none : argument(context).entries;
}

std::optional<std::string> textIfAny(const char* text) {
    return text == nullptr ? std::nullopt : std::optional<std::string>(text);
}

template <class Kind>
CMPIEnumeration* enumerationOf(Broker& broker, CMPIType type, std::vector<Kind> values) {
    const bool isMarkedNull = broker.profile().marksElementsNull;
    EnumerationContent content{
        type, {}, 0, static_cast<CMPIValueState>(isMarkedNull ? CMPI_nullValue : CMPI_goodValue)};
    content.elements.reserve(values.size());
    for (Kind& value : values) {
        content.elements.emplace_back(std::make_shared<const Kind>(std::move(value)));
    }
    return broker.arena().make<CMPIEnumeration>(std::move(content));
}

CMPIEnumeration* enumerationOf(Broker& broker, Answer<std::vector<Instance>> answer) {
    return enumerationOf(broker, CMPI_instance, taken(std::move(answer)));
}

CMPIEnumeration* enumerationOf(Broker& broker, Answer<std::vector<ObjectPath>> answer) {
    return enumerationOf(broker, CMPI_ref, taken(std::move(answer)));
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
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        return enumerationOf(broker, broker.upCalls().enumerateInstanceNames(entriesOf(context), argument(path)));
    });
}

CMPIEnumeration* enumerateInstances(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                    const char** properties, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        return enumerationOf(broker, broker.upCalls().enumerateInstances(entriesOf(context), argument(path),
                                                                         propertyListFrom(properties)));
    });
}

CMPIInstance* getInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                          const char** properties, CMPIStatus* rc) {
    return guarded<CMPIInstance*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        Instance instance =
            taken(broker.upCalls().getInstance(entriesOf(context), argument(path), propertyListFrom(properties)));
        return broker.arena().make<CMPIInstance>({std::move(instance), nullptr, {}});
    });
}

CMPIObjectPath* createInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                               const CMPIInstance* instance, CMPIStatus* rc) {
    return guarded<CMPIObjectPath*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        return broker.arena().make<CMPIObjectPath>(
            taken(broker.upCalls().createInstance(entriesOf(context), argument(path), argument(instance).value)));
    });
}

CMPIStatus modifyInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                          const CMPIInstance* instance, const char** properties) {
    return guarded([&] {
        require(Broker::of(handle).upCalls().modifyInstance(entriesOf(context), argument(path),
                                                            argument(instance).value, propertyListFrom(properties)));
    });
}

CMPIStatus deleteInstance(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path) {
    return guarded([&] { require(Broker::of(handle).upCalls().deleteInstance(entriesOf(context), argument(path))); });
}

CMPIEnumeration* execQuery(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                           const char* query, const char* language, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        return enumerationOf(broker, broker.upCalls().execQuery(entriesOf(context), argument(path), argument(query),
                                                                argument(language)));
    });
}

CMPIEnumeration* associators(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                             const char* associationClass, const char* resultClass, const char* role,
                             const char* resultRole, const char** properties, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        const AssociationFilter filter{textIfAny(associationClass), textIfAny(resultClass), textIfAny(role),
                                       textIfAny(resultRole)};
        return enumerationOf(broker, broker.upCalls().associators(entriesOf(context), argument(path), filter,
                                                                  propertyListFrom(properties)));
    });
}

CMPIEnumeration* associatorNames(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                 const char* associationClass, const char* resultClass, const char* role,
                                 const char* resultRole, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        const AssociationFilter filter{textIfAny(associationClass), textIfAny(resultClass), textIfAny(role),
                                       textIfAny(resultRole)};
        return enumerationOf(broker, broker.upCalls().associatorNames(entriesOf(context), argument(path), filter));
    });
}

CMPIEnumeration* references(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                            const char* resultClass, const char* role, const char** properties, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        const AssociationFilter filter{{}, textIfAny(resultClass), textIfAny(role), {}};
        return enumerationOf(broker, broker.upCalls().references(entriesOf(context), argument(path), filter,
                                                                 propertyListFrom(properties)));
    });
}

CMPIEnumeration* referenceNames(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                                const char* resultClass, const char* role, CMPIStatus* rc) {
    return guarded<CMPIEnumeration*>(rc, nullptr, [&] {
        Broker& broker = Broker::of(handle);
        const AssociationFilter filter{{}, textIfAny(resultClass), textIfAny(role), {}};
        return enumerationOf(broker, broker.upCalls().referenceNames(entriesOf(context), argument(path), filter));
    });
}

CMPIData invokeMethod(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                      const char* method, const CMPIArgs* input, CMPIArgs* output, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        Broker& broker = Broker::of(handle);
        static const std::vector<NamedValue> none;
        std::vector<NamedValue> returned;
        const Value value =
            taken(broker.upCalls().invokeMethod(entriesOf(context), argument(path), argument(method),
                                                input == nullptr ? none : argument(input).values, returned));
        if (output != nullptr) {
            argument(output).values = std::move(returned);
        }
        return dataFrom(value, broker.arena());
    });
}

CMPIStatus setProperty(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path,
                       const char* name, const CMPIValue* value, CMPIType type) {
    return guarded([&] {
        require(Broker::of(handle).upCalls().setProperty(entriesOf(context), argument(path), argument(name),
                                                         valueFrom(value, type)));
    });
}

CMPIData getProperty(const CMPIBroker* handle, const CMPIContext* context, const CMPIObjectPath* path, const char* name,
                     CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        Broker& broker = Broker::of(handle);
        const Value value = taken(broker.upCalls().getProperty(entriesOf(context), argument(path), argument(name)));
        return dataFrom(value, broker.arena());
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
