#include <CLI/CLI.hpp>

#include "cli/Choice.h"
#include "cli/Commands.h"
#include "lab/program/LoadCommand.h"

// The test tool: the commands of cimhost under emulated object managers, and the load generator.

namespace cimhost::lab {
namespace {

constexpr auto introduction =
    "Runs requests on CMPI providers as other object managers do, and load-tests them. For tests only.\n"
    "Providers come from registration files in SFCB's form, classes from MOF files.";

constexpr auto examples = R"(  cimhost-lab --as sfcb ci 'Some_Class.InstanceID="2"'
  cimhost-lab --as pegasus load Some_Class --clients 32 --requests 100000
)";

constexpr auto notes =
    "With --as, another object manager is emulated. A response that would crash its provider process is reported\nas "
    "an "
    "error.\n";

/** The commands of the program, under the emulated manager. */
class LabCommands : public CommandExtension {
public:
    LabCommands() {
        program = "cimhost-lab";
        introduction = lab::introduction;
        examples = lab::examples;
        notes = lab::notes;
    }

    std::shared_ptr<const ManagerBehaviour> behaviour() const override { return emulationOf(manager); }

    void adapt(Request& request) const override {
        if (request.operation == Operation::modifyInstance && !clientsSendPropertyLists(manager)) {
            request.properties.reset();
        }
    }

    bool hasCommand() const override { return load.isGiven; }

    CommandResult run(ObjectManager& host, const Arguments& arguments, const Schema& schema) override {
        return runLoadCommand(host, manager, load, arguments, schema);
    }

    void addTo(CLI::App& app) override {
        std::vector<std::pair<std::string, Manager>> managers;
        for (const Manager each : everyManager) {
            managers.emplace_back(nameOf(each), each);
        }
        addChoice(app, "--as", "Object manager to emulate: standard (default), sfcb, pegasus or pegasus-empty-key",
                  manager, managers)
            ->type_name("MANAGER");
        addLoadCommand(app, load);
    }

private:
    Manager manager = Manager::standard;
    LoadArguments load{};
};

}  // namespace
}  // namespace cimhost::lab

int main(int count, char** values) {
    cimhost::lab::LabCommands commands;
    return cimhost::runProgram(count, values, commands);
}
