#include "Formatting.h"

#include <algorithm>
#include <sstream>

#include "schema/MofWriter.h"
#include "support/Files.h"

namespace gatetest {

namespace {

using cimhost::ProviderResponse;

struct RecordFile {
    const char* name;
    const char* empty;  ///< a record with initial values, without its identifier
};

constexpr RecordFile recordFiles[] = {
    {"Lease.dat", "*\n00000000000000.000000-000\n0\n0\n0\n0\n0\n*\n*\n*\n*\n0\n"},
    {"Warranty.dat", "*\n00000000000000.000000-000\n0\n"},
};
constexpr const char* otherFiles[] = {"asset.dat"};

std::string contentOf(const std::string& name) {
    const auto file = agentEnvironment::dataDirectory() / name;
    return std::filesystem::exists(file) ? testsupport::readFile(file) : "";
}

std::string formatted(const cimhost::Value& value) {
    if (!value.isNull && value.elements().size() == 1) {
        const cimhost::Scalar& only = value.single;
        if (const auto* characters = std::get_if<std::string>(&only)) {
            return *characters;
        }
        if (const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&only)) {
            return gatetest::formatted(**path);
        }
    }
    return cimhost::formatMof(value);
}

/** Returns the paths of the results, which are paths or instances. */
std::vector<ObjectPath> pathsOf(const cimhost::Response& response) {
    std::vector<ObjectPath> paths = response.paths;
    for (const Instance& instance : response.instances) {
        paths.push_back(instance.path);
    }
    return paths;
}

bool isProvidersFailure(const cimhost::Response& response) {
    return std::any_of(response.providers.begin(), response.providers.end(),
                       [](const ProviderResponse& each) { return !each.status.ok(); });
}

/**
 * Formats the identifier and the first string of each record in a file, with spaces instead of underscores. Ignores the
 * number of records that the file states.
 */
std::string formattedRecords(const std::string& content, const RecordFile& file) {
    const std::string empty = file.empty;
    const auto lines = 1 + std::count(empty.begin(), empty.end(), '\n');
    std::istringstream stream(content);
    std::string line;
    std::getline(stream, line);
    std::string all;
    for (std::ptrdiff_t number = 0; std::getline(stream, line); ++number) {
        std::replace(line.begin(), line.end(), '_', ' ');
        if (number % lines == 0) {
            all += " " + (line.empty() ? "(empty)" : line);
        } else if (number % lines == 1 && line != "*") {
            all += "(" + line + ")";
        }
    }
    return all;
}

}  // namespace

std::string formatted(const ObjectPath& path) {
    const std::string prefix = "VELKO_";
    const bool isOurs = path.className.compare(0, prefix.size(), prefix) == 0;
    std::string text = (isOurs ? path.className.substr(prefix.size()) : path.className) + "[";
    for (const NamedValue& key : path.keys) {
        text += (&key == path.keys.data() ? "" : ",") + formatted(key.value);
    }
    return text + "]";
}

std::string formatted(const cimhost::Response& response) {
    if (!response.crashReason().empty()) {
        return "died";
    }
    if (!response.ok()) {
        return (isProvidersFailure(response) ? "error " : "manager's error ") + std::to_string(response.status.rc);
    }
    std::string text;
    for (const ObjectPath& path : pathsOf(response)) {
        text += (text.empty() ? "" : " ") + formatted(path);
    }
    return text;
}

DataFiles::DataFiles() {
    for (const RecordFile& file : recordFiles) {
        contents.emplace_back(file.name, contentOf(file.name));
    }
    for (const char* name : otherFiles) {
        contents.emplace_back(name, contentOf(name));
    }
}

std::string DataFiles::changes() const {
    std::string notes;
    for (const auto& [name, before] : contents) {
        const std::string now = contentOf(name);
        if (now == before) {
            continue;
        }
        notes += "; " + name;
        for (const RecordFile& file : recordFiles) {
            notes += name == file.name ? ":" + formattedRecords(now, file) : "";
        }
    }
    return notes;
}

void writeRecords(const std::vector<std::string>& identifiers) {
    for (const RecordFile& file : recordFiles) {
        std::string content = std::to_string(identifiers.size()) + "\n";
        for (const std::string& id : identifiers) {
            content += id + "\n" + file.empty;
        }
        testsupport::writeFile(agentEnvironment::dataDirectory() / file.name, content);
    }
}

}  // namespace gatetest
