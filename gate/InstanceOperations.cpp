#include "InstanceOperations.h"

#include "AssociationOperations.h"
#include "Calls.h"
#include "Changes.h"
#include "LossyValues.h"
#include "Objects.h"
#include "Provider.h"

namespace gate {

namespace {

constexpr const char* identifierKey = "InstanceID";

/** The class's file, for a change of one of its instances. */
const DataFile& fileOf(const Class& owner, bool forRecords) {
    const DataFile* file = dataFileOf(owner);
    if (file == nullptr || (forRecords && !file->keepsRecords())) {
        const char* operations = forRecords ? " can be neither created nor deleted." : " cannot be changed.";
        fail(CMPI_RC_ERR_NOT_SUPPORTED, std::string("Instances of ") + owner.name + operations);
    }
    return *file;
}

void requireInstance(const CMPIInstance* instance) {
    if (instance == nullptr) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, "The request has no instance.");
    }
}

const CMPIInstance* existing(const Provider& provider, const OwnPath& path, const Class& owner) {
    const CMPIInstance* instance = provider.get(path);
    if (instance == nullptr) {
        fail(CMPI_RC_ERR_NOT_FOUND, std::string("There is no such ") + owner.name + ".");
    }
    return instance;
}

/** An instance that is to be changed, as it is named. */
struct Target {
    const Class& owner;
    const DataFile& file;
    OwnPath path;

    std::string identifier() const { return path.key(identifierKey); }

    void requireStored() const {
        if (file.keepsRecords() && file.recordsOf(identifier()) == 0) {
            fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " does not hold " + identifier() + ".");
        }
    }
};

/** Makes the changes; when they cannot be stored, the provider is given the old values back. */
void apply(const Provider& provider, const Target& target, const CMPIInstance* current, const Values& changes) {
    const OwnInstance wanted(changed(target.owner, current, changes));
    const OwnInstance undone(changed(target.owner, current, undoing(changes, current)));
    try {
        provider.modify(target.path, wanted);
        requireChanged(current, existing(provider, target.path, target.owner), changes);
        target.requireStored();
    } catch (...) {
        provider.modify(target.path, undone);
        throw;
    }
}

/** The identifier of a new record: from the path or, where that has none, from the instance. */
std::string identifierFor(const CMPIObjectPath* path, const CMPIInstance* instance, const Class& owner) {
    const Property& key = *findProperty(owner, identifierKey);
    const std::string named = keyOf(path, key).value_or(std::string());
    const std::string given = propertyOf(instance, key).value_or(std::string());
    if (named.empty() && given.empty()) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, std::string("A new ") + owner.name + " needs a value of its key " +
                                                key.name + ", in the path or in the instance.");
    }
    if (!named.empty() && !given.empty() && named != given) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER,
             std::string(key.name) + " is \"" + named + "\" in the path and \"" + given + "\" in the instance.");
    }
    return named.empty() ? given : named;
}

void fillNew(const Provider& provider, const Target& target, const Values& given) {
    const CMPIInstance* current = existing(provider, target.path, target.owner);
    const Values changes = changesTo(current, given);
    target.requireStored();
    if (!changes.empty()) {
        apply(provider, target, current, changes);
    }
}

/** Makes the record with its values and answers its path, or makes none at all. */
void create(const Request& request, const Provider& provider, const Target& target, const Values& given) {
    if (provider.get(target.path) != nullptr) {
        fail(CMPI_RC_ERR_ALREADY_EXISTS,
             std::string("There is a ") + target.owner.name + " " + target.identifier() + " already.");
    }
    target.file.requireWritable();
    CMPIObjectPath* answer = makePath(request.broker, nameSpaceOf(request.path), target.owner.name);
    addKey(answer, identifierKey, target.identifier());
    try {
        provider.create(target.path);
        fillNew(provider, target, given);
        request.give(answer);
        request.finish();
    } catch (...) {
        provider.remove(target.path);
        throw;
    }
}

}  // namespace

void enumerateInstanceNames(const Request& request) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociationNames(request, requested);
    }
    const OwnPath classPath(nameSpaceOf(request.path), requested.name);
    const Provider::Paths paths = Provider(request).names(classPath);
    for (const CMPIObjectPath* path : paths) {
        request.give(path);
    }
    request.finish();
}

void enumerateInstances(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociations(request, requested);
    }
    const OwnPath classPath(nameSpaceOf(request.path), requested.name);
    const PropertyList list(properties);
    const Provider::Instances instances = Provider(request).instances(classPath);
    for (const CMPIInstance* instance : instances) {
        request.give(list.applied(request.broker, instance, requested));
    }
    request.finish();
}

void getInstance(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return getAssociation(request, requested);
    }
    const OwnPath path = namingPath(request.path, requested);
    const CMPIInstance* instance = existing(Provider(request), path, requested);
    request.give(PropertyList(properties).applied(request.broker, instance, requested));
    request.finish();
}

void createInstance(const Request& request, const CMPIInstance* instance) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, true);
    requireInstance(instance);
    const std::string identifier = identifierFor(request.path, instance, requested);
    const Values given = givenValues(requested, instance, PropertyList(nullptr));
    requireKept(file, *findProperty(requested, identifierKey), identifier);
    requireKept(file, given);
    OwnPath path(nameSpaceOf(request.path), requested.name);
    path.addKey(identifierKey, identifier);
    create(request, Provider(request), {requested, file, std::move(path)}, given);
}

void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, false);
    requireInstance(instance);
    const PropertyList list(properties);
    list.requireKnown(requested);
    const Target target{requested, file, namingPath(request.path, requested)};
    const Values given = givenValues(requested, instance, list);
    const Provider provider(request);
    const CMPIInstance* current = existing(provider, target.path, requested);
    const Values changes = changesTo(current, given);
    requireKept(file, changes);
    if (!changes.empty()) {
        file.requireWritable();
        apply(provider, target, current, changes);
    }
}

void deleteInstance(const Request& request) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, true);
    const Target target{requested, file, namingPath(request.path, requested)};
    const Provider provider(request);
    existing(provider, target.path, requested);
    file.requireWritable();
    const std::size_t before = file.recordsBefore(target.identifier());
    provider.remove(target.path);
    const std::size_t after = file.recordsOf(target.identifier());
    if (after != 0 && after >= before) {
        fail(CMPI_RC_ERR_FAILED, std::string(requested.name) + " " + target.identifier() +
                                     " is deleted for now only: " + file.fileName + " still holds it.");
    }
}

}  // namespace gate
