#include "cimxml/ClassWriter.h"

#include <algorithm>

#include "cim/Names.h"
#include "cimxml/XmlWriter.h"
#include "model/Value.h"

namespace cimhost::cimxml {
namespace {

void appendFlag(std::string& xml, std::string_view name, bool value) {
    appendAttribute(xml, name, value ? "true" : "false");
}

/** Appends the flavors that differ from the defaults of the DTD. */
void appendFlavor(std::string& xml, const Flavor& flavor) {
    if (!flavor.overridable) {
        appendFlag(xml, "OVERRIDABLE", false);
    }
    if (!flavor.toSubclass) {
        appendFlag(xml, "TOSUBCLASS", false);
    }
    if (flavor.translatable) {
        appendFlag(xml, "TRANSLATABLE", true);
    }
}

/** Writes a class and its parts. */
class ClassWriter {
public:
    ClassWriter(std::string& itsXml, const Class& itsClass, const ClassParts& itsParts, const ObjectWriter& itsWriter)
        : xml(itsXml), declared(itsClass), parts(itsParts), writer(itsWriter) {}

    void append() const {
        const Element element(xml, "CLASS", [&] {
            appendAttribute(xml, "NAME", declared.name);
            if (!declared.superclass.empty()) {
                appendAttribute(xml, "SUPERCLASS", declared.superclass);
            }
        });
        appendQualifiers(declared.qualifiers);
        for (const Property& property : declared.properties) {
            if (isWanted(property)) {
                append(property);
            }
        }
        for (const Method& method : declared.methods) {
            if (isLocalEnough(method.isPropagated)) {
                append(method);
            }
        }
    }

private:
    bool isLocalEnough(bool isPropagated) const { return !(parts.localOnly && isPropagated); }

    bool isWanted(const Property& property) const {
        return isLocalEnough(property.isPropagated) &&
               (!parts.properties ||
                std::any_of(parts.properties->begin(), parts.properties->end(),
                            [&](const std::string& each) { return cim::sameName(each, property.name); }));
    }

    void appendQualifiers(const std::vector<Qualifier>& qualifiers) const {
        for (const Qualifier& each : qualifiers) {
            if (parts.qualifiers && isLocalEnough(each.isPropagated)) {
                append(each);
            }
        }
    }

    void append(const Qualifier& qualifier) const {
        const Element element(xml, "QUALIFIER", [&] {
            appendAttribute(xml, "NAME", qualifier.name);
            appendAttribute(xml, "TYPE", typeName(qualifier.value.type));
            if (qualifier.isPropagated) {
                appendFlag(xml, "PROPAGATED", true);
            }
            appendFlavor(xml, qualifier.flavor);
        });
        writer.appendValue(xml, qualifier.value);
    }

    template <class Feature>
    void appendOrigin(const Feature& feature) const {
        if (parts.classOrigin) {
            appendAttribute(xml, "CLASSORIGIN", feature.origin);
        }
        if (feature.isPropagated) {
            appendFlag(xml, "PROPAGATED", true);
        }
    }

    void append(const Property& property) const {
        const bool isReference = property.type == CMPI_ref;
        const char* name = isReference ? "PROPERTY.REFERENCE" : property.isArray ? "PROPERTY.ARRAY" : "PROPERTY";
        const Element element(xml, name, [&] {
            appendAttribute(xml, "NAME", property.name);
            if (isReference) {
                appendAttribute(xml, "REFERENCECLASS", property.referenceClass);
            } else {
                appendAttribute(xml, "TYPE", typeName(property.type));
            }
            appendOrigin(property);
        });
        appendQualifiers(property.qualifiers);
        writer.appendValue(xml, property.defaultValue);
    }

    void append(const Method& method) const {
        const Element element(xml, "METHOD", [&] {
            appendAttribute(xml, "NAME", method.name);
            if (method.type != CMPI_null) {
                appendAttribute(xml, "TYPE", typeName(method.type));
            }
            appendOrigin(method);
        });
        appendQualifiers(method.qualifiers);
        for (const Property& parameter : method.parameters) {
            appendParameter(parameter);
        }
    }

    void appendParameter(const Property& parameter) const {
        const bool isReference = parameter.type == CMPI_ref;
        const char* name = isReference ? (parameter.isArray ? "PARAMETER.REFARRAY" : "PARAMETER.REFERENCE")
                                       : (parameter.isArray ? "PARAMETER.ARRAY" : "PARAMETER");
        const Element element(xml, name, [&] {
            appendAttribute(xml, "NAME", parameter.name);
            if (isReference) {
                appendAttribute(xml, "REFERENCECLASS", parameter.referenceClass);
            } else {
                appendAttribute(xml, "TYPE", typeName(parameter.type));
            }
        });
        appendQualifiers(parameter.qualifiers);
    }

    std::string& xml;
    const Class& declared;
    const ClassParts& parts;
    const ObjectWriter& writer;
};

}  // namespace

void appendClass(std::string& xml, const Class& declared, const ClassParts& parts, const ObjectWriter& writer) {
    ClassWriter(xml, declared, parts, writer).append();
}

void appendQualifierDeclaration(std::string& xml, const QualifierDeclaration& declaration, const ObjectWriter& writer) {
    const Element element(xml, "QUALIFIER.DECLARATION", [&] {
        appendAttribute(xml, "NAME", declaration.name);
        appendAttribute(xml, "TYPE", typeName(declaration.type));
        appendFlag(xml, "ISARRAY", declaration.isArray);
        appendFlavor(xml, declaration.flavor);
    });
    {
        const Element scope(xml, "SCOPE", [&] {
            for (std::size_t i = 0; i < scopeNames.size(); ++i) {
                if (declaration.scope[i]) {
                    appendFlag(xml, scopeNames[i], true);
                }
            }
        });
    }
    writer.appendValue(xml, declaration.defaultValue);
}

}  // namespace cimhost::cimxml
