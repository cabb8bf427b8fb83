// Generates the gate's table of classes from MOF: schema_table MOF-FILE OUTPUT.

#include <exception>
#include <fstream>
#include <iostream>

#include "schema/MofReader.h"

namespace {

using cimhost::Class;
using cimhost::Property;

void writeProperty(std::ostream& out, const Property& property) {
    out << "    {\"" << property.name << "\", " << property.type << " /* " << cimhost::typeName(property.type)
        << " */, " << property.isKey() << ", " << property.isWritable() << ", ";
    if (property.referenceClass.empty()) {
        out << "nullptr},\n";
    } else {
        out << '"' << property.referenceClass << "\"},\n";
    }
}

void writeTable(std::ostream& out, const cimhost::Schema& schema) {
    out << std::boolalpha
        << "// Generated from the MOF.\n#include \"gate/cmpi/Schema.h\"\n\nnamespace gate {\nnamespace {\n";
    for (const Class* each : schema.classes()) {
        out << "\nconstexpr Property propertiesOf" << each->name << "[] = {\n";
        for (const Property& property : each->properties) {
            writeProperty(out, property);
        }
        out << "};\n";
    }
    out << "\nconstexpr Class classes[] = {\n";
    for (const Class* each : schema.classes()) {
        out << "    {\"" << each->name << "\", " << each->isAssociation() << ", propertiesOf" << each->name << ", "
            << each->properties.size() << "},\n";
    }
    out << "};\n\n}  // namespace\n\n"
           "const Class* Classes::begin() const {\n    return std::begin(classes);\n}\n\n"
           "const Class* Classes::end() const {\n    return std::end(classes);\n}\n\n}  // namespace gate\n";
}

void write(const char* mof, const char* file) {
    cimhost::Schema schema;
    cimhost::MofReader(schema).readFile(mof);
    std::ofstream out(file);
    writeTable(out, schema);
    out.close();
    if (!out) {
        throw std::runtime_error(std::string("cannot write ") + file);
    }
}

}  // namespace

int main(int count, char** arguments) {
    if (count != 3) {
        std::cerr << "usage: schema_table MOF-FILE OUTPUT\n";
        return 2;
    }
    try {
        write(arguments[1], arguments[2]);
    } catch (const std::exception& failure) {
        std::cerr << "schema_table: " << failure.what() << '\n';
        return 1;
    }
    return 0;
}
