#pragma once

#include <gtest/gtest.h>

#include <cctype>
#include <fstream>
#include <string>

/** Returns the installed configuration file with its commented-out keys enabled. */
inline std::string shippedConfiguration() {
    std::ifstream file(AGENT_CONFIGURATION);
    EXPECT_TRUE(file) << AGENT_CONFIGURATION;
    std::string text;
    std::size_t keys = 0;
    for (std::string line; std::getline(file, line);) {
        const bool isKey = line.size() > 1 && line[0] == '#' && std::islower(static_cast<unsigned char>(line[1])) != 0;
        keys += isKey ? 1 : 0;
        text += line.substr(isKey ? 1 : 0) + '\n';
    }
    EXPECT_GT(keys, 0U) << "no key is commented out";
    return text;
}
