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

constexpr auto nothingReturned = "The provider accepted CreateInstance, but returned neither path nor instance.";
constexpr auto brokenResponse =
    "The provider accepted CreateInstance, but returned no path: the client would have got a broken response.";

template <class Kind>
bool isKindOrSilent(const ResultEvent& event) {
    return std::holds_alternative<Kind>(event) || std::holds_alternative<Done>(event) ||
           std::holds_alternative<ErrorInfo>(event) || std::holds_alternative<NullResult>(event);
}

template <class Kind>
constexpr const char* kindName = "instance";
template <>
constexpr const char* kindName<ObjectPath> = "object path";

bool returnedObject(const RawAnswer& answer) {
    return std::any_of(answer.events.begin(), answer.events.end(), [](const ResultEvent& event) {
        return std::holds_alternative<Instance>(event) || std::holds_alternative<ObjectPath>(event);
    });
}

/** What a value has beside its text in XML: elements, attributes, a type. */
constexpr std::size_t markup = 75;

std::size_t xmlSize(const std::vector<NamedValue>& values);

std::size_t xmlSize(const ObjectPath& path) {
    return markup + path.nameSpace.size() + path.className.size() + xmlSize(path.keys);
}

std::size_t xmlSize(const Scalar& value) {
    constexpr std::size_t number = 10;
    if (const auto* text = std::get_if<std::string>(&value)) {
        return text->size();
    }
    const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&value);
    return path == nullptr || *path == nullptr ? number : xmlSize(**path);
}

std::size_t xmlSize(const std::vector<NamedValue>& values) {
    std::size_t size = 0;
    for (const NamedValue& each : values) {
        size += markup + each.name.size();
        for (const Scalar& element : each.value.elements) {
            size += xmlSize(element);
        }
    }
    return size;
}

/** About how long an answer is in XML. */
std::size_t xmlSize(const ResultEvents& events) {
    std::size_t size = 0;
    for (const ResultEvent& event : events) {
        if (const auto* path = std::get_if<ObjectPath>(&event)) {
            size += xmlSize(*path);
        } else if (const auto* instance = std::get_if<Instance>(&event)) {
            size += xmlSize(instance->path) + xmlSize(instance->properties);
        }
    }
    return size;
}

bool isReferenceOperation(Operation operation) {
    return operation == Operation::references || operation == Operation::referenceNames;
}

/** What an object manager makes of an instance that it takes for a path: the namespace in the place of the class. */
ObjectPath misread(const Instance& instance) {
    return {{}, instance.path.nameSpace, instance.path.nameSpace, {}};
}

}  // namespace

std::string fatality(const RawAnswer& answer, Operation operation) {
    const Profile& profile = profileOf(answer.manager);
    if (answer.threw && profile.escape == Escape::endOfProcess) {
        return answer.status.message;
    }
    if (answer.releasedPath) {
        return "The provider released the path that it had returned.";
    }
    const bool mustReturn = operation == Operation::createInstance && profile.created == CreationResult::pathRead;
    if (mustReturn && answer.status.ok() && !returnedObject(answer)) {
        return "The provider accepted CreateInstance, but returned nothing.";
    }
    return {};
}

Status statusOf(const RawAnswer& answer, Operation operation) {
    const std::string reason = fatality(answer, operation);
    if (!reason.empty()) {
        return {CMPI_RC_ERR_FAILED, "The manager's provider process would have died: " + reason};
    }
    const Profile& profile = profileOf(answer.manager);
    if (answer.threw && profile.escape == Escape::unknownError) {
        return {CMPI_RC_ERR_FAILED, "Unknown error."};
    }
    if (profile.answerLimit != 0 && xmlSize(answer.events) > profile.answerLimit) {
        return {CMPI_RC_ERR_FAILED, "The answer is longer than the manager's limit."};
    }
    const bool isEmptied =
        profile.emptiesReferences && isReferenceOperation(operation) && answer.status.rc == CMPI_RC_ERR_NOT_SUPPORTED;
    return answer.status.ok() || isEmptied ? Status{} : Status{answer.status.rc, messageOf(answer, operation)};
}

Status statusOf(const std::vector<RawAnswer>& answers, Operation operation) {
    std::vector<Status> all;
    all.reserve(answers.size());
    for (const RawAnswer& answer : answers) {
        all.push_back(statusOf(answer, operation));
    }
    const bool anyOk = std::any_of(all.begin(), all.end(), [](const Status& each) { return each.ok(); });
    for (const Status& each : all) {
        const bool isPassedOver = anyOk && each.rc == CMPI_RC_ERR_NOT_SUPPORTED;
        if (!each.ok() && !isPassedOver) {
            return each;
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
    CreationResult wanted = CreationResult::pathOrInstance;
    for (const RawAnswer& answer : answers.value) {
        wanted = profileOf(answer.manager).created;
        for (const ResultEvent& event : answer.events) {
            if (const auto* path = std::get_if<ObjectPath>(&event)) {
                return {{}, *path};
            }
            if (const auto* instance = std::get_if<Instance>(&event)) {
                return {{}, wanted == CreationResult::pathRead ? misread(*instance) : instance->path};
            }
        }
    }
    return {{CMPI_RC_ERR_FAILED, wanted == CreationResult::pathOnly ? brokenResponse : nothingReturned}, {}};
}

template Answer<std::vector<Instance>> resultsOf(const Answer<std::vector<RawAnswer>>&, Operation);
template Answer<std::vector<ObjectPath>> resultsOf(const Answer<std::vector<RawAnswer>>&, Operation);

}  // namespace cimhost
