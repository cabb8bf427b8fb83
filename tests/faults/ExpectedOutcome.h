#pragma once

#include "TestEnvironment.h"

// The result of a request without faults, and checks of the result of a request with a fault.

namespace faults {

struct ExpectedOutcome {
    ObservedResponse response;
    testsupport::Outcome withoutAsset;   ///< for asset data: the outcome if asset.dat cannot be read (docs/classes)
    testsupport::Outcome withoutSystem;  ///< likewise, if the instrumentation has no system node either
    std::string file;                    ///< the file that the request changes; Lease.dat if the request only reads
    Lines before;                        ///< instances of the file's class before the request
    Lines after;
    std::string fileBefore;
    std::string fileAfter;
};

/** Makes the request without faults, after a restart. */
ExpectedOutcome runWithoutFaults(TestEnvironment& environment, const RequestCase& request);

/**
 * Expects a part of the results of the request without faults, or with an unreadable asset.dat: a subsequence of the
 * instances or paths, with some of their values or with null values. If memory is short, also accepts the results
 * without a system node.
 */
void expectPartOfAnswer(const ExpectedOutcome& expected, const testsupport::Outcome& outcome, bool lacksMemory = false);

/** Expects that the request set its first N properties and left the others unchanged. */
void expectSetInOrder(const ExpectedOutcome& expected, const RequestCase& request, const Lines& now);

/** Returns whether a fault prevents the provider from reading asset.dat in a modification, but not from writing it. */
bool preventsReading(const Fault& fault);

/**
 * Returns the content of asset.dat after a modification that could read only the first `readFields` fields: the
 * remaining fields that the request does not set are empty. `readFields` is 0 if the file could not be read.
 */
std::string assetWithFields(const ExpectedOutcome& expected, std::size_t readFields);

/**
 * Expects that asset.dat has its content from before or after the request. If the fault may have prevented reading it,
 * also accepts the contents that assetWithFields() returns.
 */
void expectAssetFile(const ExpectedOutcome& expected, const Fault& fault, const std::string& content);

}  // namespace faults
