// Tracing with a logging library that provides RZLogger::admits.

#include <gmock/gmock.h>

#include <stdexcept>

#include "LogDouble.h"
#include "Trace.h"

namespace {

using namespace KO;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string loggerOfTest("Test.Logger");
const TraceSource traceSource{loggerOfTest, "Unit.cpp"};

/** A value that counts how often it is formatted. */
struct FormattedValue {
    int& times;
};

std::ostream& operator<<(std::ostream& stream, const FormattedValue& shown) {
    ++shown.times;
    return stream << "value";
}

class TraceQuery : public testing::Test {
protected:
    void SetUp() override {
        logDouble::records.clear();
        logDouble::buffersCreated = 0;
    }

    void traceEverything() {
        const CallSite site{&traceSource, Level::flow, "work", 7};
        const Traced traced(site, label::value, FormattedValue{timesFormatted});
        traceMethod(site);
        traceVariable(site, "name", std::string("text"));
        traceVariable(site, "number", 5U);
        markProviderEntry(loggerOfTest, "work", "Unit.cpp", 1);
        markProviderExit(loggerOfTest, "work", "Unit.cpp", 2);
    }

    int timesFormatted = 0;
};

TEST_F(TraceQuery, DoesNotFormatLinesThatAreNotAdmitted) {
    logDouble::admittedLevel = Level::flow - 1;
    traceEverything();
    EXPECT_THAT(logDouble::records, IsEmpty());
    EXPECT_EQ(timesFormatted, 0);
    EXPECT_EQ(logDouble::buffersCreated, 0);
}

TEST_F(TraceQuery, WritesEveryAdmittedLine) {
    logDouble::admittedLevel = Level::flow;
    traceEverything();
    EXPECT_EQ(logDouble::records.size(), 18U);
    EXPECT_EQ(timesFormatted, 2);
}

TEST_F(TraceQuery, QueriesTheLevelOfEachLine) {
    logDouble::admittedLevel = Level::error;
    const CallSite site{&traceSource, Level::flow, "work", 7};
    EXPECT_THROW(fail<std::runtime_error>(site, "It failed."), std::runtime_error);
    EXPECT_THAT(logDouble::records, ElementsAre("log MESSAGE [File: Unit.cpp, Line: 7]: It failed.",
                                                "trace MESSAGE [File: Unit.cpp, Line: 7]: It failed."));
}

TEST_F(TraceQuery, WritesNoExitWithoutAnEntry) {
    logDouble::admittedLevel = Level::error;
    {
        const Traced traced(CallSite{&traceSource, Level::flow, "work", 7});
        logDouble::admittedLevel = Level::flow;
    }
    EXPECT_THAT(logDouble::records, IsEmpty());
}

}  // namespace
