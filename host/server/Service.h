#pragma once

#include <functional>
#include <string>
#include <vector>

#include "cimxml/Operations.h"
#include "server/Authentication.h"
#include "server/Settings.h"

namespace cimhost::server {

/** Blocks the signals that serve() waits for. Call before starting any thread. */
void blockSignals();

/** The sockets that the service manager has opened; those whose names start with "tls" use TLS. */
std::vector<Listener> activatedListeners();

/**
 * Serves requests until SIGTERM or SIGINT. On SIGHUP, reads the certificates again and reopens the access log. Reports
 * its state to the service manager. Ends the process if operations still run after the stop time.
 * @param announce receives a line for each address
 * @throws SettingsError
 */
void serve(const Settings& settings, cimxml::Operations& operations, Authenticator& authenticator,
           const std::function<void(const std::string&)>& announce);

}  // namespace cimhost::server
