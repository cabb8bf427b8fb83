#include "cli/Arguments.h"

#include <CLI/CLI.hpp>
#include <sstream>

#include "Installation.h"
#include "cli/Choice.h"
#include "cli/Commands.h"
#include "cli/Suggestion.h"

namespace cimhost {
namespace {

constexpr auto introduction =
    "Runs requests on CMPI providers without an installed object manager.\n"
    "Providers come from registration files in SFCB's form, classes from MOF files.";

constexpr auto examples =
    R"(Object paths are WBEM URIs: [namespace:]Class[.Key=value,...]. Write string keys in quotation marks, and the
whole path in the quotes of your shell:

  cimhost ei Some_Class
  cimhost gi 'Some_Class.InstanceID="1"'
  cimhost mi 'Some_Class.InstanceID="1"' ElementName='a name' Size=5 Tags='{"a", "b"}' --null Owner
  cimhost ai 'root/cimv2:Some_System.Name="host"' --assoc-class Some_Association
  cimhost --format json ein Some_Class
  cimhost --schema my.mof --registration my.reg --library-path build/lib ei My_Class
)";

constexpr auto closing =
    R"(
Environment: CIMHOST_SCHEMA, CIMHOST_REGISTRATION and CIMHOST_LIBRARY_PATH are lists of files or directories,
separated by colons, that replace options which are not given. CIMHOST_PROVIDER replaces --provider.

Exit status: 0 success, 1 the request failed, 2 wrong command line, 3 a library, registration or schema cannot be
loaded, 4 the output cannot be written.)";

enum class Target { none, className, objectPath };

/** Groups of options that a command has. */
enum CommandOptions : unsigned {
    plain = 0,
    assigns = 1,     ///< NAME=VALUE, --null
    associates = 2,  ///< --assoc-class, --result-role
    refers = 4,      ///< --result-class, --role
    lists = 8        ///< --property
};

struct Command {
    std::optional<Operation> operation;
    const char* name;
    const char* shortName;  ///< null: none
    const char* description;
    Target target;
    unsigned options;
    const char* example;
};

constexpr Command commands[] = {
    {Operation::enumerateInstances, "enumerate-instances", "ei", "List the instances of a class", Target::className,
     lists, "cimhost ei Some_Class --property Size"},
    {Operation::enumerateInstanceNames, "enumerate-instance-names", "ein", "List the paths of a class's instances",
     Target::className, plain, "cimhost --format json ein Some_Class"},
    {Operation::getInstance, "get-instance", "gi", "Show an instance", Target::objectPath, lists,
     "cimhost gi 'Some_Class.InstanceID=\"1\"'"},
    {Operation::createInstance, "create-instance", "ci", "Create an instance and show its path", Target::objectPath,
     assigns, "cimhost ci 'Some_Class.InstanceID=\"1\"' ElementName='a name' Size=5"},
    {Operation::modifyInstance, "modify-instance", "mi", "Set properties of an instance", Target::objectPath, assigns,
     "cimhost mi 'Some_Class.InstanceID=\"1\"' Size=6 --null ElementName"},
    {Operation::deleteInstance, "delete-instance", "di", "Delete an instance", Target::objectPath, plain,
     "cimhost di 'Some_Class.InstanceID=\"1\"'"},
    {Operation::associators, "associators", "ai", "List the instances associated with an instance", Target::objectPath,
     associates | refers | lists, "cimhost ai 'Some_System.Name=\"host\"' --assoc-class Some_Association"},
    {Operation::associatorNames, "associator-names", "ain", "List the paths of the instances associated with one",
     Target::objectPath, associates | refers, "cimhost ain 'Some_System.Name=\"host\"' --result-class Some_Class"},
    {Operation::references, "references", "ri", "List the associations that refer to an instance", Target::objectPath,
     refers | lists, "cimhost ri 'Some_System.Name=\"host\"' --result-class Some_Association"},
    {Operation::referenceNames, "reference-names", "rin", "List the paths of the associations that refer to one",
     Target::objectPath, refers, "cimhost rin 'Some_System.Name=\"host\"'"},
    {std::nullopt, "classes", nullptr, "List the classes and the providers that serve them", Target::none, plain,
     "cimhost --schema my.mof classes"},
};

template <class Strings>
void addRepeatable(CLI::App& app, const char* option, Strings& values, const char* type,
                   const std::string& description) {
    app.add_option(option, values, description + " (repeatable)")->type_name(type)->allow_extra_args(false);
}

void addCommonOptions(CLI::App& app, Arguments& arguments) {
    addRepeatable(app, "--schema", arguments.schemas, "FILE", "MOF file with classes, or a directory of them");
    addRepeatable(app, "--registration", arguments.registrations, "FILE",
                  "Provider registration file, or a directory of them");
    addRepeatable(app, "--library-path", arguments.libraryPaths, "DIR", "Directory with provider libraries");
    addChoice<std::string>(app, "--provider", "Provider of classes that a gate serves: gate (default) or bare",
                           arguments.provider, {{"gate", "gate"}, {"bare", "bare"}})
        ->type_name("NAME");
    app.add_option("--namespace", arguments.nameSpace, "Namespace of paths without one")
        ->type_name("NAME")
        ->capture_default_str();
    addChoice<Format>(app, "--format", "Form of the output: text (default), json or mof", arguments.format,
                      {{"text", Format::text}, {"json", Format::json}, {"mof", Format::mof}})
        ->type_name("FORM");
    addChoice<text::Colours>(
        app, "--color", "Colours in text: auto (default: on a terminal), always or never", arguments.colours,
        {{"auto", text::Colours::automatic}, {"always", text::Colours::always}, {"never", text::Colours::never}})
        ->type_name("WHEN");
    app.add_flag("--raw", arguments.raw,
                 "Show the provider's own response: its status, its results, its calls of returnDone");
}

void addCommand(CLI::App& app, const Command& command, Arguments& arguments) {
    CLI::App* sub = app.add_subcommand(command.name, command.description);
    sub->fallthrough();
    sub->footer(std::string("Example:\n\n  ") + command.example + "\n\nSee " + app.get_name() +
                " --help for options of all commands and for more examples.");
    if (command.shortName != nullptr) {
        sub->alias(command.shortName);
    }
    if (command.target == Target::className) {
        sub->add_option("CLASS", arguments.target, "Name of the class, [namespace:]Class")->required();
    } else if (command.target == Target::objectPath) {
        sub->add_option("PATH", arguments.target, "Object path, [namespace:]Class.Key=value,...")->required();
    }
    if ((command.options & assigns) != 0) {
        sub->add_option("NAME=VALUE", arguments.assignments, "Value of a property; NAME= is the empty string");
        addRepeatable(*sub, "--null", arguments.nulls, "NAME", "Set this property to null");
    }
    if ((command.options & associates) != 0) {
        sub->add_option("--assoc-class", arguments.filter.associationClass, "Association to follow")
            ->type_name("CLASS");
        sub->add_option("--result-role", arguments.filter.resultRole, "Role of the other instance")->type_name("NAME");
    }
    if ((command.options & refers) != 0) {
        sub->add_option("--result-class", arguments.filter.resultClass, "Class of the results")->type_name("CLASS");
        sub->add_option("--role", arguments.filter.role, "Role of the given instance")->type_name("NAME");
    }
    if ((command.options & lists) != 0) {
        addRepeatable(*sub, "--property", arguments.properties, "NAME", "Request only this property");
    }
    sub->callback([&arguments, &command] { arguments.operation = command.operation; });
}

/** The names of all commands, and of the options that the command line accepts. */
std::vector<std::string> wordsOf(const CLI::App& app) {
    std::vector<std::string> words;
    for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
        words.push_back(command->get_name());
    }
    for (const CLI::App* each : {&app, app.get_subcommands().empty() ? &app : app.get_subcommands().front()}) {
        for (const CLI::Option* option : each->get_options([](const CLI::Option*) { return true; })) {
            words.push_back(option->get_name());
        }
    }
    return words;
}

/** The message for an unknown command or option, with the most similar known one. */
std::string unknownMessage(const CLI::App& app, const std::string& word) {
    const std::vector<CLI::App*> used = app.get_subcommands();
    const std::string command = used.empty() ? "" : used.front()->get_name() + " ";
    const std::string reason =
        used.empty() ? "there is no command or option " + word : command + "does not take " + word;
    return reason + didYouMean(word, wordsOf(app)) + "\nRun " + app.get_name() + " " + command +
           "--help for commands and options.";
}

/** Sets the output of a program that ends with its help, its version or a usage error. */
void end(ParsedArguments& parsed, const CLI::App& app, const CLI::ParseError& error) {
    std::ostringstream output;
    std::ostringstream problem;
    parsed.ended = true;
    parsed.exitStatus = app.exit(error, output, problem) == 0 ? exitSuccess : exitUsage;
    parsed.output = output.str();
    if (parsed.exitStatus == exitSuccess) {
        return;
    }
    const std::vector<std::string> unknown = app.remaining(true);
    const bool isUnknown = dynamic_cast<const CLI::ExtrasError*>(&error) != nullptr || app.get_subcommands().empty();
    parsed.error = isUnknown && !unknown.empty() ? unknownMessage(app, unknown.front()) : problem.str();
    parsed.error.erase(parsed.error.find_last_not_of('\n') + 1);
}

}  // namespace

ParsedArguments parseArguments(int count, const char* const* values, CommandExtension& extension) {
    ParsedArguments parsed;
    CLI::App app(extension.introduction.empty() ? introduction : extension.introduction, extension.program);
    app.footer(examples + extension.examples + (extension.notes.empty() ? "" : "\n" + extension.notes) + closing);
    app.set_version_flag("--version", extension.program + " " + installation::version);
    app.require_subcommand(1);
    addCommonOptions(app, parsed.arguments);
    for (const Command& command : commands) {
        addCommand(app, command, parsed.arguments);
    }
    extension.addTo(app);
    try {
        app.parse(count, values);
    } catch (const CLI::ParseError& error) {
        end(parsed, app, error);
    }
    return parsed;
}

}  // namespace cimhost
