#pragma once

#include <string>
#include <vector>

#include "cli/Commands.h"

namespace cimhost {

/** Options of the command serve. */
struct ServeOptions {
    bool isChosen = false;
    std::string configuration{};
    std::vector<std::string> listen{};
    std::vector<std::string> listenTls{};
    std::string certificate{};
    std::string key{};
    std::string accessLog{};
    bool noAuthentication = false;
};

/** The command serve of cimhost: a server for clients of the network. */
class ServeCommand : public CommandExtension {
public:
    /** The command line with this command. The command must outlive it. */
    CommandLineExtension commandLine();

    bool hasCommand() const override { return options.isChosen; }
    CommandResult run(ObjectManager& manager, const Arguments& arguments, const Schema& schema) override;

private:
    ServeOptions options{};
};

}  // namespace cimhost
