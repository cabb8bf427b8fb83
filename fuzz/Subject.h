#pragma once

#include "Calls.h"

#include "operations/RequestRunner.h"
#include "support/RecordModel.h"

#include <cmpift.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace fuzz {

/** The interfaces of what is tried: the provider's own, or those of the gate before it. */
struct Interfaces {
    CMPIInstanceMI* instances;
    CMPIAssociationMI* associations;
};

/** The factories of what is tried, defined by the fuzzer. */
Interfaces openInterfaces(const CMPIBroker* broker);

/** The content of a file of the data directory; none when there is no such file. */
std::optional<std::string> dataFile(const std::string& name);
void writeDataFile(const std::string& name, const std::string& content);

/** One of the two record stores, as it is in memory: its records in use, in the model's form. */
struct Store {
    const char* className;
    const char* fileName;
    const testsupport::ModelFields& (*fields)();
    std::vector<testsupport::ModelRecord> (*records)();
    unsigned int (*count)();
};

const Store& leaseStore();
const Store& warrantyStore();

/** The store of a class, in any letter case; null for another class. */
const Store* storeOf(const std::string& className);

/**
 * What is tried, in an object manager of its own. The library is linked into the fuzzer, since the fuzzing engine could
 * not follow one that comes and goes; its tables go and come as if it did.
 */
class Subject {
public:
    /** Begins without data. @param computers how the manager answers for VELKO_ComputerSystem, see there */
    explicit Subject(std::size_t computers);

    /** Calls a function of the tables; nullptr is passed where the call has nothing. */
    cimhost::ProviderResponse make(const Call& call);

    /** Lets the tables go and reads them again. */
    static void restart();
};

}  // namespace fuzz
