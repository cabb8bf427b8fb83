#include "broker/Object.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

std::string describe(const std::vector<NamedValue>& values) {
    std::string all;
    for (const NamedValue& each : values) {
        all += each.name.string() + " = " + formatMof(each.value) + "\n";
    }
    return all;
}

// One function per type of content; an enumeration is described as an array.

std::string describe(const std::string& string) {
    return string;
}

std::string describe(const ObjectPath& path) {
    return formatObjectPath(path);
}

std::string describe(const InstanceContent& instance) {
    return formatMof(*instance.value);
}

std::string describe(const DateTime& time) {
    return time.value;
}

std::string describe(const ArrayContent& array) {
    return formatMof(Value::array(array.type, array.elements));
}

std::string describe(const ResultContent& result) {
    return std::to_string(result.events->size()) + " events";
}

std::string describe(const ErrorInfo& error) {
    return error.message.value_or(std::string{});
}

template <class Handle>
std::string describeHandle(const Object& object) {
    const auto& encapsulated = static_cast<const Encapsulated<Handle>&>(object);
    return encapsulated.content ? describe(*encapsulated.content)
                                : std::string(typeNameOf(object.kind())) + " (released)";
}

struct Kind {
    const char* name;
    std::string (*describe)(const Object& object);
};

/** The kinds, in the order of ObjectKind. */
constexpr Kind kinds[] = {
    {"CMPIString", describeHandle<CMPIString>},     {"CMPIObjectPath", describeHandle<CMPIObjectPath>},
    {"CMPIInstance", describeHandle<CMPIInstance>}, {"CMPIDateTime", describeHandle<CMPIDateTime>},
    {"CMPIArray", describeHandle<CMPIArray>},       {"CMPIEnumeration", describeHandle<CMPIEnumeration>},
    {"CMPIArgs", describeHandle<CMPIArgs>},         {"CMPIContext", describeHandle<CMPIContext>},
    {"CMPIResult", describeHandle<CMPIResult>},     {"CMPIError", describeHandle<CMPIError>}};

const Kind& kindOf(ObjectKind kind) {
    return kinds[static_cast<std::size_t>(kind)];
}

}  // namespace

const char* typeNameOf(ObjectKind kind) {
    return kindOf(kind).name;
}

std::string describe(const Object& object) {
    return kindOf(object.kind()).describe(object);
}

}  // namespace cimhost
