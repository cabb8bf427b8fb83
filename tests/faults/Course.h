#pragma once

#include "Scene.h"

// What a request brings about when nothing fails, and what of it may be seen when something does.

namespace faults {

struct Course {
    Done done;
    testsupport::Outcome withoutAsset;   ///< asset data: what is answered while asset.dat cannot be read (docs/classes)
    testsupport::Outcome withoutSystem;  ///< what is, when the instrumentation does not tell of the system either
    std::string file;                    ///< that the request changes; Lease.dat for one that only reads
    Lines before;                        ///< instances of the class whose file it is
    Lines after;
    std::string fileBefore;
    std::string fileAfter;
};

/** Makes the request anew, before, with and after which nothing fails. */
Course undisturbed(Scene& scene, const Request& request);

/**
 * Of what is answered when nothing fails, or when asset.dat cannot be read, this has some, in the same order: some of
 * the instances or paths, of these some of the values, or null in their place. For lack of memory, also the system may
 * be unknown.
 */
void expectPartOfAnswer(const Course& course, const testsupport::Outcome& outcome, bool lacksMemory = false);

/** Of the values given, the first ones are those of after, and the others those of before. */
void expectSetInOrder(const Course& course, const Request& request, const Lines& now);

/** Whether a failure of the provider itself keeps a modification from reading asset.dat, and lets it write the file. */
bool hindersReading(const Fault& fault);

/** Whether a failure may keep a modification from reading asset.dat, and yet let it write the file. */
bool mayHinderReading(const Fault& fault);

/**
 * What a modification writes to asset.dat that could read only so many of its fields: what it was not given is empty
 * from there on. A file that could not be read at all gives none.
 */
std::string assetWithFields(const Course& course, std::size_t readFields);

/** asset.dat is as before, as after or, if the failure may have hindered its reading, as assetWithFields() says. */
void expectAssetFile(const Course& course, const Fault& fault, const std::string& content);

}  // namespace faults
