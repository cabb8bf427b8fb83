#include "cimxml/ObjectWriter.h"

#include <algorithm>

#include "cim/Names.h"
#include "cimxml/CharacterWriter.h"
#include "cimxml/Errors.h"
#include "cimxml/XmlWriter.h"
#include "model/Value.h"

namespace cimhost::cimxml {
namespace {

const ObjectPath* referenceIn(const Scalar& scalar) {
    const auto* path = std::get_if<std::shared_ptr<const ObjectPath>>(&scalar);
    return path == nullptr ? nullptr : path->get();
}

const Instance* instanceIn(const Scalar& scalar) {
    const auto* instance = std::get_if<std::shared_ptr<const Instance>>(&scalar);
    return instance == nullptr ? nullptr : instance->get();
}

const char* valueTypeOf(CMPIType type) {
    return type == CMPI_boolean                                            ? "boolean"
           : isInteger(type) || type == CMPI_real32 || type == CMPI_real64 ? "numeric"
                                                                           : "string";
}

bool isInList(const std::vector<std::string>& names, const std::string& name) {
    return std::any_of(names.begin(), names.end(), [&](const std::string& each) { return cim::sameName(each, name); });
}

bool isWanted(const std::string& name, const InstanceParts& parts) {
    return (parts.onlyOf == nullptr || parts.onlyOf->findProperty(name) != nullptr) &&
           (!parts.properties || isInList(*parts.properties, name));
}

/** The element name of a property. */
const char* elementOf(const Value& value) {
    return value.type == CMPI_ref ? "PROPERTY.REFERENCE" : value.isArray ? "PROPERTY.ARRAY" : "PROPERTY";
}

std::string_view xmlType(CMPIType type) {
    return type == CMPI_instance || type == CMPI_null ? std::string_view("string") : typeName(type);
}

/** The element name of a value; empty for references, which have their own elements, and for null. */
std::string_view elementOfContent(const Value& value) {
    if (value.isNull) {
        return {};
    }
    if (value.isArray) {
        return value.type == CMPI_ref ? "VALUE.REFARRAY" : "VALUE.ARRAY";
    }
    return value.type == CMPI_ref ? "" : "VALUE";
}

void appendStartTagOf(std::string& xml, const NamedValue& property, std::string_view origin) {
    appendStartTag(xml, elementOf(property.value), [&] {
        appendAttribute(xml, "NAME", property.name);
        if (!origin.empty()) {
            appendAttribute(xml, "CLASSORIGIN", origin);
        }
        if (property.value.type != CMPI_ref) {
            appendAttribute(xml, "TYPE", xmlType(property.value.type));
        }
        if (property.value.type == CMPI_instance) {
            appendAttribute(xml, "EmbeddedObject", "instance");
        }
    });
}

/** Whether a value is neither a reference nor an embedded instance. */
bool isSimple(const Value& value) {
    return value.type != CMPI_ref && value.type != CMPI_instance;
}

/** Whether XML can represent a scalar. @throws CimError if XML cannot represent an object in the scalar */
struct ScalarCheck {
    bool operator()(const std::string& string) const { return isRepresentable(string); }
    bool operator()(const DateTime& dateTime) const { return isRepresentable(dateTime.value); }
    bool operator()(Char16 character) const { return isRepresentable(CharacterWriter::utf8Of(character)); }
    bool operator()(const std::shared_ptr<const ObjectPath>& path) const {
        cimxml::requireRepresentable(*path);
        return true;
    }
    bool operator()(const std::shared_ptr<const Instance>& instance) const {
        cimxml::requireRepresentable(*instance);
        return true;
    }
    template <class Plain>
    bool operator()(const Plain&) const {
        return true;
    }
};

void requireRepresentable(const Value& value, const std::string& className, const std::string& name) {
    for (const Scalar& scalar : value.elements()) {
        const auto* string = std::get_if<std::string>(&scalar);  // the usual case; faster than std::visit
        if (string != nullptr ? !isRepresentable(*string) : !std::visit(ScalarCheck{}, scalar)) {
            throw CimError(CMPI_RC_ERR_FAILED, std::string("The value of ").append(className).append(".").append(name) +
                                                   " has a character that XML cannot represent.");
        }
    }
}

/** Caches the start tag of the last object. The next object usually has the same class. */
struct ClassTag {
    std::string className{};
    std::string start{};

    void append(std::string& xml, std::string_view element, const std::string& itsClassName) {
        if (start.empty() || className != itsClassName) {
            std::string tag;  // if memory runs out, the cached tag stays complete
            appendStartTag(tag, element, [&] { appendAttribute(tag, "CLASSNAME", itsClassName); });
            className = itsClassName;
            start = std::move(tag);
        }
        xml += start;
    }
};

}  // namespace

struct ObjectWriter::Tags {
    Name name{};
    CMPIType type = CMPI_null;
    bool isArray = false;
    bool isNull = true;
    std::string origin{};
    std::string start{};
    std::string end{};
    bool isComplete = false;

    /** Rebuilds the tags unless the last object had the same property or key at this position. */
    template <class Make>
    void update(const NamedValue& named, std::string_view itsOrigin, Make make) {
        const Value& value = named.value;
        const bool isSame = name == named.name && type == value.type && isArray == value.isArray &&
                            isNull == value.isNull && origin == itsOrigin && isComplete;
        if (!isSame) {
            *this = {named.name, value.type, value.isArray, value.isNull, std::string(itsOrigin)};
            make();
            isComplete = true;
        }
    }

    static Tags& at(std::size_t position, std::vector<Tags>& known) {
        known.resize(std::max(known.size(), position + 1));
        return known[position];
    }
};

void requireRepresentable(const ObjectPath& path) {
    for (const NamedValue& key : path.keys) {
        requireRepresentable(key.value, path.className, key.name);
    }
}

void requireRepresentable(const Instance& instance, const InstanceParts& parts) {
    requireRepresentable(instance.path);
    for (const NamedValue& property : instance.properties) {
        if (parts.haveAllProperties() || isWanted(property.name, parts)) {
            requireRepresentable(property.value, instance.path.className, property.name);
        }
    }
}

void ObjectWriter::append(std::string& xml, const Instance& instance, ObjectForm form,
                          const InstanceParts& parts) const {
    if (form == ObjectForm::instance) {
        return appendInstance(xml, instance, parts);
    }
    if (form == ObjectForm::namedInstance) {
        const Element named(xml, "VALUE.NAMEDINSTANCE");
        appendInstanceName(xml, instance.path);
        return appendInstance(xml, instance, parts);
    }
    const Element object(xml, form == ObjectForm::objectWithPath ? "VALUE.OBJECTWITHPATH" : "VALUE.INSTANCEWITHPATH");
    appendInstancePath(xml, instance.path);
    appendInstance(xml, instance, parts);
}

void ObjectWriter::append(std::string& xml, const ObjectPath& path, ObjectForm form) const {
    if (form == ObjectForm::instanceName) {
        return appendInstanceName(xml, path);
    }
    if (form == ObjectForm::instancePath) {
        return appendInstancePath(xml, path);
    }
    const Element object(xml, "OBJECTPATH");
    appendInstancePath(xml, path);
}

void ObjectWriter::appendInstance(std::string& xml, const Instance& instance, const InstanceParts& parts) const {
    thread_local std::vector<Tags> ofProperties;
    thread_local ClassTag tag;
    tag.append(xml, "INSTANCE", instance.path.className);
    const Class* known = parts.origins != nullptr ? parts.origins->findClass(instance.path.className) : nullptr;
    std::size_t position = 0;
    for (const NamedValue& property : instance.properties) {
        if (parts.haveAllProperties() || isWanted(property.name, parts)) {
            const Property* declared = known != nullptr ? known->findProperty(property.name) : nullptr;
            const std::string_view origin = declared != nullptr ? declared->origin : std::string_view();
            appendProperty(xml, property, origin, Tags::at(position++, ofProperties));
        }
    }
    xml += "</INSTANCE>";
}

void ObjectWriter::appendProperty(std::string& xml, const NamedValue& property, std::string_view origin,
                                  Tags& tags) const {
    const Value& value = property.value;
    if (!isSimple(value)) {
        appendStartTagOf(xml, property, origin);
        appendValue(xml, value);
        return appendEndTag(xml, elementOf(value));
    }
    tags.update(property, origin, [&] {
        const std::string_view content = elementOfContent(value);
        appendStartTagOf(tags.start, property, origin);
        if (!content.empty()) {
            appendStartTag(tags.start, content, [] {});
            appendEndTag(tags.end, content);
        }
        appendEndTag(tags.end, elementOf(value));
    });
    xml += tags.start;
    appendContent(xml, value);
    xml += tags.end;
}

void ObjectWriter::appendValue(std::string& xml, const Value& value) const {
    const std::string_view name = elementOfContent(value);
    if (name.empty()) {
        return appendContent(xml, value);
    }
    const Element element(xml, name);
    appendContent(xml, value);
}

/** Appends the content of the value's element. */
void ObjectWriter::appendContent(std::string& xml, const Value& value) const {
    if (!value.isArray) {
        return appendScalar(xml, value.single);
    }
    for (const Scalar& each : value.elements()) {
        if (std::holds_alternative<std::monostate>(each)) {
            const Element null(xml, "VALUE.NULL");
        } else if (referenceIn(each) != nullptr) {
            appendScalar(xml, each);
        } else {
            const Element element(xml, "VALUE");
            appendScalar(xml, each);
        }
    }
}

void ObjectWriter::appendScalar(std::string& xml, const Scalar& scalar) const {
    if (const ObjectPath* path = referenceIn(scalar)) {
        return appendReference(xml, *path);
    }
    if (const Instance* instance = instanceIn(scalar)) {
        std::string embedded;
        appendInstance(embedded, *instance);
        return appendEscaped(xml, embedded);
    }
    std::visit(CharacterWriter{xml}, scalar);
}

void ObjectWriter::appendReference(std::string& xml, const ObjectPath& path) const {
    const Element reference(xml, "VALUE.REFERENCE");
    if (!path.host.empty()) {
        return appendInstancePath(xml, path);
    }
    const Element local(xml, "LOCALINSTANCEPATH");
    appendLocalNameSpacePath(xml, path.nameSpace);
    appendInstanceName(xml, path);
}

void ObjectWriter::appendInstanceName(std::string& xml, const ObjectPath& path) const {
    thread_local std::vector<Tags> ofKeys;
    thread_local ClassTag tag;
    tag.append(xml, "INSTANCENAME", path.className);
    std::size_t position = 0;
    for (const NamedValue& key : path.keys) {
        appendKey(xml, key, Tags::at(position++, ofKeys));
    }
    xml += "</INSTANCENAME>";
}

void ObjectWriter::appendKey(std::string& xml, const NamedValue& key, Tags& tags) const {
    const auto appendBinding = [&](std::string& tag) {
        appendStartTag(tag, "KEYBINDING", [&] { appendAttribute(tag, "NAME", key.name); });
    };
    if (!isSimple(key.value)) {
        appendBinding(xml);
        appendContent(xml, key.value);
        return appendEndTag(xml, "KEYBINDING");
    }
    tags.update(key, {}, [&] {
        appendBinding(tags.start);
        appendStartTag(tags.start, "KEYVALUE", [&] {
            appendAttribute(tags.start, "VALUETYPE", valueTypeOf(key.value.type));
            appendAttribute(tags.start, "TYPE", xmlType(key.value.type));
        });
        tags.end = "</KEYVALUE></KEYBINDING>";
    });
    xml += tags.start;
    appendContent(xml, key.value);
    xml += tags.end;
}

void ObjectWriter::appendInstancePath(std::string& xml, const ObjectPath& path) const {
    const Element element(xml, "INSTANCEPATH");
    appendNameSpacePath(xml, path);
    appendInstanceName(xml, path);
}

void ObjectWriter::appendClassPath(std::string& xml, const std::string& className) const {
    const Element element(xml, "CLASSPATH");
    appendNameSpacePath(xml, {});
    const Element name(xml, "CLASSNAME", [&] { appendAttribute(xml, "NAME", className); });
}

void ObjectWriter::appendNameSpacePath(std::string& xml, const ObjectPath& path) const {
    const Element place(xml, "NAMESPACEPATH");
    {
        const Element element(xml, "HOST");
        appendEscaped(xml, path.host.empty() ? host : path.host);
    }
    appendLocalNameSpacePath(xml, path.nameSpace);
}

void ObjectWriter::appendLocalNameSpacePath(std::string& xml, const std::string& itsNameSpace) const {
    const Element local(xml, "LOCALNAMESPACEPATH");
    std::string_view rest = itsNameSpace.empty() ? nameSpace : itsNameSpace;
    while (!rest.empty()) {
        const std::string_view part = rest.substr(0, rest.find('/'));
        const Element element(xml, "NAMESPACE", [&] { appendAttribute(xml, "NAME", part); });
        rest.remove_prefix(std::min(part.size() + 1, rest.size()));
    }
}

}  // namespace cimhost::cimxml
