#include "operations/ResponseMapping.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

Status statusOf(const ManagerBehaviour& behaviour, const std::vector<ProviderResponse>& responses,
                Operation operation) {
    std::vector<Status> all;
    all.reserve(responses.size());
    for (const ProviderResponse& response : responses) {
        all.push_back(behaviour.statusOf(response, operation));
    }
    const bool anyOk = std::any_of(all.begin(), all.end(), [](const Status& each) { return each.ok(); });
    const auto failed = std::find_if(all.begin(), all.end(), [&](const Status& each) {
        return !each.ok() && !(anyOk && each.rc == CMPI_RC_ERR_NOT_SUPPORTED);
    });
    return failed == all.end() ? Status{} : *failed;
}

template <class Kind>
constexpr const char* kindName = "instance";
template <>
constexpr const char* kindName<ObjectPath> = "object path";

/** Whether an event is of this kind, or of one that every operation permits. */
template <class Kind>
bool isExpected(const ResultEvent& event) {
    return resultOf<Kind>(event) != nullptr || std::holds_alternative<Done>(event) ||
           resultOf<ErrorInfo>(event) != nullptr || std::holds_alternative<NullResult>(event);
}

/** Appends the result of an event. Copies it if events are kept or the result is shared, otherwise moves it. */
template <class Kind>
void appendResult(std::vector<Kind>& results, std::shared_ptr<Kind>& result, bool keeps) {
    if (keeps || result.use_count() > 1) {
        results.push_back(*result);
    } else {
        results.push_back(std::move(*result));
        result.reset();  // free it while it is in the processor's caches
    }
}

/** Appends all results of this kind, which are moved unless events are kept. Fails if there are other results. */
template <class Kind>
Status collect(std::vector<ProviderResponse>& responses, Operation operation, bool keepsEvents,
               std::vector<Kind>& results) {
    for (ProviderResponse& response : responses) {
        if (!std::all_of(response.events.begin(), response.events.end(), isExpected<Kind>)) {
            results.clear();
            return {CMPI_RC_ERR_FAILED, std::string("The provider returned something other than an ") + kindName<Kind> +
                                            " for " + nameOf(operation) + "."};
        }
        results.reserve(results.size() + response.events.size());
        for (ResultEvent& event : response.events) {
            if (auto* one = std::get_if<typename AlternativeFor<Kind>::Type>(&event)) {
                appendResult(results, *one, keepsEvents);
            }
        }
    }
    return {};
}

Status collectOne(const Request& request, bool keepsEvents, Response& response) {
    Status status = collect(response.providers, request.operation, keepsEvents, response.instances);
    if (status.ok() && response.instances.empty()) {
        return {CMPI_RC_ERR_NOT_FOUND, "There is no instance " + formatObjectPath(request.path) + "."};
    }
    response.instances.resize(std::min<std::size_t>(response.instances.size(), 1));
    return status;
}

Status collectCreated(const ManagerBehaviour& behaviour, Response& response) {
    StatusOr<ObjectPath> created = behaviour.createdPath(response.providers.front());
    if (created.ok()) {
        response.paths.push_back(std::move(created.value));
    }
    return created.status;
}

Status collectResults(const ManagerBehaviour& behaviour, const Request& request, bool keepsEvents, Response& response) {
    switch (request.operation) {
        case Operation::getInstance:
            return collectOne(request, keepsEvents, response);
        case Operation::createInstance:
            return collectCreated(behaviour, response);
        case Operation::modifyInstance:
        case Operation::deleteInstance:
            return {};
        default:
            return returnsPaths(request.operation)
                       ? collect(response.providers, request.operation, keepsEvents, response.paths)
                       : collect(response.providers, request.operation, keepsEvents, response.instances);
    }
}

}  // namespace

Response mapResponses(const ManagerBehaviour& behaviour, const Request& request,
                      std::vector<ProviderResponse> responses, bool keepsEvents) {
    Response response;
    response.providers = std::move(responses);
    response.status = statusOf(behaviour, response.providers, request.operation);
    if (response.ok()) {
        response.status = collectResults(behaviour, request, keepsEvents, response);
    }
    return response;
}

}  // namespace cimhost
