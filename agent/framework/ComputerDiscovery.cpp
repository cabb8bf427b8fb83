#include <unistd.h>

#include <algorithm>
#include <charconv>

#include "KO/NodeLexicon.h"
#include "cim/Names.h"
#include "cim/Utf8.h"
#include "configuration/FileContent.h"
#include "framework/NodeTree.h"

namespace KO {

namespace {

/** Placeholders that firmware contains for missing values. Letter case is ignored. */
constexpr const char* placeholders[] = {
    "",
    "default string",
    "invalid",
    "n/a",
    "none",
    "not applicable",
    "not available",
    "not specified",
    "o.e.m.",
    "oem",
    "product name",
    "system manufacturer",
    "system product name",
    "to be filled by o.e.m",
    "to be filled by o.e.m.",
    "undefined",
    "unknown",
};

/** SMBIOS names of chassis types, starting with type 1; empty for types that do not describe the chassis. */
constexpr const char* chassisWords[] = {
    "",  // Other
    "",  // Unknown
    "Desktop",
    "Low Profile Desktop",
    "Pizza Box",
    "Mini Tower",
    "Tower",
    "Portable",
    "Laptop",
    "Notebook",
    "Hand Held",
    "Docking Station",
    "All in One",
    "Sub Notebook",
    "Space-saving",
    "Lunch Box",
    "Main Server Chassis",
    "Expansion Chassis",
    "SubChassis",
    "Bus Expansion Chassis",
    "Peripheral Chassis",
    "RAID Chassis",
    "Rack Mount Chassis",
    "Sealed-case PC",
    "Multi-system chassis",
    "Compact PCI",
    "Advanced TCA",
    "Blade",
    "Blade Enclosure",
    "Tablet",
    "Convertible",
    "Detachable",
    "IoT Gateway",
    "Embedded PC",
    "Mini PC",
    "Stick PC",
};

bool isPlaceholder(const std::string& text) {
    return std::any_of(std::begin(placeholders), std::end(placeholders),
                       [&text](const char* placeholder) { return cim::sameName(placeholder, text); });
}

/**
 * Replaces each run of blanks, control characters and bytes that are not UTF-8 by one blank. Removes such runs at both
 * ends.
 */
std::string tidy(std::string_view text) {
    std::string tidied;
    for (; !text.empty();) {
        const cim::Utf8Character character = cim::firstCharacter(text);
        if (character.valid && character.codePoint > ' ' &&
            (character.codePoint < 0x7f || character.codePoint > 0x9f)) {
            tidied += text.substr(0, character.length);
        } else if (!tidied.empty() && tidied.back() != ' ') {
            tidied += ' ';
        }
        text.remove_prefix(character.length);
    }
    if (!tidied.empty() && tidied.back() == ' ') {
        tidied.pop_back();
    }
    return tidied;
}

/** Returns the result of tidy(); empty if it is a placeholder. */
std::string meaningful(std::string_view text) {
    std::string tidied = tidy(text);
    return isPlaceholder(tidied) ? std::string() : tidied;
}

/** Returns the value of a DMI file; empty if the file is absent or unreadable or contains a placeholder. */
std::string readDmi(const std::string& path, Agent::Problems& problems) {
    const Agent::FileContent file = Agent::readFile(path);
    if (file.error != 0 && !file.absent()) {
        problems.push_back(path + " cannot be read: " + Agent::errorText(file.error));
    }
    return meaningful(file.text);
}

std::string orElse(std::string text, const char* fallback) {
    return text.empty() ? fallback : text;
}

std::string chassisWord(const std::string& text) {
    constexpr unsigned int lockBit = 0x80;
    unsigned int type = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), type);
    type &= ~lockBit;
    if (error != std::errc() || end != text.data() + text.size() || type < 1 || type > std::size(chassisWords)) {
        return {};
    }
    return chassisWords[type - 1];
}

/** Returns "model - suffix". Readers take the model from before the first hyphen, so it must not contain one. */
std::string productName(std::string model, const std::string& chassis) {
    std::replace(model.begin(), model.end(), '-', ' ');
    return orElse(meaningful(model), "Computer") + " - " + orElse(chassisWord(chassis), "Computer");
}

}  // namespace

std::string hostName() {
    char name[256] = {};
    if (::gethostname(name, sizeof name - 1) != 0 || name[0] == '\0') {
        return "localhost";
    }
    return name;
}

NodeTree discoverComputer(const std::string& dmiRoot, const std::string& name, Agent::Problems& problems) {
    Node system;
    system.type = NodeLexicon::NT_SYSTEM;
    system.path = "/system";
    system.properties[NodeLexicon::PROPERTY_NAME] = name;
    system.properties[NodeLexicon::PROPERTY_VENDOR] = orElse(readDmi(dmiRoot + "sys_vendor", problems), "Unknown");
    system.properties[NodeLexicon::PROPERTY_PRODUCT_NAME] =
        productName(readDmi(dmiRoot + "product_name", problems), readDmi(dmiRoot + "chassis_type", problems));

    Node computer = system;
    computer.type = NodeLexicon::NT_COMPUTER;
    computer.path = "/system/computer";

    NodeTree tree;
    tree.put(std::move(system));
    tree.put(std::move(computer));
    return tree;
}

}  // namespace KO
