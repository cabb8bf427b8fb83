#pragma once

#include "support/AgentEnvironment.h"
#include "support/Files.h"
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
#include <utility>
#include <vector>

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

/** The places of the two computers in the agent's tree: identifiers of what belongs to them. */
constexpr const char* firstPlace = "/system/computer1";
constexpr const char* secondPlace = "/system/computer2";

ObjectPath classPath(const std::string& className);
ObjectPath keyedPath(const std::string& className, const std::string& instanceId);
ObjectPath computerPath(const std::string& name);

/** The value of a property as text: of a string or datetime its characters, else as MOF writes it. None if null. */
std::optional<std::string> valueIn(const Instance& instance, const std::string& property);

std::vector<std::string> identifiersOf(const std::vector<ObjectPath>& paths);
std::vector<std::string> identifiersOf(const std::vector<Instance>& instances);

/** The paths as texts, in an order of their own. */
std::vector<std::string> shownPaths(const std::vector<ObjectPath>& paths);

/** That a request went well, with this many answers. */
testing::Matcher<const Outcome&> isAnswered(int answers);

/** That a change that answers nothing went well. */
testing::Matcher<const Outcome&> isDone();

/** That a request was refused with a code and a message that has these words, and nothing was answered. */
testing::Matcher<const Outcome&> isRefused(CMPIrc rc, const std::string& words);

/** Whether a shared library is in the process. */
bool isLoaded(const std::string& file);

/**
 * The gate's library over the provider and an agent that knows two computers, "alpha" and "beta"; the broker serves
 * both. The library is loaded at the first need, so files written before are what the provider loads.
 */
class GateTest : public testing::Test {
protected:
    GateTest();
    ~GateTest() override;

    testsupport::ProviderLibrary& gate();

    /** Closes the library; the next gate() loads it again if it went. */
    void close();

    /** The same; that it and the provider do not go is a failure of the test. */
    void unload();

    /** @name Requests for a lease, unless a class is named */
    ///@{
    Outcome create(const std::string& id, std::vector<NamedValue> properties = {}, const std::string& of = lease);
    Outcome modify(const std::string& id, std::vector<NamedValue> properties, const std::string& of = lease);
    Outcome remove(const std::string& id, const std::string& of = lease);
    std::vector<std::string> identifiers(const std::string& of = lease);

    /** The one instance of that identifier; a failure of the test without it. */
    Instance got(const std::string& id, const std::string& of = lease);

    /** The only instance of a class. */
    Instance only(const std::string& className);
    ///@}

    static std::filesystem::path dataFile(const std::string& name);

    testsupport::RecordingBroker broker;

private:
    std::unique_ptr<testsupport::ProviderLibrary> library;
};

/** Turns the refusal off in the agent's configuration while it lives. */
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
