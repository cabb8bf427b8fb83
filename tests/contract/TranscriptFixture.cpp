#include "TranscriptFixture.h"

#include <algorithm>
#include <iterator>
#include <map>
#include <regex>

namespace contract {

const std::string rule(78, '=');

Line lineOf(const std::string& text) {
    static const std::regex flow(
        R"((ENTERING|EXITING): (.+)\(\) in ([^ ]+) \[Line: ([0-9]+)\](?:,Parameters List: (.*))?)");
    static const std::regex method(R"(METHOD: (.+)\(\) was invoked in ([^ ]+) \[Line: ([0-9]+)\])");
    static const std::regex variable(R"(VARIABLE: '(.+)' has Value '(.*)' at line ([0-9]+) in ([^ ]+))");
    static const std::regex message(R"(MESSAGE \[File: ([^,]+), Line: ([0-9]+)\]: (.*))");
    std::smatch part;
    if (text == rule) {
        return {Line::requestRule, {}, {}, 0, {}};
    }
    if (std::regex_match(text, part, flow)) {
        return {part[1] == "ENTERING" ? Line::entering : Line::exiting, part[2], part[3], std::stoi(part[4]), part[5]};
    }
    if (std::regex_match(text, part, method)) {
        return {Line::method, part[1], part[2], std::stoi(part[3]), {}};
    }
    if (std::regex_match(text, part, variable)) {
        return {Line::variable, part[1], part[4], std::stoi(part[3]), part[2]};
    }
    if (std::regex_match(text, part, message)) {
        return {Line::message, {}, part[1], std::stoi(part[2]), part[3]};
    }
    return {};
}

std::vector<LogRecord> channel(const std::vector<LogRecord>& records, const char* name) {
    std::vector<LogRecord> found;
    std::copy_if(records.begin(), records.end(), std::back_inserter(found),
                 [&](const LogRecord& record) { return record.channel == name; });
    return found;
}

const std::vector<LogRecord>& TranscriptPropertyTest::recordsOf(const Scenario& scenario) {
    static std::map<std::string, std::vector<LogRecord>> known;
    const auto found = known.find(scenario.name);
    return found != known.end() ? found->second : known[scenario.name] = transcriptOf(scenario);
}

std::vector<LogRecord> TranscriptPropertyTest::logged(const std::string& scenarioName) {
    const auto scenario = std::find_if(scenarios().begin(), scenarios().end(),
                                       [&](const Scenario& each) { return each.name == scenarioName; });
    EXPECT_NE(scenario, scenarios().end()) << scenarioName;
    return channel(recordsOf(*scenario), "log");
}

std::vector<std::string> TranscriptPropertyTest::namesOf(const std::string& scenarioName, Line::Kind kind,
                                                         const std::string& file) {
    std::vector<std::string> names;
    for (const LogRecord& record : logged(scenarioName)) {
        const Line line = lineOf(record.text);
        if (line.kind == kind && record.file == file) {
            names.push_back(line.name);
        }
    }
    return names;
}

}  // namespace contract
