#include "broker/DateTimes.h"
#include "broker/Encapsulation.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

/** A time before 1970 comes as the two's complement of the microseconds until then. */
CMPIUint64 getBinaryFormat(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIUint64>(rc, 0, [&] {
        const std::optional<std::int64_t> binary = microseconds(content(time).text);
        if (!binary) {
            throw Failure(CMPI_RC_ERR_FAILED, "A datetime with unknown fields has no binary form.");
        }
        return static_cast<CMPIUint64>(*binary);
    });
}

CMPIString* getStringFormat(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(time);
        return arenaFor(object).make<CMPIString>(object.content->text);
    });
}

CMPIBoolean isIntervalTime(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0,
                                [&] { return static_cast<CMPIBoolean>(isInterval(content(time).text) ? 1 : 0); });
}

}  // namespace

const CMPIDateTimeFT dateTimeTable{
    tableVersion,  releaseObject<CMPIDateTime>, cloneObject<CMPIDateTime>, getBinaryFormat, getStringFormat,
    isIntervalTime};

}  // namespace cimhost
