#include "Requests.h"

#include <algorithm>
#include <ctime>
#include <functional>
#include <stdexcept>
#include <utility>
#include <variant>

#include "Rows.h"
#include "broker/RequestScope.h"
#include "operations/RequestRunner.h"
#include "operations/StatusText.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace bench {

namespace {

using cimhost::Operation;
using cimhost::ResultEvent;

/** The only property whose value depends on the time of the request. */
constexpr const char* presentTime = "LocalDateTime";

std::string described(const cimhost::NamedValue& property) {
    const std::string value = property.name == presentTime ? "now" : cimhost::formatMof(property.value);
    return property.name.string() + ':' + std::to_string(property.value.type) + '=' + value + '\n';
}

std::string described(const ResultEvent& event) {
    if (const auto* path = cimhost::resultOf<cimhost::ObjectPath>(event)) {
        return cimhost::formatObjectPath(*path);
    }
    if (const auto* instance = cimhost::resultOf<cimhost::Instance>(event)) {
        std::string description = cimhost::formatObjectPath(instance->path) + '\n';
        for (const cimhost::NamedValue& property : instance->properties) {
            description += described(property);
        }
        return description;
    }
    return std::holds_alternative<cimhost::Done>(event) ? "done" : "neither path nor instance";
}

bool takesInstance(Operation operation) {
    return operation == Operation::createInstance || operation == Operation::modifyInstance;
}

/** Whether the provider calls returnDone. */
bool isEnded(Operation operation) {
    return operation != Operation::modifyInstance && operation != Operation::deleteInstance;
}

}  // namespace

double processorSeconds() {
    std::timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + 1e-9 * static_cast<double>(time.tv_nsec);
}

TimedResponse perform(cimhost::Broker& broker, const cimhost::Request& request, const Interfaces& interfaces) {
    TimedResponse response;
    cimhost::RequestScope scope(broker);
    const CMPIContext* context = scope.context({});
    const CMPIResult* result = scope.result(response.events);
    const CMPIObjectPath* path = scope.objectPath(request.path);
    const CMPIInstance* instance = takesInstance(request.operation) ? scope.instance(request.instance) : nullptr;
    const bool isAssociation = cimhost::isAssociationOperation(request.operation);
    const double begin = processorSeconds();
    const CMPIStatus status =
        isAssociation ? cimhost::callOperation(interfaces.associations, request, context, result, path)
                      : cimhost::callOperation(interfaces.instances, request, context, result, path, instance);
    response.seconds = processorSeconds() - begin;
    response.status = cimhost::statusFrom(status);
    return response;
}

void requireExpected(const ExpectedRequest& expected, const TimedResponse& response) {
    const auto isDone = [](const ResultEvent& event) { return std::holds_alternative<cimhost::Done>(event); };
    const auto results = std::count_if(response.events.begin(), response.events.end(), std::not_fn(isDone));
    const bool mustBeDone = expected.rc == CMPI_RC_OK && isEnded(expected.request.operation);
    const bool lacksDone = mustBeDone && (response.events.empty() || !isDone(response.events.back()));
    if (response.status.rc != expected.rc || static_cast<std::size_t>(results) != expected.results || lacksDone) {
        throw std::runtime_error(std::string(nameOf(expected.request.operation)) + " of " +
                                 cimhost::formatObjectPath(expected.request.path) + ": " +
                                 cimhost::errorText(response.status) + ", expected " + std::to_string(expected.rc) +
                                 "; " + std::to_string(results) + " results, expected " +
                                 std::to_string(expected.results) + (lacksDone ? "; returnDone is not the last" : ""));
    }
}

void requireSame(const cimhost::ResultEvents& results, const cimhost::ResultEvents& expected) {
    if (results.size() != expected.size()) {
        throw std::runtime_error(std::to_string(results.size()) + " results, expected " +
                                 std::to_string(expected.size()));
    }
    for (std::size_t index = 0; index < results.size(); ++index) {
        const std::string found = described(results[index]);
        const std::string wanted = described(expected[index]);
        if (found != wanted) {
            throw std::runtime_error("result " + std::to_string(index) + " is\n" + found + "\nexpected\n" + wanted);
        }
    }
}

cimhost::ObjectPath classPath(const std::string& className) {
    return {{}, names::nameSpace, className, {}};
}

cimhost::ObjectPath recordPath(const std::string& className, const std::string& instanceId) {
    return {{}, names::nameSpace, className, {namedString("InstanceID", instanceId)}};
}

cimhost::ObjectPath computerPath(const std::string& name) {
    return {{}, names::nameSpace, names::computerClass, {namedString("Name", name)}};
}

cimhost::NamedValue namedString(const std::string& name, const std::string& value) {
    return {name, cimhost::Value::of(value)};
}

cimhost::Request creation(const cimhost::ObjectPath& path) {
    return cimhost::Request::createInstance(path, {path, {}});
}

cimhost::Request modification(const cimhost::ObjectPath& path, cimhost::NamedValue property) {
    return cimhost::Request::modifyInstance(path, {path, {std::move(property)}});
}

cimhost::AssociationFilter leaseSettings() {
    cimhost::AssociationFilter filter;
    filter.associationClass = names::leaseSettingClass;
    return filter;
}

}  // namespace bench
