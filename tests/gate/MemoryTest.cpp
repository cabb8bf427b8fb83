#include <dlfcn.h>
#include <execinfo.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <new>

#include "GateFixture.h"
#include "support/UnderTest.h"

// Lets each allocation of the gate fail in turn.

namespace {

/** Number of the gate's allocation that fails on this thread, counted from the assignment; 0 for none. */
thread_local long failingAllocation = 0;

bool isIn(const void* address, const char* library) {
    Dl_info module{};
    return dladdr(address, &module) != 0 && std::strstr(module.dli_fname, library) != nullptr;
}

/**
 * Returns whether the caller is the gate, directly or through the standard library. Allocations of the provider do not
 * fail in these tests.
 */
bool isTheGate(void* caller) {
    void* frames[24];
    void** const end = frames + backtrace(frames, 24);
    const auto isOther = [](const void* frame) { return !isIn(frame, "libstdc++"); };
    void** const found = std::find_if(std::find(frames, end, caller), end, isOther);
    return found != end && isIn(*found, "libLeaseAndWarrantyGate");
}

void* allocate(std::size_t size, void* caller) {
    if (failingAllocation > 0 && isTheGate(caller) && --failingAllocation == 0) {
        return nullptr;
    }
    return std::malloc(size == 0 ? 1 : size);
}

void* allocateOrThrow(std::size_t size, void* caller) {
    void* memory = allocate(size, caller);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

}  // namespace

// These operators replace those of the standard library, also for the libraries under test.
void* operator new(std::size_t size) {
    return allocateOrThrow(size, __builtin_return_address(0));
}
void* operator new[](std::size_t size) {
    return allocateOrThrow(size, __builtin_return_address(0));
}
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return allocate(size, __builtin_return_address(0));
}
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return allocate(size, __builtin_return_address(0));
}
void operator delete(void* memory) noexcept {
    std::free(memory);
}
void operator delete[](void* memory) noexcept {
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    std::free(memory);
}

namespace gatetest {
namespace {

using testing::ElementsAre;

/** Arguments of an entry point, created before allocations fail. */
struct Arguments {
    CMPIInstanceMI* instances;
    CMPIAssociationMI* associations;
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIObjectPath* path;
    const CMPIInstance* instance;
    const CMPIBroker* broker;
};

using Entry = std::function<CMPIStatus(const Arguments&)>;

struct EntryPoint {
    const char* name;
    const char* pathsClass;
    Entry entry;
};

const EntryPoint entryPoints[] = {
    {"enumerateInstanceNames", lease,
     [](const Arguments& a) {
         return a.instances->ft->enumerateInstanceNames(a.instances, a.context, a.result, a.path);
     }},
    {"enumerateInstances", lease,
     [](const Arguments& a) {
         return a.instances->ft->enumerateInstances(a.instances, a.context, a.result, a.path, nullptr);
     }},
    {"enumerateAssociations", leaseSetting,
     [](const Arguments& a) {
         return a.instances->ft->enumerateInstances(a.instances, a.context, a.result, a.path, nullptr);
     }},
    {"getInstance", lease,
     [](const Arguments& a) {
         const char* properties[] = {"Lessor", nullptr};
         return a.instances->ft->getInstance(a.instances, a.context, a.result, a.path, properties);
     }},
    {"createInstance", warranty,
     [](const Arguments& a) {
         return a.instances->ft->createInstance(a.instances, a.context, a.result, a.path, a.instance);
     }},
    {"modifyInstance", lease,
     [](const Arguments& a) {
         return a.instances->ft->modifyInstance(a.instances, a.context, a.result, a.path, a.instance, nullptr);
     }},
    {"deleteInstance", warranty,
     [](const Arguments& a) { return a.instances->ft->deleteInstance(a.instances, a.context, a.result, a.path); }},
    {"execQuery", lease,
     [](const Arguments& a) {
         return a.instances->ft->execQuery(a.instances, a.context, a.result, a.path, "WQL", "select");
     }},
    {"idleCleanup", lease,
     [](const Arguments& a) {
         a.associations->ft->cleanup(a.associations, a.context, 0);
         return a.instances->ft->cleanup(a.instances, a.context, 0);
     }},
    {"associators", lease,
     [](const Arguments& a) {
         return a.associations->ft->associators(a.associations, a.context, a.result, a.path, nullptr, nullptr, nullptr,
                                                nullptr, nullptr);
     }},
    {"associatorNames", lease,
     [](const Arguments& a) {
         return a.associations->ft->associatorNames(a.associations, a.context, a.result, a.path, nullptr, nullptr,
                                                    nullptr, nullptr);
     }},
    {"references", lease,
     [](const Arguments& a) {
         return a.associations->ft->references(a.associations, a.context, a.result, a.path, nullptr, nullptr, nullptr);
     }},
    {"referenceNames", lease,
     [](const Arguments& a) {
         return a.associations->ft->referenceNames(a.associations, a.context, a.result, a.path, nullptr, nullptr);
     }},
};

class MemoryTest : public GateTest, public testing::WithParamInterface<EntryPoint> {
protected:
    /** Calls the entry point while one allocation fails. @return whether the allocation occurred */
    bool run(long number, Outcome& outcome) {
        const ObjectPath path = keyedPath(GetParam().pathsClass, firstNode);
        const Instance sent = testsupport::instance(
            path, {named(GetParam().pathsClass == warranty ? "Warrantor" : "Lessor", text("Other"))});
        bool hasFailed = false;
        outcome = gate().call([&](cimhost::RequestScope& scope, const CMPIContext* context, const CMPIResult* result) {
            const Arguments arguments{gate().instanceMI(),    gate().associationMI(), context,        result,
                                      scope.objectPath(path), scope.instance(sent),   broker.handle()};
            failingAllocation = number;
            const CMPIStatus status = GetParam().entry(arguments);
            hasFailed = failingAllocation == 0;
            failingAllocation = 0;
            return status;
        });
        failingAllocation = 0;
        return hasFailed;
    }
};

TEST_P(MemoryTest, NoAllocationFailureThrowsOrBreaksTheNextRequest) {
    create("bystander", {named("Lessor", text("First"))});
    create(firstNode, {named("Lessor", text("ACME"))});
    bool allocationFailed = true;
    for (long number = 1; allocationFailed && !HasFailure(); ++number) {
        if (GetParam().pathsClass == warranty) {
            gate().deleteInstance(keyedPath(warranty, firstNode));
        }
        if (std::string(GetParam().name) == "deleteInstance") {
            create(firstNode, {}, warranty);
        }
        Outcome outcome;
        allocationFailed = run(number, outcome);
        EXPECT_FALSE(outcome.threw) << "allocation " << number;
        EXPECT_EQ(outcome.message.empty(), outcome.rc == CMPI_RC_OK) << "allocation " << number;
        EXPECT_THAT(identifiers(), ElementsAre("bystander", firstNode)) << "allocation " << number;
        EXPECT_EQ(valueIn(instanceOf("bystander"), "Lessor"), "First");
        if (std::string(GetParam().name) == "createInstance") {
            EXPECT_EQ(identifiers(warranty).empty(), outcome.rc != CMPI_RC_OK) << "allocation " << number;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Gate, MemoryTest, testing::ValuesIn(entryPoints),
                         [](const auto& parameter) { return std::string(parameter.param.name); });

TEST(FactoryMemoryTest, NoAllocationFailureThrows) {
    bool allocationFailed = true;
    for (long number = 1; allocationFailed; ++number) {
        testsupport::RecordingBroker broker;
        testsupport::ProviderLibrary library(testsupport::underTest(GATE_LIBRARY), "LeaseAndWarrantyGate", broker);
        auto* factory = library.function<CMPIInstanceMI*(const CMPIBroker*, const CMPIContext*, CMPIStatus*)>(
            "LeaseAndWarrantyGate_Create_InstanceMI");
        CMPIStatus status{CMPI_RC_OK, nullptr};
        failingAllocation = number;
        const CMPIInstanceMI* made = factory(broker.handle(), nullptr, &status);
        allocationFailed = failingAllocation == 0;
        failingAllocation = 0;
        EXPECT_EQ(made == nullptr, status.rc != CMPI_RC_OK) << "allocation " << number;
        EXPECT_EQ(status.msg == nullptr, status.rc == CMPI_RC_OK) << "allocation " << number;
        EXPECT_NE(factory(broker.handle(), nullptr, &status), nullptr);
    }
}

}  // namespace
}  // namespace gatetest
