#pragma once

#include <cmpift.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "Calls.h"
#include "operations/RequestRunner.h"
#include "support/RecordModel.h"

namespace fuzz {

/** The interfaces of the provider or the gate. */
struct Interfaces {
    CMPIInstanceMI* instances;
    CMPIAssociationMI* associations;
};

/** Calls the factories of the provider or the gate. Defined by the fuzzer. */
Interfaces openInterfaces(const CMPIBroker* broker);

/** The content of a file in the data directory; none if it does not exist. */
std::optional<std::string> dataFile(const std::string& name);
void writeDataFile(const std::string& name, const std::string& content);

/** One of the two record stores in memory: its records in use, as records of the model. */
struct Store {
    const char* className;
    const char* fileName;
    const testsupport::ModelFields& (*fields)();
    std::vector<testsupport::ModelRecord> (*records)();
    unsigned int (*count)();
};

const Store& leaseStore();
const Store& warrantyStore();

/** The store of a class, whose name is case-insensitive; null for other classes. */
const Store* storeOf(const std::string& className);

/**
 * The provider or the gate, with a broker. Both are linked into the fuzzer, since the fuzzing engine does not support
 * unloading. A restart only destroys the tables and reads them again.
 */
class SystemUnderTest {
public:
    static constexpr std::size_t kindsOfComputers = 4;

    /**
     * Removes all data.
     * @param computers the response to enumerations of VELKO_ComputerSystem: 0: the agent's computer; 1: none; 2: two,
     * one without a name; 3: an error
     */
    explicit SystemUnderTest(std::size_t computers);

    /** Performs a call with the function tables, or restarts. */
    cimhost::ProviderResponse perform(const Call& call);

    /** Destroys the record tables and reads them again. */
    static void restart();
};

}  // namespace fuzz
