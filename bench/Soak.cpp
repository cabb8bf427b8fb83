#include "Soak.h"

#include <algorithm>
#include <string>

namespace bench {

namespace {

using cimhost::ObjectPath;
using cimhost::Request;

constexpr std::size_t records = 10;

// Mean number of requests per change, per deletion, and per change of the asset data.
constexpr std::size_t changeEvery = 5;
constexpr std::size_t deletionEvery = 200;
constexpr std::size_t assetChangeEvery = 2000;  // each waits for the disk

/** A class and the number of its instances. */
struct Population {
    const char* className;
    std::size_t alone;
    std::size_t gated;  ///< the gate returns the existing associations, the provider all pairs
};

constexpr Population populations[] = {
    {LeaseRow::className, records, records},
    {WarrantyRow::className, records, records},
    {AgentRow::className, 1, 1},
    {AssetRow::className, 1, 1},
    {names::leaseSettingClass, records, 1},
    {"VELKO_WarrantySetting", records, 1},
};

ObjectPath assetPath() {
    return productPath(makeRows<AssetRow>(1).front());
}

/** Calls step this number of times, and progress after each tenth of the calls. */
template <class Step>
void inTenths(std::size_t count, const Progress& progress, Step step) {
    for (std::size_t done = 1; done <= count; ++done) {
        step();
        if (done % std::max<std::size_t>(1, count / 10) == 0) {
            progress(done, processResources());
        }
    }
}

}  // namespace

Soak::Requests Soak::allReads(bool gated) {
    const ObjectPath computer = computerPath(names::computer);
    const ObjectPath missing = recordPath(LeaseRow::className, "no such lease");
    Requests reads{{Request::associators(computer, leaseSettings()), 1},
                   {Request::associatorNames(computer, leaseSettings()), 1},
                   {Request::getInstance(assetPath()), 1},
                   {Request::getInstance(missing), 0, static_cast<int>(gated ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_OK)}};
    for (const Population& each : populations) {
        const std::size_t results = gated ? each.gated : each.alone;
        reads.push_back({Request::enumerateInstances(classPath(each.className)), results});
        reads.push_back({Request::enumerateInstanceNames(classPath(each.className)), results});
    }
    for (std::size_t index = 0; index < records; ++index) {
        for (const char* className : {LeaseRow::className, WarrantyRow::className}) {
            reads.push_back({Request::getInstance(recordPath(className, instanceIdOf(index, records))), 1});
        }
    }
    return reads;
}

Soak::Requests Soak::allChanges() {
    Requests changes;
    for (const char* party : {"ACME", "A Party With A Name That Does Not Fit Into A Small String", ""}) {
        for (std::size_t index = 0; index < records; ++index) {
            const std::string id = instanceIdOf(index, records);
            changes.push_back(
                {modification(recordPath(LeaseRow::className, id), namedString(LeaseRow::modified.name, party))});
            changes.push_back(
                {modification(recordPath(WarrantyRow::className, id), namedString(WarrantyRow::modified.name, party))});
        }
    }
    return changes;
}

Soak::Requests Soak::allCreations() {
    return {{creation(recordPath(LeaseRow::className, "for a moment")), 1},
            {creation(recordPath(WarrantyRow::className, "for a moment")), 1}};
}

Soak::Soak(Environment& itsEnvironment, bool behindGate)
    : environment(itsEnvironment),
      gated(behindGate),
      reads(allReads(behindGate)),
      changes(allChanges()),
      creations(allCreations()),
      assetChange{modification(assetPath(), namedString("AssetNumber", "A-4711"))} {}

Interfaces Soak::load() {
    return environment.loadBoth(records, gated ? ProviderEntry::ofGate() : ProviderEntry::ofProvider());
}

void Soak::perform(const ExpectedRequest& request, const Interfaces& interfaces) {
    requireExpected(request, bench::perform(environment.broker(), request.request, interfaces));
}

void Soak::createAndDelete(std::size_t number, const Interfaces& interfaces) {
    const ExpectedRequest& created = creations[number % creations.size()];
    perform(created, interfaces);
    perform({Request::deleteInstance(created.request.path)}, interfaces);
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
    environment.unload();
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
        environment.unload();
    });
}

}  // namespace bench
