#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/NamedValues.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

CMPIData getEntry(const CMPIContext* context, const char* name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(context);
        return namedData(object.content->entries, name, arenaFor(object));
    });
}

CMPIData getEntryAt(const CMPIContext* context, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(context);
        return namedDataAt(object.content->entries, index, name, arenaFor(object));
    });
}

CMPICount getEntryCount(const CMPIContext* context, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(context).entries.size()); });
}

CMPIStatus addEntry(const CMPIContext* context, const char* name, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        ContextContent& target = content(context);
        const std::string entryName = argument(name);
        setNamed(target.entries, entryName, valueFrom(value, type));
    });
}

}  // namespace

const CMPIContextFT contextTable{
    tableVersion, releaseObject<CMPIContext>, cloneObject<CMPIContext>, getEntry, getEntryAt, getEntryCount, addEntry};

}  // namespace cimhost
