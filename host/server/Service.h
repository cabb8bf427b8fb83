#pragma once

#include <functional>
#include <string>
#include <vector>

#include "cimxml/Operations.h"
#include "server/Authentication.h"
#include "server/Settings.h"

namespace cimhost::server {

/** Blocks the signals that serve() waits for. To be called before any thread is started. */
void blockSignals();

/** The sockets that the service manager has opened; those whose names start with "tls" use TLS. */
std::vector<Listener> activatedListeners();

/**
 * Serves requests until SIGTERM or SIGINT. SIGHUP reads the certificates again and reopens the access log. Reports its
 * state to the service manager. Operations that still run when the time to stop is over end with the process.
 * @param announce receives a line for each address
 * @throws SettingsError
 */
void serve(const Settings& settings, cimxml::Operations& operations, Authenticator& authenticator,
           const std::function<void(const std::string&)>& announce);

}  // namespace cimhost::server
