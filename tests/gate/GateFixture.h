#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "support/AgentEnvironment.h"
#include "support/Files.h"
#include "support/Outcome.h"
#include "support/ProviderLibrary.h"
#include "support/RecordingBroker.h"
#include "support/Values.h"

namespace gatetest {

using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using testsupport::named;
using testsupport::Outcome;
using testsupport::text;
using testsupport::uint32;

constexpr const char* nameSpace = "root/cimv2";
constexpr const char* lease = "VELKO_Lease";
constexpr const char* warranty = "VELKO_Warranty";
constexpr const char* asset = "VELKO_AssetIDDetails";
constexpr const char* agent = "VELKO_OstrelAgent";
constexpr const char* leaseSetting = "VELKO_LeaseSetting";
constexpr const char* warrantySetting = "VELKO_WarrantySetting";

/** Node paths of the two computers in the agent's tree: the InstanceIDs of their leases and warranties. */
constexpr const char* firstNode = "/system/computer1";
constexpr const char* secondNode = "/system/computer2";

ObjectPath classPath(const std::string& className);
ObjectPath keyedPath(const std::string& className, const std::string& instanceId);
ObjectPath computerPath(const std::string& name);

/**
 * Returns a property's value: the characters of a string or datetime, otherwise its MOF representation. Returns nullopt
 * if the property is missing or null.
 */
std::optional<std::string> valueIn(const Instance& instance, const std::string& property);

std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> identifiersOf(const std::vector<Instance>& instances);

/** Returns the paths as sorted strings. */
std::vector<std::string> formattedPaths(const std::vector<ObjectPath>& paths);

/** Matches a successful request with this number of results. */
testing::Matcher<const Outcome&> isAnswered(int answers);

/** Matches a successful request without results. */
testing::Matcher<const Outcome&> isDone();

/** Matches a request that failed with this code and a message with these words, without results. */
testing::Matcher<const Outcome&> isRefused(CMPIrc rc, const std::string& words);

/** Returns whether a shared library is loaded. */
bool isLoaded(const std::string& file);

/**
 * The gate's library with the provider and an agent that has two computers, "alpha" and "beta". The broker serves the
 * same two computers. The first call to gate() loads the library, so that the provider reads files written before that
 * call.
 */
class GateTest : public testing::Test {
protected:
    GateTest();
    ~GateTest() override;

    testsupport::ProviderLibrary& gate();

    /** Closes the library. The next call to gate() loads the library again if it was unloaded. */
    void close();

    /** Closes the library. Fails the test if the gate or the provider stays loaded. */
    void unload();

    /** @name Requests for leases, or for the class `of` */
    ///@{
    Outcome create(const std::string& id, std::vector<NamedValue> properties = {}, const std::string& of = lease);
    Outcome modify(const std::string& id, std::vector<NamedValue> properties, const std::string& of = lease);
    Outcome remove(const std::string& id, const std::string& of = lease);
    std::vector<std::string> identifiers(const std::string& of = lease);

    /** Returns the instance with the identifier; fails the test if there is none. */
    Instance instanceOf(const std::string& id, const std::string& of = lease);

    /** Returns the only instance of a class. */
    Instance only(const std::string& className);
    ///@}

    static std::filesystem::path dataFile(const std::string& name);

    testsupport::RecordingBroker broker;

private:
    std::unique_ptr<testsupport::ProviderLibrary> library;
};

/** The agent's configuration permits lossy values during the lifetime of this object. */
class RefusalOff {
public:
    RefusalOff() : before(testsupport::readFile(file())) {
        testsupport::writeFile(file(), before + "\n[gate]\nrefuse_lossy_values = false\n");
    }
    ~RefusalOff() { testsupport::writeFile(file(), before); }
    RefusalOff(const RefusalOff&) = delete;
    RefusalOff& operator=(const RefusalOff&) = delete;

private:
    static std::filesystem::path file() { return agentEnvironment::directory() / "agent.toml"; }

    std::string before;
};

}  // namespace gatetest
