#include <limits>
#include <string>

#include "Target.h"
#include "framework/AgentState.h"
#include "logging/LogSettings.h"

// The agent's configuration file: parsing does not throw, and all settings, configured or default, are in their ranges.

namespace {

using fuzz::require;
using RZLog::LogSettings;

void requireDirectory(const std::string& path) {
    require(path.front() == '/' && path.back() == '/', "a directory is absolute and ends with a separator");
    require(path.find('\0') == std::string::npos, "a directory is a path");
}

void requireRanges(const KO::AgentSettings& settings) {
    requireDirectory(settings.installDirectory);
    requireDirectory(settings.dataDirectory);
    requireDirectory(settings.dmiRoot);
    const auto& product = settings.product;
    for (const std::string* value :
         {&product.name, &product.version, &product.buildNumber, &product.identifyingNumber, &product.vendor}) {
        require(!value->empty(), "the product has all its values");
    }
    for (const KO::Node& node : settings.nodes) {
        require(node.type <= 0xFFFF && !node.path.empty(), "a node has a type and a path");
        for (const auto& [number, value] : node.properties) {
            require(number <= 0xFFFF, "a property has a number");
        }
    }
    for (const auto& [name, flag] : settings.flags) {
        require(name == "gate.refuse_lossy_values", "a switch is a known one");
    }
}

void requireRanges(const LogSettings& settings) {
    const bool isFile = settings.destination == LogSettings::Destination::file;
    require(isFile != settings.file.empty(), "a log has a path if it is a file");
    require(!isFile || (settings.file.front() == '/' && settings.file.find('\0') == std::string::npos),
            "a log file's path is absolute");
    require(settings.rotationSize >= 4096 && settings.rotationSize <= std::numeric_limits<int>::max(),
            "rotation size is in its range");
    require(settings.rotationCount >= 1 && settings.rotationCount <= 1000, "rotation count is in its range");
    for (const auto channel : {RZLog::Channel::log, RZLog::Channel::trace}) {
        for (const char* logger : {"", "Tarvik.LeaseAndWarrantyProvider", "Ostrel.Agent"}) {
            require(settings.levels.admit(channel, logger, 0), "a level is not negative");
        }
    }
}

/** The settings and problems of a configuration. */
struct Reading {
    explicit Reading(std::string_view content)
        : document(Agent::Document::parse(content, "agent.toml")),
          agent(KO::readAgentSettings(document, problems)),
          log(RZLog::readLogSettings(document, problems)) {}

    Agent::Problems problems{};
    Agent::Document document;
    KO::AgentSettings agent;
    LogSettings log;
};

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Reading reading(fuzz::inputOf(data, size));
    requireRanges(reading.agent);
    requireRanges(reading.log);
    for (const std::string& problem : reading.problems) {
        require(!problem.empty(), "a problem has a message");
    }
    if (!reading.document.problem().empty()) {
        const Reading defaults("");
        require(reading.problems.empty(), "a file that cannot be parsed has one problem");
        require(reading.agent.nodes.empty() && reading.agent.dataDirectory == defaults.agent.dataDirectory &&
                    reading.agent.product.name == defaults.agent.product.name && reading.log.file.empty(),
                "a file that cannot be parsed changes nothing");
    }
    return 0;
}
