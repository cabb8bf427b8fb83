#include "Requests.h"

#include "Rows.h"
#include "broker/RequestScope.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

#include <ctime>
#include <stdexcept>
#include <utility>
#include <variant>

namespace bench {

namespace {

/** The association whose ends the requests ask for. */
constexpr const char* associationClass = "VELKO_LeaseSetting";

/** The one property whose value depends on when it is asked for. */
constexpr const char* presentTime = "LocalDateTime";

std::string described(const cimhost::NamedValue& property) {
    const std::string value = property.name == presentTime ? "now" : cimhost::formatMof(property.value);
    return property.name + ':' + std::to_string(property.value.type) + '=' + value + '\n';
}

std::string described(const cimhost::ResultEvent& event) {
    if (const auto* path = std::get_if<cimhost::ObjectPath>(&event)) {
        return cimhost::formatObjectPath(*path);
    }
    if (const auto* instance = std::get_if<cimhost::Instance>(&event)) {
        std::string text = cimhost::formatObjectPath(instance->path) + '\n';
        for (const cimhost::NamedValue& property : instance->properties) {
            text += described(property);
        }
        return text;
    }
    return std::holds_alternative<cimhost::Done>(event) ? "done" : "neither path nor instance";
}

CMPIStatus callEnumInstances(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->enumerateInstances(mi, call.context, call.result, call.path, nullptr);
}

CMPIStatus callEnumInstanceNames(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->enumerateInstanceNames(mi, call.context, call.result, call.path);
}

CMPIStatus callGetInstance(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->getInstance(mi, call.context, call.result, call.path, nullptr);
}

CMPIStatus callCreateInstance(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->createInstance(mi, call.context, call.result, call.path, call.instance);
}

CMPIStatus callModifyInstance(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->modifyInstance(mi, call.context, call.result, call.path, call.instance, nullptr);
}

CMPIStatus callDeleteInstance(const Interfaces& interfaces, const CallArguments& call) {
    CMPIInstanceMI* mi = interfaces.instances;
    return mi->ft->deleteInstance(mi, call.context, call.result, call.path);
}

CMPIStatus callAssociators(const Interfaces& interfaces, const CallArguments& call) {
    CMPIAssociationMI* mi = interfaces.associations;
    return mi->ft->associators(mi, call.context, call.result, call.path, associationClass, nullptr, nullptr, nullptr,
                               nullptr);
}

CMPIStatus callAssociatorNames(const Interfaces& interfaces, const CallArguments& call) {
    CMPIAssociationMI* mi = interfaces.associations;
    return mi->ft->associatorNames(mi, call.context, call.result, call.path, associationClass, nullptr, nullptr,
                                   nullptr);
}

}  // namespace

double processorSeconds() {
    std::timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + 1e-9 * static_cast<double>(time.tv_nsec);
}

Outcome perform(cimhost::Broker& broker, const Request& request, const Interfaces& interfaces) {
    Outcome outcome;
    cimhost::RequestScope scope(broker);
    const CMPIInstance* instance = request.instance ? scope.instance(*request.instance) : nullptr;
    const CallArguments arguments{scope.context({}), scope.result(outcome.events), scope.objectPath(request.path),
                                  instance};
    const double begin = processorSeconds();
    const CMPIStatus status = request.operation(interfaces, arguments);
    outcome.seconds = processorSeconds() - begin;
    outcome.status = cimhost::statusFrom(status);
    return outcome;
}

void requireAnswered(const Request& request, const Outcome& outcome) {
    if (!outcome.status.ok()) {
        throw std::runtime_error("status " + std::to_string(outcome.status.rc) + ' ' + outcome.status.message);
    }
    const std::size_t expected = request.answers + (request.ends ? 1 : 0);
    if (outcome.events.size() != expected) {
        throw std::runtime_error(std::to_string(outcome.events.size()) + " things were returned, not " +
                                 std::to_string(expected));
    }
    if (request.ends && !std::holds_alternative<cimhost::Done>(outcome.events.back())) {
        throw std::runtime_error("the answer was not ended");
    }
}

void requireSame(const cimhost::ResultEvents& answers, const cimhost::ResultEvents& expected) {
    if (answers.size() != expected.size()) {
        throw std::runtime_error(std::to_string(answers.size()) + " answers, not " + std::to_string(expected.size()));
    }
    for (std::size_t index = 0; index < answers.size(); ++index) {
        const std::string answer = described(answers[index]);
        const std::string wanted = described(expected[index]);
        if (answer != wanted) {
            std::string difference = "answer " + std::to_string(index) + " is\n";
            difference.append(answer).append("\nand not\n").append(wanted);
            throw std::runtime_error(difference);
        }
    }
}

cimhost::ObjectPath classPath(const std::string& className) {
    cimhost::ObjectPath path;
    path.nameSpace = names::nameSpace;
    path.className = className;
    return path;
}

cimhost::NamedValue textValue(const std::string& name, const std::string& text) {
    return {name, cimhost::Value::of(text)};
}

Request enumInstances(const std::string& className, std::size_t answers) {
    return {&callEnumInstances, classPath(className), std::nullopt, answers, true};
}

Request enumInstanceNames(const std::string& className, std::size_t answers) {
    return {&callEnumInstanceNames, classPath(className), std::nullopt, answers, true};
}

Request getInstance(cimhost::ObjectPath path) {
    return {&callGetInstance, std::move(path), std::nullopt, 1, true};
}

Request createInstance(cimhost::ObjectPath path) {
    cimhost::Instance instance;
    instance.path = path;
    return {&callCreateInstance, std::move(path), std::move(instance), 1, true};
}

Request modifyInstance(cimhost::ObjectPath path, cimhost::NamedValue property) {
    cimhost::Instance instance;
    instance.path = path;
    instance.properties.push_back(std::move(property));
    return {&callModifyInstance, std::move(path), std::move(instance), 0, false};
}

Request deleteInstance(cimhost::ObjectPath path) {
    return {&callDeleteInstance, std::move(path), std::nullopt, 0, false};
}

Request associators(cimhost::ObjectPath path, std::size_t answers) {
    return {&callAssociators, std::move(path), std::nullopt, answers, true};
}

Request associatorNames(cimhost::ObjectPath path, std::size_t answers) {
    return {&callAssociatorNames, std::move(path), std::nullopt, answers, true};
}

}  // namespace bench
