#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/NamedValues.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

CMPIStatus addArg(const CMPIArgs* args, const char* name, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        ArgsContent& target = content(args);
        const std::string argumentName = argument(name);
        setNamed(target.values, argumentName, valueFrom(value, type));
    });
}

CMPIData getArg(const CMPIArgs* args, const char* name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(args);
        return namedData(object.content->values, name, arenaFor(object));
    });
}

CMPIData getArgAt(const CMPIArgs* args, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(args);
        return namedDataAt(object.content->values, index, name, arenaFor(object));
    });
}

CMPICount getArgCount(const CMPIArgs* args, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(args).values.size()); });
}

}  // namespace

const CMPIArgsFT argsTable{tableVersion, releaseObject<CMPIArgs>, cloneObject<CMPIArgs>, addArg, getArg, getArgAt,
                           getArgCount};

}  // namespace cimhost
