#include "AssociationOperations.h"

#include "Calls.h"
#include "Links.h"
#include "Objects.h"
#include "PropertyList.h"
#include "Values.h"

#include <algorithm>

namespace gate {

namespace {

bool isAny(const char* name) {
    return name == nullptr || *name == '\0';
}

bool isOrAny(const char* asked, const char* name) {
    return isAny(asked) || sameName(asked, name);
}

/** Whether a path's class is the class or, as the object manager knows, a subclass of it. */
bool isA(const Request& request, const CMPIObjectPath* path, const char* className) {
    request.requireManager();
    const std::string pathsClass = classNameOf(path);
    if (sameName(pathsClass, className)) {
        return true;
    }
    // The classes of the MOF do not descend from each other: the object manager need not be asked.
    const CMPIBroker* broker = request.broker;
    const bool areBothKnown = findClass(pathsClass) != nullptr && findClass(className) != nullptr;
    if (areBothKnown || broker->eft == nullptr || broker->eft->classPathIsA == nullptr) {
        return false;
    }
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const bool answer = broker->eft->classPathIsA(broker, path, className, &status) != 0;
    return answer && status.rc == CMPI_RC_OK;
}

bool isComputerEnd(const Property& end) {
    return sameName(end.referenceClass, computerClass);
}

/** A way along an association: from one of its two ends to the other. */
struct Way {
    const Class* association;
    const Property* near;
    const Property* far;

    const CMPIObjectPath* nearOf(const Link& link) const {
        return isComputerEnd(*near) ? link.computerPath : link.element;
    }
    const CMPIObjectPath* farOf(const Link& link) const {
        return isComputerEnd(*near) ? link.element : link.computerPath;
    }
};

/** The ways that begin at the request's path and that the filter allows. */
std::vector<Way> waysFrom(const Request& request, const AssociationFilter& filter) {
    std::vector<Way> ways;
    for (const Class& association : Classes()) {
        if (!association.isAssociation || !isOrAny(filter.associationClass, association.name)) {
            continue;
        }
        const Property* one = association.begin();
        const Property* other = one + 1;
        for (const Way& way : {Way{&association, one, other}, Way{&association, other, one}}) {
            if (isOrAny(filter.role, way.near->name) && isOrAny(filter.resultRole, way.far->name) &&
                isA(request, request.path, way.near->referenceClass)) {
                ways.push_back(way);
            }
        }
    }
    return ways;
}

/** The links that a way leads along from a path. */
std::vector<Link> linksAlong(const Way& way, const Provider& provider, const std::vector<Computer>& computers,
                             const CMPIObjectPath* source) {
    std::vector<Link> links = linksOf(provider, computers, *way.association);
    const auto isElsewhere = [&](const Link& link) { return !samePath(way.nearOf(link), source); };
    links.erase(std::remove_if(links.begin(), links.end(), isElsewhere), links.end());
    return links;
}

void requireInstancePath(const CMPIObjectPath* path) {
    if (keyCountOf(path) == 0) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, "Associations begin at an instance: the path needs its keys.");
    }
}

/** Calls `take(way, link, provider)` for each link at the path that the filter allows, in one turn. */
template <class Take>
void follow(const Request& request, const AssociationFilter& filter, Take take) {
    requireInstancePath(request.path);
    const std::vector<Way> ways = waysFrom(request, filter);
    if (ways.empty()) {
        return;
    }
    const Provider provider(request);
    const std::vector<Computer> computers = knownComputers(request, provider);
    for (const Way& way : ways) {
        for (const Link& link : linksAlong(way, provider, computers, request.path)) {
            take(way, link, provider);
        }
    }
}

/** Drops the answers at a far end that is not of the result class. */
template <class Answer, class PathOf>
void restrict(const Request& request, const char* resultClass, std::vector<Answer>& answers, PathOf pathOfAnswer) {
    const auto isOther = [&](const Answer& answer) {
        return !isAny(resultClass) && !isA(request, pathOfAnswer(answer), resultClass);
    };
    answers.erase(std::remove_if(answers.begin(), answers.end(), isOther), answers.end());
}

const CMPIObjectPath* associationPath(const Request& request, const Class& association, const Link& link) {
    request.requireManager();
    CMPIObjectPath* path = makePath(request.broker, nameSpaceOf(request.path), association.name);
    for (const Property& end : association) {
        addReference(path, end.name, isComputerEnd(end) ? link.computerPath : link.element);
    }
    return path;
}

/** Both ends of an association are its keys: no property list takes anything away. */
const CMPIInstance* associationInstance(const Request& request, const Class& association, const Link& link) {
    CMPIInstance* instance = makeInstance(request.broker, associationPath(request, association, link));
    for (const Property& end : association) {
        setReference(instance, end.name, isComputerEnd(end) ? link.computerPath : link.element);
    }
    return instance;
}

std::vector<Link> allLinks(const Request& request, const Class& association) {
    const Provider provider(request);
    return linksOf(provider, knownComputers(request, provider), association);
}

/** Makes an answer of an association's class and link. */
template <class Made>
using Maker = const Made* (*)(const Request&, const Class&, const Link&);

template <class Made>
std::vector<const Made*> allBy(const Request& request, const Class& association, Maker<Made> made) {
    std::vector<const Made*> answers;
    for (const Link& link : allLinks(request, association)) {
        answers.push_back(made(request, association, link));
    }
    return answers;
}

/** The associations at the path. */
template <class Made>
std::vector<const Made*> referencesBy(const Request& request, const AssociationFilter& filter, Maker<Made> made) {
    std::vector<const Made*> answers;
    const AssociationFilter byAssociation{filter.resultClass, nullptr, filter.role, nullptr};
    follow(request, byAssociation, [&](const Way& way, const Link& link, const Provider&) {
        answers.push_back(made(request, *way.association, link));
    });
    return answers;
}

const CMPIInstance* elementOf(const Provider& provider, const Way& way, const Link& link) {
    return provider.get(namingPath(link.element, *findClass(way.far->referenceClass)));
}

}  // namespace

void associatorNames(const Request& request, const AssociationFilter& filter) {
    std::vector<const CMPIObjectPath*> answers;
    follow(request, filter,
           [&](const Way& way, const Link& link, const Provider&) { answers.push_back(way.farOf(link)); });
    restrict(request, filter.resultClass, answers, [](const CMPIObjectPath* path) { return path; });
    request.giveAll(answers);
}

void associators(const Request& request, const AssociationFilter& filter, const char** properties) {
    std::vector<const CMPIInstance*> answers;
    const PropertyList list(properties);
    follow(request, filter, [&](const Way& way, const Link& link, const Provider& provider) {
        const CMPIInstance* instance = isComputerEnd(*way.far) ? link.computer : elementOf(provider, way, link);
        const Class* farClass = findClass(way.far->referenceClass);
        if (instance != nullptr) {
            answers.push_back(list.applied(request, instance, *farClass));
        }
    });
    restrict(request, filter.resultClass, answers, pathOf);
    request.giveAll(answers);
}

void references(const Request& request, const AssociationFilter& filter, const char**) {
    request.giveAll(referencesBy(request, filter, associationInstance));
}

void referenceNames(const Request& request, const AssociationFilter& filter) {
    request.giveAll(referencesBy(request, filter, associationPath));
}

void enumerateAssociations(const Request& request, const Class& association) {
    request.giveAll(allBy(request, association, associationInstance));
}

void enumerateAssociationNames(const Request& request, const Class& association) {
    request.giveAll(allBy(request, association, associationPath));
}

void getAssociation(const Request& request, const Class& association) {
    for (const Property& end : association) {
        if (referenceOf(request.path, end.name) == nullptr) {
            fail(CMPI_RC_ERR_INVALID_PARAMETER,
                 std::string("The path of a ") + association.name + " needs the key " + end.name + " as a reference.");
        }
    }
    for (const Link& link : allLinks(request, association)) {
        if (samePath(associationPath(request, association, link), request.path)) {
            request.give(associationInstance(request, association, link));
            return request.finish();
        }
    }
    fail(CMPI_RC_ERR_NOT_FOUND, std::string("There is no such ") + association.name + ".");
}

}  // namespace gate
