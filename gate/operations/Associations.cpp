#include <algorithm>

#include "Operations.h"

// All association requests combine the same facts: the object manager knows the computers, and the provider knows which
// lease or warranty belongs to each.

namespace gate {

namespace {

/** An object at an end of an association. */
struct End {
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
};

enum class ElementForm { path, instance };

/** The direction in which an association is followed, and the ends that the pairs must have: null for any. */
struct Traversal {
    const Class* association;
    ElementForm form = ElementForm::path;  ///< of the elements; always a path if an element is required
    const Property* target = nullptr;      ///< the property that refers to the associated object
    const CMPIObjectPath* computer = nullptr;
    const CMPIObjectPath* element = nullptr;
};

/** A computer and one of its leases or warranties. The element has either a path or an instance. */
struct AssociationPair {
    Traversal traversal;
    End computer;
    End element;
};

using Ends = std::vector<End>;
using Traversals = std::vector<Traversal>;
using Pairs = std::vector<AssociationPair>;

/** Fails unless the computers could be enumerated. Also logs the reason, since many clients do not show it. */
void requireEnumerated(bool isDone, const CMPIStatus& status) {
    if (!isDone) {
        const std::string message = managerFailure("enumerate VELKO_ComputerSystem", status);
        logError(message);
        fail(CMPI_RC_ERR_FAILED, message);
    }
}

CMPIEnumeration* enumerateComputers(const ClientRequest& request, ProviderSession& session) {
    const CMPIBroker* broker = request.broker();
    failIf(broker->bft == nullptr || broker->bft->enumerateInstances == nullptr, CMPI_RC_ERR_FAILED,
           "The object manager cannot enumerate computers.");
    const CMPIObjectPath* classPath = makePath(broker, nameSpaceOf(request.path), computerClass);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    CMPIEnumeration* computers = nullptr;
    session.releaseFor(
        [&] { computers = broker->bft->enumerateInstances(broker, request.context, classPath, nullptr, &status); });
    requireEnumerated(status.rc == CMPI_RC_OK && computers != nullptr, status);
    return computers;
}

bool hasNext(CMPIEnumeration* computers) {
    const auto answer = ask<&CMPIEnumerationFT::hasNext>(computers);
    requireEnumerated(answer.isOk(), answer.status);
    return answer.value != 0;
}

/** A copy of the instance's path with the request's namespace: some managers return paths without a namespace. */
const CMPIObjectPath* computerPathOf(const ClientRequest& request, const CMPIInstance* instance) {
    const CMPIObjectPath* given = pathOf(instance);
    require(keyOf(given, "Name", CMPI_string).has_value(), "name a computer");
    CMPIObjectPath* path = makePath(request.broker(), nameSpaceOf(request.path), classNameOf(given).c_str());
    const CMPICount count = keyCountOf(given);
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* keyName = nullptr;
        const CMPIData key = demand<&CMPIObjectPathFT::getKeyAt>("name a computer", given, index, &keyName);
        requireOk("name a computer",
                  tell<&CMPIObjectPathFT::addKey>(path, toString(keyName).c_str(), &key.value, key.type));
    }
    return path;
}

/** Returns each computer in the request's namespace once. Releases the lock while the manager enumerates them. */
Ends knownComputers(const ClientRequest& request, ProviderSession& session) {
    Ends computers;
    CMPIEnumeration* enumeration = enumerateComputers(request, session);
    while (hasNext(enumeration)) {
        const auto next = ask<&CMPIEnumerationFT::getNext>(enumeration);
        CMPIInstance* instance = next.isOk() ? cim::elementInstance(next.value) : nullptr;
        requireEnumerated(instance != nullptr, next.status);
        const CMPIObjectPath* path = computerPathOf(request, instance);
        if (nameSpaceOf(pathOf(instance)).empty()) {
            // Also adds the namespace to the path in the instance, if the manager supports that.
            tell<&CMPIInstanceFT::setObjectPath>(instance, path);
        }
        const bool isKnown =
            std::any_of(computers.begin(), computers.end(), [&](const End& each) { return samePath(each.path, path); });
        if (!isKnown) {
            computers.push_back({path, instance});
        }
    }
    return computers;
}

/** Adds the pairs of a computer and the leases or warranties that belong to it according to the provider. */
void addPairs(Pairs& pairs, const ProviderSession& session, const Traversal& traversal, const End& computer) {
    if (traversal.computer != nullptr && !samePath(computer.path, traversal.computer)) {
        return;
    }
    const LocalObject keys = localPath(computer.path, *findClass(computerClass));
    if (traversal.form == ElementForm::instance && traversal.element == nullptr) {
        for (const CMPIInstance* instance : session.associators(keys, *traversal.association)) {
            pairs.push_back({traversal, computer, {nullptr, instance}});
        }
        return;
    }
    for (const CMPIObjectPath* path : session.associatorNames(keys, *traversal.association)) {
        if (traversal.element == nullptr || samePath(path, traversal.element)) {
            pairs.push_back({traversal, computer, {path, nullptr}});
        }
    }
}

/** The pairs of each traversal, in the order of the computers. */
Pairs pairsOf(const ClientRequest& request, ProviderSession& session, const Traversals& traversals) {
    Pairs pairs;
    const Ends computers = knownComputers(request, session);
    for (const Traversal& traversal : traversals) {
        for (const End& computer : computers) {
            addPairs(pairs, session, traversal, computer);
        }
    }
    return pairs;
}

bool isAny(const char* name) {
    return name == nullptr || *name == '\0';
}

bool matches(const char* filter, const char* name) {
    return isAny(filter) || sameName(filter, name);
}

/** Whether a path's class is this class or a subclass of it. Asks the object manager about classes not in the MOF. */
bool isA(const ClientRequest& request, const CMPIObjectPath* path, const char* className) {
    const CMPIBroker* broker = request.broker();
    const std::string pathsClass = classNameOf(path);
    if (sameName(pathsClass, className)) {
        return true;
    }
    // No class of the MOF is a subclass of another.
    const bool areBothKnown = findClass(pathsClass) != nullptr && findClass(className) != nullptr;
    return !areBothKnown && make<&CMPIBrokerEncFT::classPathIsA>(broker, path, className) != 0;
}

bool isComputerEnd(const Property& end) {
    return sameName(end.referenceClass, computerClass);
}

const End& at(const Property& end, const AssociationPair& pair) {
    return isComputerEnd(end) ? pair.computer : pair.element;
}

const CMPIObjectPath*& requiredAt(const Property& end, Traversal& traversal) {
    return isComputerEnd(end) ? traversal.computer : traversal.element;
}

/**
 * The traversals that begin at the request's path, which must have keys. Names ignore letter case; null and the empty
 * string mean any. The role is the association's property that refers to the path, the result role the other property.
 */
Traversals traversalsFrom(const ClientRequest& request, const char* associationClass, const char* role,
                          const char* resultRole, ElementForm form = ElementForm::path) {
    failIf(keyCountOf(request.path) == 0, CMPI_RC_ERR_INVALID_PARAMETER,
           "Associations begin at an instance: the path needs its keys.");
    Traversals traversals;
    for (const Class& association : Classes()) {
        if (!association.isAssociation || !matches(associationClass, association.name)) {
            continue;
        }
        const Property* one = association.begin();
        const Property* other = one + 1;
        for (const auto& [source, target] : {std::pair(one, other), std::pair(other, one)}) {
            if (matches(role, source->name) && matches(resultRole, target->name) &&
                isA(request, request.path, source->referenceClass)) {
                traversals.push_back({&association, form, target});
                requiredAt(*source, traversals.back()) = request.path;
            }
        }
    }
    return traversals;
}

/** Returns the results of `make(request, pair)` for all pairs of the traversals, which one session reads. */
template <class Results, class Make>
Results traverse(const ClientRequest& request, const Traversals& traversals, Make make) {
    Results results;
    if (!traversals.empty()) {
        ProviderSession session(request);
        for (const AssociationPair& pair : pairsOf(request, session, traversals)) {
            results.push_back(make(request, pair));
        }
    }
    return results;
}

/** Returns to the client only those results that are of the result class. */
template <class Results, class PathOf>
void returnOfClass(const ClientRequest& request, const char* resultClass, Results results, PathOf pathOfResult) {
    const auto isOther = [&](const auto* result) {
        return !isAny(resultClass) && !isA(request, pathOfResult(result), resultClass);
    };
    results.erase(std::remove_if(results.begin(), results.end(), isOther), results.end());
    request.returnResults(results);
}

CMPIValue referenceTo(const CMPIObjectPath* target) {
    CMPIValue value{};
    value.ref = const_cast<CMPIObjectPath*>(target);
    return value;
}

const CMPIObjectPath* associationPath(const ClientRequest& request, const AssociationPair& pair) {
    const Class& association = *pair.traversal.association;
    CMPIObjectPath* path = makePath(request.broker(), nameSpaceOf(request.path), association.name);
    for (const Property& end : association) {
        const CMPIValue target = referenceTo(at(end, pair).path);
        addKey(path, end.name, &target, CMPI_ref);
    }
    return path;
}

/** An instance of an association. It ignores property lists, because both properties are keys. */
const CMPIInstance* associationInstance(const ClientRequest& request, const AssociationPair& pair) {
    CMPIInstance* instance = makeInstance(request.broker(), associationPath(request, pair));
    for (const Property& end : *pair.traversal.association) {
        const CMPIValue target = referenceTo(at(end, pair).path);
        setProperty(instance, end.name, &target, CMPI_ref);
    }
    return instance;
}

}  // namespace

void associators(const ClientRequest& request, const char* associationClass, const char* resultClass, const char* role,
                 const char* resultRole, const char** properties) {
    const auto instanceAt = [&](const ClientRequest&, const AssociationPair& pair) {
        const Property& target = *pair.traversal.target;
        const PropertySelection selection(properties, *findClass(target.referenceClass));
        return selection.applied(request.broker(), at(target, pair).instance);
    };
    const auto traversals = traversalsFrom(request, associationClass, role, resultRole, ElementForm::instance);
    returnOfClass(request, resultClass, traverse<Instances>(request, traversals, instanceAt), pathOf);
}

void associatorNames(const ClientRequest& request, const char* associationClass, const char* resultClass,
                     const char* role, const char* resultRole) {
    const auto targetOf = [](const ClientRequest&, const AssociationPair& pair) {
        return at(*pair.traversal.target, pair).path;
    };
    const Traversals traversals = traversalsFrom(request, associationClass, role, resultRole);
    returnOfClass(request, resultClass, traverse<Paths>(request, traversals, targetOf),
                  [](const CMPIObjectPath* path) { return path; });
}

void references(const ClientRequest& request, const char* associationClass, const char* role, const char**) {
    const Traversals traversals = traversalsFrom(request, associationClass, role, nullptr);
    request.returnResults(traverse<Instances>(request, traversals, associationInstance));
}

void referenceNames(const ClientRequest& request, const char* associationClass, const char* role) {
    const Traversals traversals = traversalsFrom(request, associationClass, role, nullptr);
    request.returnResults(traverse<Paths>(request, traversals, associationPath));
}

Instances associationInstances(const ClientRequest& request, const Class& association) {
    return traverse<Instances>(request, {Traversal{&association}}, associationInstance);
}

Paths associationPaths(const ClientRequest& request, const Class& association) {
    return traverse<Paths>(request, {Traversal{&association}}, associationPath);
}

const CMPIInstance* associationAt(const ClientRequest& request, const Class& association) {
    ProviderSession session(request);
    Traversal traversal{&association};
    for (const Property& end : association) {
        const CMPIObjectPath* target = referenceOf(request.path, end.name);
        failIf(target == nullptr, CMPI_RC_ERR_INVALID_PARAMETER, "The path of a ", association.name, " needs the key ",
               end.name, " as a reference.");
        requiredAt(end, traversal) = target;
    }
    const Pairs pairs = pairsOf(request, session, {traversal});
    const bool isOther = pairs.empty() || keyCountOf(request.path) != association.propertyCount;
    failIf(isOther, CMPI_RC_ERR_NOT_FOUND, "There is no such ", association.name, ".");
    return associationInstance(request, pairs.front());
}

}  // namespace gate
