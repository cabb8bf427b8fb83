#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

#include "cimxml/OpenEnumerations.h"

namespace cimhost::server {

/** An address to listen on. */
struct Listener {
    std::string address = "127.0.0.1";
    std::uint16_t port = 5988;  ///< 0: any free port
    bool tls = false;
    int descriptor = -1;  ///< a listening socket from the service manager instead of address and port; -1: none

    bool isLoopback() const;
    std::string url() const;
};

/** Users and groups with a right; a group has @ before its name. */
struct AccessRules {
    std::vector<std::string> readers{};
    std::vector<std::string> writers{"root"};
};

struct Limits {
    std::size_t connections = 256;
    std::size_t connectionsPerAddress = 192;         ///< connections of one network, see networkOf()
    std::size_t runningLists = 4;                    ///< requests that return lists
    std::size_t runningRequests = 1;                 ///< other requests
    std::chrono::seconds queueTime{30};              ///< longest time that a request waits for others
    std::size_t responseResults = 200'000;           ///< results in responses that clients have not completely received
    std::size_t headBytes = std::size_t{64} << 10U;  ///< of a request head; also the largest block that is sent at once
    std::size_t requestBytes = std::size_t{4} << 20U;
    std::size_t xmlDepth = 64;
    std::size_t xmlElements = 50'000;
    std::chrono::seconds headTime{10};             ///< from the first byte of a request to the end of its head
    std::chrono::seconds bodyTime{30};             ///< for the body of a request
    std::chrono::seconds responseTime{300};        ///< until the client has received the response
    std::chrono::seconds idleTime{600};            ///< of a connection without a request
    std::chrono::seconds stopTime{30};             ///< for running requests when the server stops
    std::chrono::milliseconds failureDelay{2000};  ///< after a failed authentication
    cimxml::EnumerationLimits enumerations{};
};

/** Configuration of the server. */
struct Settings {
    std::vector<Listener> listeners{};
    std::filesystem::path certificate{};
    std::filesystem::path key{};
    bool authenticates = true;
    AccessRules access{};
    std::string pamService = "cimhost";
    std::filesystem::path accessLog{};  ///< empty: standard error
    Limits limits{};
};

/** Reports settings that cannot be used. */
class SettingsError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/**
 * Reads a configuration file.
 * @throws SettingsError if the file is absent, is not TOML, or has an unknown key or a wrong value
 */
Settings readSettings(const std::filesystem::path& file);

/** @throws SettingsError if the network could read passwords or use the server without one, or TLS has no files */
void checkSettings(const Settings& settings);

}  // namespace cimhost::server
