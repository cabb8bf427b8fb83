#pragma once

#include "ProviderFixture.h"
#include "support/RecordModel.h"

#include <ostream>
#include <string>
#include <vector>

namespace contract {

/** What tells the two classes of records apart, as clients and operators see them. */
struct RecordClass {
    const char* name;
    const char* className;
    const char* dataFile;
    const char* defaultFields;  ///< what follows the identifier of a new record in the file
    std::size_t linesOfRecord;  ///< in the file

    std::vector<std::string> defaultProperties;  ///< of a new record's instance, without InstanceID; as shown() has it
    const char* textProperty;
    const char* numberProperty;
    const char* dateProperty;

    const char* exists;  ///< messages of failures
    const char* notAvailable;
    const char* identify;
    const char* cannotOpen;

    /** The fields of a record in the file, for a model of it. */
    const testsupport::ModelFields& fields() const;

    /** The lines of a new record in the file. */
    std::string newRecord(const std::string& storedIdentifier) const { return storedIdentifier + "\n" + defaultFields; }

    /** What shown() answers for the instance of a record, given those properties that are not as a new record has. */
    std::vector<std::string> shownRecord(const std::string& instanceId,
                                         const std::vector<std::string>& changed = {}) const;
};

extern const RecordClass lease;
extern const RecordClass warranty;

std::ostream& operator<<(std::ostream& stream, const RecordClass& recordClass);

/** Requests for one class of records; a test that is a RecordTest runs for leases and for warranties. */
class RecordTest : public ProviderTest, public testing::WithParamInterface<RecordClass> {
protected:
    const RecordClass& kind() const { return GetParam(); }
    ObjectPath allPath() const { return classPath(kind().className); }
    ObjectPath path(const std::string& instanceId) const { return keyedPath(kind().className, instanceId); }

    /** @name Requests with what a client usually sends */
    ///@{
    Outcome create(const std::string& instanceId);
    Outcome get(const std::string& instanceId);
    Outcome modify(const std::string& instanceId, std::vector<NamedValue> properties);
    Outcome remove(const std::string& instanceId);
    ///@}

    /** Creates records, which must succeed. */
    void createAll(const std::vector<std::string>& instanceIds);

    /** The identifiers of all records, in order, as an enumeration of the names gives them. */
    std::vector<std::string> identifiers();

    /** The properties of a record, as shown() has them; empty when there is none. */
    std::vector<std::string> recordOf(const std::string& instanceId);

    /** Content of the class's data file; none when there is no such file. */
    std::optional<std::string> data() const { return readData(kind().dataFile); }

    /** What the data file holds with these new records in it. */
    std::string dataOfNew(const std::vector<std::string>& storedIdentifiers) const;
};

/** The name of a test for one class of records. */
inline std::string nameOfKind(const testing::TestParamInfo<RecordClass>& tested) {
    return tested.param.name;
}

#define INSTANTIATE_RECORD_TEST(suite) \
    INSTANTIATE_TEST_SUITE_P(Records, suite, testing::Values(lease, warranty), nameOfKind)

}  // namespace contract
