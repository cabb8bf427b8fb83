#pragma once

#include <cmpidt.h>

#include <string>
#include <utility>
#include <vector>

#include "model/Response.h"

namespace testsupport {

/** The response of a provider to one call. */
struct Outcome {
    int rc = CMPI_RC_OK;
    bool hasMessage = false;         ///< whether the status had a message
    std::string message{};           ///< its characters
    bool threw = false;              ///< whether the provider threw an exception; rc is then CMPI_RC_ERR_FAILED
    cimhost::ResultEvents events{};  ///< its results, in order
    int doneCount = 0;               ///< number of calls of returnDone

    std::vector<cimhost::Instance> instances() const { return cimhost::eventsOf<cimhost::Instance>(events); }
    std::vector<cimhost::ObjectPath> paths() const { return cimhost::eventsOf<cimhost::ObjectPath>(events); }
};

inline Outcome outcomeOf(cimhost::ProviderResponse response) {
    const int done = response.doneCount();
    return {response.status.rc, response.hasMessage,        std::move(response.status.message),
            response.threw,     std::move(response.events), done};
}

}  // namespace testsupport
