#include "lab/program/LoadCommand.h"

#include <CLI/CLI.hpp>
#include <limits>

#include "cli/ExitStatus.h"
#include "lab/load/Load.h"
#include "lab/program/LoadReport.h"
#include "schema/ObjectPathText.h"

namespace cimhost::lab {
namespace {

constexpr auto closing =
    R"(Each client creates instances of its own, whose keys begin with "load", and modifies, gets, enumerates and deletes
them. It knows what it was told, and holds every answer against it; now and then it asks for what is not there, and
creates what is there already. At the end, what is there is held against what all clients were told, and deleted.

A class needs one key, a string. What is modified are its properties with the qualifier Write. Associations are asked
for with --source, and must be the same as before the load.

Requests are as concurrent as the clients: a provider that is made for one request at a time answers wrongly, or ends
this program by a signal, and both say something about it. The exit status is 0 only when no answer was wrong.

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

std::size_t shownOf(const std::string& given, Format format) {
    const bool isAll = given == "all" || (given.empty() && format == Format::json);
    return isAll ? std::numeric_limits<std::size_t>::max() : std::stoul(given.empty() ? "10" : given);
}

Plan planOf(const LoadArguments& given, Manager emulated, const Arguments& arguments, const Schema& schema) {
    Plan plan;
    for (const std::string& text : given.classes) {
        const ObjectPath path = parseObjectPath(text, schema, arguments.nameSpace);
        if (!path.keys.empty()) {
            throw UsageError(text + " names an instance; name a class");
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

std::string failureText(const Report& report) {
    return report.wrong == 0
               ? ""
               : std::to_string(report.wrong) + (report.wrong == 1 ? " answer was wrong" : " answers were wrong");
}

}  // namespace

void addLoadCommand(CLI::App& app, LoadArguments& load) {
    CLI::App* sub = app.add_subcommand("load", "Send requests of many clients at a time and check every answer");
    sub->fallthrough();
    sub->footer(closing);
    sub->add_option("CLASS", load.classes, "Classes to work on, [namespace:]Class")->required();
    sub->add_option("--clients", load.clients, "How many clients")
        ->type_name("NUMBER")
        ->check(CLI::Range(1, 1024))
        ->capture_default_str();
    sub->add_option("--requests", load.requests, "How many requests, of all clients together")
        ->type_name("NUMBER")
        ->check(CLI::Range(std::size_t{1}, std::size_t{100'000'000}))
        ->capture_default_str();
    sub->add_option("--seed", load.seed, "Where the random numbers start: the same seed is the same load")
        ->type_name("NUMBER")
        ->capture_default_str();
    sub->add_option("--mix", load.mix,
                    "How often what is done: create, modify, delete, enumerate, get, associate; usually "
                    "create=20,modify=25,delete=15,enumerate=5,get=35, and associate=5 with --source")
        ->type_name("NAME=WEIGHT,...");
    sub->add_option("--source", load.source, "Instance whose associations are asked for")->type_name("PATH");
    sub->add_option("--assoc-class", load.associationClass, "Association to follow from there")->type_name("CLASS");
    sub->add_flag("--fill", load.fills, "Send values along at creation, and expect them to be there");
    sub->add_flag("--keep", load.keeps, "Leave the instances there at the end");
    sub->add_flag("--no-probes", load.isTrusting, "Ask only for what is there, create only what is not");
    sub->add_option("--show", load.shown, "How many wrong answers to show, or all; usually 10, in JSON all")
        ->type_name("NUMBER")
        ->check(CLI::IsMember({"all"}) | CLI::Range(std::size_t{0}, std::size_t{100'000'000}));
    sub->callback([&load] { load.isGiven = true; });
}

CommandResult runLoadCommand(ObjectManager& manager, Manager emulated, const LoadArguments& load,
                             const Arguments& arguments, const Schema& schema) {
    if (arguments.raw) {
        throw UsageError("--raw shows what a provider did with one request; load has many");
    }
    try {
        StatusOr<Report> answer = runLoad(manager, planOf(load, emulated, arguments, schema));
        if (!answer.ok()) {
            return {"", answer.status};
        }
        Report& report = answer.value;
        report.manager = nameOf(emulated);
        return {arguments.format == Format::json ? json::format(report) : text::format(report, arguments.style),
                {},
                failureText(report)};
    } catch (const PlanError& error) {
        throw UsageError(error.what());
    }
}

}  // namespace cimhost::lab
