#pragma once

#include <cmpift.h>

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "broker/ClassInfo.h"
#include "broker/FunctionTables.h"
#include "model/Request.h"
#include "model/ResultEvent.h"
#include "model/Value.h"

namespace cimhost {

/** What an encapsulated object can be. */
enum class ObjectKind { string, objectPath, instance, dateTime, array, enumeration, args, context, result, error };

/** Content of a CMPIInstance. */
struct InstanceContent {
    Instance value{};
    std::shared_ptr<const ClassInfo> classInfo{};  ///< null when the class is not known
    PropertyList accepted{};                       ///< the property filter; none accepts every property
    bool filtersKeys = false;                      ///< whether the filter is one for keys, too
    std::size_t given = 0;                         ///< how many properties, all at the front, the broker put in itself
};

/** Content of a CMPIArray: elements of one type. */
struct ArrayContent {
    CMPIType type = CMPI_null;
    std::vector<Scalar> elements{};
};

/** Content of a CMPIEnumeration: elements of one type, and how many of them were taken. */
struct EnumerationContent {
    CMPIType type = CMPI_null;
    std::vector<Scalar> elements{};
    std::size_t taken = 0;
};

/** Content of a CMPIArgs. */
struct ArgsContent {
    std::vector<NamedValue> values{};
};

/** Content of a CMPIContext. */
struct ContextContent {
    std::vector<NamedValue> entries{};
};

/** What a result insists on. What it refuses is answered with an error and does not become an event. */
struct ResultRules {
    bool refusesInstances = false;
    bool refusesToBeEmpty = false;  ///< returnDone before anything was returned
    bool keepsPaths = false;        ///< paths that were returned must not be released by the provider
};

/** Content of a CMPIResult: where the events go. They belong to who runs the request. */
struct ResultContent {
    ResultEvents* events = nullptr;
    ResultRules rules{};
    std::shared_ptr<bool> pathReleased{};  ///< true once such a path was released; null while none was returned
};

/** What the broker knows of a handle type: its content, its kind, its name and its table. */
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
template <> struct Traits<CMPIObjectPath> : TraitsOf<ObjectPath, ObjectKind::objectPath, &FunctionTables::objectPath> {};
template <> struct Traits<CMPIInstance> : TraitsOf<InstanceContent, ObjectKind::instance, &FunctionTables::instance> {};
template <> struct Traits<CMPIDateTime> : TraitsOf<DateTime, ObjectKind::dateTime, &FunctionTables::dateTime> {};
template <> struct Traits<CMPIArray> : TraitsOf<ArrayContent, ObjectKind::array, &FunctionTables::array> {};
template <> struct Traits<CMPIEnumeration> : TraitsOf<EnumerationContent, ObjectKind::enumeration, &FunctionTables::enumeration> {};
template <> struct Traits<CMPIArgs> : TraitsOf<ArgsContent, ObjectKind::args, &FunctionTables::args> {};
template <> struct Traits<CMPIContext> : TraitsOf<ContextContent, ObjectKind::context, &FunctionTables::context> {};
template <> struct Traits<CMPIResult> : TraitsOf<ResultContent, ObjectKind::result, &FunctionTables::result> {};
template <> struct Traits<CMPIError> : TraitsOf<ErrorInfo, ObjectKind::error, &FunctionTables::error> {};
// clang-format on

}  // namespace cimhost
