#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

CMPIData getNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        auto& object = self(enumeration);
        EnumerationContent& from = *object.content;
        if (from.taken >= from.elements.size()) {
            throw Failure(CMPI_RC_ERR_FAILED, "The enumeration has no more elements.");
        }
        CMPIData element = dataFrom(from.elements[from.taken++], from.type, arenaFor(object));
        element.state = from.state;
        return element;
    });
}

CMPIBoolean hasNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0, [&] {
        const EnumerationContent& from = content(enumeration);
        return static_cast<CMPIBoolean>(from.taken < from.elements.size() ? 1 : 0);
    });
}

/** All elements, also those taken already; the enumeration stays where it is. */
CMPIArray* toArray(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded<CMPIArray*>(rc, nullptr, [&] {
        const auto& object = self(enumeration);
        return arenaFor(object).make<CMPIArray>({object.content->type, object.content->elements});
    });
}

}  // namespace

const CMPIEnumerationFT enumerationTable{
    tableVersion, releaseObject<CMPIEnumeration>, cloneObject<CMPIEnumeration>, getNext, hasNext, toArray};

}  // namespace cimhost
