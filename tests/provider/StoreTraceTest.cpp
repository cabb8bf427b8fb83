// Log records of the stores.

#include <gmock/gmock.h>

#include <algorithm>

#include "RecordKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;
using testing::StartsWith;

template <class Kind>
class StoreTrace : public RecordStore<Kind> {
protected:
    static std::string source() { return Words<Kind>::sourceFile; }
    static std::string named(const std::string& before, const std::string& after = {}) {
        return Words<Kind>::with(before, after);
    }

    template <class Operation>
    static std::vector<std::string> loggedBy(const std::string& function, Operation operation) {
        return flowLoggedBy(source(), function, operation);
    }
};

TYPED_TEST_SUITE(StoreTrace, RecordKinds, KindNames);

TYPED_TEST(StoreTrace, LogsTheCountWhenACursorIsCreated) {
    this->fill({"A", "B"});
    EXPECT_THAT(this->loggedBy(this->named("", "Base"), [] { typename TypeParam::Base base; }),
                ElementsAre(entering(this->named("", "Base"), this->source()),
                            variable(Words<TypeParam>::countName, "2", this->source()),
                            exiting(this->named("", "Base"), this->source())));
}

TYPED_TEST(StoreTrace, LogsInTheDestructorWhetherACursorChangedAnything) {
    this->fill({"A"});
    const std::string destructor = this->named("~", "Base");
    EXPECT_THAT(this->loggedBy(destructor, [] { typename TypeParam::Base base; }),
                ElementsAre(entering(destructor, this->source()), variable("cacheModified", "0", this->source()),
                            exiting(destructor, this->source())));
    EXPECT_THAT(this->loggedBy(destructor,
                               [] {
                                   typename TypeParam::Base base;
                                   base.setProperty(TypeParam::number, 5U);
                               }),
                ElementsAre(entering(destructor, this->source()), variable("cacheModified", "1", this->source()),
                            exiting(destructor, this->source())));
}

TYPED_TEST(StoreTrace, LogsTheNamesOfOperators) {
    this->fill({"A"});
    typename TypeParam::Base base;
    EXPECT_THAT(this->loggedBy("operator bool", [&] { EXPECT_TRUE(hasCurrent(base)); }),
                ElementsAre(entering("operator bool", this->source()), exiting("operator bool", this->source())));
    EXPECT_THAT(this->loggedBy("operator++", [&] { ++base; }),
                ElementsAre(entering("operator++", this->source()), exiting("operator++", this->source())));
}

TYPED_TEST(StoreTrace, LogsSelectedAndCreatedIdentifiers) {
    typename TypeParam::Base base;
    const std::string create = this->named("create");
    EXPECT_THAT(this->loggedBy(create, [&] { TypeParam::create(base, "new one"); }),
                ElementsAre(entering(create, this->source(), " instanceId=new one"),
                            exiting(create, this->source(), " instanceId=new one")));
    const std::string select = this->named("select");
    EXPECT_THAT(this->loggedBy(select, [&] { TypeParam::select(base, "other one"); }),
                ElementsAre(entering(select, this->source(), " instanceId=other one"),
                            exiting(select, this->source(), " instanceId=other one")));
}

TYPED_TEST(StoreTrace, LogsTheCountAfterADeletion) {
    this->fill({"A", "B"});
    typename TypeParam::Base base;
    const std::string remove = this->named("delete");
    EXPECT_THAT(
        this->loggedBy(remove, [&] { TypeParam::remove(base); }),
        ElementsAre(entering(remove, this->source()), variable(Words<TypeParam>::countName, "1", this->source()),
                    exiting(remove, this->source())));
}

TYPED_TEST(StoreTrace, LogsAPropertyAndItsValueAtEntryAndExit) {
    this->fill({"A"});
    typename TypeParam::Base base;
    const std::string property = std::to_string(static_cast<int>(TypeParam::text));
    EXPECT_THAT(this->loggedBy("setProperty", [&] { base.setProperty(TypeParam::text, std::string("ACME Co")); }),
                ElementsAre(entering("setProperty", this->source(), " property=" + property + " value=ACME Co"),
                            exiting("setProperty", this->source(), " property=" + property + " value=ACME Co")));
    std::string value = "before";
    EXPECT_THAT(this->loggedBy("getProperty", [&] { base.getProperty(TypeParam::text, value); }),
                ElementsAre(entering("getProperty", this->source(), " property=" + property + " value=before"),
                            exiting("getProperty", this->source(), " property=" + property + " value=ACME Co")));
}

TYPED_TEST(StoreTrace, LogsNumbersUnchanged) {
    this->fill({"A"});
    typename TypeParam::Base base;
    const std::string list = " property=" + std::to_string(static_cast<int>(TypeParam::number)) + " value=4294967295";
    EXPECT_THAT(
        this->loggedBy("setProperty", [&] { base.setProperty(TypeParam::number, 4294967295U); }),
        ElementsAre(entering("setProperty", this->source(), list), exiting("setProperty", this->source(), list)));
}

/** Expects that a failed operation logs its failure at error level after its entry, and no exit. */
void expectFailureLogged(const std::string& source, const std::string& function, const std::string& text) {
    const auto records = recordsOf(source, function);
    ASSERT_EQ(records.size(), 2U) << function;
    EXPECT_THAT(records[0].text, StartsWith("ENTERING: " + function + "() in " + source));
    EXPECT_EQ(records[0].level, 4000);
    EXPECT_EQ(withoutLine(records[1].text), message(text, source));
    EXPECT_EQ(records[1].level, 3000);
}

TYPED_TEST(StoreTrace, LogsFailuresAtErrorLevelAndNoExit) {
    this->fill({"A"});
    typename TypeParam::Base base;
    agentEnvironment::forgetLog();
    EXPECT_THROW(TypeParam::create(base, "A"), InstrumentationException);
    expectFailureLogged(this->source(), this->named("create"), Words<TypeParam>::exists);
    EXPECT_THROW(base.setProperty(TypeParam::text, 5U), InstrumentationException);
    expectFailureLogged(this->source(), "setProperty", "Incorrect Type or Property.");
    unsigned int number = 0;
    EXPECT_THROW(base.getProperty(TypeParam::text, number), InstrumentationException);
    expectFailureLogged(this->source(), "getProperty", "Incorrect Type or Property");
    ++base;
    EXPECT_THROW(TypeParam::remove(base), InstrumentationException);
    expectFailureLogged(this->source(), this->named("delete"), Words<TypeParam>::notAvailable);
}

TYPED_TEST(StoreTrace, LogsStreamOperatorsWithStreamAndRecord) {
    const std::string streamed = " " + this->named("", "=");
    const std::string label = static_cast<char>(std::tolower(TypeParam::name[0])) + std::string(TypeParam::name + 1);
    typename TypeParam::Unit unit("A");
    std::ostringstream record;
    record << " " << label << "=" << &unit;

    std::ofstream target(this->path());
    std::ostringstream targetAddress;
    targetAddress << " target=" << &target;
    EXPECT_THAT(this->loggedBy("operator<<", [&] { target << unit; }),
                ElementsAre(entering("operator<<", this->source(), targetAddress.str() + record.str()),
                            exiting("operator<<", this->source(), targetAddress.str() + record.str())));

    std::ifstream source(this->path());
    std::ostringstream sourceAddress;
    sourceAddress << " source=" << &source;
    EXPECT_THAT(this->loggedBy("operator>>", [&] { source >> unit; }),
                ElementsAre(entering("operator>>", this->source(), sourceAddress.str() + record.str()),
                            exiting("operator>>", this->source(), sourceAddress.str() + record.str())));
}

TYPED_TEST(StoreTrace, LogsConstructionCopyAndAssignmentOfRecords) {
    const std::string unit = this->named("", "Unit");
    EXPECT_THAT(this->loggedBy(unit, [] { const typename TypeParam::Unit made; }),
                ElementsAre(entering(unit, this->source()), exiting(unit, this->source())));
    EXPECT_THAT(
        this->loggedBy(unit, [] { const typename TypeParam::Unit made("A"); }),
        ElementsAre(entering(unit, this->source(), " instanceId=A"), exiting(unit, this->source(), " instanceId=A")));
    const typename TypeParam::Unit original("A");
    std::ostringstream list;
    list << " instance=" << &original;
    EXPECT_THAT(this->loggedBy(unit, [&] { const typename TypeParam::Unit copy(original); }),
                ElementsAre(entering(unit, this->source(), list.str()), exiting(unit, this->source(), list.str())));
    typename TypeParam::Unit assigned;
    EXPECT_THAT(this->loggedBy("operator=", [&] { assigned = original; }),
                ElementsAre(entering("operator=", this->source(), list.str()),
                            exiting("operator=", this->source(), list.str())));
}

TYPED_TEST(StoreTrace, LogsConstructionAndDestructionOfTheTable) {
    const std::string cache = this->named("", "Cache");
    EXPECT_THAT(this->loggedBy(cache, [] { typename TypeParam::Cache made; }),
                ElementsAre(entering(cache, this->source()), exiting(cache, this->source())));
    const std::string destructor = "~" + cache;
    EXPECT_THAT(this->loggedBy(destructor, [] { typename TypeParam::Cache made; }),
                ElementsAre(entering(destructor, this->source()), exiting(destructor, this->source())));
}

TYPED_TEST(StoreTrace, LogsACountOfZeroLikeAMissingFile) {
    const auto loaded = [] {
        agentEnvironment::forgetLog();
        { typename TypeParam::Cache cache; }
        return logMessages();
    };
    const auto withoutFile = loaded();
    EXPECT_EQ(withoutFile.size(), 4U) << "construction and destruction of the table, no record";
    for (const char* content : {"0\n", "0", "0\nA\n"}) {
        write(this->path(), content);
        EXPECT_EQ(loaded(), withoutFile) << content;
    }
}

TYPED_TEST(StoreTrace, IsTheSameOnBothChannels) {
    agentEnvironment::forgetLog();
    {
        typename TypeParam::Base base;
        TypeParam::create(base, "A");
    }
    EXPECT_GT(logMessages("log").size(), 10U);
    EXPECT_EQ(logMessages("log"), logMessages("trace"));
}

using LeaseFlagTrace = StoreTrace<LeaseKind>;

TEST_F(LeaseFlagTrace, LogsFlagsAsNumbers) {
    fill({"A"});
    LeaseBase base;
    EXPECT_THAT(loggedBy("setProperty", [&] { base.setProperty(LeaseKind::Property::RenewalOption, true); }),
                ElementsAre(entering("setProperty", source(), " property=11 value=1"),
                            exiting("setProperty", source(), " property=11 value=1")));
}

}  // namespace
