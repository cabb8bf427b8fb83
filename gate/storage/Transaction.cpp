#include "Transaction.h"

#include <algorithm>
#include <exception>
#include <iterator>

namespace gate {

namespace {

constexpr const char* identifierKey = "InstanceID";

/** The identifier of a record; empty for another instance. */
std::string recordIdentifier(const LocalObjectPath& path, const Class& owner) {
    const Property* key = findProperty(owner, identifierKey);
    return key == nullptr ? std::string() : keyOf(path.handle(), *key).value_or(std::string());
}

/** The most bytes that values take in a file. */
std::size_t sizeOf(const Values& values) {
    std::size_t size = 0;
    for (const auto& value : values) {
        size += value.second.size() + 1;
    }
    return size;
}

/** Whether the rollback has restored the file. The client receives the change's failure, not the rollback's. */
template <class RollBack>
bool succeeds(RollBack rollBack) {
    try {
        return rollBack();
    } catch (...) {
        return false;
    }
}

}  // namespace

Transaction::Transaction(ProviderSession& itsSession, const Class& itsClass, const DataFile& itsFile,
                         const LocalObjectPath& itsPath)
    : session(itsSession),
      owner(itsClass),
      file(itsFile),
      path(itsPath),
      identifier(recordIdentifier(itsPath, itsClass)) {}

/**
 * Runs a change and its checks, after which it is committed. If one of them fails, rolls the change back and passes
 * the failure on, with a note if the file could not be restored.
 * @param rollBack returns whether the file is as before
 */
template <class Change, class RollBack>
void Transaction::runOrRollBack(Change change, RollBack rollBack) const {
    try {
        change();
    } catch (Failure& failure) {
        if (!succeeds(rollBack)) {
            failure.message += damageNote();
        }
        throw;
    } catch (const std::exception& exception) {
        if (succeeds(rollBack)) {
            throw;
        }
        fail(CMPI_RC_ERR_FAILED, std::string("The request failed: ") + exception.what() + "." + damageNote());
    } catch (...) {
        succeeds(rollBack);
        throw;
    }
}

std::string Transaction::damageNote() const {
    return std::string(" ") + file.fileName +
           (file.hasRecords() ? " stays damaged until the next change succeeds."
                              : " may differ from what it was before.");
}

void Transaction::create(const Values& given, const std::function<void()>& returnPath) {
    requireRoundTrip(file, *findProperty(owner, identifierKey), identifier);
    requireRoundTrip(file, given);
    requireReadOnlyValues(given);
    file.requireWritable(identifier.size() + 1 + sizeOf(given));
    const std::optional<std::size_t> before = file.countRecordsIfComplete(identifier);
    const auto change = [&] {
        session.create(path);
        const CMPIInstance* current = session.get(path, owner);
        const Values changes = diff(current, given, false);
        const FileState created = file.state();
        requireRecord(created);
        if (!changes.empty()) {
            apply(current, changes, created);
        }
        returnPath();
    };
    runOrRollBack(change, [&] {
        session.remove(path);
        return hasCount(before);
    });
}

void Transaction::modify(const CMPIInstance* current, const Values& changes) {
    requireRoundTrip(file, changes);
    file.requireWritable(sizeOf(changes));
    const FileState before = file.state();
    const Values restored = rollbackValues(owner, file, changes, current);
    const Values rollback = valuesToSend(owner, current, restored);
    runOrRollBack([&] { apply(current, changes, before); },
                  [&] {
                      const FileState failed = file.state();
                      session.modify(path, rollback);
                      return file.hasRecords() ? isRolledBack(before, failed)
                                               : equalOn(restored, current, session.get(path, owner));
                  });
}

void Transaction::remove(const CMPIInstance* current) {
    const Values restored = valuesOf(current, owner, [](const Property&) { return true; });
    file.requireWritable(0);
    const std::optional<std::size_t> before = file.countRecordsIfComplete(identifier);
    const auto change = [&] {
        session.remove(path);
        const std::size_t after = file.countRecords(file.state().content, identifier);
        if (after != 0 && after >= before.value_or(0)) {
            fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " still holds " + identifier + ".");
        }
    };
    runOrRollBack(change, [&] {
        const bool exists = session.find(path, owner) != nullptr || recreate(restored);
        return exists && hasCount(before);
    });
}

/** Makes the changes. Fails unless they are stored. */
void Transaction::apply(const CMPIInstance* current, const Values& changes, const FileState& before) {
    session.modify(path, valuesToSend(owner, current, changes));
    requireChanged(owner, file, current, session.get(path, owner), changes);
    const FileState after = file.state();
    requireRecord(after);
    if (file.hasRecords() && after == before && altersFile(file, current, changes)) {
        fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " was not written.");
    }
}

/** Creates a deleted record again. Returns whether its values have been written. */
bool Transaction::recreate(const Values& values) {
    try {
        session.create(path);
    } catch (const Failure&) {
        // The record may exist: the last step that can fail is the answer.
    }
    const CMPIInstance* created = session.get(path, owner);
    const FileState before = file.state();
    const bool isAltered = altersFile(file, created, values);
    session.modify(path, values);
    return !isAltered || !(file.state() == before);
}

void Transaction::requireRecord(const FileState& state) const {
    if (file.hasRecords() && file.countRecords(state.content, identifier) == 0) {
        fail(CMPI_RC_ERR_FAILED, std::string(file.fileName) + " does not hold " + identifier + ".");
    }
}

/** Refuses other read-only values than an existing record has, since all records have the same. */
void Transaction::requireReadOnlyValues(const Values& given) const {
    Values readOnly;
    std::copy_if(given.begin(), given.end(), std::back_inserter(readOnly),
                 [](const auto& value) { return !value.first->isWritable; });
    if (readOnly.empty()) {
        return;
    }
    const ProviderSession::Paths paths = session.names(LocalObjectPath(nameSpaceOf(path.handle()), owner));
    if (!paths.empty()) {
        diff(session.get(localPath(paths.front(), owner), owner), readOnly, false);
    }
}

/** Whether the file is complete and has as many records with the identifier as before, if that is known. */
bool Transaction::hasCount(std::optional<std::size_t> before) const {
    const std::optional<std::size_t> now = file.countRecordsIfComplete(identifier);
    return now && now == before.value_or(*now);
}

/**
 * Whether the file is complete and without a change that failed.
 * @param before its state before the change
 * @param failed its state before the rollback
 */
bool Transaction::isRolledBack(const FileState& before, const FileState& failed) const {
    const FileState now = file.state();
    return file.isComplete(now.content) && (now.content == before.content || !(now == failed));
}

}  // namespace gate
