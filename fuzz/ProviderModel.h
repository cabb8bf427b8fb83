#pragma once

#include "Subject.h"

#include <map>
#include <optional>
#include <string>
#include <vector>

// What the provider must make of calls, written down a second time.

namespace fuzz {

/** The text of a key that the provider takes for one; none where there is no such key or its value is no text. */
std::optional<std::string> keyText(const cimhost::ObjectPath& path, const char* name);

/** @name Values of properties as the provider takes them; none where there is nothing that it takes
 * A text is taken from strings and datetimes, a number from integers that fit.
 */
///@{
std::optional<std::string> givenText(const cimhost::Instance& instance, const char* name);
std::optional<std::string> givenNumber(const cimhost::Instance& instance, const char* name);
std::optional<std::string> givenFlag(const cimhost::Instance& instance, const char* name);
///@}

/** What a call is to be answered with. */
struct Expectation {
    int rc = CMPI_RC_OK;
    int done = 0;
    bool isKnown = true;                            ///< whether the following is told
    std::vector<std::vector<std::string>> shown{};  ///< the instances, or for names the identifiers alone
};

/** The records of a class, in memory and on disk. */
class RecordSide {
public:
    explicit RecordSide(const Store& itsStore) : store(itsStore), model(itsStore.fields()) {}

    /** Does what the call is to do, and tells how it is to be answered. */
    Expectation apply(const Call& call);
    void restart();

    /** @throws Violation unless memory and file are as they are to be */
    void requireAgreement() const;

    std::size_t size() const { return model.records.size(); }

    /** Writes the file as if somebody else did. */
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

/** The asset data, which are only on disk. */
class AssetSide {
public:
    Expectation apply(const Call& call);
    void requireAgreement() const;

private:
    void modify(const cimhost::Instance& instance);
    std::vector<std::string> shown() const;

    bool exists = false;
    std::map<std::string, std::string> values{};  ///< by the file's key
};

}  // namespace fuzz
