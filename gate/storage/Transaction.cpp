#include "Transaction.h"

#include <algorithm>
#include <exception>
#include <system_error>

namespace gate {

namespace {

/** An estimate of the bytes that values take in a file. */
std::size_t sizeOf(const Values& values) {
    std::size_t size = 0;
    for (const auto& value : values) {
        size += value.second.size() + 1;
    }
    return size;
}

/** Calls a function, and converts std::system_error to a Failure for the client. */
template <class Work>
auto onFiles(Work work) {
    try {
        return work();
    } catch (const std::system_error& error) {
        fail(CMPI_RC_ERR_FAILED, "The change cannot be stored in ", error.what(), ".");
    }
}

}  // namespace

/** Returns the state of the file before a change. Fails if the change cannot be written or would lose records. */
FileState Transaction::open(std::size_t growth) const {
    return onFiles([&] {
        file.requireWritable(growth);
        requireTable();
        return file.state();
    });
}

/**
 * Calls `change()`, which makes a change, checks it and commits it. If that fails, rolls the change back and fails with
 * the same reason, plus a note if the file could not be restored.
 */
template <class Change>
void Transaction::run(const FileState& before, Change change) const {
    const std::string restorable = onFiles([&] { return file.begin(before.content); });
    try {
        onFiles(change);
    } catch (Failure& failure) {
        failure.message += rollBack(restorable);
        throw;
    } catch (const std::exception& exception) {
        const std::string note = rollBack(restorable);
        fail(CMPI_RC_ERR_FAILED, "The request failed: ", exception.what(), note.empty() ? "" : ".", note);
    } catch (...) {
        rollBack(restorable);
        throw;
    }
}

/** Restores the file and marks the provider as outdated. Returns a note for the client if the file is not restored. */
std::string Transaction::rollBack(const std::string& restorable) const {
    try {
        if (file.hasRecords && !restorable.empty()) {
            theConnection.setOutdated();
        }
        onFiles([&] { file.rollBack(restorable); });
        return {};
    } catch (const Failure& failure) {
        return " The change could not be rolled back. " + failure.message;
    } catch (const std::exception& exception) {
        return std::string(" The change could not be rolled back. ") + exception.what();
    }
}

void Transaction::create(const std::string& identifier, const Values& given, const std::function<void()>& returnPath) {
    requireRoundTrip(file, {{cim::findNamed(requested, "InstanceID"), identifier}});
    requireRoundTrip(file, given);
    const FileState before = open(identifier.size() + 1 + sizeOf(given));
    const bool exists = file.mayHave(before.content, identifier) && session.find(path, requested) != nullptr;
    failIf(exists, CMPI_RC_ERR_ALREADY_EXISTS, requested.name, " ", identifier, " already exists.");
    requireReadOnlyValues(given);
    run(before, [&] {
        const CMPIInstance* current = session.create(path);
        const Values changes = diff(current, given, false);
        const FileState created = altersFile(file, current, changes) ? file.state() : before;
        if (!changes.empty()) {
            apply(current, changes);
        }
        file.commit(created, true, &identifier);
        returnPath();
    });
}

void Transaction::modify(const CMPIInstance* current, const Values& changes) {
    requireRoundTrip(file, changes);
    const FileState before = open(sizeOf(changes));
    run(before, [&] {
        apply(current, changes);
        file.commit(before, altersFile(file, current, changes));
    });
}

void Transaction::remove() {
    const FileState before = open(0);
    run(before, [&] {
        session.remove(path);
        file.commit(before, true);
    });
}

/** Sends the changes to the provider. Fails unless the instance, read again, has them. */
void Transaction::apply(const CMPIInstance* current, const Values& changes) const {
    session.modify(path, LocalObject({}, requested, valuesToSend(requested, current, changes)));
    requireChanged(requested, file, current, session.get(path, requested), changes);
}

/** Fails if the provider and its file have different numbers of records, since the next write could lose some. */
void Transaction::requireTable() const {
    if (!file.hasRecords || (theConnection.tableOf(requested)->isVerified && file.records().isStored())) {
        return;
    }
    const Paths paths = session.names(requested);
    if (!paths.empty() && !file.records().isStored()) {
        storeTable(paths.front());
    }
    const durable::RecordFile records = file.records();
    const auto declared = durable::RecordFile::declaredIn(records.content().value_or(std::string()));
    if (declared.value_or(0) != paths.size() || records.needsRecovery()) {
        theConnection.setOutdated();
        fail(CMPI_RC_ERR_FAILED, file.fileName,
             " has other records than the provider. It is read again; repeat the request.");
    }
    theConnection.tableOf(requested)->isVerified = true;
}

/** Restores a removed record file from memory: sets a property to its current value, so that the provider writes it. */
void Transaction::storeTable(const CMPIObjectPath* record) const {
    const LocalObject changed = localPath(record, requested);
    const auto* number = std::find_if(requested.begin(), requested.end(), [](const Property& property) {
        return property.isWritable && property.type == CMPI_uint32;
    });
    const std::string current = propertyOf(session.get(changed, requested), *number).value();
    session.modify(changed, LocalObject({}, requested, {{number, current}}));
    file.commit({}, true);
}

/** Refuses read-only values that differ from those of an existing record, since all records have the same ones. */
void Transaction::requireReadOnlyValues(const Values& given) const {
    const bool haveReadOnly =
        std::any_of(given.begin(), given.end(), [](const auto& value) { return !value.first->isWritable; });
    const Paths records = haveReadOnly ? session.names(requested) : Paths();
    if (!records.empty()) {
        diff(session.get(localPath(records.front(), requested), requested), given, false);  // fails if one differs
    }
}

}  // namespace gate
