#pragma once

#include <map>
#include <string>
#include <vector>

#include "ProviderModel.h"

// A model of the gate: the effect of each call on the stored data, and its response.

namespace fuzz {

using Records = std::vector<testsupport::ModelRecord>;
using AssetValues = std::map<std::string, std::string>;

/** All stored data, before or after a call. */
struct Snapshot {
    Snapshot();

    const Records& of(const Store& store) const { return &store == &leaseStore() ? leases : warranties; }

    bool operator==(const Snapshot& other) const {
        return leases == other.leases && warranties == other.warranties && asset == other.asset;
    }

    Records leases;
    Records warranties;
    AssetValues asset;  ///< by key of the file; absent values are empty
};

/** Whether a call asks for a property: it has no list of properties, or its list contains the property. */
bool isListed(const Call& call, const std::string& property);

/** The values of a record that a response must have: the identifier, and the listed properties. */
std::vector<std::string> shownRecord(const testsupport::RecordModel& model, const Call& call,
                                     const testsupport::ModelRecord& record);

/**
 * Checks the response to a call and the data after it: a call that returns OK has the effect that CIM defines. Any
 * other call returns a message and changes nothing. A valid call returns the status that CIM defines.
 * @throws Violation
 */
void requireRight(const Call& call, const cimhost::ProviderResponse& response, const Snapshot& before);

/** A read that has no effect. If a change was rolled back, the gate reloads the provider before this read. */
Call harmlessRead();

}  // namespace fuzz
