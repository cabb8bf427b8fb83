#include <systemd/sd-id128.h>

#include <charconv>

#include "framework/AgentState.h"

namespace KO {

namespace {

constexpr std::int64_t largestNumber = 0xFFFF;

/** A number that is derived from the machine id but does not reveal it; "unknown" if it cannot be derived. */
std::string defaultIdentifyingNumber() {
    sd_id128_t agent{};
    sd_id128_t number{};
    if (::sd_id128_from_string("5d3e0c948a174b629f26c170de48b305", &agent) < 0 ||
        ::sd_id128_get_machine_app_specific(agent, &number) < 0) {
        return "unknown";
    }
    char text[SD_ID128_STRING_MAX];
    return ::sd_id128_to_string(number, text);
}

std::string directory(Agent::TableReader& table, std::string_view key, const char* defaultDirectory) {
    std::string path = defaultDirectory;
    if (std::optional<std::string> configured = table.nonEmptyString(key)) {
        if (configured->front() == '/' && configured->find('\0') == std::string::npos) {
            path = std::move(*configured);
        } else {
            table.reject(key, "must be an absolute path");
        }
    }
    if (path.back() != '/') {
        path += '/';
    }
    return path;
}

void readDirectories(Agent::TableReader table, AgentSettings& settings) {
    settings.installDirectory = directory(table, "install", "/usr/lib/ostrel/");
    settings.dataDirectory = directory(table, "data", "/var/lib/ostrel/");
    table.rejectUnknownKeys();
}

void readProduct(Agent::TableReader table, AgentSettings& settings) {
    auto& product = settings.product;
    product.name = table.nonEmptyString("name").value_or("Ostrel");
    product.version = table.nonEmptyString("version").value_or(AGENT_VERSION);
    product.buildNumber = table.nonEmptyString("build_number").value_or("1");
    if (std::optional<std::string> number = table.nonEmptyString("identifying_number")) {
        product.identifyingNumber = std::move(*number);
    } else {  // derived only if needed, since this reads a file
        product.identifyingNumber = defaultIdentifyingNumber();
    }
    product.vendor = table.nonEmptyString("vendor").value_or("VEL");
    table.rejectUnknownKeys();
}

std::optional<unsigned int> propertyNumber(const std::string& text) {
    unsigned int number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    const bool whole = error == std::errc() && end == text.data() + text.size();
    return whole && number <= largestNumber ? std::optional<unsigned int>(number) : std::nullopt;
}

void readProperties(Agent::TableReader table, Node& node) {
    for (auto& [key, value] : table.allStrings()) {
        if (const std::optional<unsigned int> number = propertyNumber(key)) {
            node.properties[*number] = value;
        } else {
            table.reject(key, "is not a property number");
        }
    }
}

void readNode(Agent::TableReader& table, std::vector<Node>& nodes) {
    const std::optional<std::int64_t> type = table.number("type", 0, largestNumber);
    const std::optional<std::string> path = table.nonEmptyString("path");
    Node node;
    readProperties(table.table("properties"), node);
    table.rejectUnknownKeys();
    for (const char* key : {"type", "path"}) {
        if (!table.has(key)) {
            table.reject(key, "is missing");
        }
    }
    if (type && path) {
        node.type = static_cast<unsigned int>(*type);
        node.path = *path;
        nodes.push_back(std::move(node));
    }
}

void readInstrumentation(Agent::TableReader table, AgentSettings& settings) {
    settings.dmiRoot = directory(table, "dmi_root", "/sys/class/dmi/id/");
    settings.discover = table.flag("discover").value_or(true);
    for (Agent::TableReader& node : table.tables("node")) {
        readNode(node, settings.nodes);
    }
    table.rejectUnknownKeys();
}

void readGate(Agent::TableReader table, AgentSettings& settings) {
    if (const std::optional<bool> refuses = table.flag("refuse_lossy_values")) {
        settings.flags["gate.refuse_lossy_values"] = *refuses;
    }
    table.rejectUnknownKeys();
}

}  // namespace

AgentSettings readAgentSettings(const Agent::Document& document, Agent::Problems& problems) {
    AgentSettings settings;
    Agent::TableReader root = document.root(problems);
    readDirectories(root.table("directories"), settings);
    readProduct(root.table("product"), settings);
    readInstrumentation(root.table("instrumentation"), settings);
    readGate(root.table("gate"), settings);
    root.has("log");  // read by the logging library
    root.rejectUnknownKeys();
    return settings;
}

}  // namespace KO
