#include "Computer.h"

#include "KO/Instrumentation.h"
#include "KO/ProviderUtilities.h"
#include "cim/Names.h"

namespace KO::ComputerSystem {

namespace {

constexpr const char* className = "VELKO_ComputerSystem";
constexpr const char* keyName = "Name";

/** One property of the class: its CIM name and its value. */
struct Property {
    const char* name;
    std::optional<std::string> (*value)(const Computer& computer);
};

const Property properties[] = {
    {keyName, [](const Computer& computer) { return std::make_optional(computer.name); }},
    {"Caption", [](const Computer&) { return std::make_optional<std::string>("Computer System"); }},
    {"Description", [](const Computer& computer) { return std::make_optional("Computer system " + computer.name); }},
    {"ElementName", [](const Computer& computer) { return std::make_optional(computer.name); }},
    {"Vendor", [](const Computer& computer) { return computer.vendor; }},
    {"Model", [](const Computer& computer) { return computer.model(); }},
    {"ProductName", [](const Computer& computer) { return computer.productName; }},
};

std::optional<std::string> read(Instrumentation& node, NodeLexicon::Properties property) {
    std::string text;
    return node.getProperty(property, text) ? std::make_optional(text) : std::nullopt;
}

bool isWanted(const char* name, const char** wanted) {
    if (wanted == nullptr || cim::sameName(name, keyName)) {
        return true;
    }
    for (; *wanted != nullptr; ++wanted) {
        if (cim::sameName(name, *wanted)) {
            return true;
        }
    }
    return false;
}

}  // namespace

std::optional<std::string> Computer::model() const {
    if (!productName) {
        return std::nullopt;
    }
    std::string text = productName->substr(0, productName->find('-'));
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

std::vector<Computer> allComputers() {
    std::vector<Computer> computers;
    Instrumentation node;
    for (node.selectNode(NodeLexicon::NT_COMPUTER); node; ++node) {
        if (const std::optional<std::string> name = read(node, NodeLexicon::PROPERTY_NAME)) {
            computers.push_back(
                {*name, read(node, NodeLexicon::PROPERTY_VENDOR), read(node, NodeLexicon::PROPERTY_PRODUCT_NAME)});
        }
    }
    return computers;
}

CMPIObjectPath* makePath(const CMPIBroker* broker, const std::string& nameSpace, const Computer& computer) {
    CMPIObjectPath* path = ProviderUtilities::createObjectPath(broker, className, nameSpace);
    ProviderUtilities::setKeyProperty(path, keyName, computer.name);
    return path;
}

CMPIInstance* makeInstance(const CMPIBroker* broker, const std::string& nameSpace, const Computer& computer,
                           const char** wanted) {
    CMPIInstance* instance = ProviderUtilities::createInstance(broker, makePath(broker, nameSpace, computer));
    for (const Property& property : properties) {
        std::optional<std::string> value = isWanted(property.name, wanted) ? property.value(computer) : std::nullopt;
        if (value) {
            ProviderUtilities::setProperty(instance, property.name, *value);
        }
    }
    return instance;
}

}  // namespace KO::ComputerSystem
