#include "ManagedGate.h"
#include "lab/emulation/ManagerEmulation.h"

// Checks under every object manager that responses contain the listed properties and the keys.

namespace gatetest {
namespace {

using cimhost::Operation;
using cimhost::lab::Manager;
using testing::UnorderedElementsAreArray;

using Names = std::vector<std::string>;

struct Row {
    Operation operation;
    ObjectPath path;
    std::string associationClass;
    Names list;
    Names shown;
};

/** Returns rows whose lists include duplicate names, names in another letter case and unknown names. */
std::vector<Row> rows(const ObjectPath& agentPath, const ObjectPath& assetPath) {
    const ObjectPath beta = computerPath("beta");
    const Names assetNames{"IdentifyingNumber", "Name", "Vendor", "Version", "AssetNumber"};
    const Names agentNames{"IdentifyingNumber", "Name", "ProductName", "Vendor", "Version", "BuildNumber"};
    const Names ends{"Antecedent", "Dependent"};
    return {
        {Operation::enumerateInstances, classPath(lease), "", {"Lessor"}, {"InstanceID", "Lessor"}},
        {Operation::enumerateInstances, classPath(lease), "", {}, {"InstanceID"}},
        {Operation::getInstance,
         keyedPath(lease, secondNode),
         "",
         {"lessor", "LESSOR", "Nothing"},
         {"InstanceID", "Lessor"}},
        {Operation::enumerateInstances, classPath(warranty), "", {"Warrantor"}, {"InstanceID", "Warrantor"}},
        {Operation::getInstance, keyedPath(warranty, secondNode), "", {"InstanceID"}, {"InstanceID"}},
        {Operation::enumerateInstances, classPath(asset), "", {"AssetNumber"}, assetNames},
        {Operation::getInstance, assetPath, "", {"AssetNumber"}, assetNames},
        {Operation::enumerateInstances, classPath(agent), "", {"BuildNumber"}, agentNames},
        {Operation::getInstance, agentPath, "", {"BuildNumber"}, agentNames},
        {Operation::enumerateInstances, classPath(leaseSetting), "", {"Dependent"}, ends},
        {Operation::enumerateInstances, classPath(warrantySetting), "", {}, ends},
        {Operation::associators, beta, leaseSetting, {"Lessor"}, {"InstanceID", "Lessor"}},
        {Operation::associators, beta, warrantySetting, {"Warrantor"}, {"InstanceID", "Warrantor"}},
        {Operation::references, beta, leaseSetting, {"Antecedent"}, ends},
        {Operation::references, beta, warrantySetting, {}, ends},
    };
}

class PropertyListTest : public testing::TestWithParam<Manager> {
protected:
    PropertyListTest() {
        agentEnvironment::clear();
        EXPECT_TRUE(gate.create(secondNode, {named("Lessor", text("ACME"))}).ok());
        EXPECT_TRUE(gate.create(secondNode, {named("Warrantor", text("ACME"))}, warranty).ok());
    }
    ~PropertyListTest() override { agentEnvironment::clear(); }

    std::vector<Instance> ask(const Row& row) {
        cimhost::Request request;
        request.operation = row.operation;
        request.path = row.path;
        request.properties = row.list;
        const bool refers = row.operation == Operation::references;
        (refers ? request.filter.resultClass : request.filter.associationClass) = row.associationClass;
        const cimhost::Response found = gate.manager().perform(request);
        EXPECT_TRUE(found.ok()) << found.status.message;
        return found.instances;
    }

    SilentLog silence;
    ManagedGate gate{GetParam()};
};

TEST_P(PropertyListTest, ResponsesContainTheListedPropertiesAndTheKeys) {
    for (const Row& row : rows(gate.paths(agent).at(0), gate.paths(asset).at(0))) {
        SCOPED_TRACE(std::string(cimhost::nameOf(row.operation)) + " " + testsupport::toText(row.path));
        const std::vector<Instance> found = ask(row);
        EXPECT_THAT(found, testing::Not(testing::IsEmpty()));
        for (const Instance& instance : found) {
            EXPECT_THAT(testsupport::namesOf(instance.properties), UnorderedElementsAreArray(row.shown));
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Managers, PropertyListTest, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

}  // namespace
}  // namespace gatetest
