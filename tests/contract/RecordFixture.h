#pragma once

#include <ostream>
#include <string>
#include <vector>

#include "ProviderFixture.h"
#include "support/RecordModel.h"

namespace contract {

/** Differences between the two record classes. */
struct RecordClass {
    const char* name;
    const char* className;
    const char* dataFile;
    const char* defaultFields;  ///< lines of a new record after the identifier
    std::size_t linesOfRecord;  ///< per record of the file

    std::vector<std::string>
        defaultProperties;  ///< properties of a new record except InstanceID, in the format of shown()
    const char* textProperty;
    const char* numberProperty;
    const char* dateProperty;

    const char* exists;  ///< failure messages
    const char* notAvailable;
    const char* identify;
    const char* cannotOpen;

    /** Returns the fields of a record in the file, for the model. */
    const testsupport::ModelFields& fields() const;

    /** Returns the lines of a new record in the file. */
    std::string newRecord(const std::string& storedIdentifier) const { return storedIdentifier + "\n" + defaultFields; }

    /** Returns the properties of a record in the format of shown(), with some values of a new record replaced. */
    std::vector<std::string> shownRecord(const std::string& instanceId,
                                         const std::vector<std::string>& changed = {}) const;
};

extern const RecordClass lease;
extern const RecordClass warranty;

std::ostream& operator<<(std::ostream& stream, const RecordClass& recordClass);

/** Requests for one record class. Each RecordTest runs for leases and for warranties. */
class RecordTest : public ProviderTest, public testing::WithParamInterface<RecordClass> {
protected:
    const RecordClass& kind() const { return GetParam(); }
    ObjectPath allPath() const { return classPath(kind().className); }
    ObjectPath path(const std::string& instanceId) const { return keyedPath(kind().className, instanceId); }

    /** @name Requests with typical arguments */
    ///@{
    Outcome create(const std::string& instanceId);
    Outcome get(const std::string& instanceId);
    Outcome modify(const std::string& instanceId, std::vector<NamedValue> properties);
    Outcome remove(const std::string& instanceId);
    ///@}

    /** Creates records. Fails the test if a request fails. */
    void createAll(const std::vector<std::string>& instanceIds);

    /** Returns the identifiers of all records in the order of EnumerateInstanceNames. */
    std::vector<std::string> identifiers();

    /** Returns the properties of a record in the format of shown(); empty if the record does not exist. */
    std::vector<std::string> recordOf(const std::string& instanceId);

    /** Returns the content of the class's data file; nullopt if the file does not exist. */
    std::optional<std::string> data() const { return readData(kind().dataFile); }

    /** Returns the content of a data file with these new records. */
    std::string dataOfNew(const std::vector<std::string>& storedIdentifiers) const;
};

/** Returns the name of a record class for test names. */
inline std::string nameOfKind(const testing::TestParamInfo<RecordClass>& tested) {
    return tested.param.name;
}

#define INSTANTIATE_RECORD_TEST(suite) \
    INSTANTIATE_TEST_SUITE_P(Records, suite, testing::Values(lease, warranty), nameOfKind)

}  // namespace contract
