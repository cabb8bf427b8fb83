#include "support/Describe.h"

#include "broker/Convert.h"
#include "broker/ErrorTranslation.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace testsupport {
namespace {

/** Describes the content of an object; "null", or "invalid" if the handle has no object. */
template <class Handle, class Describe>
std::string describeContent(const Handle* handle, Describe describe) {
    if (handle == nullptr) {
        return "null";
    }
    const auto* object = cimhost::objectOf(handle);
    return object == nullptr ? "invalid" : describe(*object->content);
}

std::string describeValue(const CMPIValue* value, CMPIType type) {
    try {
        return cimhost::formatMof(cimhost::valueFrom(value, type));
    } catch (const cimhost::Failure&) {
        return "invalid";
    }
}

}  // namespace

void Description::add(const char* text) {
    strings.emplace_back(text == nullptr ? "null" : text);
}

void Description::add(const char** names) {
    if (names == nullptr) {
        strings.emplace_back("null");
        return;
    }
    std::string list;
    for (; *names != nullptr; ++names) {
        list += (list.empty() ? "" : ",") + std::string(*names);
    }
    strings.push_back("{" + list + "}");
}

void Description::add(const CMPIObjectPath* path) {
    strings.push_back(describeContent(path, cimhost::formatObjectPath));
}

void Description::add(const CMPIInstance* instance) {
    strings.push_back(
        describeContent(instance, [](const auto& content) { return formatObjectPath(content.value->path); }));
}

void Description::add(const CMPIString* string) {
    strings.push_back(describeContent(string, [](const std::string& text) { return text; }));
}

void Description::add(const CMPIValue* value) {
    pending = {value, strings.size()};
    strings.emplace_back("value");
}

void Description::add(CMPIType type) {
    if (pending.position) {
        strings[*pending.position] = describeValue(pending.value, type);
        pending = {};
    }
    strings.push_back(std::to_string(type));
}

}  // namespace testsupport
