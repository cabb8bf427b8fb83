#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <utility>
#include <vector>

namespace cimhost {

/** Adds an option that accepts one of these names and sets the target to the name's value. */
template <class Target>
CLI::Option* addChoice(CLI::App& app, const std::string& option, const std::string& description, Target& target,
                       const std::vector<std::pair<std::string, Target>>& choices) {
    // CLI11 first runs the transformer that was added last. Without descriptions, the help does not repeat the names.
    return app.add_option(option, target, description)
        ->transform(CLI::Transformer(choices).description(""))
        ->transform(CLI::IsMember(choices).description(""));
}

}  // namespace cimhost
