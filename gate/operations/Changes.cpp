#include "Operations.h"
#include "gate/storage/Transaction.h"

namespace gate {

namespace {

/**
 * The class's data file. Fails with CMPI_RC_ERR_NOT_SUPPORTED if the class does not support the change.
 * @param hasRecords whether the file must be a record file, as for creations and deletions
 */
const DataFile& fileOf(const Class& requested, bool hasRecords, const char* changed) {
    const DataFile* file = dataFileOf(requested);
    failIf(file == nullptr || (hasRecords && !file->hasRecords), CMPI_RC_ERR_NOT_SUPPORTED, "Instances of ",
           requested.name, changed);
    return *file;
}

const DataFile& recordFileOf(const Class& requested) {
    return fileOf(requested, true, " can be neither created nor deleted.");
}

void requireInstance(const CMPIInstance* instance) {
    failIf(instance == nullptr, CMPI_RC_ERR_INVALID_PARAMETER, "The request has no instance.");
}

void requireKnownProperties(const Class& requested, const CMPIInstance* instance) {
    const CMPICount count = demand<&CMPIInstanceFT::getPropertyCount>("count the properties of the instance", instance);
    for (CMPICount index = 0; index < count; ++index) {
        CMPIString* nameString = nullptr;
        ask<&CMPIInstanceFT::getPropertyAt>(instance, index, &nameString);
        const std::string name = toString(nameString);
        require(!name.empty(), "name a property of the instance");
        requireProperty(requested, name);
    }
}

/** The identifier of a new record: from the path or, if the path has none, from the instance. */
std::string identifierOf(const CMPIObjectPath* path, const CMPIInstance* instance, const Property& key,
                         const Class& requested) {
    std::string fromPath = keyOf(path, key.name, key.type).value_or(std::string());
    std::string fromInstance = propertyOf(instance, key).value_or(std::string());
    failIf(fromPath.empty() && fromInstance.empty(), CMPI_RC_ERR_INVALID_PARAMETER, "A new ", requested.name,
           " needs a value of its key ", key.name, ", in the path or in the instance.");
    return fromPath.empty() ? fromInstance : fromPath;
}

}  // namespace

void createInstance(const ClientRequest& request, const CMPIInstance* instance) {
    const Class& requested = request.requestedClass();
    const DataFile& file = recordFileOf(requested);
    requireInstance(instance);
    ProviderSession session(request, ProviderSession::Access::change);
    const Property& key = *cim::findNamed(requested, "InstanceID");
    const std::string identifier = identifierOf(request.path, instance, key, requested);
    requireKnownProperties(requested, instance);
    const Values given = valuesOf(instance, requested, [](const Property& property) { return !property.isKey; });
    const std::string nameSpace = nameSpaceOf(request.path);
    CMPIObjectPath* created = makePath(request.broker(), nameSpace, requested.name);
    // CMPI expects a pointer to the characters for CMPI_chars, instead of a pointer to a CMPIValue.
    addKey(created, key.name, reinterpret_cast<const CMPIValue*>(identifier.c_str()), CMPI_chars);
    const Paths results{created};
    const LocalObject path(nameSpace, requested, {{&key, identifier}});
    Transaction(session, requested, file, path).create(identifier, given, [&] { request.returnResults(results); });
}

void modifyInstance(const ClientRequest& request, const CMPIInstance* instance, const char** properties) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, false, " cannot be changed.");
    requireInstance(instance);
    const PropertySelection selection(properties, requested);
    selection.requireKnown();
    ProviderSession session(request, ProviderSession::Access::change);
    const LocalObject path = localPath(request.path, requested);
    requireKnownProperties(requested, instance);
    const Values given = valuesOf(instance, requested, [&](const Property& each) { return selection.has(each); });
    const CMPIInstance* current = session.get(path, requested);
    const Values changes = diff(current, given, properties != nullptr);
    if (!changes.empty()) {
        Transaction(session, requested, file, path).modify(current, changes);
    }
}

void deleteInstance(const ClientRequest& request) {
    const Class& requested = request.requestedClass();
    const DataFile& file = recordFileOf(requested);
    ProviderSession session(request, ProviderSession::Access::change);
    const LocalObject path = localPath(request.path, requested);
    session.get(path, requested);  // fails if there is no such record
    Transaction(session, requested, file, path).remove();
}

}  // namespace gate
