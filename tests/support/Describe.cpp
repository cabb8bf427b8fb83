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
    texts.emplace_back(text == nullptr ? "null" : text);
}

void Description::add(const char** names) {
    if (names == nullptr) {
        texts.emplace_back("null");
        return;
    }
    std::string list;
    for (; *names != nullptr; ++names) {
        list += (list.empty() ? "" : ",") + std::string(*names);
    }
    texts.push_back("{" + list + "}");
}

void Description::add(const CMPIObjectPath* path) {
    texts.push_back(describeContent(path, cimhost::formatObjectPath));
}

void Description::add(const CMPIInstance* instance) {
    texts.push_back(
        describeContent(instance, [](const auto& content) { return formatObjectPath(content.value.path); }));
}

void Description::add(const CMPIString* string) {
    texts.push_back(describeContent(string, [](const std::string& text) { return text; }));
}

void Description::add(const CMPIValue* value) {
    pending = {value, texts.size()};
    texts.emplace_back("value");
}

void Description::add(CMPIType type) {
    if (pending.position) {
        texts[*pending.position] = describeValue(pending.value, type);
        pending = {};
    }
    texts.push_back(std::to_string(type));
}

}  // namespace testsupport
