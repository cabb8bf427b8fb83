#include "broker/Convert.h"
#include "broker/Encapsulation.h"
#include "broker/Tables.h"

namespace cimhost {
namespace {

/** The element at that position. Failure with CMPI_RC_ERR_NO_SUCH_PROPERTY when there is none. */
Scalar& elementAt(ArrayContent& array, CMPICount index) {
    if (index >= array.elements.size()) {
        throw Failure(CMPI_RC_ERR_NO_SUCH_PROPERTY);
    }
    return array.elements[index];
}

CMPICount getSize(const CMPIArray* array, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(array).elements.size()); });
}

CMPIType getSimpleType(const CMPIArray* array, CMPIStatus* rc) {
    return guarded<CMPIType>(rc, CMPI_null, [&] { return content(array).type; });
}

CMPIData getElementAt(const CMPIArray* array, CMPICount index, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        auto& object = self(array);
        return dataFrom(elementAt(*object.content, index), object.content->type, arenaFor(object));
    });
}

CMPIStatus setElementAt(CMPIArray* array, CMPICount index, const CMPIValue* value, CMPIType type) {
    return guarded([&] {
        ArrayContent& target = content(array);
        Scalar& element = elementAt(target, index);
        if (type != CMPI_null && ((type & CMPI_ARRAY) != 0 || elementType(type) != target.type)) {
            throw Failure(CMPI_RC_ERR_TYPE_MISMATCH);
        }
        element = scalarFrom(value, type);
    });
}

}  // namespace

const CMPIArrayFT arrayTable{
    tableVersion, releaseObject<CMPIArray>, cloneObject<CMPIArray>, getSize, getSimpleType, getElementAt, setElementAt};

}  // namespace cimhost
