// The adapter for the computer end of associations, which returns the instances of another provider unchanged.

#include <cmpift.h>
#include <gmock/gmock.h>

#include <array>

#include "CMPIComputerSystem.h"
#include "KO/Exceptions.h"
#include "Support.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;

using KO::LeaseWarrantyProvider::CMPILAWComputerSystem;

/** An object manager that serves only computer systems. */
class Manager {
public:
    explicit Manager(std::size_t computers) : computerCount(computers) {
        services.enumerateInstances = &enumerateInstances;
        enumerationTable.hasNext = &hasNext;
        enumerationTable.getNext = &getNext;
        instanceTable.getObjectPath = &getObjectPath;
        for (std::size_t index = 0; index < instances.size(); ++index) {
            instances.at(index) = {&paths.at(index), &instanceTable};
        }
    }
    Manager(const Manager&) = delete;
    Manager& operator=(const Manager&) = delete;

    const CMPIBroker* broker() const { return &handle; }
    const CMPIContext* context() const { return &requestContext; }
    const CMPIObjectPath* classPath() const { return &requestPath; }
    CMPIInstance* instance(std::size_t index) { return &instances.at(index); }
    CMPIObjectPath* path(std::size_t index) { return &paths.at(index); }

    /** Sets the type and the state of an element of the enumeration. */
    void setElement(std::size_t index, CMPIType type, CMPIValueState state) {
        types.at(index) = type;
        states.at(index) = state;
    }

    /** Status codes that getNext and getObjectPath return from now on. */
    CMPIrc nextStatus = CMPI_RC_OK;
    CMPIrc pathStatus = CMPI_RC_OK;

    int enumerations = 0;
    const CMPIContext* receivedContext = nullptr;
    const CMPIObjectPath* receivedPath = nullptr;
    bool receivedList = false;

private:
    template <class Handle>
    static Manager& of(const Handle* object) {
        return *static_cast<Manager*>(object->hdl);
    }

    static CMPIEnumeration* enumerateInstances(const CMPIBroker* broker, const CMPIContext* context,
                                               const CMPIObjectPath* path, const char** properties, CMPIStatus* rc) {
        Manager& manager = of(broker);
        ++manager.enumerations;
        manager.receivedContext = context;
        manager.receivedPath = path;
        manager.receivedList = properties != nullptr;
        *rc = {CMPI_RC_OK, nullptr};
        return &manager.enumeration;
    }

    static CMPIBoolean hasNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
        *rc = {CMPI_RC_OK, nullptr};
        return of(enumeration).taken < of(enumeration).computerCount ? 1 : 0;
    }

    static CMPIData getNext(const CMPIEnumeration* enumeration, CMPIStatus* rc) {
        Manager& manager = of(enumeration);
        const bool isThere = manager.nextStatus == CMPI_RC_OK && manager.taken < manager.computerCount;
        *rc = {isThere ? CMPI_RC_OK : CMPI_RC_ERR_FAILED, nullptr};
        const std::size_t index = isThere ? manager.taken++ : 0;
        CMPIData data{};
        data.type = manager.types.at(index);
        data.state = manager.states.at(index);
        data.value.inst = &manager.instances.at(index);
        return data;
    }

    /** Returns the path regardless of the status. */
    static CMPIObjectPath* getObjectPath(const CMPIInstance* instance, CMPIStatus* rc) {
        auto* path = static_cast<CMPIObjectPath*>(instance->hdl);
        *rc = {of(path).pathStatus, nullptr};
        return path;
    }

    std::size_t computerCount;
    std::size_t taken = 0;
    CMPIBrokerFT services{};
    CMPIEnumerationFT enumerationTable{};
    CMPIInstanceFT instanceTable{};
    CMPIBroker handle{this, &services, nullptr, nullptr, nullptr};
    CMPIContext requestContext{};
    CMPIObjectPath requestPath{};
    CMPIEnumeration enumeration{this, &enumerationTable};
    std::array<CMPIObjectPath, 3> paths{{{this, nullptr}, {this, nullptr}, {this, nullptr}}};
    std::array<CMPIInstance, 3> instances{};
    std::array<CMPIType, 3> types{CMPI_instance, CMPI_instance, CMPI_instance};
    std::array<CMPIValueState, 3> states{CMPI_goodValue, CMPI_goodValue, CMPI_goodValue};
};

class ComputerSystemAdapter : public CleanAgent {
protected:
    static void expectNone(CMPILAWComputerSystem& adapter) {
        EXPECT_FALSE(hasCurrent(adapter));
        EXPECT_EQ(adapter.getObjectPath(), nullptr);
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    }

    static std::string refusal(CMPILAWComputerSystem& adapter, const CMPIObjectPath* path) {
        return thrown<KO::ProviderException>([&] { adapter.setObjectPath(path); });
    }
};

constexpr const char* noComputer = "Could not obtain an instance of Computer System";

TEST_F(ComputerSystemAdapter, HasNoInstanceBeforeItsPathIsSet) {
    Manager manager(2);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    expectNone(adapter);
    ++adapter;
    expectNone(adapter);
    EXPECT_EQ(manager.enumerations, 0);
}

TEST_F(ComputerSystemAdapter, ReturnsTheInstancesOfTheObjectManager) {
    Manager manager(3);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    const char* list[] = {"Name", nullptr};
    for (const std::size_t index : {0U, 1U, 2U}) {
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), manager.instance(index));
        EXPECT_EQ(adapter.getCMPIInstance(list), manager.instance(index));
        EXPECT_EQ(adapter.getObjectPath(), manager.path(index));
        EXPECT_EQ(hasCurrent(adapter), index < 2) << "whether there is a further instance";
        ++adapter;
    }
}

TEST_F(ComputerSystemAdapter, HasNoInstanceAfterTheLast) {
    Manager manager(1);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), manager.instance(0));
    for (int steps = 0; steps < 3; ++steps) {
        ++adapter;
        expectNone(adapter);
    }
}

TEST_F(ComputerSystemAdapter, OmitsTheLastInstanceInALoopOverItsCondition) {
    Manager manager(3);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    std::vector<CMPIInstance*> visited;
    for (; adapter; ++adapter) {
        visited.push_back(adapter.getCMPIInstance(nullptr));
    }
    EXPECT_THAT(visited, ElementsAre(manager.instance(0), manager.instance(1)));
}

TEST_F(ComputerSystemAdapter, EnumeratesTheClassOfThePathWithAllProperties) {
    Manager manager(1);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/elsewhere");
    adapter.setObjectPath(manager.classPath());
    EXPECT_EQ(manager.enumerations, 1);
    EXPECT_EQ(manager.receivedContext, manager.context());
    EXPECT_EQ(manager.receivedPath, manager.classPath());
    EXPECT_FALSE(manager.receivedList);
}

TEST_F(ComputerSystemAdapter, DoesNotCallTheBrokerForANullPath) {
    Manager manager(1);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    EXPECT_EQ(refusal(adapter, nullptr), noComputer);
    EXPECT_EQ(manager.enumerations, 0);
    expectNone(adapter);
}

TEST_F(ComputerSystemAdapter, ThrowsWithoutAComputer) {
    Manager manager(0);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    EXPECT_EQ(refusal(adapter, manager.classPath()), noComputer);
    expectNone(adapter);
}

TEST_F(ComputerSystemAdapter, KeepsTheEnumerationIfTheFirstInstanceCannotBeRead) {
    Manager manager(2);
    manager.nextStatus = CMPI_RC_ERR_FAILED;
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    EXPECT_EQ(refusal(adapter, manager.classPath()), noComputer);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    EXPECT_TRUE(hasCurrent(adapter)) << "there is a further instance";
}

TEST_F(ComputerSystemAdapter, HasNoInstanceIfTheNextCannotBeRead) {
    Manager manager(3);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    manager.nextStatus = CMPI_RC_ERR_FAILED;
    ++adapter;
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
    manager.nextStatus = CMPI_RC_OK;
    ++adapter;
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), manager.instance(1));
}

TEST_F(ComputerSystemAdapter, HasNoPathIfTheInstanceReportsAFailure) {
    Manager manager(1);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    manager.pathStatus = CMPI_RC_ERR_FAILED;
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), manager.instance(0));
}

TEST_F(ComputerSystemAdapter, HasNoInstanceIfTheElementIsOfAnotherType) {
    Manager manager(2);
    manager.setElement(1, CMPI_string, CMPI_goodValue);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    ++adapter;
    EXPECT_EQ(adapter.getCMPIInstance(nullptr), nullptr);
    EXPECT_EQ(adapter.getObjectPath(), nullptr);
}

TEST_F(ComputerSystemAdapter, IgnoresTheStateOfElements) {
    Manager manager(3);
    manager.setElement(0, CMPI_instance, CMPI_nullValue);
    manager.setElement(1, CMPI_instance, CMPI_notFound);
    manager.setElement(2, CMPI_instance, CMPI_badValue);
    CMPILAWComputerSystem adapter(manager.broker(), manager.context(), "root/cimv2");
    adapter.setObjectPath(manager.classPath());
    for (const std::size_t index : {0U, 1U, 2U}) {
        EXPECT_EQ(adapter.getCMPIInstance(nullptr), manager.instance(index));
        EXPECT_EQ(adapter.getObjectPath(), manager.path(index));
        ++adapter;
    }
}

}  // namespace
