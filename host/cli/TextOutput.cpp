#include "cli/Output.h"
#include "operations/StatusText.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace cimhost::text {
namespace {

std::string valueText(const Value& value) {
    if (value.type == CMPI_ref && !value.isArray) {
        const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&value.single);
        if (path != nullptr && *path != nullptr) {
            return formatObjectPath(**path);
        }
    }
    return formatMof(value);
}

std::string instanceText(const Instance& instance, const std::string& indent, const Style& style) {
    std::vector<Row> rows;
    for (const NamedValue& property : instance.properties) {
        const std::string type = std::string(typeName(property.value.type)) + (property.value.isArray ? "[]" : "");
        rows.push_back({property.name, type, valueText(property.value)});
    }
    return painted(formatObjectPath(instance.path), Role::heading, style) + "\n" +
           aligned(rows, indent + "  ", style, {Role::name, Role::detail});
}

struct EventText {
    const Style& style;

    template <class Kind>
    std::string operator()(const std::shared_ptr<Kind>& shared) const {
        return (*this)(*shared);
    }
    std::string operator()(const Instance& instance) const {
        return "instance " + instanceText(instance, "   ", style);
    }
    std::string operator()(const ObjectPath& path) const { return "object path " + formatObjectPath(path) + "\n"; }
    std::string operator()(const Value& value) const {
        return "data " + std::string(typeName(value.type)) + (value.isArray ? "[] " : " ") + valueText(value) + "\n";
    }
    std::string operator()(const ErrorInfo& error) const {
        return errorText({error.statusCode, error.message.value_or("")}) + "\n";
    }
    std::string operator()(const NullResult&) const { return "null (refused)\n"; }
    std::string operator()(const Done&) const { return "done\n"; }
};

std::string responseText(const ProviderResponse& response, const Style& style) {
    std::string text = "status: " + std::to_string(response.status.rc) + " (" + codeName(response.status.rc) + ")\n";
    if (response.hasMessage || response.threw) {
        const Value message = Value::of(response.status.message);
        text += (response.threw ? "exception: " : "message: ") + formatMof(message) + "\n";
    }
    int number = 0;
    for (const ResultEvent& event : response.events) {
        text += std::to_string(++number) + ". " + std::visit(EventText{style}, event);
    }
    return text + "returnDone: " + std::to_string(response.doneCount()) + "\n";
}

Row providerRow(const ListedClass& listed, const ProviderRegistration& provider) {
    std::vector<std::string> interfaces;
    if (provider.instance) {
        interfaces.emplace_back("instance");
    }
    if (provider.association) {
        interfaces.emplace_back("association");
    }
    return {listed.name, joined(interfaces, ","), provider.provider, "lib" + provider.location + ".so",
            joined(provider.nameSpaces, ",") + (listed.definition == nullptr ? "  (not in the schema)" : "")};
}

}  // namespace

std::string format(const std::vector<Instance>& instances, const Style& style) {
    return joined(instances, "\n", [&](const Instance& each) { return instanceText(each, "", style); });
}

std::string format(const std::vector<ObjectPath>& paths, const Style& style) {
    std::string text;
    for (const ObjectPath& path : paths) {
        text += painted(formatObjectPath(path), Role::heading, style) + "\n";
    }
    return text;
}

std::string format(const std::vector<ProviderResponse>& responses, const Style& style) {
    return joined(responses, "\n", [&](const ProviderResponse& each) { return responseText(each, style); });
}

std::string format(const std::vector<ListedClass>& classes, const Style& style) {
    std::vector<Row> rows;
    for (const ListedClass& listed : classes) {
        for (const ProviderRegistration& provider : listed.providers) {
            rows.push_back(providerRow(listed, provider));
        }
        if (listed.providers.empty()) {
            rows.push_back({listed.name, "-"});
        }
    }
    return aligned(rows, "", style, {Role::heading});
}

}  // namespace cimhost::text
