#pragma once

#include <cmpidt.h>

#include <optional>
#include <string>
#include <vector>

namespace KO::ComputerSystem {

/** A computer of the agent's instrumentation tree, as the class VELKO_ComputerSystem shows it. */
struct Computer {
    std::string name;  ///< the key
    std::optional<std::string> vendor;
    std::optional<std::string> productName;  ///< "model - suffix"

    /** The part of the product name before its first dash; none without product name. */
    std::optional<std::string> model() const;
};

/** All computers of the tree that have a name, in tree order. */
std::vector<Computer> allComputers();

/** @name CIM objects of a computer
 * Created by the broker, which owns them; null if it fails.
 */
///@{
CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const Computer& computer);

/**
 * @param properties names of the wanted properties, in any letter case, ended by null; null for all. The key is always
 *                   there.
 */
CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace, const Computer& computer,
                           const char** properties);
///@}

}  // namespace KO::ComputerSystem
