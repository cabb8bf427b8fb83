#include <gtest/gtest.h>

#include "lab/load/Checks.h"
#include "lab/test/Inventory.h"

namespace cimhost::lab {
namespace {

std::string kindOf(const CheckResult& mismatch) {
    return mismatch ? mismatch->kind : "right";
}

class ChecksTest : public testing::Test {
protected:
    ChecksTest() {
        state.created("load-c1-1", {{"Text", testsupport::text("x")}});
        state.created("load-c1-2", {});
        state.doubt("load-c1-3");
    }

    Instance thing(const std::string& id, std::vector<cimhost::NamedValue> properties = {}) const {
        return {known.instancePath(id), std::move(properties)};
    }

    /** Checks an enumeration of the expected instances and these. @return the kind of mismatch, or "right" */
    std::string listing(std::vector<Instance> more, bool hasProperties = false) const {
        more.push_back(thing("old"));
        more.push_back(thing("load-c1-1", {testsupport::named("Text", testsupport::text("x"))}));
        more.push_back(thing("load-c1-2"));
        return kindOf(checkListing(expectation, more, hasProperties));
    }

    LoadClass known = inventoryClass();
    std::set<std::string> others{"old"};
    ExpectedState state{};
    Expectation expectation{known, others, state, "load-c1-", "load-"};
};

TEST_F(ChecksTest, ReportsAnUnexpectedStatus) {
    EXPECT_EQ(kindOf(checkStatus({}, CMPI_RC_OK)), "right");
    EXPECT_EQ(kindOf(checkStatus({CMPI_RC_ERR_NOT_FOUND, ""}, CMPI_RC_ERR_NOT_FOUND)), "right");
    const CheckResult failure = checkStatus({CMPI_RC_ERR_FAILED, "broken"}, CMPI_RC_OK);
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->kind, "status");
    EXPECT_EQ(failure->expected, "OK");
    EXPECT_EQ(failure->got, "error 1 (CMPI_RC_ERR_FAILED): broken");
    const CheckResult success = checkStatus({}, CMPI_RC_ERR_ALREADY_EXISTS);
    EXPECT_EQ(success->expected, "CMPI_RC_ERR_ALREADY_EXISTS");
    EXPECT_EQ(success->got, "OK");
}

TEST_F(ChecksTest, ReportsAnUnexpectedPathOfACreation) {
    EXPECT_EQ(kindOf(checkPath(known.instancePath("a"), known.instancePath("a"))), "right");
    EXPECT_EQ(kindOf(checkPath(known.instancePath("b"), known.instancePath("a"))), "path");
    EXPECT_EQ(kindOf(checkPath(inventoryPath("Inventory_Thing"), known.instancePath("a"))), "path");
    EXPECT_EQ(kindOf(checkPath(inventoryClass("Inventory_Liar").instancePath("a"), known.instancePath("a"))), "path");
}

TEST_F(ChecksTest, ReportsUnexpectedKeysAndValuesOfAnInstance) {
    const ExpectedState::Values values{{"Text", testsupport::text("x")}};
    const auto text = [](const char* value) { return testsupport::named("Text", testsupport::text(value)); };
    EXPECT_EQ(kindOf(checkInstance(known, thing("a", {text("x")}), "a", values)), "right");
    EXPECT_EQ(kindOf(checkInstance(known, thing("a", {text("y")}), "a", values)), "value");
    EXPECT_EQ(kindOf(checkInstance(known, thing("a"), "a", values)), "value");
    EXPECT_EQ(kindOf(checkInstance(known, thing("b", {text("x")}), "a", values)), "value");
    EXPECT_EQ(kindOf(checkInstance(known, thing("a", {text("x")}), "a", {})), "right")
        << "an unknown property can have any value";
    EXPECT_EQ(kindOf(checkInstance(known, {inventoryPath("Inventory_Thing"), {text("x")}}, "a", values)), "value")
        << "no key";
}

TEST_F(ChecksTest, ReportsInstancesThatAnEnumerationLacks) {
    EXPECT_EQ(listing({}), "right");
    EXPECT_EQ(listing({}, true), "right");
    EXPECT_EQ(kindOf(checkListing(expectation, {}, false)), "missing");
    EXPECT_EQ(kindOf(checkListing(expectation, {thing("old"), thing("load-c1-1")}, false)), "missing");
    EXPECT_EQ(kindOf(checkListing(expectation, {thing("load-c1-1"), thing("load-c1-2")}, false)), "missing");
}

TEST_F(ChecksTest, ReportsDuplicateAndUnexpectedInstancesOfAnEnumeration) {
    EXPECT_EQ(listing({thing("load-c1-1")}), "duplicate");
    EXPECT_EQ(listing({thing("load-c1-4")}), "deleted");
    EXPECT_EQ(listing({thing("load-c1-3")}), "right") << "doubtful";
    EXPECT_EQ(listing({thing("load-c2-1")}), "right") << "another client's";
    EXPECT_EQ(listing({thing("odd")}), "unknown");
    EXPECT_EQ(listing({thing("")}), "nameless");
    EXPECT_EQ(listing({{inventoryPath("Inventory_Thing"), {}}}), "nameless");
}

TEST_F(ChecksTest, ReportsUnexpectedValuesOfAnEnumeration) {
    const std::vector<Instance> wrong{
        thing("old"), thing("load-c1-1", {testsupport::named("Text", testsupport::text("y"))}), thing("load-c1-2")};
    EXPECT_EQ(kindOf(checkListing(expectation, wrong, true)), "value");
    EXPECT_EQ(kindOf(checkListing(expectation, wrong, false)), "right");
}

TEST_F(ChecksTest, ReportsAssociationsThatChange) {
    EXPECT_EQ(kindOf(checkAssociated({"a", "b"}, {"a", "b"})), "right");
    const CheckResult mismatch = checkAssociated({}, {"a", "b"});
    ASSERT_TRUE(mismatch);
    EXPECT_EQ(mismatch->kind, "association");
    EXPECT_EQ(mismatch->expected, "2: a...");
    EXPECT_EQ(mismatch->got, "nothing");
}

}  // namespace
}  // namespace cimhost::lab
