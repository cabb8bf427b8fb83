#include "cli/Commands.h"

#include <algorithm>

#include "cim/Names.h"
#include "cli/Output.h"
#include "cli/RequestBuilder.h"
#include "cli/SearchPaths.h"
#include "cli/Suggestion.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"

namespace cimhost {
namespace {

ObjectManagerOptions managerOptions(const SearchPaths& paths, const Schema& schema, const Arguments& arguments,
                                    const CommandExtension& extension) {
    ObjectManagerOptions options;
    options.libraries.searchPath = paths.libraryPaths;
    options.classInfo = classInfos(schema);
    options.behaviour = extension.behaviour();
    options.keepsEvents = arguments.raw;
    return options;
}

Schema readSchema(const SearchPaths& paths) {
    Schema schema;
    MofReader reader(schema);
    for (const auto& file : paths.schemas) {
        reader.readFile(file);
    }
    return schema;
}

std::vector<ProviderRegistration> readRegistrationFiles(const std::vector<std::filesystem::path>& files) {
    std::vector<ProviderRegistration> registrations;
    for (const auto& file : files) {
        const std::vector<ProviderRegistration> found = readRegistrationFile(file);
        registrations.insert(registrations.end(), found.begin(), found.end());
    }
    return registrations;
}

/** The registrations of the gates, and those of classes that no gate serves. */
std::vector<ProviderRegistration> readRegistrations(const SearchPaths& paths) {
    const std::vector<ProviderRegistration> gates = readRegistrationFiles(paths.gates);
    std::vector<ProviderRegistration> registrations = readRegistrationFiles(paths.registrations);
    const auto isReplaced = [&](const ProviderRegistration& each) {
        return std::any_of(gates.begin(), gates.end(), [&](const ProviderRegistration& gate) {
            return cim::sameName(gate.className, each.className);
        });
    };
    registrations.erase(std::remove_if(registrations.begin(), registrations.end(), isReplaced), registrations.end());
    registrations.insert(registrations.end(), gates.begin(), gates.end());
    return registrations;
}

std::string formatted(const std::vector<Instance>& instances, const Arguments& arguments) {
    switch (arguments.format) {
        case Format::json:
            return json::format(instances);
        case Format::mof:
            return joined(instances, "\n", [](const Instance& each) { return formatMof(each); });
        default:
            return text::format(instances, arguments.style);
    }
}

std::string formatted(const std::vector<ObjectPath>& paths, const Arguments& arguments) {
    return arguments.format == Format::json ? json::format(paths) : text::format(paths, arguments.style);
}

/** Formats the results of an operation. In JSON, the result of getting or creating an instance is not a list. */
std::string formatted(const Response& response, Operation operation, const Arguments& arguments) {
    const bool isJson = arguments.format == Format::json;
    switch (operation) {
        case Operation::modifyInstance:
        case Operation::deleteInstance:
            return "";
        case Operation::getInstance:
            return isJson ? json::format(response.instances.front()) : formatted(response.instances, arguments);
        case Operation::createInstance:
            return isJson ? json::format(response.paths.front()) : formatted(response.paths, arguments);
        default:
            return returnsPaths(operation) ? formatted(response.paths, arguments)
                                           : formatted(response.instances, arguments);
    }
}

std::string formattedRaw(const Response& response, const Arguments& arguments) {
    return arguments.format == Format::json ? json::format(response.providers)
                                            : text::format(response.providers, arguments.style);
}

/** The status of the providers: OK even if the object manager maps their results to an error. */
Status rawStatus(const Response& response) {
    const auto hasSucceeded = [](const ProviderResponse& each) { return each.status.ok() && each.crashReason.empty(); };
    const bool haveAll = std::all_of(response.providers.begin(), response.providers.end(), hasSucceeded);
    return haveAll && !response.providers.empty() ? Status{} : response.status;
}

/** The hint for an unknown class, namespace or instance; empty for other codes. */
std::string hintFor(int code, const Request& request, const std::vector<ProviderRegistration>& registrations) {
    const std::string className = request.filter.associationClass.value_or(request.path.className);
    std::vector<std::string> names;
    names.reserve(registrations.size());
    for (const ProviderRegistration& each : registrations) {
        names.push_back(each.className);
    }
    switch (code) {
        case CMPI_RC_ERR_INVALID_CLASS:
            return "Run cimhost classes to list the classes" + didYouMean(className, names);
        case CMPI_RC_ERR_INVALID_NAMESPACE:
            return "Run cimhost classes to list the namespaces of each class, and choose one with --namespace.";
        case CMPI_RC_ERR_NOT_FOUND:
            return "Run cimhost enumerate-instance-names " + request.path.className + " to list the instances.";
        default:
            return "";
    }
}

CommandResult runRequest(const Arguments& arguments, const SearchPaths& paths, const Schema& schema,
                         const CommandExtension& extension) {
    const std::vector<ProviderRegistration> registrations = readRegistrations(paths);
    const ProviderRegistry registry(registrations);
    try {
        Request request = buildRequest(arguments, schema);
        extension.adapt(request);
        ObjectManager manager(managerOptions(paths, schema, arguments, extension), registry);
        const Response response = manager.perform(request);
        if (arguments.raw) {
            return {formattedRaw(response, arguments), rawStatus(response)};
        }
        return {response.ok() ? formatted(response, request.operation, arguments) : "", response.status, "",
                hintFor(response.status.rc, request, registrations)};
    } catch (const UnknownClass& error) {
        return {"", {CMPI_RC_ERR_INVALID_CLASS, error.what()}};
    }
}

/** All classes of the schema, then classes that are only registered, each with its providers. */
std::vector<ListedClass> listClasses(const Schema& schema, const std::vector<ProviderRegistration>& registrations) {
    std::vector<ListedClass> list;
    for (const Class* each : schema.classes()) {
        list.push_back({each->name, each});
    }
    for (const ProviderRegistration& registration : registrations) {
        ListedClass* listed = cim::findNamed(list, registration.className);
        if (listed == nullptr) {
            listed = &list.emplace_back(ListedClass{registration.className});
        }
        listed->providers.push_back(registration);
    }
    return list;
}

}  // namespace

CommandResult runCommand(const Arguments& arguments, CommandExtension& extension) {
    if (arguments.format == Format::mof && (arguments.raw || !arguments.operation)) {
        throw UsageError("--format mof shows only instances; use text or json");
    }
    const SearchPaths paths = findSearchPaths(arguments);
    const Schema schema = readSchema(paths);
    if (arguments.operation) {
        return runRequest(arguments, paths, schema, extension);
    }
    if (extension.hasCommand()) {
        ObjectManager manager(managerOptions(paths, schema, arguments, extension),
                              ProviderRegistry(readRegistrations(paths)));
        return extension.run(manager, arguments, schema);
    }
    const std::vector<ListedClass> classes = listClasses(schema, readRegistrations(paths));
    return {arguments.format == Format::json ? json::format(classes) : text::format(classes, arguments.style)};
}

}  // namespace cimhost
