#include <nlohmann/json.hpp>

#include "cim/Utf8.h"
#include "cli/Output.h"
#include "operations/StatusText.h"
#include "schema/ObjectPathText.h"

namespace cimhost::json {
namespace {

using Json = nlohmann::ordered_json;

Json pathJson(const ObjectPath& path);
Json instanceJson(const Instance& instance);

template <typename Convert, typename Items>
Json listJson(const Items& items, Convert convert) {
    Json list = Json::array();
    for (const auto& item : items) {
        list.push_back(convert(item));
    }
    return list;
}

struct ScalarJson {
    Json operator()(std::monostate) const { return nullptr; }
    Json operator()(Char16 value) const {
        std::string character;
        cim::appendUtf8(character, value.code);
        return character;
    }
    Json operator()(const DateTime& value) const { return value.value; }
    Json operator()(const std::shared_ptr<const ObjectPath>& value) const {
        return value ? pathJson(*value) : Json(nullptr);
    }
    Json operator()(const std::shared_ptr<const Instance>& value) const {
        return value ? instanceJson(*value) : Json(nullptr);
    }
    template <typename Plain>
    Json operator()(const Plain& value) const {
        return value;
    }
};

Json contentJson(const Value& value) {
    if (value.isNull) {
        return nullptr;
    }
    const auto scalarJson = [](const Scalar& scalar) { return std::visit(ScalarJson{}, scalar); };
    return value.isArray ? listJson(value.elements(), scalarJson) : scalarJson(value.single);
}

Json valueJson(const Value& value) {
    return {{"type", typeName(value.type)}, {"array", value.isArray}, {"value", contentJson(value)}};
}

Json namedJson(const std::vector<NamedValue>& values) {
    Json object = Json::object();
    for (const NamedValue& value : values) {
        object[value.name] = valueJson(value.value);
    }
    return object;
}

Json pathJson(const ObjectPath& path) {
    return {{"uri", formatObjectPath(path)},
            {"host", path.host.empty() ? Json(nullptr) : Json(path.host)},
            {"namespace", path.nameSpace},
            {"class", path.className},
            {"keys", namedJson(path.keys)}};
}

Json instanceJson(const Instance& instance) {
    return {{"path", pathJson(instance.path)}, {"properties", namedJson(instance.properties)}};
}

Json stringOrNull(const std::string& string) {
    return string.empty() ? Json(nullptr) : Json(string);
}

struct EventJson {
    template <class Kind>
    Json operator()(const std::shared_ptr<Kind>& shared) const {
        return (*this)(*shared);
    }
    Json operator()(const Instance& instance) const {
        return {{"kind", "instance"}, {"instance", instanceJson(instance)}};
    }
    Json operator()(const ObjectPath& path) const { return {{"kind", "objectPath"}, {"objectPath", pathJson(path)}}; }
    Json operator()(const Value& value) const { return {{"kind", "data"}, {"data", valueJson(value)}}; }
    Json operator()(const ErrorInfo& error) const {
        return {{"kind", "error"},
                {"code", static_cast<int>(error.statusCode)},
                {"name", codeName(error.statusCode)},
                {"message", error.message ? Json(*error.message) : Json(nullptr)}};
    }
    Json operator()(const NullResult&) const { return {{"kind", "null"}}; }
    Json operator()(const Done&) const { return {{"kind", "done"}}; }
};

Json responseJson(const ProviderResponse& response) {
    const auto eventJson = [](const ResultEvent& event) { return std::visit(EventJson{}, event); };
    const bool hasMessage = response.hasMessage || response.threw;
    return {{"status",
             {{"code", static_cast<int>(response.status.rc)},
              {"name", codeName(response.status.rc)},
              {"message", hasMessage ? Json(response.status.message) : Json(nullptr)}}},
            {"exception", response.threw},
            {"returned", listJson(response.events, eventJson)},
            {"returnDoneCount", response.doneCount()}};
}

Json providerJson(const ProviderRegistration& provider) {
    return {{"provider", provider.provider},           {"location", provider.location},
            {"instance", provider.instance},           {"association", provider.association},
            {"namespaces", provider.nameSpaces},       {"group", stringOrNull(provider.group)},
            {"unload", stringOrNull(provider.unload)}, {"source", provider.source}};
}

/** The value of a qualifier of a class or property; null if the qualifier is absent. */
template <typename Qualified>
Json qualifierJson(const Qualified& qualified, const char* name) {
    const Qualifier* qualifier = qualified.findQualifier(name);
    return qualifier != nullptr ? contentJson(qualifier->value) : Json(nullptr);
}

Json propertyJson(const Property& property) {
    return {{"name", property.name},
            {"type", typeName(property.type)},
            {"array", property.isArray},
            {"referenceClass", stringOrNull(property.referenceClass)},
            {"key", property.isKey()},
            {"writable", property.isWritable()},
            {"description", qualifierJson(property, "Description")}};
}

Json classJson(const ListedClass& listed) {
    const Class* definition = listed.definition;
    const bool known = definition != nullptr;
    const auto keyName = [](const Property* key) { return Json(key->name); };
    return {{"class", listed.name},
            {"inSchema", known},
            {"superclass", known ? stringOrNull(definition->superclass) : Json(nullptr)},
            {"association", known && definition->isAssociation()},
            {"description", known ? qualifierJson(*definition, "Description") : Json(nullptr)},
            {"keys", known ? listJson(definition->keys(), keyName) : Json::array()},
            {"properties", known ? listJson(definition->properties, propertyJson) : Json::array()},
            {"providers", listJson(listed.providers, providerJson)}};
}

std::string dumped(const Json& document) {
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

}  // namespace

std::string format(const std::vector<Instance>& instances) {
    return dumped(listJson(instances, instanceJson));
}

std::string format(const Instance& instance) {
    return dumped(instanceJson(instance));
}

std::string format(const std::vector<ObjectPath>& paths) {
    return dumped(listJson(paths, pathJson));
}

std::string format(const ObjectPath& path) {
    return dumped(pathJson(path));
}

std::string format(const std::vector<ProviderResponse>& responses) {
    return dumped({{"answers", listJson(responses, responseJson)}});
}

std::string format(const std::vector<ListedClass>& classes) {
    return dumped(listJson(classes, classJson));
}

}  // namespace cimhost::json
