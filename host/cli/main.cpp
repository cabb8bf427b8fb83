#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>

#include "Installation.h"
#include "cli/Commands.h"
#include "schema/Errors.h"
#include "server/Service.h"

// The program cimhost, with the command serve.

namespace cimhost {
namespace {

constexpr auto standardConfiguration = installation::serverConfiguration;

/** Options of the command serve. */
struct ServeOptions {
    bool isChosen = false;
    std::string configuration{};
    std::vector<std::string> listen{};
    std::vector<std::string> listenTls{};
    std::string certificate{};
    std::string key{};
    std::string accessLog{};
    bool noAuthentication = false;
};

std::string hostName() {
    std::array<char, 256> name{};
    return ::gethostname(name.data(), name.size() - 1) == 0 && name[0] != '\0' ? name.data() : "localhost";
}

/** Reads ADDRESS:PORT, [ADDRESS]:PORT, ADDRESS or PORT. */
server::Listener listenerFrom(const std::string& argument, bool tls) {
    server::Listener listener;
    listener.tls = tls;
    listener.port = tls ? 5989 : 5988;
    std::string port = argument;
    const std::size_t bracket = argument.find(']');
    const std::size_t colon = argument.rfind(':');
    if (bracket != std::string::npos && argument.front() == '[') {
        listener.address = argument.substr(1, bracket - 1);
        port = argument.substr(bracket + 1);
    } else if (colon != std::string::npos && argument.find(':') == colon) {
        listener.address = argument.substr(0, colon);
        port = argument.substr(colon);
    } else if (argument.find_first_not_of("0123456789") != std::string::npos) {
        listener.address = argument;
        port.clear();
    }
    port.erase(0, port.find_first_not_of(':'));
    const auto result = std::from_chars(port.data(), port.data() + port.size(), listener.port);
    if (!port.empty() && (result.ec != std::errc{} || result.ptr != port.data() + port.size())) {
        throw UsageError(argument + " is not an address and a port, such as 127.0.0.1:5988");
    }
    return listener;
}

/** Assigns each socket of the service manager to the listener with its address and port, or to a new listener. */
void addActivated(std::vector<server::Listener>& listeners) {
    for (const server::Listener& each : server::activatedListeners()) {
        const auto same = std::find_if(listeners.begin(), listeners.end(), [&](const server::Listener& other) {
            return other.address == each.address && other.port == each.port;
        });
        if (same == listeners.end()) {
            listeners.push_back(each);
        } else {
            same->descriptor = each.descriptor;
        }
    }
}

server::Settings settingsFrom(const ServeOptions& options) {
    server::Settings settings;
    if (!options.configuration.empty()) {
        settings = server::readSettings(options.configuration);
    } else if (::access(standardConfiguration, F_OK) == 0) {
        settings = server::readSettings(standardConfiguration);
    }
    if (!options.listen.empty() || !options.listenTls.empty()) {
        settings.listeners.clear();
    }
    for (const std::string& each : options.listen) {
        settings.listeners.push_back(listenerFrom(each, false));
    }
    for (const std::string& each : options.listenTls) {
        settings.listeners.push_back(listenerFrom(each, true));
    }
    addActivated(settings.listeners);
    if (settings.listeners.empty()) {
        settings.listeners.emplace_back();
    }
    const auto replace = [](std::filesystem::path& target, const std::string& given) {
        target = given.empty() ? target : std::filesystem::path(given);
    };
    replace(settings.certificate, options.certificate);
    replace(settings.key, options.key);
    replace(settings.accessLog, options.accessLog);
    settings.authenticates = !options.noAuthentication;
    return settings;
}

void announce(const std::string& message) {
    std::printf("cimhost: %s\n", message.c_str());
    std::fflush(stdout);
}

/** The command serve, which runs the server. */
class ServeCommand : public CommandExtension {
public:
    void addTo(CLI::App& app) override {
        CLI::App* serve = app.add_subcommand("serve", "Serve clients over HTTP, with CIM-XML, until SIGTERM");
        serve->fallthrough();
        serve->footer("Example:\n\n  cimhost serve --no-authentication\n\nSee cimhost-serve(8).");
        serve->add_option("--configuration", options.configuration, std::string("Default: ") + standardConfiguration)
            ->type_name("FILE");
        serve->add_option("--listen", options.listen, "Address without TLS, default 127.0.0.1:5988 (repeatable)")
            ->type_name("ADDRESS:PORT")
            ->allow_extra_args(false);
        serve->add_option("--listen-tls", options.listenTls, "Address with TLS (repeatable)")
            ->type_name("ADDRESS:PORT")
            ->allow_extra_args(false);
        serve->add_option("--certificate", options.certificate, "Certificate chain in PEM")->type_name("FILE");
        serve->add_option("--key", options.key, "Private key of the certificate in PEM")->type_name("FILE");
        serve->add_option("--access-log", options.accessLog, "File for one line per request; default: standard error")
            ->type_name("FILE");
        serve->add_flag("--no-authentication", options.noAuthentication,
                        "Serve every local user without a password; loopback addresses only");
        serve->callback([this] { options.isChosen = true; });
    }

    bool hasCommand() const override { return options.isChosen; }

    CommandResult run(ObjectManager& manager, const Arguments&, const Schema& schema) override {
        try {
            const server::Settings settings = settingsFrom(options);
            server::blockSignals();
            cimxml::Operations operations(schema, manager.registry(), manager,
                                          {hostName(), installation::version, settings.limits.enumerations});
            server::PamAuthenticator authenticator(settings.pamService);
            if (!settings.authenticates) {
                announce("every user of this machine may read and change everything (--no-authentication)");
            }
            server::serve(settings, operations, authenticator, announce);
        } catch (const server::SettingsError& error) {
            throw LoadError(error.what());
        }
        manager.stop();
        return {};
    }

private:
    ServeOptions options{};
};

}  // namespace
}  // namespace cimhost

/**
 * Options that jemalloc reads. With few arenas (narenas), the server needs half the memory while it serves several
 * clients, since a request reuses memory that other requests have freed. Threads still rarely wait for each other,
 * since each thread caches free memory. lg_extent_max_active_fit lets small objects reuse the memory that a large
 * result has freed. By default, small objects receive new memory, and the system must provide memory for each large
 * result again.
 */
extern "C" [[gnu::visibility("default")]] const char* malloc_conf;
const char* malloc_conf = "narenas:2,lg_extent_max_active_fit:24";

int main(int count, char** values) {
    cimhost::ServeCommand serve;
    return cimhost::runProgram(count, values, serve);
}
