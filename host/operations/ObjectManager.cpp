#include "operations/ObjectManager.h"

#include <algorithm>
#include <utility>

#include "broker/NamedValues.h"
#include "operations/Interpretation.h"
#include "operations/RequestRunner.h"
#include "operations/Typing.h"
#include "schema/Names.h"

namespace cimhost {
namespace {

Value textValue(std::string text) {
    return {CMPI_string, false, false, {std::move(text)}};
}

void addIfMissing(ContextEntries& entries, const char* name, Value value) {
    if (findNamed(entries, name) == nullptr) {
        entries.push_back({name, std::move(value)});
    }
}

Status noProvider(const Request& request, const std::string& className) {
    const bool isAssociation = isAssociationOperation(request.operation);
    return {CMPI_RC_ERR_INVALID_CLASS, std::string("No ") + (isAssociation ? "association" : "instance") +
                                           " provider is registered for " +
                                           (className.empty() ? std::string("any class") : "class " + className) +
                                           " in namespace " + request.path.nameSpace + "."};
}

/** The filter that carries the association class: of references, it is the class of their results. */
auto associationClassOf(Operation operation) {
    const bool isReference = operation == Operation::references || operation == Operation::referenceNames;
    return isReference ? &AssociationFilter::resultClass : &AssociationFilter::associationClass;
}

/** The instance for a provider to create: keys that are only in the path come first. */
Instance withKeys(const ObjectPath& path, const Instance& instance) {
    Instance complete{path, {}};
    for (const NamedValue& key : path.keys) {
        if (findNamed(instance.properties, key.name) == nullptr) {
            complete.properties.push_back(key);
        }
    }
    complete.properties.insert(complete.properties.end(), instance.properties.begin(), instance.properties.end());
    return complete;
}

/** Leaves one class of each provider, the first. */
void dropSameProviders(std::vector<const ServedClass*>& classes) {
    std::vector<const ServedClass*> kept;
    std::copy_if(classes.begin(), classes.end(), std::back_inserter(kept), [&](const ServedClass* each) {
        return std::none_of(kept.begin(), kept.end(), [&](const ServedClass* other) {
            return other->address.location == each->address.location &&
                   other->address.provider == each->address.provider;
        });
    });
    classes = std::move(kept);
}

}  // namespace

ObjectManager::ObjectManager(ObjectManagerOptions itsOptions, ProviderRegistry itsRegistry)
    : baseContext(std::move(itsOptions.context)),
      providers(std::move(itsRegistry)),
      itsBroker({std::move(itsOptions.classShape), this, std::move(itsOptions.log), nullptr, itsOptions.manager}),
      pool(itsBroker, std::move(itsOptions.libraries)) {}

ObjectManager::~ObjectManager() = default;

void ObjectManager::completeContext(Request& request) const {
    for (const NamedValue& entry : baseContext) {
        addIfMissing(request.context, entry.name.c_str(), entry.value);
    }
    addIfMissing(request.context, CMPIInvocationFlags, {CMPI_uint32, false, false, {std::uint32_t{0}}});
    addIfMissing(request.context, CMPIInitNameSpace, textValue(request.path.nameSpace));
    if (!itsBroker.profile().hollowTexts) {
        addIfMissing(request.context, CMPIPrincipal, textValue({}));
    }
}

ProviderAddress ObjectManager::addressOf(const ServedClass& served) const {
    ProviderAddress address = served.address;
    if (itsBroker.profile().startsProviderPerClass) {
        address.forClass = foldedName(served.className);
    }
    return address;
}

template <class Interface>
Interface* ObjectManager::started(const ServedClass& served) {
    const ProviderAddress address = addressOf(served);
    if (itsBroker.profile().startsAllInterfaces) {
        if (providers.find(served.nameSpace, served.className, InterfaceKind::instance) != nullptr) {
            pool.get<CMPIInstanceMI>(address);
        }
        if (providers.find(served.nameSpace, served.className, InterfaceKind::association) != nullptr) {
            pool.get<CMPIAssociationMI>(address);
        }
    }
    return pool.get<Interface>(address);
}

template <class Interface>
RawAnswer ObjectManager::ask(const ServedClass& served, const Request& request) {
    RawAnswer answer = runRequest(itsBroker, started<Interface>(served), request);
    if (!fatality(answer, request.operation).empty()) {
        pool.lose(served.address.location);
    }
    return answer;
}

Answer<std::vector<RawAnswer>> ObjectManager::run(Request request) {
    const ProviderPool::Stay stay(pool);
    if (pool.isStopped()) {
        return {{CMPI_RC_ERR_FAILED, stoppingText}, {}};
    }
    if (!providers.knowsNameSpace(request.path.nameSpace)) {
        return {{CMPI_RC_ERR_INVALID_NAMESPACE, "There is no namespace " + request.path.nameSpace + "."}, {}};
    }
    completeContext(request);
    return isAssociationOperation(request.operation) ? runForAssociation(std::move(request))
                                                     : runForInstance(std::move(request));
}

Answer<std::vector<RawAnswer>> ObjectManager::runForInstance(Request request) {
    const ObjectPath& path = request.path;
    const ServedClass* served = providers.find(path.nameSpace, path.className, InterfaceKind::instance);
    if (served == nullptr) {
        return {noProvider(request, path.className), {}};
    }
    const Status refusal = takeTypes(request, itsBroker);
    if (!refusal.ok()) {
        return {refusal, {}};
    }
    return {{}, {ask<CMPIInstanceMI>(*served, request)}};
}

Answer<std::vector<RawAnswer>> ObjectManager::runForAssociation(Request request) {
    const auto associationClass = associationClassOf(request.operation);
    const std::optional<std::string> asked = request.filter.*associationClass;
    std::vector<const ServedClass*> found = associationsFor(request.path.nameSpace, asked);
    if (found.empty()) {
        return {noProvider(request, asked.value_or(std::string{})), {}};
    }
    const bool tellsClass = itsBroker.profile().fillsAssociationClass;
    if (!tellsClass) {
        dropSameProviders(found);
    }
    std::vector<RawAnswer> answers;
    for (const ServedClass* served : found) {
        if (tellsClass) {
            const bool isAsked = asked && sameName(served->className, *asked);
            request.filter.*associationClass = isAsked ? *asked : served->className;
        }
        answers.push_back(ask<CMPIAssociationMI>(*served, request));
    }
    return {{}, std::move(answers)};
}

std::vector<const ServedClass*> ObjectManager::associationsFor(const std::string& nameSpace,
                                                               const std::optional<std::string>& className) const {
    std::vector<const ServedClass*> found = providers.associations(nameSpace);
    if (className) {
        const auto isOther = [&](const ServedClass* each) { return !itsBroker.isA(each->className, *className); };
        found.erase(std::remove_if(found.begin(), found.end(), isOther), found.end());
    }
    return found;
}

Answer<std::vector<Instance>> ObjectManager::enumerateInstances(const ContextEntries& context, const ObjectPath& path,
                                                                const PropertyList& properties) {
    const auto operation = Operation::enumerateInstances;
    return resultsOf<Instance>(run({operation, path, properties, {}, {}, context}), operation);
}

Answer<std::vector<ObjectPath>> ObjectManager::enumerateInstanceNames(const ContextEntries& context,
                                                                      const ObjectPath& path) {
    const auto operation = Operation::enumerateInstanceNames;
    return resultsOf<ObjectPath>(run({operation, path, {}, {}, {}, context}), operation);
}

Answer<Instance> ObjectManager::getInstance(const ContextEntries& context, const ObjectPath& path,
                                            const PropertyList& properties) {
    return oneInstance(run({Operation::getInstance, path, properties, {}, {}, context}), path);
}

Answer<ObjectPath> ObjectManager::createInstance(const ContextEntries& context, const ObjectPath& path,
                                                 const Instance& instance) {
    return createdPath(run({Operation::createInstance, path, {}, withKeys(path, instance), {}, context}));
}

Status ObjectManager::modifyInstance(const ContextEntries& context, const ObjectPath& path, const Instance& instance,
                                     const PropertyList& properties) {
    const Instance handed{path, instance.properties};
    return statusOf(run({Operation::modifyInstance, path, properties, handed, {}, context}), Operation::modifyInstance);
}

Status ObjectManager::deleteInstance(const ContextEntries& context, const ObjectPath& path) {
    return statusOf(run({Operation::deleteInstance, path, {}, {}, {}, context}), Operation::deleteInstance);
}

Answer<std::vector<Instance>> ObjectManager::associators(const ContextEntries& context, const ObjectPath& path,
                                                         const AssociationFilter& filter,
                                                         const PropertyList& properties) {
    const auto operation = Operation::associators;
    return resultsOf<Instance>(run({operation, path, properties, {}, filter, context}), operation);
}

Answer<std::vector<ObjectPath>> ObjectManager::associatorNames(const ContextEntries& context, const ObjectPath& path,
                                                               const AssociationFilter& filter) {
    const auto operation = Operation::associatorNames;
    return resultsOf<ObjectPath>(run({operation, path, {}, {}, filter, context}), operation);
}

Answer<std::vector<Instance>> ObjectManager::references(const ContextEntries& context, const ObjectPath& path,
                                                        const AssociationFilter& filter,
                                                        const PropertyList& properties) {
    const auto operation = Operation::references;
    return resultsOf<Instance>(run({operation, path, properties, {}, filter, context}), operation);
}

Answer<std::vector<ObjectPath>> ObjectManager::referenceNames(const ContextEntries& context, const ObjectPath& path,
                                                              const AssociationFilter& filter) {
    const auto operation = Operation::referenceNames;
    return resultsOf<ObjectPath>(run({operation, path, {}, {}, filter, context}), operation);
}

}  // namespace cimhost
