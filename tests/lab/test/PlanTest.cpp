#include <gmock/gmock.h>

#include "lab/load/Plan.h"
#include "lab/test/Inventory.h"

namespace {

using cimhost::lab::LoadClass;
using cimhost::lab::Mix;
using cimhost::lab::OperationKind;
using cimhost::lab::Plan;
using cimhost::lab::PlanError;
using cimhost::lab::Random;
using testing::HasSubstr;

template <class Body>
std::string errorOf(Body body) {
    try {
        body();
        return {};
    } catch (const PlanError& error) {
        return error.what();
    }
}

TEST(Mix, ChoosesKindsByWeight) {
    const Mix mix("create=1,get=3");
    Random random(1, 1);
    int gets = 0;
    for (int i = 0; i < 4000; ++i) {
        const OperationKind kind = mix.pick(random);
        EXPECT_TRUE(kind == OperationKind::create || kind == OperationKind::get);
        gets += kind == OperationKind::get ? 1 : 0;
    }
    EXPECT_NEAR(gets, 3000, 150);
    EXPECT_EQ(mix.weight(OperationKind::remove), 0U);
}

TEST(Mix, ByDefaultContainsEverythingExceptAssociations) {
    const Mix mix;
    for (const OperationKind kind : {OperationKind::create, OperationKind::modify, OperationKind::remove,
                                     OperationKind::enumerate, OperationKind::get}) {
        EXPECT_GT(mix.weight(kind), 0U) << nameOf(kind);
    }
    EXPECT_EQ(mix.weight(OperationKind::associate), 0U);
}

TEST(Mix, RejectsInvalidLists) {
    EXPECT_THAT(errorOf([] { Mix("create=1,fly=2"); }), HasSubstr("fly is not one of create, modify"));
    EXPECT_THAT(errorOf([] { Mix("create"); }), HasSubstr("'create' is not NAME=WEIGHT"));
    EXPECT_THAT(errorOf([] { Mix("create=x"); }), HasSubstr("'x' is not a weight"));
    EXPECT_THAT(errorOf([] { Mix("create=-1"); }), HasSubstr("'-1' is not a weight"));
    EXPECT_THAT(errorOf([] { Mix("create="); }), HasSubstr("'' is not a weight"));
    EXPECT_THAT(errorOf([] { Mix("create=1000001"); }), HasSubstr("not a weight"));
    EXPECT_THAT(errorOf([] { Mix("create=0"); }), HasSubstr("are 0"));
    EXPECT_THAT(errorOf([] { Mix(""); }), HasSubstr("are 0"));
}

TEST(LoadClass, ReadsKeyAndModifiablePropertiesFromTheSchema) {
    const LoadClass thing = inventoryClass("inventory_thing");
    EXPECT_EQ(thing.key, "Name");
    std::vector<std::string> names;
    for (const cimhost::Property* each : thing.modifiable) {
        names.push_back(each->name);
    }
    EXPECT_THAT(names, testing::ElementsAre("Text", "Number", "Open"));
    EXPECT_TRUE(inventoryClass("Inventory_Sealed").modifiable.empty()) << "no values for arrays";
}

TEST(LoadClass, FindsIdentifiersInPathsAndInstances) {
    const LoadClass thing = inventoryClass();
    EXPECT_EQ(thing.idIn(thing.instancePath("x").keys), "x");
    EXPECT_EQ(thing.idIn({}), std::nullopt);
    EXPECT_EQ(thing.idIn({testsupport::named("NAME", testsupport::text("y"))}), "y");
    EXPECT_EQ(thing.idIn({testsupport::named("Name", testsupport::uint32(1))}), std::nullopt);
    EXPECT_EQ(thing.idIn({testsupport::named("Name", testsupport::nullOf(CMPI_string))}), std::nullopt);
}

TEST(LoadClass, RejectsClassesWithoutASingleStringKey) {
    EXPECT_THAT(errorOf([] { inventoryClass("Inventory_Numbered"); }), HasSubstr("other keys than one string"));
    EXPECT_THAT(errorOf([] { inventoryClass("Inventory_Pair"); }), HasSubstr("other keys than one string"));
    EXPECT_THAT(errorOf([] { inventoryClass("Inventory_Missing"); }), HasSubstr("not in the schema"));
}

TEST(Plan, MustBeFeasible) {
    Plan plan;
    plan.classes = {inventoryClass()};
    EXPECT_EQ(errorOf([&] { requireFeasible(plan); }), "");
    plan.mix = Mix("associate=1");
    EXPECT_THAT(errorOf([&] { requireFeasible(plan); }), HasSubstr("no instance to start from"));
    plan.mix = Mix();
    plan.classes.push_back(inventoryClass("Inventory_Sealed"));
    EXPECT_THAT(errorOf([&] { requireFeasible(plan); }), HasSubstr("Inventory_Sealed has no property"));
    plan.mix = Mix("create=1,delete=1");
    EXPECT_EQ(errorOf([&] { requireFeasible(plan); }), "");
}

}  // namespace
