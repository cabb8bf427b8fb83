#include <gmock/gmock.h>

#include "lab/emulation/ManagerEmulation.h"
#include "lab/load/Load.h"
#include "lab/test/Inventory.h"
#include "operations/LoadedLibrary.h"

// Loads of correct and of defective providers. The wrong responses are the same in each run.

namespace {

using cimhost::Request;
using cimhost::lab::Manager;
using cimhost::lab::Mix;
using cimhost::lab::Plan;
using cimhost::lab::Report;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Key;

class LoadTest : public testing::Test {
protected:
    explicit LoadTest(Manager which = Manager::standard) : manager(inventoryOptions(which), inventoryRegistry()) {
        plan.requests = 800;
        plan.clients = 4;
        plan.listsChanges = cimhost::lab::clientsSendPropertyLists(which);
    }

    Report run(const std::vector<std::string>& classes = {"Inventory_Thing"}) {
        plan.classes.clear();
        for (const std::string& each : classes) {
            plan.classes.push_back(inventoryClass(each));
        }
        auto report = runLoad(manager, plan);
        EXPECT_TRUE(report.ok()) << report.status.message;
        return report.value;
    }

    std::size_t countOf(const std::string& className) {
        return manager.perform(Request::enumerateInstanceNames(inventoryPath(className))).paths.size();
    }

    static std::string firstOf(const Report& report) {
        return report.first.empty() ? ""
                                    : report.first.front().request + ": " + report.first.front().mismatch.expected +
                                          ", " + report.first.front().mismatch.got;
    }

    cimhost::ObjectManager manager;
    Plan plan{};
};

class LoadAsManager : public LoadTest, public testing::WithParamInterface<Manager> {
protected:
    LoadAsManager() : LoadTest(GetParam()) {}
};

TEST_P(LoadAsManager, ACorrectProviderHasNoWrongResponse) {
    plan.source = inventoryClass().instancePath("any");
    plan.associationClass = "Inventory_Holds";
    plan.mix = Mix("create=4,modify=5,delete=3,enumerate=1,get=7,associate=2");
    plan.clients = 16;
    plan.requests = 3200;
    plan.fills = true;
    const Report report = run({"Inventory_Thing", "Inventory_Shelf"});
    EXPECT_THAT(report.kinds, IsEmpty()) << firstOf(report);
    EXPECT_EQ(report.all.requests, 3200U);
    EXPECT_EQ(report.operations.size(), 6U);
    EXPECT_EQ(report.clients, 16U);
    EXPECT_EQ(countOf("Inventory_Thing"), 0U) << "nothing is left";
}

INSTANTIATE_TEST_SUITE_P(Managers, LoadAsManager, testing::ValuesIn(cimhost::lab::everyManager),
                         cimhost::lab::ManagerName());

struct WrongClass {
    const char* className;
    const char* kind;
};
void PrintTo(const WrongClass& wrong, std::ostream* out) {
    *out << wrong.className;
}

class LoadOnWrongClass : public LoadTest, public testing::WithParamInterface<WrongClass> {};

TEST_P(LoadOnWrongClass, ReportsTheMismatch) {
    const Report report = run({GetParam().className});
    EXPECT_THAT(report.kinds, testing::Contains(Key(GetParam().kind))) << firstOf(report);
    EXPECT_FALSE(report.first.empty());
    EXPECT_THAT(run().kinds, IsEmpty()) << "the other class is right";
}

INSTANTIATE_TEST_SUITE_P(
    Inventory, LoadOnWrongClass,
    testing::Values(WrongClass{"Inventory_Liar", "value"}, WrongClass{"Inventory_Hoarder", "deleted"},
                    WrongClass{"Inventory_Forgetful", "missing"}, WrongClass{"Inventory_Inventive", "unknown"},
                    WrongClass{"Inventory_Nameless", "nameless"}, WrongClass{"Inventory_Repeating", "duplicate"},
                    WrongClass{"Inventory_Misnaming", "path"}, WrongClass{"Inventory_Generous", "status"},
                    WrongClass{"Inventory_Polite", "status"}, WrongClass{"Inventory_Throwing", "status"},
                    WrongClass{"Inventory_Silent", "status"}),
    [](const auto& each) { return std::string(each.param.className).substr(6); });

TEST_F(LoadTest, ASingleDefectIsASingleMismatch) {
    for (const auto& [className, kind] :
         {std::pair("Inventory_Liar", "value"), std::pair("Inventory_Forgetful", "missing"),
          std::pair("Inventory_Misnaming", "path"), std::pair("Inventory_Polite", "status")}) {
        const Report report = run({className});
        EXPECT_THAT(report.kinds, ElementsAre(Key(kind))) << className << " " << firstOf(report);
    }
}

TEST_F(LoadTest, WithoutProbesOnlyExistingInstancesAreRequested) {
    EXPECT_THAT(run({"Inventory_Polite"}).kinds, testing::Contains(Key("status"))) << "success for a missing instance";
    plan.probes = false;
    EXPECT_THAT(run({"Inventory_Polite"}).kinds, IsEmpty());
    EXPECT_THAT(run({"Inventory_Liar"}).kinds, testing::Contains(Key("value")));
}

TEST_F(LoadTest, AssociationsThatChangeAreWrong) {
    plan.source = inventoryClass().instancePath("any");
    plan.associationClass = "Inventory_Wandering";
    plan.mix = Mix("get=1,associate=1");
    EXPECT_THAT(run().kinds, ElementsAre(Key("association")));
    plan.associationClass = "Inventory_Holds";
    EXPECT_THAT(run().kinds, IsEmpty()) << "unsupported references are still unsupported";
}

TEST_F(LoadTest, TheSameSeedResultsInTheSameLoad) {
    plan.clients = 1;
    const Report first = run({"Inventory_Liar"});
    const Report second = run({"Inventory_Liar"});
    EXPECT_EQ(first.wrong, second.wrong);
    EXPECT_EQ(firstOf(first), firstOf(second));
    plan.seed = 2;
    EXPECT_NE(firstOf(run({"Inventory_Liar"})), firstOf(first));
}

TEST_F(LoadTest, InitialInstancesRemainAndAreNotReportedAsUnknown) {
    manager.perform(Request::createInstance(inventoryClass().instancePath("mine"), {}));
    plan.keeps = true;
    EXPECT_THAT(run().kinds, IsEmpty());
    const std::size_t kept = countOf("Inventory_Thing");
    EXPECT_GT(kept, 1U);
    plan.keeps = false;
    EXPECT_THAT(run().kinds, IsEmpty()) << "with the same seed, but other names";
    EXPECT_EQ(countOf("Inventory_Thing"), kept);
}

TEST_F(LoadTest, AllRequestsAreDistributedToTheClients) {
    plan.clients = 7;
    plan.requests = 100;
    EXPECT_EQ(run().all.requests, 100U);
    plan.requests = 3;
    EXPECT_EQ(run().all.requests, 3U);
}

TEST_F(LoadTest, AFailureBeforeTheLoadIsReturned) {
    plan.classes = {inventoryClass()};
    plan.classes.front().path.nameSpace = "root/nowhere";
    EXPECT_EQ(runLoad(manager, plan).status.rc, CMPI_RC_ERR_INVALID_NAMESPACE);
    plan.classes = {inventoryClass()};
    plan.source = inventoryClass().instancePath("any");
    plan.associationClass = "Inventory_Nothing";
    EXPECT_EQ(runLoad(manager, plan).status.rc, CMPI_RC_ERR_INVALID_CLASS);
}

TEST_F(LoadTest, AProviderThatCannotBeLoadedIsALibraryError) {
    auto options = inventoryOptions(Manager::standard);
    options.libraries.searchPath = {"/nonexistent"};
    cimhost::ObjectManager without(options, inventoryRegistry());
    plan.classes = {inventoryClass()};
    EXPECT_THROW(runLoad(without, plan), cimhost::LibraryError);
}

class LoadAsSfcb : public LoadTest {
protected:
    LoadAsSfcb() : LoadTest(Manager::sfcb) {}
};

TEST_F(LoadAsSfcb, ACrashIsReported) {
    for (const char* className : {"Inventory_Throwing", "Inventory_Silent"}) {
        EXPECT_THAT(run({className}).kinds, testing::Contains(Key("died"))) << className;
    }
}

}  // namespace
