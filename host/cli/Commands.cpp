#include "cli/Commands.h"

#include "cli/ClassList.h"
#include "cli/ExitStatus.h"
#include "cli/JsonOutput.h"
#include "cli/LoadCommand.h"
#include "cli/Locations.h"
#include "cli/RequestBuilder.h"
#include "cli/Suggestion.h"
#include "cli/TextOutput.h"
#include "operations/ClassShapes.h"
#include "operations/Interpretation.h"
#include "operations/ObjectManager.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

namespace cimhost {
namespace {

using Answers = Answer<std::vector<RawAnswer>>;

ObjectManagerOptions managerOptions(const Arguments& arguments, const Locations& locations, const Schema& schema) {
    ObjectManagerOptions options;
    options.libraries.searchPath = locations.libraryPaths;
    options.classShape = classShapes(schema);
    options.manager = arguments.manager;
    return options;
}

Schema readSchema(const Locations& locations) {
    Schema schema;
    MofReader reader(schema);
    for (const auto& file : locations.schemas) {
        reader.readFile(file);
    }
    return schema;
}

std::vector<ProviderRegistration> readRegistrations(const Locations& locations) {
    std::vector<ProviderRegistration> registrations;
    for (const auto& file : locations.registrations) {
        const std::vector<ProviderRegistration> found = readRegistrationFile(file);
        registrations.insert(registrations.end(), found.begin(), found.end());
    }
    return registrations;
}

std::string mofOf(const std::vector<Instance>& instances) {
    std::string text;
    for (const Instance& instance : instances) {
        text += (text.empty() ? "" : "\n") + formatMof(instance);
    }
    return text;
}

Outcome showInstances(const Answers& answers, Operation operation, const Arguments& arguments) {
    const Answer<std::vector<Instance>> found = resultsOf<Instance>(answers, operation);
    if (!found.ok()) {
        return {"", found.status};
    }
    switch (arguments.format) {
        case Format::json:
            return {json::format(found.value)};
        case Format::mof:
            return {mofOf(found.value)};
        default:
            return {text::format(found.value, arguments.style)};
    }
}

Outcome showInstance(const Answers& answers, const ObjectPath& path, const Arguments& arguments) {
    const Answer<Instance> found = oneInstance(answers, path);
    if (!found.ok()) {
        return {"", found.status};
    }
    switch (arguments.format) {
        case Format::json:
            return {json::format(found.value)};
        case Format::mof:
            return {formatMof(found.value)};
        default:
            return {text::format(std::vector<Instance>{found.value}, arguments.style)};
    }
}

Outcome showPaths(const Answers& answers, Operation operation, const Arguments& arguments) {
    const Answer<std::vector<ObjectPath>> found = resultsOf<ObjectPath>(answers, operation);
    if (!found.ok()) {
        return {"", found.status};
    }
    return {arguments.format == Format::json ? json::format(found.value) : text::format(found.value, arguments.style)};
}

Outcome showCreated(const Answers& answers, const Arguments& arguments) {
    const Answer<ObjectPath> created = createdPath(answers);
    if (!created.ok()) {
        return {"", created.status};
    }
    return {arguments.format == Format::json ? json::format(created.value)
                                             : text::format(std::vector<ObjectPath>{created.value}, arguments.style)};
}

Outcome show(const Answers& answers, const Request& request, const Arguments& arguments) {
    switch (request.operation) {
        case Operation::enumerateInstances:
        case Operation::associators:
        case Operation::references:
            return showInstances(answers, request.operation, arguments);
        case Operation::enumerateInstanceNames:
        case Operation::associatorNames:
        case Operation::referenceNames:
            return showPaths(answers, request.operation, arguments);
        case Operation::getInstance:
            return showInstance(answers, request.path, arguments);
        case Operation::createInstance:
            return showCreated(answers, arguments);
        default:
            return {"", statusOf(answers, request.operation)};
    }
}

Outcome showRaw(const Answers& answers, Operation operation, const Arguments& arguments) {
    return {
        arguments.format == Format::json ? json::format(answers.value) : text::format(answers.value, arguments.style),
        statusOf(answers, operation)};
}

/** What to try when there is no such class, namespace or instance. */
std::string hintFor(int code, const Request& request, const std::vector<ProviderRegistration>& registrations) {
    const std::string className = request.filter.associationClass.value_or(request.path.className);
    std::vector<std::string> names;
    names.reserve(registrations.size());
    for (const ProviderRegistration& each : registrations) {
        names.push_back(each.className);
    }
    switch (code) {
        case CMPI_RC_ERR_INVALID_CLASS:
            return "Run cimhost classes for those that are served" + didYouMean(className, names);
        case CMPI_RC_ERR_INVALID_NAMESPACE:
            return "Run cimhost classes for where each class is served; --namespace names another.";
        case CMPI_RC_ERR_NOT_FOUND:
            return "Run cimhost enumerate-instance-names " + request.path.className + " for those that there are.";
        default:
            return "";
    }
}

Outcome runRequest(const Arguments& arguments, const Locations& locations, const Schema& schema) {
    const std::vector<ProviderRegistration> registrations = readRegistrations(locations);
    const ProviderRegistry registry(registrations);
    try {
        const Request request = buildRequest(arguments, schema);
        ObjectManager manager(managerOptions(arguments, locations, schema), registry);
        const Answers answers = manager.run(request);
        if (arguments.raw) {
            return showRaw(answers, request.operation, arguments);
        }
        Outcome outcome = show(answers, request, arguments);
        outcome.hint = hintFor(outcome.status.rc, request, registrations);
        return outcome;
    } catch (const UnknownClass& error) {
        return {"", {CMPI_RC_ERR_INVALID_CLASS, error.what()}};
    }
}

}  // namespace

Outcome runCommand(const Arguments& arguments) {
    if (arguments.format == Format::mof && (arguments.raw || !arguments.operation)) {
        throw UsageError("--format mof shows instances; use text or json with --raw, for classes and for load");
    }
    if (arguments.raw && arguments.isLoad) {
        throw UsageError("--raw shows what a provider did with one request; load has many");
    }
    const Locations locations = findLocations(arguments);
    const Schema schema = readSchema(locations);
    if (arguments.operation) {
        return runRequest(arguments, locations, schema);
    }
    if (arguments.isLoad) {
        ObjectManager manager(managerOptions(arguments, locations, schema),
                              ProviderRegistry(readRegistrations(locations)));
        return runLoadCommand(manager, arguments, schema);
    }
    const std::vector<ListedClass> classes = listClasses(schema, readRegistrations(locations));
    return {arguments.format == Format::json ? json::format(classes) : text::format(classes, arguments.style)};
}

}  // namespace cimhost
