#pragma once

#include "support/AgentEnvironment.h"
#include "support/Outcome.h"
#include "support/ProviderLibrary.h"
#include "support/RecordingBroker.h"
#include "support/Values.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace contract {

using agentEnvironment::LogRecord;
using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using testsupport::Outcome;

/** The namespace of all requests, unless a test says otherwise. */
constexpr const char* nameSpace = "root/cimv2";

/** The path of a class in the namespace. */
ObjectPath classPath(const std::string& className);

/** The path of the instance whose only key "InstanceID" is this. */
ObjectPath keyedPath(const std::string& className, const std::string& instanceId);

/** The path of the computer system that the agent of these tests knows, "testhost". */
ObjectPath computerPath(const std::string& name = "testhost");

/** An instance as a client sends it: its path and properties. */
Instance clientInstance(const ObjectPath& path, std::vector<NamedValue> properties);

/** The values of the key "InstanceID" of paths, of the property of that name of instances; "(none)" without one. */
std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> identifiersOf(const std::vector<Instance>& instances);

/** Names and values of an instance's properties or a path's keys, in order, as text: "LeaseTerm=12". */
std::vector<std::string> shown(const std::vector<NamedValue>& values);

/** @name The log
 * Records of the log channel, unless a channel is named.
 */
///@{
std::vector<LogRecord> logOf(const std::string& channel = "log");

/** The texts of all records of level 3000 that stand for failures, in order: those of the form MESSAGE. */
std::vector<std::string> loggedFailures(const std::string& channel = "log");

/** The same, only those that the entry points logged: what the adapters threw. */
std::vector<std::string> caughtFailures();
///@}

/** That a request went well: the status is OK without a message, and it ended with this many calls of returnDone. */
testing::Matcher<const Outcome&> isOk(int doneCount);

/** That a request was answered with a code, nothing in the result, and no message. */
testing::Matcher<const Outcome&> isRefused(CMPIrc rc);

/**
 * The provider library over an agent and a data directory that are new for each test.
 *
 * Neither library nor interfaces are there before a test first asks for provider(): files written before that are
 * what the provider loads. The agent's libraries come and go with it. At the end the library is closed and must be
 * gone from the process.
 */
class ProviderTest : public testing::Test {
protected:
    ProviderTest();
    ~ProviderTest() override;

    /** The loaded provider; its factories are called with the broker's handle at the first request. */
    testsupport::ProviderLibrary& provider();

    /** Closes the library. It must be gone; the next provider() loads it again, and with it the files. */
    void unload();

    /** Whether the library is in the process. */
    static bool isLoaded();

    /** @name Files of the data directory */
    ///@{
    static std::filesystem::path dataFile(const std::string& name);
    static void writeData(const std::string& name, const std::string& content);

    /** The content; none when there is no such file. */
    static std::optional<std::string> readData(const std::string& name);

    /** Puts a folder in the file's place, so that nobody can open it, the superuser included. */
    static void blockData(const std::string& name);

    /** Makes the file's place free. */
    static void freeData(const std::string& name);
    ///@}

    testsupport::RecordingBroker broker;

private:
    std::unique_ptr<testsupport::ProviderLibrary> library;
};

}  // namespace contract
