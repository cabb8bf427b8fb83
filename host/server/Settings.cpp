#include "server/Settings.h"

#include <arpa/inet.h>

#include <algorithm>
#include <limits>

#include "configuration/Document.h"

namespace cimhost::server {
namespace {

using Agent::TableReader;

/** A problem without the part after its last semicolon, which says what the agent does. Here, a problem is an error. */
std::string causeOf(const std::string& problem) {
    return problem.substr(0, problem.rfind("; "));
}

/** Each connection has a thread and a file; the unit of the service permits that many. */
constexpr std::int64_t mostConnections = 20'000;

void readNumber(TableReader& table, const char* key, std::size_t& target, std::int64_t most) {
    target = static_cast<std::size_t>(table.number(key, 1, most).value_or(static_cast<std::int64_t>(target)));
}

void readSeconds(TableReader& table, const char* key, std::chrono::seconds& target) {
    constexpr std::int64_t day = 86'400;
    target = std::chrono::seconds(table.number(key, 1, day).value_or(target.count()));
}

void readLimits(TableReader table, Limits& limits) {
    readNumber(table, "connections", limits.connections, mostConnections);
    readNumber(table, "connections_per_address", limits.connectionsPerAddress, mostConnections);
    readNumber(table, "running_lists", limits.runningLists, 10'000);
    readNumber(table, "running_requests", limits.runningRequests, 10'000);
    readNumber(table, "response_results", limits.responseResults, 1'000'000'000);
    readNumber(table, "request_bytes", limits.requestBytes, std::int64_t{1} << 30U);
    limits.headBytes = static_cast<std::size_t>(
        table.number("head_bytes", 4096, 1'048'576).value_or(static_cast<std::int64_t>(limits.headBytes)));
    readNumber(table, "xml_depth", limits.xmlDepth, 200);
    readNumber(table, "xml_elements", limits.xmlElements, 10'000'000);
    readNumber(table, "open_enumerations", limits.enumerations.open, 1'000'000);
    readNumber(table, "enumeration_results", limits.enumerations.results, 1'000'000'000);
    limits.enumerations.mostObjects = static_cast<std::uint32_t>(
        table.number("pull_objects", 1, 1'000'000'000).value_or(limits.enumerations.mostObjects));
    readSeconds(table, "enumeration_default_seconds", limits.enumerations.timeout);
    readSeconds(table, "queue_seconds", limits.queueTime);
    readSeconds(table, "head_seconds", limits.headTime);
    readSeconds(table, "body_seconds", limits.bodyTime);
    readSeconds(table, "response_seconds", limits.responseTime);
    readSeconds(table, "idle_seconds", limits.idleTime);
    readSeconds(table, "stop_seconds", limits.stopTime);
    readSeconds(table, "enumeration_seconds", limits.enumerations.longestTimeout);
    constexpr std::int64_t longestDelay = 60'000;
    limits.failureDelay = std::chrono::milliseconds(
        table.number("failure_milliseconds", 0, longestDelay).value_or(limits.failureDelay.count()));
    table.rejectUnknownKeys();
}

Listener readListener(TableReader table) {
    Listener listener;
    listener.address = table.nonEmptyString("address").value_or(listener.address);
    listener.tls = table.flag("tls").value_or(false);
    const std::int64_t standardPort = listener.tls ? 5989 : 5988;
    listener.port = static_cast<std::uint16_t>(
        table.number("port", 0, std::numeric_limits<std::uint16_t>::max()).value_or(standardPort));
    table.rejectUnknownKeys();
    return listener;
}

Settings readRoot(TableReader root) {
    Settings settings;
    for (TableReader& each : root.tables("listen")) {
        settings.listeners.push_back(readListener(each));
    }
    TableReader tls = root.table("tls");
    settings.certificate = tls.nonEmptyString("certificate").value_or("");
    settings.key = tls.nonEmptyString("key").value_or("");
    tls.rejectUnknownKeys();
    TableReader access = root.table("access");
    settings.access.readers = access.strings("readers").value_or(settings.access.readers);
    settings.access.writers = access.strings("writers").value_or(settings.access.writers);
    access.rejectUnknownKeys();
    settings.accessLog = root.nonEmptyString("access_log").value_or("");
    readLimits(root.table("limits"), settings.limits);
    root.rejectUnknownKeys();
    return settings;
}

}  // namespace

bool Listener::isLoopback() const {
    in_addr four{};
    in6_addr six{};
    if (::inet_pton(AF_INET, address.c_str(), &four) == 1) {
        return (ntohl(four.s_addr) >> 24U) == 127;
    }
    return ::inet_pton(AF_INET6, address.c_str(), &six) == 1 && IN6_IS_ADDR_LOOPBACK(&six);
}

std::string Listener::url() const {
    const bool isSix = address.find(':') != std::string::npos;
    return std::string(tls ? "https" : "http") + "://" + (isSix ? "[" + address + "]" : address) + ":" +
           std::to_string(port);
}

Settings readSettings(const std::filesystem::path& file) {
    if (!std::filesystem::exists(file)) {
        throw SettingsError(file.string() + ": this file does not exist");
    }
    const Agent::Document document = Agent::Document::read(file.string());
    if (!document.problem().empty()) {
        throw SettingsError(causeOf(document.problem()));
    }
    Agent::Problems problems;
    Settings settings = readRoot(document.root(problems));
    if (!problems.empty()) {
        throw SettingsError(file.string() + ": " + causeOf(problems.front()));
    }
    return settings;
}

void checkSettings(const Settings& settings) {
    for (const Listener& each : settings.listeners) {
        if (!each.isLoopback() && !settings.authenticates) {
            throw SettingsError(each.url() + ": requests are served without authentication on loopback addresses only");
        }
        if (!each.isLoopback() && !each.tls) {
            throw SettingsError(each.url() + ": passwords need TLS on an address that is not loopback");
        }
        if (each.tls && (settings.certificate.empty() || settings.key.empty())) {
            throw SettingsError(each.url() + ": TLS needs a certificate and its key");
        }
    }
}

}  // namespace cimhost::server
