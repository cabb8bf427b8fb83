#include "Course.h"

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

/** The fixed keys of asset.dat, in the order in which they are read. */
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
    if (const auto* path = std::get_if<ObjectPath>(&event)) {
        const auto* wholePath = std::get_if<ObjectPath>(&whole);
        return wholePath != nullptr && isPartOf(*path, *wholePath);
    }
    const auto* instance = std::get_if<Instance>(&event);
    const auto* wholeInstance = std::get_if<Instance>(&whole);
    return instance != nullptr && wholeInstance != nullptr && isPartOf(instance->path, wholeInstance->path) &&
           isPartOf(instance->properties, wholeInstance->properties);
}

/** In the same order, with gaps. */
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

/** A directory in its place. */
void makeUnreadable(const fs::path& file) {
    fs::remove(file);
    fs::create_directory(file);
}

void askWithoutAsset(Scene& scene, const Request& request, Course& course) {
    scene.restart();
    makeUnreadable(scene.dataDirectory() / assetFile);
    course.withoutAsset = scene.ask(request).outcome;
    scene.unload();
    scene.configure({}, Scene::System::untold);
    course.withoutSystem = scene.ask(request).outcome;
    scene.configure({});
}

Lines linesOf(const std::string& content) {
    std::istringstream stream(content);
    Lines lines;
    for (std::string line; std::getline(stream, line);) {
        lines.push_back(line);
    }
    return lines;
}

}  // namespace

Course undisturbed(Scene& scene, const Request& request) {
    Course course;
    course.file = request.changes != nullptr ? request.changes : leaseFile;
    if (request.path.className == classOf(assetFile)) {
        askWithoutAsset(scene, request, course);
    }
    scene.restart();
    course.before = scene.instancesOf(classOf(course.file));
    course.fileBefore = scene.filesAtFirst().at(course.file);
    course.done = scene.ask(request);
    course.after = scene.instancesOf(classOf(course.file));
    course.fileAfter = scene.files().at(course.file);
    return course;
}

void expectPartOfAnswer(const Course& course, const testsupport::Outcome& outcome, bool lacksMemory) {
    std::vector<ResultEvents> possible{course.done.outcome.events, course.withoutAsset.events};
    if (lacksMemory) {
        possible.push_back(course.withoutSystem.events);
    }
    EXPECT_TRUE(std::any_of(possible.begin(), possible.end(), [&](const ResultEvents& each) {
        return isPartOf(outcome.events, each);
    })) << described(outcome.events);
    EXPECT_LE(outcome.doneCount, course.done.outcome.doneCount);
}

void expectSetInOrder(const Course& course, const Request& request, const Lines& now) {
    Lines halfWay = course.before;
    std::vector<Lines> possible{halfWay};
    for (const NamedValue& given : request.instance.properties) {
        for (std::size_t line = 0; line < halfWay.size(); ++line) {
            if (halfWay[line].rfind(given.name + "=", 0) == 0) {
                halfWay[line] = course.after.at(line);
            }
        }
        possible.push_back(halfWay);
    }
    EXPECT_EQ(possible.back(), course.after);
    EXPECT_THAT(possible, testing::Contains(now));
}

bool hindersReading(const Fault& fault) {
    constexpr std::array<std::pair<OperationKind, int>, 4> reading{{
        {operationOpen, 2},
        {operationStatus, 2},
        {operationRead, 1},
        {operationRead, 2},
    }};
    const bool isOfReading =
        std::find(reading.begin(), reading.end(), std::make_pair(fault.kind, fault.number)) != reading.end();
    return mayHinderReading(fault) && (!isOnFiles(fault.kind) || isOfReading);
}

bool mayHinderReading(const Fault& fault) {
    if (fault.lasting) {
        return false;  // it cannot be written either
    }
    const bool isOfReading =
        fault.kind == operationOpen || fault.kind == operationRead || fault.kind == operationStatus;
    const bool isPassedOver = fault.error == EINTR || fault.error == 0;
    return !isOnFiles(fault.kind) || (isOfReading && !isPassedOver);
}

std::string assetWithFields(const Course& course, std::size_t readFields) {
    const Lines before = linesOf(course.fileBefore);
    std::string content;
    for (const std::string& line : linesOf(course.fileAfter)) {
        const bool wasGiven = std::find(before.begin(), before.end(), line) == before.end();
        const std::string key = line.substr(0, line.find('='));
        const auto isRead = [&](const char* name) { return key == std::string("USER.") + name; };
        const bool keeps =
            wasGiven ||
            std::any_of(readInOrder.begin(), readInOrder.begin() + static_cast<std::ptrdiff_t>(readFields), isRead);
        content += (keeps ? line : key + "=") + "\n";
    }
    return content;
}

void expectAssetFile(const Course& course, const Fault& fault, const std::string& content) {
    std::vector<std::string> possible{course.fileBefore, course.fileAfter};
    if (mayHinderReading(fault)) {
        const std::size_t most = isOnFiles(fault.kind) ? 0 : readInOrder.size();
        for (std::size_t readFields = 0; readFields <= most; ++readFields) {
            possible.push_back(assetWithFields(course, readFields));
        }
    }
    EXPECT_THAT(possible, testing::Contains(content));
}

}  // namespace faults
