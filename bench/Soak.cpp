#include "Soak.h"

#include "schema/ObjectPathText.h"

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>
#include <variant>

namespace bench {

namespace {

constexpr std::size_t records = 10;

// How often something other than reading is done: once in so many requests.
constexpr std::size_t changeEvery = 5;
constexpr std::size_t deletionEvery = 200;
constexpr std::size_t assetChangeEvery = 2000;  // each waits for the disk

template <class Row>
cimhost::ObjectPath recordPath(const std::string& id) {
    cimhost::ObjectPath path = classPath(Row::className);
    path.keys.push_back(textValue("InstanceID", id));
    return path;
}

cimhost::ObjectPath assetPath() {
    cimhost::ObjectPath path = classPath(AssetRow::className);
    const AssetRow row = makeRows<AssetRow>(1).front();
    for (const auto& key : AssetRow::keys) {
        path.keys.push_back(textValue(key.name, row.*key.member));
    }
    return path;
}

/** The class of an association or of instances, and how many there are to enumerate. */
struct Population {
    const char* className;
    std::size_t alone;
    std::size_t gated;  ///< the gate tells the associations that there are, not all pairs
};

constexpr Population populations[] = {
    {LeaseRow::className, records, records},
    {WarrantyRow::className, records, records},
    {AgentRow::className, 1, 1},
    {AssetRow::className, 1, 1},
    {"VELKO_LeaseSetting", records, 1},
    {"VELKO_WarrantySetting", records, 1},
};

/** Calls step so many times, and progress after each tenth of them. */
template <class Step>
void inTenths(std::size_t count, const Progress& progress, Step step) {
    for (std::size_t done = 1; done <= count; ++done) {
        step();
        if (done % std::max<std::size_t>(1, count / 10) == 0) {
            progress(done, holdings());
        }
    }
}

}  // namespace

Soak::Questions Soak::allReads(bool gated) {
    cimhost::ObjectPath computer = classPath("VELKO_ComputerSystem");
    computer.keys.push_back(textValue("Name", names::computer));
    Questions reads{{associators(computer, 1)}, {associatorNames(computer, 1)}, {getInstance(assetPath())}};
    Request missing = getInstance(recordPath<LeaseRow>("no such lease"));
    missing.answers = 0;
    missing.ends = !gated;
    reads.push_back({std::move(missing), gated ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_OK});
    for (const Population& each : populations) {
        const std::size_t answers = gated ? each.gated : each.alone;
        reads.push_back({enumInstances(each.className, answers)});
        reads.push_back({enumInstanceNames(each.className, answers)});
    }
    for (std::size_t index = 0; index < records; ++index) {
        reads.push_back({getInstance(recordPath<LeaseRow>(instanceIdOf(index, records)))});
        reads.push_back({getInstance(recordPath<WarrantyRow>(instanceIdOf(index, records)))});
    }
    return reads;
}

Soak::Questions Soak::allChanges() {
    Questions changes;
    for (const char* party : {"ACME", "A Party With A Name That Does Not Fit Into A Small String", ""}) {
        for (std::size_t index = 0; index < records; ++index) {
            const std::string id = instanceIdOf(index, records);
            changes.push_back({modifyInstance(recordPath<LeaseRow>(id), textValue(LeaseRow::modified.name, party))});
            changes.push_back(
                {modifyInstance(recordPath<WarrantyRow>(id), textValue(WarrantyRow::modified.name, party))});
        }
    }
    return changes;
}

Soak::Questions Soak::allCreations() {
    return {{createInstance(recordPath<LeaseRow>("for a moment"))},
            {createInstance(recordPath<WarrantyRow>("for a moment"))}};
}

Soak::Soak(Workbench& workbench, bool behindGate)
    : bench(workbench),
      gated(behindGate),
      reads(allReads(behindGate)),
      changes(allChanges()),
      creations(allCreations()),
      assetChange{modifyInstance(assetPath(), textValue("AssetNumber", "A-4711"))} {}

Interfaces Soak::load() {
    return bench.loadBoth(records, gated ? Entrance::gate() : Entrance::provided());
}

void Soak::perform(const Question& question, const Interfaces& interfaces) {
    const Outcome outcome = bench::perform(bench.broker(), question.request, interfaces);
    const auto isEnd = [](const cimhost::ResultEvent& event) { return std::holds_alternative<cimhost::Done>(event); };
    const auto ends = std::count_if(outcome.events.begin(), outcome.events.end(), isEnd);
    const std::size_t answers = outcome.events.size() - static_cast<std::size_t>(ends);
    const bool isEnded = !outcome.events.empty() && isEnd(outcome.events.back());
    if (outcome.status.rc != question.rc || answers != question.request.answers ||
        (question.request.ends && !isEnded)) {
        throw std::runtime_error(cimhost::formatObjectPath(question.request.path) + ": status " +
                                 std::to_string(outcome.status.rc) + ", not " + std::to_string(question.rc) + "; " +
                                 std::to_string(answers) + " answers, not " + std::to_string(question.request.answers) +
                                 (isEnded ? "; ended. " : "; not ended. ") + outcome.status.message);
    }
}

void Soak::createAndDelete(std::size_t number, const Interfaces& interfaces) {
    const Question& creation = creations[number % creations.size()];
    perform(creation, interfaces);
    perform({deleteInstance(creation.request.path)}, interfaces);
    ++deleted;
}

void Soak::performOne(const Interfaces& interfaces) {
    const auto number = static_cast<std::size_t>(random());
    if (number % assetChangeEvery == 0) {
        perform(assetChange, interfaces);
    } else if (number % deletionEvery == 0) {
        createAndDelete(number / deletionEvery, interfaces);
    } else if (number % changeEvery == 0) {
        perform(changes[number / changeEvery % changes.size()], interfaces);
    } else {
        perform(reads[number / changeEvery % reads.size()], interfaces);
    }
}

void Soak::request(std::size_t count, const Progress& progress) {
    const Interfaces interfaces = load();
    inTenths(count, progress, [&] { performOne(interfaces); });
    bench.unload();
}

void Soak::cycle(std::size_t count, const Progress& progress) {
    constexpr int uses = 20;
    inTenths(count, progress, [&] {
        const Interfaces interfaces = load();
        for (int use = 0; use < uses; ++use) {
            performOne(interfaces);
        }
        createAndDelete(0, interfaces);
        createAndDelete(1, interfaces);
        bench.unload();
    });
}

}  // namespace bench
