#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "support/AgentEnvironment.h"
#include "support/Outcome.h"
#include "support/ProviderLibrary.h"
#include "support/RecordingBroker.h"
#include "support/Values.h"

namespace contract {

using agentEnvironment::LogRecord;
using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using testsupport::Outcome;

/** The default namespace of requests. */
constexpr const char* nameSpace = "root/cimv2";

/** Returns the path of a class. */
ObjectPath classPath(const std::string& className);

/** Returns the path of the instance with this "InstanceID" as its only key. */
ObjectPath keyedPath(const std::string& className, const std::string& instanceId);

/** Returns the path of a computer system, by default the one of the test agent. */
ObjectPath computerPath(const std::string& name = "testhost");

/** Returns an instance that a client sends. */
Instance clientInstance(const ObjectPath& path, std::vector<NamedValue> properties);

/** Return the key or property "InstanceID" of paths or instances; "(none)" if there is none. */
std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> identifiersOf(const std::vector<Instance>& instances);

/** Returns properties or keys in order as strings such as "LeaseTerm=12". */
std::vector<std::string> shown(const std::vector<NamedValue>& values);

/** @name The log
 * Records of a channel, by default the log channel.
 */
///@{
std::vector<LogRecord> logOf(const std::string& channel = "log");

/** Returns the messages of all MESSAGE records at level 3000, which report failures, in order. */
std::vector<std::string> loggedFailures(const std::string& channel = "log");

/** Returns the messages of failures that the entry points logged: exceptions that they caught. */
std::vector<std::string> caughtFailures();
///@}

/** Matches a successful request: status OK without a message, and this number of calls to returnDone. */
testing::Matcher<const Outcome&> isOk(int doneCount);

/** Matches a request with this status code, no results and no message. */
testing::Matcher<const Outcome&> isRefused(CMPIrc rc);

/**
 * The provider library with a new agent and a new data directory for each test.
 *
 * The first call to provider() loads the library, so that the provider loads the files that the test wrote before. The
 * agent's libraries are loaded and unloaded together with the provider library. At the end, the fixture unloads the
 * library and expects that it is no longer loaded.
 */
class ProviderTest : public testing::Test {
protected:
    ProviderTest();
    ~ProviderTest() override;

    /** Returns the loaded provider. Calls its factories with the broker at the first request. */
    testsupport::ProviderLibrary& provider();

    /**
     * Unloads the library and expects that it is no longer loaded. The next call to provider() loads the library and
     * its files again.
     */
    void unload();

    /** Returns whether the library is loaded. */
    static bool isLoaded();

    /** @name Files of the data directory */
    ///@{
    static std::filesystem::path dataFile(const std::string& name);
    static void writeData(const std::string& name, const std::string& content);

    /** Returns the content of a file; nullopt if the file does not exist. */
    static std::optional<std::string> readData(const std::string& name);

    /** Replaces the file with a directory, so that even the superuser cannot open the file. */
    static void blockData(const std::string& name);

    /** Removes the file or directory at the file's path. */
    static void freeData(const std::string& name);
    ///@}

    testsupport::RecordingBroker broker;

private:
    std::unique_ptr<testsupport::ProviderLibrary> library;
};

}  // namespace contract
