#include <gmock/gmock.h>

#include <array>
#include <sstream>

#include "KO/Exceptions.h"
#include "Support.h"
#include "Trace.h"

namespace {

using namespace KO;
using namespace providerTest;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string loggerOfTest("Test.Logger");
const TraceSource traceSource{loggerOfTest, "TraceLineTest.cpp"};

class TraceLine : public CleanAgent {};

TEST_F(TraceLine, IsWrittenToTheLogChannelAndThenToTheTraceChannel) {
    traceMessage({&traceSource, Level::error, "aFunction", 17}, "a text");
    const auto records = agentEnvironment::log();
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].channel, "log");
    EXPECT_EQ(records[1].channel, "trace");
    for (const auto& record : records) {
        EXPECT_EQ(record.level, 3000);
        EXPECT_EQ(record.logger, "Test.Logger");
        EXPECT_EQ(record.function, "aFunction");
        EXPECT_EQ(record.file, "TraceLineTest.cpp");
        EXPECT_EQ(record.line, 17);
        EXPECT_EQ(record.text, "MESSAGE [File: TraceLineTest.cpp, Line: 17]: a text");
    }
}

TEST_F(TraceLine, HasTheFunctionAndLineOfTheCall) {
    traceMethod(at(traceSource));
    const unsigned int line = __LINE__ - 1;
    const auto records = agentEnvironment::log();
    ASSERT_EQ(records.size(), 2U);
    EXPECT_EQ(records[0].function, "TestBody");
    EXPECT_EQ(records[0].line, static_cast<int>(line));
    EXPECT_EQ(records[0].text,
              "METHOD: TestBody() was invoked in TraceLineTest.cpp [Line: " + std::to_string(line) + "]");
    EXPECT_EQ(records[0].level, 4000);
}

TEST_F(TraceLine, EscapesControlCharacters) {
    traceVariable(at(traceSource), "value", std::string("one\ntwo\tthree"));
    EXPECT_THAT(logMessages(), ElementsAre(variable("value", "one\\ntwo\\tthree", "TraceLineTest.cpp")));
}

TEST_F(TraceLine, FormatsAFlagAsANumber) {
    traceVariable(at(traceSource), "flag", true);
    EXPECT_THAT(logMessages(), ElementsAre(variable("flag", "1", "TraceLineTest.cpp")));
}

TEST_F(TraceLine, IsDroppedIfItsLevelIsNotAdmitted) {
    traceMessage({&traceSource, 10000, "aFunction", 1}, "a text");
    EXPECT_THAT(agentEnvironment::log(), IsEmpty());
}

TEST_F(TraceLine, IsTruncatedAt511Characters) {
    const std::string longList(600, 'x');
    traceLine({&traceSource, Level::flow, "f", 1}, MT_ENTERING, label::value, longList);
    const auto shown = logMessages();
    ASSERT_EQ(shown.size(), 1U);
    const std::string head = "ENTERING: f() in TraceLineTest.cpp [Line: 1],Parameters List:  value=";
    const auto records = agentEnvironment::log();
    EXPECT_EQ(records[0].text, head + std::string(511 - head.size(), 'x'));
    EXPECT_EQ(records[1].text, records[0].text);
}

enum class Colour : int { green = 6 };

TEST_F(TraceLine, FormatsParameterListsAsLabelsAndValues) {
    traceLine(at(traceSource), MT_MESSAGE, label::property, Colour::green, label::value, std::string("a b"),
              label::instanceId, "text", label::filterTypeBare, 4294967295U);
    EXPECT_THAT(logMessages(), ElementsAre("MESSAGE [File: TraceLineTest.cpp, Line: N]: TestBody,Parameters List:  "
                                           "property=6 value=a b instanceId=textFilterType=4294967295"));
}

TEST_F(TraceLine, FormatsAPointerAsAnAddress) {
    const int target = 0;
    const void* const nothing = nullptr;
    traceLine(at(traceSource), MT_ENTERING, label::broker, &target, label::context, nothing);
    std::ostringstream address;
    address << &target;
    EXPECT_THAT(logMessages(),
                ElementsAre(entering("TestBody", "TraceLineTest.cpp", " _broker=" + address.str() + " _context=0")));
}

void leaveNormally() {
    const Traced traced(at(traceSource));
    traceMethod(at(traceSource));
}

TEST_F(TraceLine, IsWrittenAtEntryAndExitOfAFunction) {
    leaveNormally();
    EXPECT_THAT(logMessages(), ElementsAre(entering("leaveNormally", "TraceLineTest.cpp"),
                                           "METHOD: leaveNormally() was invoked in TraceLineTest.cpp [Line: N]",
                                           exiting("leaveNormally", "TraceLineTest.cpp")));
    EXPECT_EQ(logMessages("trace"), logMessages("log"));
}

void change(std::string& value) {
    const Traced traced(at(traceSource, Level::error), label::value, value);
    value = "after";
}

TEST_F(TraceLine, HasTheCurrentParametersAtTheExit) {
    std::string value = "before";
    change(value);
    EXPECT_THAT(logMessages(), ElementsAre(entering("change", "TraceLineTest.cpp", " value=before"),
                                           exiting("change", "TraceLineTest.cpp", " value=after")));
    EXPECT_EQ(agentEnvironment::log().back().level, 3000);
}

void nameAsGiven() {
    const Traced traced(at(traceSource, Level::flow, "~Name"), label::value, std::string("kept until the exit"));
}

TEST_F(TraceLine, HasTemporaryParametersAtTheExit) {
    nameAsGiven();
    EXPECT_THAT(logMessages(), ElementsAre(entering("~Name", "TraceLineTest.cpp", " value=kept until the exit"),
                                           exiting("~Name", "TraceLineTest.cpp", " value=kept until the exit")));
}

void leaveByException() {
    const Traced traced(at(traceSource));
    fail<FrameworkException>(at(traceSource), "It failed.");
}

TEST_F(TraceLine, IsNotWrittenAtTheExitByAnException) {
    EXPECT_EQ(thrown<FrameworkException>(leaveByException), "It failed.");
    EXPECT_THAT(logMessages(), ElementsAre(entering("leaveByException", "TraceLineTest.cpp"),
                                           message("It failed.", "TraceLineTest.cpp")));
}

void swallow() {
    const Traced traced(at(traceSource));
    try {
        throw ProviderException("swallowed");
    } catch (const ProviderException&) {
        return;
    }
}

TEST_F(TraceLine, IsWrittenAtTheExitAfterACaughtException) {
    swallow();
    EXPECT_THAT(logMessages(),
                ElementsAre(entering("swallow", "TraceLineTest.cpp"), exiting("swallow", "TraceLineTest.cpp")));
}

struct TracedAtDestruction {
    ~TracedAtDestruction() { leaveNormally(); }
};

TEST_F(TraceLine, IsWrittenAtTheExitDuringUnwinding) {
    try {
        const TracedAtDestruction leaving;
        throw ProviderException("on its way");
    } catch (const ProviderException&) {
    }
    EXPECT_THAT(logMessages(), testing::Contains(exiting("leaveNormally", "TraceLineTest.cpp")));
}

TEST_F(TraceLine, IsWrittenAtErrorLevelBeforeAFailureIsThrown) {
    EXPECT_EQ(thrown<InstrumentationException>(
                  [] { fail<InstrumentationException>(at(traceSource, Level::flow, "find"), "Not there"); }),
              "Not there");
    const auto records = recordsOf("TraceLineTest.cpp", "find");
    ASSERT_EQ(records.size(), 1U);
    EXPECT_EQ(records[0].level, 3000);
    EXPECT_EQ(withoutLine(records[0].text), message("Not there", "TraceLineTest.cpp"));
}

struct Marker {
    const char* channel;
    const char* function;
    int line;
    std::string text;
};

void expectMarkers(const std::vector<Marker>& expected) {
    const auto records = agentEnvironment::log();
    ASSERT_EQ(records.size(), expected.size());
    for (std::size_t index = 0; index < expected.size(); ++index) {
        SCOPED_TRACE(index);
        EXPECT_EQ(records[index].channel, expected[index].channel);
        EXPECT_EQ(records[index].level, 4000);
        EXPECT_EQ(records[index].logger, "Test.Logger");
        EXPECT_EQ(records[index].function, expected[index].function);
        EXPECT_EQ(records[index].file, "sdk/kolib/include/Trace.h");
        EXPECT_EQ(records[index].line, expected[index].line);
        EXPECT_EQ(records[index].text, expected[index].text);
    }
}

TEST_F(TraceLine, StartsARequestWithASeparatorAndTheEnteringLine) {
    markProviderEntry(loggerOfTest, "LeaseAndWarranty_GetInstance", "Entry.cpp", 41);
    const std::string line = "ENTERING: LeaseAndWarranty_GetInstance() in Entry.cpp [Line: 41]";
    expectMarkers({{"log", "markProviderEntry", 336, rule},
                   {"trace", "markProviderEntry", 336, rule},
                   {"log", "markProviderEntry", 337, line},
                   {"trace", "markProviderEntry", 337, line}});
}

TEST_F(TraceLine, EndsARequestWithTheExitingLineAndASeparator) {
    markProviderExit(loggerOfTest, "LeaseAndWarranty_GetInstance", "Entry.cpp", 41);
    const std::string line = "EXITING: LeaseAndWarranty_GetInstance() in Entry.cpp [Line: 41]";
    expectMarkers({{"log", "markProviderExit", 348, line},
                   {"trace", "markProviderExit", 348, line},
                   {"log", "markProviderExit", 349, rule},
                   {"trace", "markProviderExit", 349, rule}});
}

template <class Exception>
class ThrownMessage : public testing::Test {};

using ExceptionClasses = testing::Types<InstrumentationException, FrameworkException, ProviderException>;

struct ExceptionNames {
    template <class Exception>
    static std::string GetName(int number) {
        return std::array{"Instrumentation", "Framework", "Provider"}.at(static_cast<std::size_t>(number));
    }
};

TYPED_TEST_SUITE(ThrownMessage, ExceptionClasses, ExceptionNames);

TYPED_TEST(ThrownMessage, IsReturnedByTheExceptionAndItsCopies) {
    std::string text = "Lease record not available";
    const TypeParam original(text.c_str());
    text = "something else";
    const TypeParam copy(original);
    EXPECT_STREQ(original.what(), "Lease record not available");
    EXPECT_STREQ(copy.what(), "Lease record not available");
    EXPECT_EQ(thrown<std::exception>([&] { throw TypeParam(copy); }), "Lease record not available");
    static_assert(std::is_base_of_v<std::exception, TypeParam>);
}

}  // namespace
