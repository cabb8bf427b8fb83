#pragma once

#include <CLI/CLI.hpp>
#include <algorithm>
#include <string>
#include <utility>
#include <vector>

namespace cimhost {

/** "a, b and c" */
inline std::string listOf(const std::vector<std::string>& words) {
    std::string list;
    for (std::size_t i = 0; i < words.size(); ++i) {
        list += (i == 0 ? "" : i + 1 == words.size() ? " and " : ", ") + words[i];
    }
    return list;
}

/** Adds an option that takes one of these names, and sets the target to the name's value. */
template <class Target>
CLI::Option* addChoice(CLI::App& app, const std::string& option, const std::string& description, Target& target,
                       std::vector<std::pair<std::string, Target>> choices) {
    const auto choose = [option, &target, choices = std::move(choices)](const std::string& name) {
        std::vector<std::string> names;
        for (const auto& [each, value] : choices) {
            if (each == name) {
                target = value;
                return;
            }
            names.push_back(each);
        }
        throw CLI::ValidationError(option, name + " is not one of " + listOf(names));
    };
    return app.add_option_function<std::string>(option, choose, description);
}

}  // namespace cimhost
