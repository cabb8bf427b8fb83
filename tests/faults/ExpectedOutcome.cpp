#include "ExpectedOutcome.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <filesystem>
#include <sstream>

#include "schema/MofWriter.h"
#include "support/Values.h"

namespace faults {

namespace {

namespace fs = std::filesystem;
using cimhost::Instance;
using cimhost::NamedValue;
using cimhost::ObjectPath;
using cimhost::ResultEvent;
using cimhost::ResultEvents;
using testing::AnyOf;

/** The fixed keys of asset.dat in the order in which they are read. */
constexpr std::array<const char*, 11> readInOrder{
    "AssetNumber",     "AssetIdTag",   "Name",     "Phone",       "Position",       "Department",
    "LastInventoried", "PurchaseDate", "Location", "ZOPMProfile", "ZOPMUpdateTime",
};

bool isPartOf(const std::vector<NamedValue>& values, const std::vector<NamedValue>& whole) {
    return std::all_of(values.begin(), values.end(), [&](const NamedValue& each) {
        const cimhost::Value* value = testsupport::find(whole, each.name);
        const bool isClock = each.name == "LocalDateTime";
        return value != nullptr &&
               (each.value.isNull || isClock || cimhost::formatMof(each.value) == cimhost::formatMof(*value));
    });
}

bool isPartOf(const ObjectPath& path, const ObjectPath& whole) {
    return path.nameSpace == whole.nameSpace && path.className == whole.className && isPartOf(path.keys, whole.keys);
}

bool isPartOf(const ResultEvent& event, const ResultEvent& whole) {
    if (const auto* path = cimhost::resultOf<ObjectPath>(event)) {
        const auto* wholePath = cimhost::resultOf<ObjectPath>(whole);
        return wholePath != nullptr && isPartOf(*path, *wholePath);
    }
    const auto* instance = cimhost::resultOf<Instance>(event);
    const auto* wholeInstance = cimhost::resultOf<Instance>(whole);
    return instance != nullptr && wholeInstance != nullptr && isPartOf(instance->path, wholeInstance->path) &&
           isPartOf(instance->properties, wholeInstance->properties);
}

/** Returns whether the events appear in `whole` in the same order, possibly with gaps. */
bool isPartOf(const ResultEvents& events, const ResultEvents& whole) {
    auto from = whole.begin();
    return std::all_of(events.begin(), events.end(), [&](const ResultEvent& event) {
        if (std::holds_alternative<cimhost::Done>(event)) {
            return true;
        }
        const auto found = std::find_if(from, whole.end(), [&](const auto& each) { return isPartOf(event, each); });
        from = found == whole.end() ? found : found + 1;
        return found != whole.end();
    });
}

std::string described(const ResultEvents& events) {
    std::string text;
    for (const Instance& instance : cimhost::eventsOf<Instance>(events)) {
        text += cimhost::formatMof(instance) + "\n";
    }
    for (const ObjectPath& path : cimhost::eventsOf<ObjectPath>(events)) {
        text += testsupport::toText(path) + "\n";
    }
    return text;
}

/** Replaces the file by a directory. */
void makeUnreadable(const fs::path& file) {
    fs::remove(file);
    fs::create_directory(file);
}

void runWithoutAsset(TestEnvironment& environment, const RequestCase& request, ExpectedOutcome& expected) {
    environment.restart();
    makeUnreadable(environment.dataDirectory() / assetFile);
    expected.withoutAsset = environment.ask(request).outcome;
    environment.unload();
    environment.configure({}, TestEnvironment::System::absent);
    expected.withoutSystem = environment.ask(request).outcome;
    environment.configure({});
}

Lines linesOf(const std::string& content) {
    std::istringstream stream(content);
    Lines lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

/** Returns whether a fault may prevent a modification from reading asset.dat, but not from writing it. */
bool mayPreventReading(const Fault& fault) {
    if (fault.lasting) {
        return false;  // writing fails as well
    }
    const bool isOfReading =
        fault.kind == operationOpen || fault.kind == operationRead || fault.kind == operationStatus;
    const bool isIgnored = fault.error == EINTR || fault.error == 0;
    return !isOnFiles(fault.kind) || (isOfReading && !isIgnored);
}

}  // namespace

ExpectedOutcome runWithoutFaults(TestEnvironment& environment, const RequestCase& request) {
    ExpectedOutcome expected;
    expected.file = request.changes != nullptr ? request.changes : leaseFile;
    if (request.path.className == classOf(assetFile)) {
        runWithoutAsset(environment, request, expected);
    }
    environment.restart();
    expected.before = environment.instancesOf(classOf(expected.file));
    expected.fileBefore = environment.filesAtFirst().at(expected.file);
    expected.response = environment.ask(request);
    expected.after = environment.instancesOf(classOf(expected.file));
    expected.fileAfter = environment.files().at(expected.file);
    return expected;
}

void expectPartOfAnswer(const ExpectedOutcome& expected, const testsupport::Outcome& outcome, bool lacksMemory) {
    std::vector<ResultEvents> possible{expected.response.outcome.events, expected.withoutAsset.events};
    if (lacksMemory) {
        possible.push_back(expected.withoutSystem.events);
    }
    EXPECT_TRUE(std::any_of(possible.begin(), possible.end(), [&](const ResultEvents& each) {
        return isPartOf(outcome.events, each);
    })) << described(outcome.events);
    EXPECT_LE(outcome.doneCount, expected.response.outcome.doneCount);
}

void expectSetInOrder(const ExpectedOutcome& expected, const RequestCase& request, const Lines& now) {
    Lines partial = expected.before;
    std::vector<Lines> possible{partial};
    for (const NamedValue& property : request.instance.properties) {
        for (std::size_t line = 0; line < partial.size(); ++line) {
            if (partial[line].rfind(property.name.string() + "=", 0) == 0) {
                partial[line] = expected.after.at(line);
            }
        }
        possible.push_back(partial);
    }
    EXPECT_EQ(possible.back(), expected.after);
    EXPECT_THAT(possible, testing::Contains(now));
}

bool preventsReading(const Fault& fault) {
    constexpr std::array<std::pair<OperationKind, int>, 4> reading{{
        {operationOpen, 2},
        {operationStatus, 2},
        {operationRead, 1},
        {operationRead, 2},
    }};
    const bool isOfReading =
        std::find(reading.begin(), reading.end(), std::make_pair(fault.kind, fault.number)) != reading.end();
    return mayPreventReading(fault) && (!isOnFiles(fault.kind) || isOfReading);
}

std::string assetWithFields(const ExpectedOutcome& expected, std::size_t readFields) {
    const Lines before = linesOf(expected.fileBefore);
    std::string content;
    for (const std::string& line : linesOf(expected.fileAfter)) {
        const bool wasSet = std::find(before.begin(), before.end(), line) == before.end();
        const std::string key = line.substr(0, line.find('='));
        const auto isRead = [&](const char* name) { return key == std::string("USER.") + name; };
        const bool keeps = wasSet || std::any_of(readInOrder.begin(),
                                                 readInOrder.begin() + static_cast<std::ptrdiff_t>(readFields), isRead);
        content += (keeps ? line : key + "=") + "\n";
    }
    return content;
}

void expectAssetFile(const ExpectedOutcome& expected, const Fault& fault, const std::string& content) {
    std::vector<std::string> possible{expected.fileBefore, expected.fileAfter};
    if (mayPreventReading(fault)) {
        const std::size_t most = isOnFiles(fault.kind) ? 0 : readInOrder.size();
        for (std::size_t readFields = 0; readFields <= most; ++readFields) {
            possible.push_back(assetWithFields(expected, readFields));
        }
    }
    EXPECT_THAT(possible, testing::Contains(content));
}

}  // namespace faults
