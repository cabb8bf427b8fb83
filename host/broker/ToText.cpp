#include "broker/ToText.h"

#include "broker/ErrorTranslation.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

std::string text(const std::vector<NamedValue>& values) {
    std::string all;
    for (const NamedValue& each : values) {
        all += each.name + " = " + formatMof(each.value) + "\n";
    }
    return all;
}

std::string text(CMPIType type, const std::vector<Scalar>& elements) {
    return formatMof(Value::array(type, elements));
}

// One function a content.

std::string textOf(const std::string& string) {
    return string;
}

std::string textOf(const ObjectPath& path) {
    return formatObjectPath(path);
}

std::string textOf(const InstanceContent& instance) {
    return formatMof(instance.value);
}

std::string textOf(const DateTime& time) {
    return time.value;
}

std::string textOf(const ArrayContent& array) {
    return text(array.type, array.elements);
}

std::string textOf(const EnumerationContent& enumeration) {
    return text(enumeration.type, enumeration.elements);
}

std::string textOf(const ArgsContent& args) {
    return text(args.values);
}

std::string textOf(const ContextContent& context) {
    return text(context.entries);
}

std::string textOf(const ResultContent& result) {
    return std::to_string(result.events->size()) + " events";
}

std::string textOf(const ErrorInfo& error) {
    return error.message.value_or(std::string{});
}

template <class Handle>
std::string textOfHandle(const Object& object) {
    const auto& encapsulated = static_cast<const Encapsulated<Handle>&>(object);
    return encapsulated.content ? textOf(*encapsulated.content) : std::string(typeText(object.kind())) + " (released)";
}

/** What there is to know of each kind, in the order of ObjectKind. */
struct Kind {
    const char* name;
    std::string (*text)(const Object& object);
};

constexpr Kind kinds[] = {
    {"CMPIString", textOfHandle<CMPIString>},     {"CMPIObjectPath", textOfHandle<CMPIObjectPath>},
    {"CMPIInstance", textOfHandle<CMPIInstance>}, {"CMPIDateTime", textOfHandle<CMPIDateTime>},
    {"CMPIArray", textOfHandle<CMPIArray>},       {"CMPIEnumeration", textOfHandle<CMPIEnumeration>},
    {"CMPIArgs", textOfHandle<CMPIArgs>},         {"CMPIContext", textOfHandle<CMPIContext>},
    {"CMPIResult", textOfHandle<CMPIResult>},     {"CMPIError", textOfHandle<CMPIError>}};

const Kind& kindOf(ObjectKind kind) {
    return kinds[static_cast<std::size_t>(kind)];
}

}  // namespace

const char* typeText(ObjectKind kind) {
    return kindOf(kind).name;
}

std::string toText(const Object& object) {
    return kindOf(object.kind()).text(object);
}

}  // namespace cimhost
