#pragma once

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "SystemUnderTest.h"

// A model of the provider: the response to each call, and the stored data after it.

namespace fuzz {

/** The value of a key as the provider reads it; none if there is no such key or it is not a string. */
std::optional<std::string> keyString(const cimhost::ObjectPath& path, const char* name);

/** @name Values of properties as the provider reads them; none if it ignores them
 * The provider reads strings from strings and datetimes, and numbers from integers in the range of uint32.
 */
///@{
std::optional<std::string> givenString(const cimhost::Instance& instance, const char* name);
std::optional<std::string> givenNumber(const cimhost::Instance& instance, const char* name);
std::optional<std::string> givenFlag(const cimhost::Instance& instance, const char* name);
///@}

/** The response that a call must have. */
struct Expectation {
    int rc = CMPI_RC_OK;
    int done = 0;
    bool isKnown = true;                            ///< whether done and shown are known
    std::vector<std::vector<std::string>> shown{};  ///< the instances; of paths, only the identifiers
};

/** The expected records of a class, in memory and in the file. */
class ExpectedRecords {
public:
    explicit ExpectedRecords(const Store& itsStore) : store(itsStore), model(itsStore.fields()) {}

    /** Applies a call and returns the response that it must have. */
    Expectation apply(const Call& call);
    void restart();

    /** @throws Violation if the records in memory or in the file are not the expected ones */
    void requireAgreement() const;

    std::size_t size() const { return model.records.size(); }

    /** Writes the file as another program would. */
    void replaceFile(const std::string& content);

private:
    std::vector<testsupport::ModelRecord*> selected(const cimhost::ObjectPath& path);
    Expectation read(const Call& call);
    Expectation create(const Call& call);
    Expectation modify(const Call& call);
    Expectation remove(const Call& call);
    bool change(testsupport::ModelRecord& record, const cimhost::Instance& instance) const;
    void write();

    const Store& store;
    testsupport::RecordModel model;
    std::optional<std::string> file{};
};

/** The expected asset data, which are only in the file. */
class ExpectedAsset {
public:
    Expectation apply(const Call& call);
    void requireAgreement() const;

private:
    void modify(const cimhost::Instance& instance);
    std::vector<std::string> shown() const;

    bool exists = false;
    std::map<std::string, std::string> values{};  ///< by key of the file
};

}  // namespace fuzz
