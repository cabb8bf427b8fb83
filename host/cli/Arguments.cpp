#include "cli/Arguments.h"

#include <CLI/CLI.hpp>
#include <map>
#include <sstream>

#include "Installation.h"
#include "cli/ExitStatus.h"
#include "cli/LoadArguments.h"
#include "cli/Suggestion.h"

namespace cimhost {
namespace {

constexpr auto introduction =
    "Runs requests on CMPI providers without an installed object manager.\n"
    "Providers come from registration files in SFCB's form, classes from MOF files.";

constexpr auto closing =
    R"(Object paths are WBEM URIs: [namespace:]Class[.Key=value,...]. String keys stand in quotation marks, which
a shell keeps only inside of quotes:

  cimhost ei Some_Class
  cimhost gi 'Some_Class.InstanceID="1"'
  cimhost mi 'Some_Class.InstanceID="1"' ElementName='a name' Size=5 Tags='{"a", "b"}' --null Owner
  cimhost ai 'root/cimv2:Some_System.Name="host"' --assoc-class Some_Association
  cimhost --format json ein Some_Class
  cimhost --schema my.mof --registration my.reg --library-path build/lib ei My_Class
  cimhost --as sfcb ci 'Some_Class.InstanceID="2"'
  cimhost --as pegasus load Some_Class --clients 32 --requests 100000

With --as, the providers meet the behaviour of another object manager. What would end its provider process is reported
as an error.

Environment: CIMHOST_SCHEMA, CIMHOST_REGISTRATION and CIMHOST_LIBRARY_PATH hold files or directories, separated
by colons, for what the options do not name.

Exit status: 0 success, 1 the request was answered with an error, 2 wrong usage, 3 a library, registration or
schema cannot be loaded, 4 the output cannot be written.)";

enum class Target { none, className, objectPath };

struct Command {
    std::optional<Operation> operation;
    const char* name;
    const char* shortName;  ///< null: none
    const char* description;
    Target target;
    bool assigns;     ///< takes NAME=VALUE
    bool associates;  ///< takes --assoc-class, --result-role
    bool refers;      ///< takes --result-class, --role
    bool lists;       ///< takes --property
    const char* example;
};

constexpr Command commands[] = {
    {Operation::enumerateInstances, "enumerate-instances", "ei", "List the instances of a class", Target::className,
     false, false, false, true, "cimhost ei Some_Class --property Size"},
    {Operation::enumerateInstanceNames, "enumerate-instance-names", "ein", "List the paths of a class's instances",
     Target::className, false, false, false, false, "cimhost --format json ein Some_Class"},
    {Operation::getInstance, "get-instance", "gi", "Show an instance", Target::objectPath, false, false, false, true,
     "cimhost gi 'Some_Class.InstanceID=\"1\"'"},
    {Operation::createInstance, "create-instance", "ci", "Create an instance and show its path", Target::objectPath,
     true, false, false, false, "cimhost ci 'Some_Class.InstanceID=\"1\"' ElementName='a name' Size=5"},
    {Operation::modifyInstance, "modify-instance", "mi", "Set properties of an instance", Target::objectPath, true,
     false, false, false, "cimhost mi 'Some_Class.InstanceID=\"1\"' Size=6 --null ElementName"},
    {Operation::deleteInstance, "delete-instance", "di", "Delete an instance", Target::objectPath, false, false, false,
     false, "cimhost di 'Some_Class.InstanceID=\"1\"'"},
    {Operation::associators, "associators", "ai", "List the instances associated with an instance", Target::objectPath,
     false, true, true, true, "cimhost ai 'Some_System.Name=\"host\"' --assoc-class Some_Association"},
    {Operation::associatorNames, "associator-names", "ain", "List the paths of the instances associated with one",
     Target::objectPath, false, true, true, false, "cimhost ain 'Some_System.Name=\"host\"' --result-class Some_Class"},
    {Operation::references, "references", "ri", "List the associations that refer to an instance", Target::objectPath,
     false, false, true, true, "cimhost ri 'Some_System.Name=\"host\"' --result-class Some_Association"},
    {Operation::referenceNames, "reference-names", "rin", "List the paths of the associations that refer to one",
     Target::objectPath, false, false, true, false, "cimhost rin 'Some_System.Name=\"host\"'"},
    {std::nullopt, "classes", nullptr, "List the classes and the providers that serve them", Target::none, false, false,
     false, false, "cimhost --schema my.mof classes"},
};

Format formatNamed(const std::string& word) {
    const std::map<std::string, Format> formats = {
        {"text", Format::text}, {"json", Format::json}, {"mof", Format::mof}};
    const auto found = formats.find(word);
    if (found == formats.end()) {
        throw CLI::ValidationError("--format", word + " is not one of text, json and mof");
    }
    return found->second;
}

Manager managerCalled(const std::string& word) {
    const std::optional<Manager> manager = managerNamed(word);
    if (!manager) {
        throw CLI::ValidationError("--as", word + " is not one of standard, sfcb, pegasus and pegasus-empty-key");
    }
    return *manager;
}

text::Colours coloursCalled(const std::string& word) {
    const std::map<std::string, text::Colours> wishes = {
        {"auto", text::Colours::automatic}, {"always", text::Colours::always}, {"never", text::Colours::never}};
    const auto found = wishes.find(word);
    if (found == wishes.end()) {
        throw CLI::ValidationError("--color", word + " is not one of auto, always and never");
    }
    return found->second;
}

void addCommonOptions(CLI::App& app, Arguments& arguments) {
    app.add_option("--schema", arguments.schemas, "MOF file with classes, or a directory of them (repeatable)")
        ->type_name("FILE")
        ->allow_extra_args(false);
    app.add_option("--registration", arguments.registrations,
                   "Provider registration file, or a directory of them (repeatable)")
        ->type_name("FILE")
        ->allow_extra_args(false);
    app.add_option("--library-path", arguments.libraryPaths, "Directory with provider libraries (repeatable)")
        ->type_name("DIR")
        ->allow_extra_args(false);
    app.add_option("--namespace", arguments.nameSpace, "Namespace of paths that name none")
        ->type_name("NAME")
        ->capture_default_str();
    const auto setFormat = [&arguments](const std::string& word) { arguments.format = formatNamed(word); };
    app.add_option_function<std::string>("--format", setFormat, "Form of the output: text (default), json or mof")
        ->type_name("FORM");
    const auto setManager = [&arguments](const std::string& word) { arguments.manager = managerCalled(word); };
    app.add_option_function<std::string>(
           "--as", setManager, "Object manager to behave like: standard (default), sfcb, pegasus or pegasus-empty-key")
        ->type_name("MANAGER");
    const auto setColours = [&arguments](const std::string& word) { arguments.colours = coloursCalled(word); };
    app.add_option_function<std::string>("--color", setColours,
                                         "Colours in text: auto (default: on a terminal), always or never")
        ->type_name("WHEN");
    app.add_flag("--raw", arguments.raw,
                 "Show exactly what the provider did: its status, each object it returned, its calls of returnDone");
}

void addCommand(CLI::App& app, const Command& command, Arguments& arguments) {
    CLI::App* sub = app.add_subcommand(command.name, command.description);
    sub->fallthrough();
    sub->footer(std::string("Example:\n\n  ") + command.example +
                "\n\nSee cimhost --help for options of all commands and for more examples.");
    if (command.shortName != nullptr) {
        sub->alias(command.shortName);
    }
    if (command.target == Target::className) {
        sub->add_option("CLASS", arguments.target, "Name of the class, [namespace:]Class")->required();
    } else if (command.target == Target::objectPath) {
        sub->add_option("PATH", arguments.target, "Object path, [namespace:]Class.Key=value,...")->required();
    }
    if (command.assigns) {
        sub->add_option("NAME=VALUE", arguments.assignments, "Value for a property; NAME= is the empty string");
        sub->add_option("--null", arguments.nulls, "Set this property to null (repeatable)")
            ->type_name("NAME")
            ->allow_extra_args(false);
    }
    if (command.associates) {
        sub->add_option("--assoc-class", arguments.filter.associationClass, "Association to follow")
            ->type_name("CLASS");
        sub->add_option("--result-role", arguments.filter.resultRole, "Role of the other instance")->type_name("NAME");
    }
    if (command.refers) {
        sub->add_option("--result-class", arguments.filter.resultClass, "Class of the results")->type_name("CLASS");
        sub->add_option("--role", arguments.filter.role, "Role of the instance given")->type_name("NAME");
    }
    if (command.lists) {
        sub->add_option("--property", arguments.properties, "Ask for this property only (repeatable)")
            ->type_name("NAME")
            ->allow_extra_args(false);
    }
    sub->callback([&arguments, &command] { arguments.operation = command.operation; });
}

/** All that could stand where a word does that is not known: names of commands, and options. */
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

/** What is wrong with words that neither a command nor an option takes, and what was perhaps meant. */
std::string unknownText(const CLI::App& app, const std::string& word) {
    const std::vector<CLI::App*> used = app.get_subcommands();
    const std::string command = used.empty() ? "" : used.front()->get_name() + " ";
    const std::string what = used.empty() ? "there is no command or option " + word : command + "takes no " + word;
    return what + didYouMean(word, wordsOf(app)) + "\nRun cimhost " + command + "--help for what there is.";
}

/** Ends the program with what help, version or the mistake have to say. */
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
    parsed.error = isUnknown && !unknown.empty() ? unknownText(app, unknown.front()) : problem.str();
    parsed.error.erase(parsed.error.find_last_not_of('\n') + 1);
}

}  // namespace

ParsedArguments parseArguments(int count, const char* const* values) {
    ParsedArguments parsed;
    CLI::App app(introduction, "cimhost");
    app.footer(closing);
    app.set_version_flag("--version", std::string("cimhost ") + installation::version);
    app.require_subcommand(1);
    addCommonOptions(app, parsed.arguments);
    for (const Command& command : commands) {
        addCommand(app, command, parsed.arguments);
    }
    addLoadCommand(app, parsed.arguments);
    try {
        app.parse(count, values);
    } catch (const CLI::ParseError& error) {
        end(parsed, app, error);
    }
    return parsed;
}

}  // namespace cimhost
