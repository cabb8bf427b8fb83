#pragma once

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "model/ResultEvent.h"
#include "model/Status.h"
#include "model/Value.h"

namespace cimhost {

/** The status and the results that one provider returned for a request. */
struct ProviderResponse {
    Status status{};            ///< as the provider returned it; CMPI_RC_ERR_FAILED if it threw an exception
    bool hasMessage = false;    ///< whether the status had a message, even an empty one
    bool threw = false;         ///< whether the provider threw an exception
    bool releasedPath = false;  ///< whether the provider released a path that the result keeps
    ResultEvents events{};      ///< the results, in order, including those before a failure
    std::string crashReason{};  ///< a sentence if the provider's process would have crashed, otherwise empty

    int doneCount() const { return cimhost::doneCount(events); }
};

/** The response that a client receives, and those of the providers that were called for it. */
struct Response {
    Status status{};                            ///< OK, or another code with a message and without results
    std::vector<Instance> instances{};          ///< results that are instances; one for getInstance
    std::vector<ObjectPath> paths{};            ///< results that are paths; one for createInstance
    Value value{};                              ///< result of invokeMethod or getProperty
    std::vector<NamedValue> output{};           ///< output parameters of invokeMethod
    std::vector<ProviderResponse> providers{};  ///< one per provider that was called

    static Response failed(Status status) { return {std::move(status)}; }
    static Response ofInstances(std::vector<Instance> instances) { return {{}, std::move(instances)}; }
    static Response ofPaths(std::vector<ObjectPath> paths) { return {{}, {}, std::move(paths)}; }
    static Response ofValue(Value value, std::vector<NamedValue> output = {}) {
        return {{}, {}, {}, std::move(value), std::move(output)};
    }

    bool ok() const { return status.ok(); }

    /** The first instance or path; an empty one if there is none. */
    Instance instance() const { return instances.empty() ? Instance{} : instances.front(); }
    ObjectPath path() const { return paths.empty() ? ObjectPath{} : paths.front(); }

    /** The crash reason of the first provider that has one; empty if none has. */
    std::string crashReason() const {
        const auto found = std::find_if(providers.begin(), providers.end(),
                                        [](const ProviderResponse& each) { return !each.crashReason.empty(); });
        return found == providers.end() ? std::string{} : found->crashReason;
    }
};

}  // namespace cimhost
