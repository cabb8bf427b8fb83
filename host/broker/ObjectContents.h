#pragma once

#include <cmpift.h>

#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "broker/ClassInfo.h"
#include "broker/FunctionTables.h"
#include "model/Request.h"
#include "model/ResultEvent.h"
#include "model/Value.h"

namespace cimhost {

/** The kinds of encapsulated objects. */
enum class ObjectKind { string, objectPath, instance, dateTime, array, enumeration, args, context, result, error };

/** An instance or a path that can be shared with results. While it is shared, a change copies it first. */
template <class Kind>
class Shared {
public:
    Shared(Kind initial) : object(std::make_shared<Kind>(std::move(initial))) {}
    Shared(const Shared& other) : Shared(*other) {}
    Shared(Shared&&) noexcept = default;
    Shared& operator=(Shared) = delete;

    operator const Kind&() const { return *object; }
    const Kind& operator*() const { return *object; }
    const Kind* operator->() const { return object.get(); }

    std::shared_ptr<Kind> share() const { return object; }

    /** The object, which is copied first if it is shared. */
    Kind& writable() {
        if (object.use_count() > 1) {
            object = std::make_shared<Kind>(*object);
        }
        return *object;
    }

private:
    std::shared_ptr<Kind> object;
};

/** Content of a CMPIInstance. */
struct InstanceContent {
    Shared<Instance> value;
    std::shared_ptr<const ClassInfo> classInfo{};  ///< null if the class is unknown
    PropertyList accepted{};                       ///< the property filter; std::nullopt accepts every property
    bool filtersKeys = false;                      ///< whether the filter also applies to keys
    std::size_t initialCount = 0;                  ///< number of properties, all at the front, that the broker added
    std::size_t unset = 0;  ///< position in the class; no property from there on is set; unused if the class is unknown
};

/** Content of a CMPIArray: elements of one type. */
struct ArrayContent {
    CMPIType type = CMPI_null;
    std::vector<Scalar> elements{};
};

/** Content of a CMPIEnumeration: the elements, and the number of elements that getNext has returned. */
struct EnumerationContent : ArrayContent {
    std::size_t position = 0;
};

/** Special rules of a result. A call that it refuses fails and does not become an event. */
struct ResultRules {
    bool refusesInstances = false;
    bool refusesToBeEmpty = false;  ///< refuses returnDone before any result
    bool keepsPaths = false;        ///< the provider must not release the paths that it returned
};

/** Content of a CMPIResult: the events, which are owned by the caller of the request. */
struct ResultContent {
    ResultEvents* events = nullptr;
    ResultRules rules{};
    std::shared_ptr<bool> pathReleased{};  ///< whether a path that it keeps was released; null: it keeps none
};

/** The content, kind and function table of a handle type. */
template <class Handle>
struct Traits;

template <class ContentType, ObjectKind objectKind, auto tableMember>
struct TraitsOf {
    using Content = ContentType;
    static constexpr ObjectKind kind = objectKind;
    static constexpr auto table = tableMember;
};

// clang-format off
template <> struct Traits<CMPIString> : TraitsOf<std::string, ObjectKind::string, &FunctionTables::string> {};
template <> struct Traits<CMPIObjectPath> : TraitsOf<Shared<ObjectPath>, ObjectKind::objectPath, &FunctionTables::objectPath> {};
template <> struct Traits<CMPIInstance> : TraitsOf<InstanceContent, ObjectKind::instance, &FunctionTables::instance> {};
template <> struct Traits<CMPIDateTime> : TraitsOf<DateTime, ObjectKind::dateTime, &FunctionTables::dateTime> {};
template <> struct Traits<CMPIArray> : TraitsOf<ArrayContent, ObjectKind::array, &FunctionTables::array> {};
template <> struct Traits<CMPIEnumeration> : TraitsOf<EnumerationContent, ObjectKind::enumeration, &FunctionTables::enumeration> {};
template <> struct Traits<CMPIArgs> : TraitsOf<std::vector<NamedValue>, ObjectKind::args, &FunctionTables::args> {};
template <> struct Traits<CMPIContext> : TraitsOf<ContextEntries, ObjectKind::context, &FunctionTables::context> {};
template <> struct Traits<CMPIResult> : TraitsOf<ResultContent, ObjectKind::result, &FunctionTables::result> {};
template <> struct Traits<CMPIError> : TraitsOf<ErrorInfo, ObjectKind::error, &FunctionTables::error> {};
// clang-format on

}  // namespace cimhost
