#include "cli/LoadArguments.h"

#include <CLI/CLI.hpp>

namespace cimhost {
namespace {

constexpr auto closing =
    R"(Each client creates instances of its own, whose keys begin with "load", and modifies, gets, enumerates and deletes
them. It knows what it was told, and holds every answer against it; now and then it asks for what is not there, and
creates what is there already. At the end, what is there is held against what all clients were told, and deleted.

A class needs one key, a string. What is modified are its properties with the qualifier Write. Associations are asked
for with --source, and must be the same as before the load.

Requests are as concurrent as the clients: a provider that is made for one request at a time answers wrongly, or ends
this program by a signal, and both say something about it. The exit status is 0 only when no answer was wrong.

  cimhost load Some_Class --clients 32 --requests 100000 --seed 7
  cimhost --as sfcb load Some_Class Other_Class --mix create=3,modify=4,delete=2,get=5
  cimhost load Some_Class --mix get=1,associate=1 --source 'Some_System.Name="host"' --assoc-class Some_Association

See cimhost --help for options of all commands.)";

}  // namespace

void addLoadCommand(CLI::App& app, Arguments& arguments) {
    LoadArguments& load = arguments.load;
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
    sub->callback([&arguments] { arguments.isLoad = true; });
}

}  // namespace cimhost
