#pragma once

#include <cmpidt.h>

#include <string>
#include <utility>
#include <vector>

#include "model/Response.h"

namespace testsupport {

/** Everything that a provider did in answer to one call. */
struct Outcome {
    int rc = CMPI_RC_OK;
    bool hasMessage = false;         ///< whether the status' message pointer was not null
    std::string message{};           ///< its text
    bool threw = false;              ///< an exception left the provider; rc is then CMPI_RC_ERR_FAILED
    cimhost::ResultEvents events{};  ///< what it returned, in order
    int doneCount = 0;               ///< how often it called returnDone

    std::vector<cimhost::Instance> instances() const { return cimhost::eventsOf<cimhost::Instance>(events); }
    std::vector<cimhost::ObjectPath> paths() const { return cimhost::eventsOf<cimhost::ObjectPath>(events); }
};

inline Outcome outcomeOf(cimhost::ProviderResponse response) {
    const int done = response.doneCount();
    return {response.status.rc, response.hasMessage,        std::move(response.status.message),
            response.threw,     std::move(response.events), done};
}

}  // namespace testsupport
