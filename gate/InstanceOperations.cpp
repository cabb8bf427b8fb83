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

const CMPIInstance* existing(const Provider& provider, const CMPIObjectPath* path, const Class& owner) {
    const CMPIInstance* instance = provider.get(path);
    if (instance == nullptr) {
        fail(CMPI_RC_ERR_NOT_FOUND, std::string("There is no such ") + owner.name + ".");
    }
    return instance;
}

/** A record, as it is named. */
struct Record {
    const Class& owner;
    const DataFile& file;
    std::string identifier;
    const CMPIObjectPath* path;

    void requireStored() const {
        if (file.keepsRecords() && file.recordsOf(identifier) == 0) {
            fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " does not hold " + identifier + ".");
        }
    }
};

Record recordOf(const CMPIObjectPath* path, const Class& owner, const DataFile& file) {
    const Property* key = findProperty(owner, identifierKey);
    return {owner, file, key == nullptr ? std::string() : keyOf(path, *key).value_or(std::string()), path};
}

/** Makes the changes; when they cannot be stored, the provider is given the old values back. */
void apply(const Request& request, const Provider& provider, const Record& record, const CMPIInstance* current,
           const Values& changes) {
    const auto changedBy = [&](const Values& values) {
        return changed(request.broker, record.path, record.owner, current, values);
    };
    const CMPIInstance* undone = changedBy({});
    try {
        provider.modify(record.path, changedBy(changes));
        requireChanged(current, existing(provider, record.path, record.owner), changes);
        record.requireStored();
    } catch (const Failure&) {
        provider.modify(record.path, undone);
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

void fillNew(const Request& request, const Provider& provider, const Record& record, const Values& given) {
    const CMPIInstance* current = existing(provider, record.path, record.owner);
    const Values changes = changesTo(current, given);
    record.requireStored();
    if (!changes.empty()) {
        apply(request, provider, record, current, changes);
    }
}

/** Makes the record with its values, or none at all. */
void create(const Request& request, const Provider& provider, const Record& record, const CMPIInstance* instance,
            const Values& given) {
    if (provider.get(record.path) != nullptr) {
        fail(CMPI_RC_ERR_ALREADY_EXISTS,
             std::string("There is a ") + record.owner.name + " " + record.identifier + " already.");
    }
    record.file.requireWritable();
    try {
        provider.create(record.path, instance);
        fillNew(request, provider, record, given);
    } catch (const Failure&) {
        if (provider.get(record.path) != nullptr) {
            provider.remove(record.path);
        }
        throw;
    }
}

}  // namespace

void enumerateInstanceNames(const Request& request) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociationNames(request, requested);
    }
    const CMPIObjectPath* classPath = makePath(request.broker, nameSpaceOf(request.path), requested.name);
    const Provider::Paths paths = Provider(request.context).names(classPath);
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
    const CMPIObjectPath* classPath = makePath(request.broker, nameSpaceOf(request.path), requested.name);
    const PropertyList list(properties);
    const Provider::Instances instances = Provider(request.context).instances(classPath);
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
    const CMPIObjectPath* path = namingPath(request.broker, request.path, requested);
    const CMPIInstance* instance = existing(Provider(request.context), path, requested);
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
    const auto newPath = [&] {
        CMPIObjectPath* path = makePath(request.broker, nameSpaceOf(request.path), requested.name);
        addKey(path, identifierKey, identifier);
        return path;
    };
    const CMPIObjectPath* answer = newPath();
    create(request, Provider(request.context), {requested, file, identifier, newPath()}, instance, given);
    request.give(answer);
    request.finish();
}

void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, false);
    requireInstance(instance);
    const PropertyList list(properties);
    list.requireKnown(requested);
    const Record record = recordOf(namingPath(request.broker, request.path, requested), requested, file);
    const Values given = givenValues(requested, instance, list);
    const Provider provider(request.context);
    const CMPIInstance* current = existing(provider, record.path, requested);
    const Values changes = changesTo(current, given);
    requireKept(file, changes);
    if (!changes.empty()) {
        file.requireWritable();
        apply(request, provider, record, current, changes);
    }
}

void deleteInstance(const Request& request) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, true);
    const Record record = recordOf(namingPath(request.broker, request.path, requested), requested, file);
    const Provider provider(request.context);
    existing(provider, record.path, requested);
    file.requireWritable();
    const std::size_t before = file.recordsBefore(record.identifier);
    provider.remove(record.path);
    const std::size_t after = file.recordsOf(record.identifier);
    if (provider.get(record.path) != nullptr || (after != 0 && after >= before)) {
        fail(CMPI_RC_ERR_FAILED, std::string(requested.name) + " " + record.identifier +
                                     " could not be deleted for good: " + file.fileName + " still holds it.");
    }
}

}  // namespace gate
