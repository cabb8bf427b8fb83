#include "cimxml/Interop.h"

#include "schema/MofReader.h"
#include "schema/StringLiteral.h"

namespace cimhost::cimxml {
namespace {

constexpr auto classes = R"(
[Description("A CIM object manager.")]
class CIM_ObjectManager {
    [Key] string SystemCreationClassName;
    [Key] string SystemName;
    [Key] string CreationClassName;
    [Key] string Name;
    string ElementName;
    string Description;
    string Version;
    boolean GatherStatisticalData = false;
};
[Description("A namespace of the object manager.")]
class CIM_Namespace {
    [Key] string SystemCreationClassName;
    [Key] string SystemName;
    [Key] string ObjectManagerCreationClassName;
    [Key] string ObjectManagerName;
    [Key] string CreationClassName;
    [Key] string Name;
    uint16 ClassInfo = 0;
    uint16 ClassType = 0;
    string DescriptionOfClassInfo;
};
[Description("The name of a namespace, for clients that do not know CIM_Namespace.")]
class __Namespace {
    [Key] string Name;
};
)";

std::string assignment(const char* name, const std::string& value) {
    return std::string("    ") + name + " = " + inQuotes(value) + ";\n";
}

std::string systemKeys(const std::string& host) {
    return assignment("SystemCreationClassName", "CIM_ComputerSystem") + assignment("SystemName", host);
}

constexpr auto managerName = "cimhost";

std::string managerInstance(const std::string& host, const std::string& version) {
    return "instance of CIM_ObjectManager {\n" + systemKeys(host) +
           assignment("CreationClassName", "CIM_ObjectManager") + assignment("Name", managerName) +
           assignment("ElementName", managerName) + assignment("Description", "cimhost version " + version) +
           assignment("Version", version) + "};\n";
}

std::string nameSpaceInstances(const std::string& host, const std::string& nameSpace) {
    return "instance of CIM_Namespace {\n" + systemKeys(host) +
           assignment("ObjectManagerCreationClassName", "CIM_ObjectManager") +
           assignment("ObjectManagerName", managerName) + assignment("CreationClassName", "CIM_Namespace") +
           assignment("Name", nameSpace) + "};\ninstance of __Namespace {\n" + assignment("Name", nameSpace) + "};\n";
}

}  // namespace

const std::vector<std::string>& interopNameSpaces() {
    static const std::vector<std::string> names{"root/interop", "interop"};
    return names;
}

Schema interopSchema(const std::string& host, const std::string& version, const std::vector<std::string>& nameSpaces) {
    std::string mof = classes + managerInstance(host, version);
    for (const auto& names : {nameSpaces, interopNameSpaces()}) {
        for (const std::string& each : names) {
            mof += nameSpaceInstances(host, each);
        }
    }
    Schema schema;
    MofReader(schema).readSource(mof, "classes of the interop namespace");
    return schema;
}

}  // namespace cimhost::cimxml
