#include "Soak.h"

#include <algorithm>
#include <stdexcept>
#include <string>

namespace bench {

namespace {

constexpr std::size_t records = 10;

// How often something other than reading is done: once in so many requests.
constexpr std::size_t changeEvery = 5;
constexpr std::size_t deletionEvery = 200;
constexpr std::size_t assetChangeEvery = 2000;  // each waits for the disk

cimhost::ObjectPath leasePath(const std::string& id) {
    cimhost::ObjectPath path = classPath(LeaseRow::className);
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

std::vector<Request> allReads() {
    cimhost::ObjectPath computer = classPath("VELKO_ComputerSystem");
    computer.keys.push_back(textValue("Name", names::computer));
    std::vector<Request> reads{associators(computer, 1), associatorNames(computer, 1), getInstance(assetPath()),
                               getInstance(leasePath("no such lease"))};
    for (const char* className : {LeaseRow::className, WarrantyRow::className, AgentRow::className, AssetRow::className,
                                  "VELKO_LeaseSetting", "VELKO_WarrantySetting"}) {
        reads.push_back(enumInstances(className, 0));
        reads.push_back(enumInstanceNames(className, 0));
    }
    for (std::size_t index = 0; index < records; ++index) {
        reads.push_back(getInstance(leasePath(instanceIdOf(index, records))));
    }
    return reads;
}

std::vector<Request> allChanges() {
    std::vector<Request> changes;
    for (const char* lessor : {"ACME", "A Lessor With A Name That Does Not Fit Into A Small String", ""}) {
        for (std::size_t index = 0; index < records; ++index) {
            changes.push_back(
                modifyInstance(leasePath(instanceIdOf(index, records)), textValue(LeaseRow::modified.name, lessor)));
        }
    }
    return changes;
}

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

Soak::Soak(Workbench& workbench, bool behindGate)
    : bench(workbench),
      gated(behindGate),
      reads(allReads()),
      changes(allChanges()),
      assetChange(modifyInstance(assetPath(), textValue("AssetNumber", "A-4711"))) {}

Interfaces Soak::load() {
    bench.unload();
    return gated ? bench.loadedTwice<LeaseRow>(records).second : bench.loaded<LeaseRow>(records);
}

void Soak::perform(const Request& request, const Interfaces& interfaces) {
    const Outcome outcome = bench::perform(bench.broker(), request, interfaces);
    const bool mayBeMissing = gated && outcome.status.rc == CMPI_RC_ERR_NOT_FOUND;
    const bool mayBeUnsupported = gated && outcome.status.rc == CMPI_RC_ERR_NOT_SUPPORTED;
    if (outcome.status.rc != CMPI_RC_OK && !mayBeMissing && !mayBeUnsupported) {
        throw std::runtime_error("status " + std::to_string(outcome.status.rc) + ": " + outcome.status.message);
    }
}

void Soak::createAndDelete(const Interfaces& interfaces) {
    const cimhost::ObjectPath path = leasePath("for a moment");
    perform(createInstance(path), interfaces);
    perform(deleteInstance(path), interfaces);
    ++deleted;
}

void Soak::performOne(const Interfaces& interfaces) {
    const auto number = static_cast<std::size_t>(random());
    if (number % assetChangeEvery == 0) {
        perform(assetChange, interfaces);
    } else if (number % deletionEvery == 0) {
        createAndDelete(interfaces);
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
        createAndDelete(interfaces);
        bench.unload();
    });
}

}  // namespace bench
