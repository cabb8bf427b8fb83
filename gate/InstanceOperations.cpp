#include "InstanceOperations.h"

#include "AssociationOperations.h"
#include "Calls.h"
#include "Changes.h"
#include "LossyValues.h"
#include "Objects.h"
#include "Provider.h"

#include <algorithm>
#include <exception>
#include <iterator>
#include <optional>
#include <string_view>

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

    /** @param text what the file holds after the change */
    void requireStored(std::string_view text) const {
        if (file.keepsRecords() && file.recordsIn(text, identifier()) == 0) {
            fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " does not hold " + identifier() + ".");
        }
    }

    /** @param before how many records with the identifier there were before this one was deleted */
    void requireDeleted(std::size_t before) const {
        const std::size_t after = file.recordsIn(file.state().text, identifier());
        if (after != 0 && after >= before) {
            fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " still holds " + identifier() + ".");
        }
    }

    /** Whether the file is whole and has as many records with the identifier as before, if that is known. */
    bool hasAgain(std::optional<std::size_t> before) const {
        const std::optional<std::size_t> now = file.recordsIfWhole(identifier());
        return now && now == before.value_or(*now);
    }

    /**
     * Whether the file is whole and does not keep a change that failed.
     * @param before what it held before the change
     * @param failed what it held after it
     */
    bool isWithout(const FileState& before, const FileState& failed) const {
        const FileState now = file.state();
        return file.isWhole(now.text) && (now.text == before.text || !(now == failed));
    }

    /** What a failure says where the file could not be brought back. */
    std::string wordOfFile() const {
        return std::string(" ") + file.fileName +
               (file.keepsRecords() ? " stays damaged until the next change succeeds."
                                    : " may not be what it was before.");
    }
};

/** How many bytes values take in a file, at most. */
std::size_t sizeOf(const Values& values) {
    std::size_t size = 0;
    for (const auto& value : values) {
        size += value.second.size() + 1;
    }
    return size;
}

template <class Undo>
bool isUndoneBy(Undo undo) {
    try {
        return undo();
    } catch (...) {
        return false;  // what made the change fail is what is told
    }
}

/**
 * Runs a change and its checks. When one fails, the change is undone, and the failure goes on: with a word where the
 * file could not be brought back either.
 * @param undo answers whether the file is what it was
 */
template <class Change, class Undo>
void orUndone(const Target& target, Change change, Undo undo) {
    try {
        change();
    } catch (const Ended&) {
        throw;  // without the turn nothing can be undone, and there is nobody to tell
    } catch (Failure& failure) {
        if (!isUndoneBy(undo)) {
            failure.text += target.wordOfFile();
        }
        throw;
    } catch (const std::exception& exception) {
        if (isUndoneBy(undo)) {
            throw;
        }
        fail(CMPI_RC_ERR_FAILED, std::string("The request broke off: ") + exception.what() + "." + target.wordOfFile());
    } catch (...) {
        isUndoneBy(undo);
        throw;
    }
}

/**
 * Makes the changes; fails unless they are stored.
 * @param before what the file held
 */
void apply(const Provider& provider, const Target& target, const CMPIInstance* current, const Values& changes,
           const FileState& before) {
    provider.modify(target.path, OwnInstance(changed(target.owner, current, changes)));
    requireChanged(target.owner, target.file, current, existing(provider, target.path, target.owner), changes);
    const FileState after = target.file.state();
    target.requireStored(after.text);
    if (target.file.keepsRecords() && after == before && showIn(target.file, current, changes)) {
        fail(CMPI_RC_ERR_FAILED, std::string(target.file.fileName) + " was not written.");
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
    return named.empty() ? given : named;
}

/** The values for a new record; its identifier is none of them. */
Values valuesFor(const Class& owner, const CMPIInstance* instance) {
    Values values = givenValues(owner, instance, PropertyList(nullptr));
    values.erase(std::remove_if(values.begin(), values.end(), [](const auto& value) { return value.first->isKey; }),
                 values.end());
    return values;
}

/** Refuses read-only values before there is a record that has others: all records have the same. */
void requireReadOnly(const Provider& provider, const Target& target, const Values& given) {
    Values readOnly;
    std::copy_if(given.begin(), given.end(), std::back_inserter(readOnly),
                 [](const auto& value) { return !value.first->isWritable; });
    if (readOnly.empty()) {
        return;
    }
    const Provider::Paths paths = provider.names(OwnPath(nameSpaceOf(target.path.handle()), target.owner.name));
    if (!paths.empty()) {
        changesTo(existing(provider, namingPath(paths.front(), target.owner), target.owner), readOnly, false);
    }
}

void fillNew(const Provider& provider, const Target& target, const Values& given) {
    const CMPIInstance* current = existing(provider, target.path, target.owner);
    const Values changes = changesTo(current, given, false);
    const FileState stored = target.file.state();
    target.requireStored(stored.text);
    if (!changes.empty()) {
        apply(provider, target, current, changes, stored);
    }
}

/** Makes the record with its values and answers its path, or makes none at all. */
void create(const Request& request, const Provider& provider, const Target& target, const Values& given) {
    if (provider.get(target.path) != nullptr) {
        fail(CMPI_RC_ERR_ALREADY_EXISTS,
             std::string("There is a ") + target.owner.name + " " + target.identifier() + " already.");
    }
    requireKept(target.file, *findProperty(target.owner, identifierKey), target.identifier());
    requireKept(target.file, given);
    requireReadOnly(provider, target, given);
    target.file.requireWritable(target.identifier().size() + 1 + sizeOf(given));
    CMPIObjectPath* answer = makePath(request.broker, nameSpaceOf(request.path), target.owner.name);
    addKey(answer, identifierKey, target.identifier());
    const std::optional<std::size_t> before = target.file.recordsIfWhole(target.identifier());
    const Provider::Watch watch(target.path);
    const auto change = [&] {
        provider.create(target.path);
        fillNew(provider, target, given);
        provider.letOthersIn([&] {
            request.give(answer);
            request.finish();
        });
    };
    orUndone(target, change, [&] {
        if (watch.sawRemoval()) {
            return true;  // while the path went out: what is there now is somebody else's
        }
        provider.remove(target.path);
        return target.hasAgain(before);
    });
}

/** Makes a deleted record with its values again; whether the file has both. */
bool isMadeAnew(const Provider& provider, const Target& target, const Values& values) {
    try {
        provider.create(target.path);
    } catch (const Failure&) {
        // It may have been made all the same: the answer to it is the last thing that can fail.
    }
    const CMPIInstance* made = existing(provider, target.path, target.owner);
    const FileState empty = target.file.state();
    const bool shows = showIn(target.file, made, values);
    provider.modify(target.path, OwnInstance(values));
    return !shows || !(target.file.state() == empty);
}

}  // namespace

// A manager may crash while a client's object is read: SFCB does, for a string that was sent for a number. Requests
// that read a client's keys and values therefore hold the lock first, so that no record file is being rewritten then.

void enumerateInstanceNames(const Request& request) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociationNames(request, requested);
    }
    const OwnPath classPath(nameSpaceOf(request.path), requested.name);
    const Provider::Paths paths = Provider(request).names(classPath);
    request.giveAll(paths);
}

void enumerateInstances(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return enumerateAssociations(request, requested);
    }
    const OwnPath classPath(nameSpaceOf(request.path), requested.name);
    Provider::Instances instances = Provider(request).instances(classPath);
    PropertyList(properties).apply(request, instances, requested);
    request.giveAll(instances);
}

void getInstance(const Request& request, const char** properties) {
    const Class& requested = request.requestedClass();
    if (requested.isAssociation) {
        return getAssociation(request, requested);
    }
    const auto found = [&] {
        const Provider provider(request);
        return existing(provider, namingPath(request.path, requested), requested);
    };
    request.give(PropertyList(properties).applied(request, found(), requested));
    request.finish();
}

void createInstance(const Request& request, const CMPIInstance* instance) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, true);
    requireInstance(instance);
    const Provider provider(request);
    const std::string identifier = identifierFor(request.path, instance, requested);
    const Values given = valuesFor(requested, instance);
    OwnPath path(nameSpaceOf(request.path), requested.name);
    path.addKey(identifierKey, identifier);
    create(request, provider, {requested, file, std::move(path)}, given);
}

void modifyInstance(const Request& request, const CMPIInstance* instance, const char** properties) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, false);
    requireInstance(instance);
    const PropertyList list(properties);
    list.requireKnown(requested);
    const Provider provider(request);
    const Target target{requested, file, namingPath(request.path, requested)};
    const Values given = givenValues(requested, instance, list);
    const CMPIInstance* current = existing(provider, target.path, requested);
    const Values changes = changesTo(current, given, list.isGiven());
    requireKept(file, changes);
    if (!changes.empty()) {
        file.requireWritable(sizeOf(changes));
        const FileState before = file.state();
        const Values restored = undoing(requested, file, changes, current);
        const OwnInstance undone(changed(requested, current, restored));
        const auto change = [&] { apply(provider, target, current, changes, before); };
        orUndone(target, change, [&] {
            const FileState failed = file.state();
            provider.modify(target.path, undone);
            return file.keepsRecords() ? target.isWithout(before, failed)
                                       : areSame(restored, current, existing(provider, target.path, requested));
        });
    }
}

void deleteInstance(const Request& request) {
    const Class& requested = request.requestedClass();
    const DataFile& file = fileOf(requested, true);
    const Provider provider(request);
    const Target target{requested, file, namingPath(request.path, requested)};
    const CMPIInstance* current = existing(provider, target.path, requested);
    const Values restored = givenValues(requested, current, PropertyList(nullptr));
    file.requireWritable(0);
    const std::optional<std::size_t> before = file.recordsIfWhole(target.identifier());
    const auto change = [&] {
        provider.remove(target.path);
        target.requireDeleted(before.value_or(0));
    };
    orUndone(target, change, [&] {
        const bool isThere = provider.get(target.path) != nullptr || isMadeAnew(provider, target, restored);
        return isThere && target.hasAgain(before);
    });
}

}  // namespace gate
