#include "lab/program/LoadCommand.h"

#include <CLI/CLI.hpp>
#include <limits>

#include "lab/load/Load.h"
#include "lab/program/LoadReport.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

constexpr auto closing =
    R"(Each client creates instances whose keys begin with "load", and modifies, gets, enumerates and deletes them. It checks
all responses against the changes that it made. Some requests are about instances that do not exist, or create ones
that exist. At the end, the instances of all clients are checked and deleted.

A class must have exactly one key, a string. Properties with the qualifier Write are modified. Associations require
--source, and must be the same as before the load.

The requests are concurrent: a provider that does not support this returns wrong responses, or ends this program by a
signal. The exit status is 0 only if no response was wrong.

  cimhost-lab load Some_Class --clients 32 --requests 100000 --seed 7
  cimhost-lab --as sfcb load Some_Class Other_Class --mix create=3,modify=4,delete=2,get=5
  cimhost-lab load Some_Class --mix get=1,associate=1 --source 'Some_System.Name="host"' --assoc-class Some_Association

See cimhost-lab --help for options of all commands.)";

constexpr auto usualMixWithAssociations = "create=20,modify=25,delete=15,enumerate=5,get=35,associate=5";

Mix mixOf(const LoadArguments& arguments) {
    if (!arguments.mix.empty()) {
        return Mix(arguments.mix);
    }
    return arguments.source.empty() ? Mix() : Mix(usualMixWithAssociations);
}

std::size_t shownOf(const std::string& option, Format format) {
    const bool isAll = option == "all" || (option.empty() && format == Format::json);
    return isAll ? std::numeric_limits<std::size_t>::max() : std::stoul(option.empty() ? "10" : option);
}

Plan planOf(const LoadArguments& given, Manager emulated, const Arguments& arguments, const Schema& schema) {
    Plan plan;
    for (const std::string& uri : given.classes) {
        const ObjectPath path = parseObjectPath(uri, schema, arguments.nameSpace);
        if (!path.keys.empty()) {
            throw UsageError(uri + " is the path of an instance; write a class");
        }
        plan.classes.push_back(loadClass(schema, path));
    }
    if (!given.source.empty()) {
        plan.source = parseObjectPath(given.source, schema, arguments.nameSpace);
    }
    plan.associationClass = given.associationClass;
    plan.clients = given.clients;
    plan.requests = given.requests;
    plan.seed = given.seed;
    plan.mix = mixOf(given);
    plan.fills = given.fills;
    plan.keeps = given.keeps;
    plan.listsChanges = clientsSendPropertyLists(emulated);
    plan.probes = !given.isTrusting;
    plan.shown = shownOf(given.shown, arguments.format);
    return plan;
}

std::string failureMessage(const Report& report) {
    return report.wrong == 0
               ? ""
               : std::to_string(report.wrong) + (report.wrong == 1 ? " answer was wrong" : " answers were wrong");
}

}  // namespace

void addLoadCommand(CLI::App& app, LoadArguments& load) {
    CLI::App* sub = app.add_subcommand("load", "Send requests of many concurrent clients and check all responses");
    sub->fallthrough();
    sub->footer(closing);
    sub->add_option("CLASS", load.classes, "Classes of the instances, [namespace:]Class")->required();
    sub->add_option("--clients", load.clients, "Number of clients")
        ->type_name("NUMBER")
        ->check(CLI::Range(1, 1024))
        ->capture_default_str();
    sub->add_option("--requests", load.requests, "Number of requests of all clients")
        ->type_name("NUMBER")
        ->check(CLI::Range(std::size_t{1}, std::size_t{100'000'000}))
        ->capture_default_str();
    sub->add_option("--seed", load.seed, "Seed of the random numbers: the same seed results in the same requests")
        ->type_name("NUMBER")
        ->capture_default_str();
    sub->add_option("--mix", load.mix,
                    "Weights of create, modify, delete, enumerate, get and associate; default "
                    "create=20,modify=25,delete=15,enumerate=5,get=35, and associate=5 with --source")
        ->type_name("NAME=WEIGHT,...");
    sub->add_option("--source", load.source, "Instance whose associations are requested")->type_name("PATH");
    sub->add_option("--assoc-class", load.associationClass, "Association to follow from it")->type_name("CLASS");
    sub->add_flag("--fill", load.fills, "Create instances with values, and expect these values");
    sub->add_flag("--keep", load.keeps, "Do not delete the instances at the end");
    sub->add_flag("--no-probes", load.isTrusting, "Do not request missing instances or create existing ones");
    sub->add_option("--show", load.shown, "Number of wrong responses to show, or all; default 10, in JSON all")
        ->type_name("NUMBER")
        ->check(CLI::IsMember({"all"}) | CLI::Range(std::size_t{0}, std::size_t{100'000'000}));
    sub->callback([&load] { load.isGiven = true; });
}

CommandResult runLoadCommand(ObjectManager& manager, Manager emulated, const LoadArguments& load,
                             const Arguments& arguments, const Schema& schema) {
    if (arguments.raw) {
        throw UsageError("--raw shows the response to one request; load sends many");
    }
    try {
        StatusOr<Report> result = runLoad(manager, planOf(load, emulated, arguments, schema));
        if (!result.ok()) {
            return {"", result.status};
        }
        Report& report = result.value;
        report.manager = nameOf(emulated);
        return {arguments.format == Format::json ? json::format(report) : text::format(report, arguments.style),
                {},
                failureMessage(report)};
    } catch (const PlanError& error) {
        throw UsageError(error.what());
    }
}

}  // namespace cimhost::lab
