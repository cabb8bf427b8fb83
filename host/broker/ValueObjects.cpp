#include "broker/Convert.h"
#include "broker/DateTimes.h"
#include "broker/Encapsulation.h"
#include "broker/FunctionTables.h"
#include "broker/NamedValues.h"

// The encapsulated objects that contain only values: strings, datetimes, arrays, enumerations, arguments, contexts.

namespace cimhost {
namespace {

// CMPIString.

const char* getCharPtr(const CMPIString* string, CMPIStatus* rc) {
    return guarded<const char*>(rc, nullptr, [&]() -> const char* {
        const auto& object = self(string);
        return object.lacksCharacters ? nullptr : object.content->c_str();
    });
}

// CMPIDateTime.

/** A time before 1970 is returned as a negative number in two's complement. */
CMPIUint64 getBinaryFormat(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIUint64>(rc, 0, [&] {
        const std::optional<std::int64_t> binary = microsecondsOf(content(time).value);
        if (!binary) {
            throw Failure(CMPI_RC_ERR_FAILED, "A datetime with unknown fields has no binary form.");
        }
        return static_cast<CMPIUint64>(*binary);
    });
}

CMPIString* getStringFormat(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIString*>(rc, nullptr, [&] {
        const auto& object = self(time);
        return arenaFor(object).make<CMPIString>(object.content->value);
    });
}

CMPIBoolean isIntervalTime(const CMPIDateTime* time, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0,
                                [&] { return static_cast<CMPIBoolean>(isIntervalForm(content(time).value) ? 1 : 0); });
}

// CMPIArray.

/** @throws Failure with CMPI_RC_ERR_NO_SUCH_PROPERTY if there is no such element */
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

// CMPIEnumeration.

CMPIData getNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        auto& object = self(enumeration);
        EnumerationContent& from = *object.content;
        if (from.position >= from.elements.size()) {
            throw Failure(CMPI_RC_ERR_FAILED, "The enumeration has no more elements.");
        }
        return dataFrom(from.elements[from.position++], from.type, arenaFor(object));
    });
}

CMPIBoolean hasNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded<CMPIBoolean>(rc, 0, [&] {
        const EnumerationContent& from = content(enumeration);
        return static_cast<CMPIBoolean>(from.position < from.elements.size() ? 1 : 0);
    });
}

/** Returns all elements, including those that getNext has returned. Does not change the position. */
CMPIArray* toArray(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
    return guarded<CMPIArray*>(rc, nullptr, [&] {
        const auto& object = self(enumeration);
        return arenaFor(object).make<CMPIArray>({object.content->type, object.content->elements});
    });
}

// CMPIArgs and CMPIContext, whose content is a list of named values.

template <class Handle>
CMPIStatus addValue(const Handle* handle, const char* name, const CMPIValue* value, const CMPIType type) {
    return guarded([&] {
        std::vector<NamedValue>& values = content(handle);
        const std::string_view valueName = argument(name);
        setNamed(values, valueName, valueFrom(value, type));
    });
}

template <class Handle>
CMPIData getValue(const Handle* handle, const char* name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(handle);
        return namedData(*object.content, name, arenaFor(object));
    });
}

template <class Handle>
CMPIData getValueAt(const Handle* handle, CMPICount index, CMPIString** name, CMPIStatus* rc) {
    return guarded(rc, badData(), [&] {
        const auto& object = self(handle);
        return namedDataAt(*object.content, index, name, arenaFor(object));
    });
}

template <class Handle>
CMPICount getValueCount(const Handle* handle, CMPIStatus* rc) {
    return guarded<CMPICount>(rc, 0, [&] { return static_cast<CMPICount>(content(handle).size()); });
}

}  // namespace

const CMPIStringFT stringTable{tableVersion, releaseObject<CMPIString>, cloneObject<CMPIString>, getCharPtr};

const CMPIDateTimeFT dateTimeTable{
    tableVersion,  releaseObject<CMPIDateTime>, cloneObject<CMPIDateTime>, getBinaryFormat, getStringFormat,
    isIntervalTime};

const CMPIArrayFT arrayTable{
    tableVersion, releaseObject<CMPIArray>, cloneObject<CMPIArray>, getSize, getSimpleType, getElementAt, setElementAt};

const CMPIEnumerationFT enumerationTable{
    tableVersion, releaseObject<CMPIEnumeration>, cloneObject<CMPIEnumeration>, getNext, hasNext, toArray};

const CMPIArgsFT argsTable{tableVersion,       releaseObject<CMPIArgs>, cloneObject<CMPIArgs>,  addValue<CMPIArgs>,
                           getValue<CMPIArgs>, getValueAt<CMPIArgs>,    getValueCount<CMPIArgs>};

const CMPIContextFT contextTable{tableVersion,          releaseObject<CMPIContext>, cloneObject<CMPIContext>,
                                 getValue<CMPIContext>, getValueAt<CMPIContext>,    getValueCount<CMPIContext>,
                                 addValue<CMPIContext>};

}  // namespace cimhost
