#include "schema/Schema.h"

namespace cimhost {
namespace {

constexpr Flavor open{true, true, false};         // inherited, may be overridden
constexpr Flavor fixed{true, false, false};       // inherited, may not be overridden
constexpr Flavor restricted{false, true, false};  // not inherited
constexpr Flavor translatable{true, true, true};

struct Row {
    const char* name;
    CMPIType type;
    bool isArray;
    Flavor flavor;
};

constexpr Row standard[] = {
    {"Abstract", CMPI_boolean, false, restricted},
    {"Aggregate", CMPI_boolean, false, fixed},
    {"Aggregation", CMPI_boolean, false, fixed},
    {"ArrayType", CMPI_string, false, fixed},
    {"Association", CMPI_boolean, false, fixed},
    {"BitMap", CMPI_string, true, open},
    {"BitValues", CMPI_string, true, translatable},
    {"ClassConstraint", CMPI_string, true, open},
    {"Composition", CMPI_boolean, false, fixed},
    {"Correlatable", CMPI_string, true, open},
    {"Counter", CMPI_boolean, false, open},
    {"Deprecated", CMPI_string, true, restricted},
    {"Description", CMPI_string, false, translatable},
    {"DisplayName", CMPI_string, false, translatable},
    {"DN", CMPI_boolean, false, fixed},
    {"EmbeddedInstance", CMPI_string, false, open},
    {"EmbeddedObject", CMPI_boolean, false, fixed},
    {"Exception", CMPI_boolean, false, fixed},
    {"Experimental", CMPI_boolean, false, restricted},
    {"Gauge", CMPI_boolean, false, open},
    {"In", CMPI_boolean, false, fixed},
    {"Indication", CMPI_boolean, false, fixed},
    {"IsPUnit", CMPI_boolean, false, open},
    {"Key", CMPI_boolean, false, fixed},
    {"MappingStrings", CMPI_string, true, open},
    {"Max", CMPI_uint32, false, open},
    {"MaxLen", CMPI_uint32, false, open},
    {"MaxValue", CMPI_sint64, false, open},
    {"MethodConstraint", CMPI_string, true, open},
    {"Min", CMPI_uint32, false, open},
    {"MinLen", CMPI_uint32, false, open},
    {"MinValue", CMPI_sint64, false, open},
    {"ModelCorrespondence", CMPI_string, true, open},
    {"NullValue", CMPI_string, false, fixed},
    {"OctetString", CMPI_boolean, false, fixed},
    {"Out", CMPI_boolean, false, fixed},
    {"Override", CMPI_string, false, restricted},
    {"Propagated", CMPI_string, false, fixed},
    {"PropertyConstraint", CMPI_string, true, open},
    {"PUnit", CMPI_string, false, open},
    {"Read", CMPI_boolean, false, open},
    {"Required", CMPI_boolean, false, fixed},
    {"Revision", CMPI_string, false, translatable},
    {"Schema", CMPI_string, false, translatable},
    {"Static", CMPI_boolean, false, fixed},
    {"Structure", CMPI_boolean, false, restricted},
    {"Terminal", CMPI_boolean, false, restricted},
    {"UMLPackagePath", CMPI_string, false, open},
    {"Units", CMPI_string, false, translatable},
    {"ValueMap", CMPI_string, true, open},
    {"Values", CMPI_string, true, translatable},
    {"Version", CMPI_string, false, {false, true, true}},
    {"Weak", CMPI_boolean, false, fixed},
    {"Write", CMPI_boolean, false, open},
};

QualifierDeclaration declaration(const Row& row) {
    QualifierDeclaration declared{row.name,   row.type, row.isArray, Value::null(row.type, row.isArray),
                                  row.flavor, true};
    if (row.type == CMPI_boolean) {
        declared.defaultValue = Value::of(false);
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
