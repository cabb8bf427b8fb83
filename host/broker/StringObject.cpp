#include "broker/Encapsulation.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

const char* getCharPtr(const CMPIString* string, CMPIStatus* rc) {
    return guarded<const char*>(rc, nullptr, [&]() -> const char* {
        const auto& object = self(string);
        return object.isHollow ? nullptr : object.content->c_str();
    });
}

}  // namespace

const CMPIStringFT stringTable{tableVersion, releaseObject<CMPIString>, cloneObject<CMPIString>, getCharPtr};

}  // namespace cimhost
