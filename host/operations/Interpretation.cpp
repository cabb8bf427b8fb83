#include "operations/Interpretation.h"

#include <algorithm>

#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

/** A text for a failure: the provider's, that of an extended error it returned, or what is known otherwise. */
std::string messageOf(const RawAnswer& answer, Operation operation) {
    if (!answer.status.message.empty()) {
        return answer.status.message;
    }
    for (const ErrorInfo& error : eventsOf<ErrorInfo>(answer.events)) {
        if (error.message) {
            return *error.message;
        }
    }
    return std::string("The provider answered ") + nameOf(operation) + " with code " +
           std::to_string(answer.status.rc) + " and no message.";
}

template <class Kind>
bool isKindOrSilent(const ResultEvent& event) {
    return std::holds_alternative<Kind>(event) || std::holds_alternative<Done>(event) ||
           std::holds_alternative<ErrorInfo>(event);
}

template <class Kind>
constexpr const char* kindName = "instance";
template <>
constexpr const char* kindName<ObjectPath> = "object path";

}  // namespace

Status statusOf(const RawAnswer& answer, Operation operation) {
    return answer.status.ok() ? Status{} : Status{answer.status.rc, messageOf(answer, operation)};
}

Status statusOf(const std::vector<RawAnswer>& answers, Operation operation) {
    const bool anyOk = std::any_of(answers.begin(), answers.end(), [](const auto& each) { return each.status.ok(); });
    for (const RawAnswer& answer : answers) {
        const bool isPassedOver = anyOk && answer.status.rc == CMPI_RC_ERR_NOT_SUPPORTED;
        if (!answer.status.ok() && !isPassedOver) {
            return statusOf(answer, operation);
        }
    }
    return {};
}

Status statusOf(const Answer<std::vector<RawAnswer>>& answers, Operation operation) {
    return answers.ok() ? statusOf(answers.value, operation) : answers.status;
}

template <class Kind>
Answer<std::vector<Kind>> resultsOf(const Answer<std::vector<RawAnswer>>& answers, Operation operation) {
    const Status status = statusOf(answers, operation);
    if (!status.ok()) {
        return {status, {}};
    }
    std::vector<Kind> results;
    for (const RawAnswer& answer : answers.value) {
        if (!std::all_of(answer.events.begin(), answer.events.end(), isKindOrSilent<Kind>)) {
            return {{CMPI_RC_ERR_FAILED, std::string("The provider answered ") + nameOf(operation) +
                                             " with something other than an " + kindName<Kind> + "."},
                    {}};
        }
        const std::vector<Kind> found = eventsOf<Kind>(answer.events);
        results.insert(results.end(), found.begin(), found.end());
    }
    return {{}, std::move(results)};
}

Answer<Instance> oneInstance(const Answer<std::vector<RawAnswer>>& answers, const ObjectPath& path) {
    Answer<std::vector<Instance>> found = resultsOf<Instance>(answers, Operation::getInstance);
    if (!found.ok()) {
        return {found.status, {}};
    }
    if (found.value.empty()) {
        return {{CMPI_RC_ERR_NOT_FOUND, "There is no instance " + formatObjectPath(path) + "."}, {}};
    }
    return {{}, std::move(found.value.front())};
}

Answer<ObjectPath> createdPath(const Answer<std::vector<RawAnswer>>& answers) {
    const Status status = statusOf(answers, Operation::createInstance);
    if (!status.ok()) {
        return {status, {}};
    }
    for (const RawAnswer& answer : answers.value) {
        for (const ResultEvent& event : answer.events) {
            if (const auto* path = std::get_if<ObjectPath>(&event)) {
                return {{}, *path};
            }
            if (const auto* instance = std::get_if<Instance>(&event)) {
                return {{}, instance->path};
            }
        }
    }
    return {{CMPI_RC_ERR_FAILED, "The provider accepted CreateInstance, but returned neither path nor instance."}, {}};
}

template Answer<std::vector<Instance>> resultsOf(const Answer<std::vector<RawAnswer>>&, Operation);
template Answer<std::vector<ObjectPath>> resultsOf(const Answer<std::vector<RawAnswer>>&, Operation);

}  // namespace cimhost
