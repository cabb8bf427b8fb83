#include "schema/Schema.h"

namespace cimhost {
namespace {

constexpr Flavor open{true, true, false};         // inherited, can be overridden
constexpr Flavor fixed{true, false, false};       // inherited, cannot be overridden
constexpr Flavor restricted{false, true, false};  // not inherited
constexpr Flavor translatable{true, true, true};

// Bits of Scope, in the order of scopeNames.
constexpr unsigned anyClass = 1;
constexpr unsigned association = 2;
constexpr unsigned reference = 4;
constexpr unsigned property = 8;
constexpr unsigned method = 16;
constexpr unsigned parameter = 32;
constexpr unsigned indication = 64;
constexpr unsigned classes = anyClass | association | indication;
constexpr unsigned values = property | method | parameter;
constexpr unsigned any = classes | reference | values;

struct Row {
    const char* name;
    CMPIType type;
    bool isArray;
    Flavor flavor;
    unsigned scope;
};

constexpr Row standard[] = {
    {"Abstract", CMPI_boolean, false, restricted, classes},
    {"Aggregate", CMPI_boolean, false, fixed, reference},
    {"Aggregation", CMPI_boolean, false, fixed, association},
    {"ArrayType", CMPI_string, false, fixed, property | parameter},
    {"Association", CMPI_boolean, false, fixed, association},
    {"BitMap", CMPI_string, true, open, values},
    {"BitValues", CMPI_string, true, translatable, values},
    {"ClassConstraint", CMPI_string, true, open, classes},
    {"Composition", CMPI_boolean, false, fixed, association},
    {"Correlatable", CMPI_string, true, open, property},
    {"Counter", CMPI_boolean, false, open, values},
    {"Deprecated", CMPI_string, true, restricted, any},
    {"Description", CMPI_string, false, translatable, any},
    {"DisplayName", CMPI_string, false, translatable, any},
    {"DN", CMPI_boolean, false, fixed, values},
    {"EmbeddedInstance", CMPI_string, false, open, values},
    {"EmbeddedObject", CMPI_boolean, false, fixed, values},
    {"Exception", CMPI_boolean, false, fixed, anyClass | indication},
    {"Experimental", CMPI_boolean, false, restricted, any},
    {"Gauge", CMPI_boolean, false, open, values},
    {"In", CMPI_boolean, false, fixed, parameter},
    {"Indication", CMPI_boolean, false, fixed, anyClass | indication},
    {"IsPUnit", CMPI_boolean, false, open, values},
    {"Key", CMPI_boolean, false, fixed, property | reference},
    {"MappingStrings", CMPI_string, true, open, any},
    {"Max", CMPI_uint32, false, open, reference},
    {"MaxLen", CMPI_uint32, false, open, values},
    {"MaxValue", CMPI_sint64, false, open, values},
    {"MethodConstraint", CMPI_string, true, open, method},
    {"Min", CMPI_uint32, false, open, reference},
    {"MinLen", CMPI_uint32, false, open, values},
    {"MinValue", CMPI_sint64, false, open, values},
    {"ModelCorrespondence", CMPI_string, true, open, any},
    {"NullValue", CMPI_string, false, fixed, property},
    {"OctetString", CMPI_boolean, false, fixed, values},
    {"Out", CMPI_boolean, false, fixed, parameter},
    {"Override", CMPI_string, false, restricted, property | reference | method},
    {"Propagated", CMPI_string, false, fixed, property},
    {"PropertyConstraint", CMPI_string, true, open, property | reference},
    {"PUnit", CMPI_string, false, open, values},
    {"Read", CMPI_boolean, false, open, property},
    {"Required", CMPI_boolean, false, fixed, values | reference},
    {"Revision", CMPI_string, false, translatable, classes},
    {"Schema", CMPI_string, false, translatable, property | method},
    {"Static", CMPI_boolean, false, fixed, property | method},
    {"Structure", CMPI_boolean, false, restricted, classes},
    {"Terminal", CMPI_boolean, false, restricted, classes},
    {"UMLPackagePath", CMPI_string, false, open, classes},
    {"Units", CMPI_string, false, translatable, values},
    {"ValueMap", CMPI_string, true, open, values},
    {"Values", CMPI_string, true, translatable, values},
    {"Version", CMPI_string, false, {false, true, true}, classes},
    {"Weak", CMPI_boolean, false, fixed, reference},
    {"Write", CMPI_boolean, false, open, property},
};

QualifierDeclaration declaration(const Row& row) {
    QualifierDeclaration declared{row.name,   row.type,  row.isArray, Value::null(row.type, row.isArray),
                                  row.flavor, row.scope, true};
    if (row.type == CMPI_boolean) {
        declared.defaultValue = Value::of(cim::sameName(row.name, "In") || cim::sameName(row.name, "Read"));
    } else if (cim::sameName(row.name, "ArrayType")) {
        declared.defaultValue = Value::of("Bag");
    }
    return declared;
}

}  // namespace

std::vector<QualifierDeclaration> standardQualifiers() {
    std::vector<QualifierDeclaration> declarations;
    for (const Row& row : standard) {
        declarations.push_back(declaration(row));
    }
    return declarations;
}

}  // namespace cimhost
