#include "Operations.h"
#include "gate/storage/Transaction.h"

namespace gate {

namespace {

/** The class's file. Fails with CMPI_RC_ERR_NOT_SUPPORTED if its instances cannot be changed. */
const DataFile& fileOf(const Class& owner) {
    const DataFile* file = dataFileOf(owner);
    if (file == nullptr) {
        fail(CMPI_RC_ERR_NOT_SUPPORTED, std::string("Instances of ") + owner.name + " cannot be changed.");
    }
    return *file;
}

/** The same for creations and deletions, which need a record file. */
const DataFile& recordFileOf(const Class& owner) {
    const DataFile* file = dataFileOf(owner);
    if (file == nullptr || !file->hasRecords) {
        fail(CMPI_RC_ERR_NOT_SUPPORTED,
             std::string("Instances of ") + owner.name + " can be neither created nor deleted.");
    }
    return *file;
}

void requireInstance(const CMPIInstance* instance) {
    if (instance == nullptr) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, "The request has no instance.");
    }
}

void requireKnownProperties(const Class& owner, const CMPIInstance* instance) {
    const CMPICount count = demand<&CMPIInstanceFT::getPropertyCount>("count the properties of the instance", instance);
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* nameString = nullptr;
        ask<&CMPIInstanceFT::getPropertyAt>(instance, index, &nameString);
        const std::string name = toString(nameString);
        require(!name.empty(), "name a property of the instance");
        if (findProperty(owner, name) == nullptr) {
            fail(CMPI_RC_ERR_NO_SUCH_PROPERTY, std::string(owner.name) + " has no property " + name + ".");
        }
    }
}

/** The identifier of a new record: from the path or, if that has none, from the instance. */
std::string identifierOf(const CMPIObjectPath* path, const CMPIInstance* instance, const Property& key,
                         const Class& owner) {
    std::string fromPath = keyOf(path, key).value_or(std::string());
    std::string fromInstance = propertyOf(instance, key).value_or(std::string());
    if (fromPath.empty() && fromInstance.empty()) {
        fail(CMPI_RC_ERR_INVALID_PARAMETER, std::string("A new ") + owner.name + " needs a value of its key " +
                                                key.name + ", in the path or in the instance.");
    }
    return fromPath.empty() ? fromInstance : fromPath;
}

}  // namespace

void createInstance(const Request& request, const CMPIInstance* instance) {
    const Class& requested = request.requestedClass();
    const DataFile& file = recordFileOf(requested);
    requireInstance(instance);
    ProviderSession session(request, ProviderSession::Access::change);
    const Property& key = *findProperty(requested, "InstanceID");
    const std::string identifier = identifierOf(request.path, instance, key, requested);
    requireKnownProperties(requested, instance);
    const Values given = valuesOf(instance, requested, [](const Property& property) { return !property.isKey; });
    const LocalObjectPath path(nameSpaceOf(request.path), requested, {{&key, identifier}});
    if (session.find(path, requested) != nullptr) {
        fail(CMPI_RC_ERR_ALREADY_EXISTS, std::string(requested.name) + " " + identifier + " already exists.");
    }
    CMPIObjectPath* created = makePath(session.broker(), nameSpaceOf(request.path), requested.name);
    addKey(created, key.name, identifier);
    const std::vector<const CMPIObjectPath*> answer{created};
    Transaction(session, requested, file, path).create(identifier, given, [&] { request.give(answer); });
}

void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested);
    requireInstance(instance);
    const PropertyList list(properties, requested);
    list.requireKnown();
    ProviderSession session(request, ProviderSession::Access::change);
    const LocalObjectPath path = localPath(request.path, requested);
    requireKnownProperties(requested, instance);
    const Values given = valuesOf(instance, requested, [&](const Property& property) { return list.has(property); });
    const CMPIInstance* current = session.get(path, requested);
    const Values changes = diff(current, given, list.isGiven());
    if (!changes.empty()) {
        Transaction(session, requested, file, path).modify(current, changes);
    }
}

void deleteInstance(const Request& request) {
    const Class& requested = request.requestedClass();
    const DataFile& file = recordFileOf(requested);
    ProviderSession session(request, ProviderSession::Access::change);
    const LocalObjectPath path = localPath(request.path, requested);
    session.get(path, requested);  // there must be one
    Transaction(session, requested, file, path).remove();
}

}  // namespace gate
