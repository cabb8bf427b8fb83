#include "support/AgentEnvironment.h"

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <stdexcept>

namespace agentEnvironment {

namespace {

namespace fs = std::filesystem;

/** Never destroyed: it is used after static objects are destroyed. */
std::string& root() {
    static std::string& path = *new std::string;
    return path;
}

void writeConfiguration(const fs::path& file) {
    const std::string version = &agentVersion != nullptr ? agentVersion : "4.2.0";
    const std::string log = &agentHasNoLog != nullptr ? "none" : logFile().string();
    std::ofstream stream(file);
    stream << "[directories]\ninstall = \"" << installDirectory().string() << "\"\ndata = \""
           << dataDirectory().string() << "\"\n[product]\nname = \"Test Agent\"\nversion = \"" << version << "\"\n"
           << "build_number = \"77\"\nidentifying_number = \"ID-1\"\nvendor = \"VEL\"\n"
           << "[log]\ndestination = \"" << log << "\"\nlog_level = 9999\ntrace_level = 9999\n"
           << "rotation_size = 2147483647\n"
           << "[instrumentation]\ndiscover = false\n"
           << agentNodes;
}

/** Runs before static objects are initialized, which loads the record tables. */
__attribute__((constructor(101))) void setUp() {
    std::string pattern = (fs::temp_directory_path() / "agent-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a directory for the agent");
    }
    root() = pattern;
    fs::create_directory(dataDirectory());
    fs::create_directory(installDirectory());
    const fs::path configuration = directory() / "agent.toml";
    writeConfiguration(configuration);
    setenv("OSTREL_CONFIG", configuration.c_str(), 1);
}

__attribute__((destructor(101))) void tearDown() {
    std::error_code ignored;
    fs::permissions(dataDirectory(), fs::perms::owner_all, ignored);
    fs::remove_all(directory(), ignored);
}

LogRecord parse(const std::string& line) {
    std::istringstream fields(line);
    LogRecord record;
    std::string time;
    std::string level;
    std::string number;
    std::getline(fields, time, '\t');
    std::getline(fields, record.channel, '\t');
    std::getline(fields, level, '\t');
    std::getline(fields, record.logger, '\t');
    std::getline(fields, record.function, '\t');
    std::getline(fields, record.file, '\t');
    std::getline(fields, number, '\t');
    std::getline(fields, record.text);
    record.level = std::stoi(level);
    record.line = std::stoi(number);
    return record;
}

}  // namespace

fs::path directory() {
    return root();
}

fs::path dataDirectory() {
    return directory() / "data";
}

fs::path installDirectory() {
    return directory() / "install";
}

fs::path logFile() {
    return directory() / "agent.log";
}

void clear() {
    fs::create_directories(dataDirectory());
    fs::permissions(dataDirectory(), fs::perms::owner_all);
    for (const auto& entry : fs::directory_iterator(dataDirectory())) {
        fs::remove_all(entry);
    }
    forgetLog();
}

std::vector<LogRecord> log() {
    std::ifstream stream(logFile());
    std::vector<LogRecord> records;
    for (std::string line; std::getline(stream, line);) {
        records.push_back(parse(line));
    }
    return records;
}

void forgetLog() {
    if (fs::exists(logFile())) {
        fs::resize_file(logFile(), 0);
    }
}

}  // namespace agentEnvironment
