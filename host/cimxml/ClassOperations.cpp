#include <algorithm>
#include <utility>

#include "cim/Names.h"
#include "cimxml/ClassWriter.h"
#include "cimxml/Errors.h"
#include "cimxml/Operations.h"
#include "cimxml/XmlWriter.h"

namespace cimhost::cimxml {
namespace {

using Classes = std::vector<const Class*>;

/** A result with one element for each item of a list. */
template <class Item, class Append>
OperationResult listed(std::vector<Item> items, Append append) {
    OperationResult result;
    result.count = items.size();
    result.next = [items = std::move(items), append = std::move(append),
                   at = std::size_t{0}](std::string& xml) mutable {
        if (at == items.size()) {
            return false;
        }
        append(xml, items[at++]);
        return true;
    };
    return result;
}

void appendClassName(std::string& xml, const Class* each) {
    const Element name(xml, "CLASSNAME", [&] { appendAttribute(xml, "NAME", each->name); });
}

ClassParts classPartsOf(const OperationArguments& arguments, bool localOnly, bool qualifiers) {
    ClassParts parts;
    parts.localOnly = arguments.flag("LocalOnly", localOnly);
    parts.qualifiers = arguments.flag("IncludeQualifiers", qualifiers);
    parts.classOrigin = arguments.flag("IncludeClassOrigin", false);
    parts.properties = arguments.strings("PropertyList");
    return parts;
}

/** The direct subclasses of a class, or all if deep. Without a class: the top-level classes, or all if deep. */
Classes enumerated(const Schema& schema, const std::string& superclass, bool deep) {
    Classes found = superclass.empty() ? schema.classes() : schema.subclasses(superclass);
    if (!deep) {
        found.erase(std::remove_if(found.begin(), found.end(),
                                   [&](const Class* each) { return !cim::sameName(each->superclass, superclass); }),
                    found.end());
    }
    return found;
}

/** Finds the association classes that refer to a class, and the classes that they associate with it. */
class ClassTraversal {
public:
    ClassTraversal(const Schema& itsSchema, const std::string& itsSource, const AssociationFilter& itsFilter)
        : schema(itsSchema), source(itsSource), filter(itsFilter) {}

    Classes associations(const std::optional<std::string>& wanted) const {
        Classes found;
        for (const Class* each : schema.classes()) {
            if (each->isAssociation() && (!wanted || schema.isA(each->name, *wanted)) && refersToSource(*each)) {
                found.push_back(each);
            }
        }
        return found;
    }

    Classes associated() const {
        Classes found;
        for (const Class* association : associations(filter.associationClass)) {
            for (const Property& end : association->properties) {
                const Class* target = end.type == CMPI_ref ? schema.findClass(end.referenceClass) : nullptr;
                const bool isWanted = target != nullptr && has(filter.resultRole, end.name) &&
                                      (!filter.resultClass || schema.isA(target->name, *filter.resultClass)) &&
                                      refersToSource(*association, &end);
                if (isWanted && std::find(found.begin(), found.end(), target) == found.end()) {
                    found.push_back(target);
                }
            }
        }
        return found;
    }

private:
    static bool has(const std::optional<std::string>& role, const std::string& name) {
        return !role || cim::sameName(*role, name);
    }

    /** Whether a reference other than the excluded one can refer to the source. */
    bool refersToSource(const Class& association, const Property* excluded = nullptr) const {
        return std::any_of(association.properties.begin(), association.properties.end(), [&](const Property& each) {
            return &each != excluded && each.type == CMPI_ref && has(filter.role, each.name) &&
                   schema.isA(source, each.referenceClass);
        });
    }

    const Schema& schema;
    const std::string& source;
    const AssociationFilter& filter;
};

}  // namespace

OperationResult Operations::getClass(const Call& call) {
    const std::string name = call.arguments.requiredClassName("ClassName");
    const Class* found = call.schema.findClass(name);
    if (found == nullptr) {
        throw CimError(CMPI_RC_ERR_NOT_FOUND, "There is no class " + name + ".");
    }
    return listed(Classes{found}, [writer = writerFor(call), parts = classPartsOf(call.arguments, true, true)](
                                      std::string& xml, const Class* each) { appendClass(xml, *each, parts, writer); });
}

OperationResult Operations::enumerateClasses(const Call& call) {
    const std::optional<std::string> superclass = call.arguments.className("ClassName");
    const std::string name = superclass ? classOf(call, *superclass).name : "";
    return listed(enumerated(call.schema, name, call.arguments.flag("DeepInheritance", false)),
                  [writer = writerFor(call), parts = classPartsOf(call.arguments, true, true)](
                      std::string& xml, const Class* each) { appendClass(xml, *each, parts, writer); });
}

OperationResult Operations::enumerateClassNames(const Call& call) {
    const std::optional<std::string> superclass = call.arguments.className("ClassName");
    const std::string name = superclass ? classOf(call, *superclass).name : "";
    return listed(enumerated(call.schema, name, call.arguments.flag("DeepInheritance", false)), &appendClassName);
}

OperationResult Operations::getQualifier(const Call& call) {
    const std::string name = call.arguments.requiredString("QualifierName");
    const QualifierDeclaration* found = call.schema.findQualifier(name);
    if (found == nullptr) {
        throw CimError(CMPI_RC_ERR_NOT_FOUND, "There is no qualifier " + name + ".");
    }
    return listed(std::vector{found}, [writer = writerFor(call)](std::string& xml, const QualifierDeclaration* each) {
        appendQualifierDeclaration(xml, *each, writer);
    });
}

OperationResult Operations::enumerateQualifiers(const Call& call) {
    return listed(call.schema.qualifiers(),
                  [writer = writerFor(call)](std::string& xml, const QualifierDeclaration* each) {
                      appendQualifierDeclaration(xml, *each, writer);
                  });
}

OperationResult Operations::traverseClasses(const Call& call, const ObjectPath& path) const {
    const std::string name = classOf(call, path.className).name;
    const AssociationFilter filter = filterOf(call);
    const ClassTraversal traversal(call.schema, name, filter);
    Classes found =
        isReferenceOperation(call.operation) ? traversal.associations(filter.resultClass) : traversal.associated();
    if (returnsPaths(call.operation)) {
        return listed(std::move(found), [writer = writerFor(call)](std::string& xml, const Class* each) {
            const Element object(xml, "OBJECTPATH");
            writer.appendClassPath(xml, each->name);
        });
    }
    return listed(std::move(found), [writer = writerFor(call), parts = classPartsOf(call.arguments, false, false)](
                                        std::string& xml, const Class* each) {
        const Element object(xml, "VALUE.OBJECTWITHPATH");
        writer.appendClassPath(xml, each->name);
        appendClass(xml, *each, parts, writer);
    });
}

}  // namespace cimhost::cimxml
