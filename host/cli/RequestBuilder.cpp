#include "cli/RequestBuilder.h"

#include "broker/NamedValues.h"
#include "cli/Suggestion.h"
#include "cli/TextLayout.h"
#include "schema/Literal.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

namespace cimhost {
namespace {

bool takesClass(Operation operation) {
    return operation == Operation::enumerateInstances || operation == Operation::enumerateInstanceNames;
}

const Class& classOf(const ObjectPath& path, const Schema& schema) {
    const Class* known = schema.findClass(path.className);
    if (known == nullptr) {
        throw UnknownClass("class " + path.className +
                           " is not in the schema, so the types of its properties are unknown; name the MOF file that "
                           "declares it with --schema");
    }
    return *known;
}

template <class Elements>
std::vector<std::string> namesOf(const Elements& elements) {
    std::vector<std::string> names;
    names.reserve(elements.size());
    for (const auto& each : elements) {
        names.push_back(each.name);
    }
    return names;
}

const Property& propertyOf(const Class& known, const std::string& name) {
    const Property* property = known.findProperty(name);
    if (property != nullptr) {
        return *property;
    }
    const std::vector<std::string> names = namesOf(known.properties);
    throw UsageError("class " + known.name + " has no property " + name + "; its properties are " +
                     joined(names, ", ") + didYouMean(name, names));
}

/** Reads the values of a command line for one class. */
class ValueReader {
public:
    ValueReader(const Class& itsClass, const Schema& itsSchema, const std::string& itsNameSpace)
        : known(itsClass), schema(itsSchema), nameSpace(itsNameSpace) {}

    void assign(const std::string& assignment) {
        const std::size_t equals = assignment.find('=');
        if (equals == std::string::npos || equals == 0) {
            throw UsageError(assignment + " is not NAME=VALUE; to set null, write --null NAME");
        }
        const Property& property = propertyOf(known, assignment.substr(0, equals));
        add({property.name, parsePropertyValue(assignment.substr(equals + 1), property, schema, nameSpace)});
    }

    void setNull(const std::string& name) {
        const Property& property = propertyOf(known, name);
        add({property.name, Value::null(property.type, property.isArray)});
    }

    std::vector<NamedValue> values{};

private:
    void add(NamedValue value) {
        if (findNamed(values, value.name) != nullptr) {
            throw UsageError("property " + value.name.string() + " is given twice");
        }
        values.push_back(std::move(value));
    }

    const Class& known;
    const Schema& schema;
    const std::string& nameSpace;
};

std::vector<NamedValue> readValues(const Arguments& arguments, const ObjectPath& path, const Schema& schema) {
    if (arguments.assignments.empty() && arguments.nulls.empty()) {
        return {};
    }
    ValueReader reader(classOf(path, schema), schema, path.nameSpace);
    for (const std::string& assignment : arguments.assignments) {
        reader.assign(assignment);
    }
    for (const std::string& name : arguments.nulls) {
        reader.setNull(name);
    }
    return std::move(reader.values);
}

/** Copies the keys among the properties to the path. The object manager adds the path's keys to the properties. */
void joinKeys(Request& request, const Schema& schema) {
    const std::vector<NamedValue>& properties = request.instance.properties;
    const Class* known = schema.findClass(request.path.className);
    for (const Property* key : known != nullptr ? known->keys() : std::vector<const Property*>()) {
        const NamedValue* inPath = findNamed(request.path.keys, key->name);
        const NamedValue* given = findNamed(properties, key->name);
        if (given != nullptr && given->value.isNull) {
            throw UsageError("key " + key->name + " cannot be null");
        }
        if (given != nullptr && inPath != nullptr && formatMof(given->value) != formatMof(inPath->value)) {
            throw UsageError("key " + key->name + " has one value in the path and another one after it");
        }
        if (given != nullptr && inPath == nullptr) {
            request.path.keys.push_back(*given);
        }
    }
}

void addInstance(Request& request, const Arguments& arguments, const Schema& schema) {
    request.instance.properties = readValues(arguments, request.path, schema);
    if (request.operation == Operation::createInstance) {
        joinKeys(request, schema);
    } else {
        if (request.instance.properties.empty()) {
            throw UsageError("there is nothing to modify: write NAME=VALUE or --null NAME");
        }
        request.properties = namesOf(request.instance.properties);
    }
    request.instance.path = request.path;
}

}  // namespace

Request buildRequest(const Arguments& arguments, const Schema& schema) {
    Request request;
    request.operation = *arguments.operation;
    request.path = parseObjectPath(arguments.target, schema, arguments.nameSpace);
    request.properties = arguments.properties;
    request.filter = arguments.filter;
    if (takesClass(request.operation) && !request.path.keys.empty()) {
        throw UsageError(arguments.target + " is the path of an instance; write a class, or use get-instance");
    }
    if (request.operation == Operation::createInstance || request.operation == Operation::modifyInstance) {
        addInstance(request, arguments, schema);
    }
    return request;
}

}  // namespace cimhost
