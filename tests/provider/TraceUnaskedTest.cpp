// Tracing with a logging library that does not provide RZLogger::admits.

#include <gmock/gmock.h>

#include "LogDouble.h"
#include "Trace.h"

namespace {

using namespace KO;
using testing::ElementsAre;

const std::string loggerOfTest("Test.Logger");
const TraceSource traceSource{loggerOfTest, "Unit.cpp"};

TEST(TraceUnasked, WritesLinesOfEveryLevel) {
    { const Traced traced(CallSite{&traceSource, 10000, "work", 7}, label::value, 5); }
    EXPECT_THAT(logDouble::records,
                ElementsAre("log ENTERING: work() in Unit.cpp [Line: 7],Parameters List:  value=5",
                            "trace ENTERING: work() in Unit.cpp [Line: 7],Parameters List:  value=5",
                            "log EXITING: work() in Unit.cpp [Line: 7],Parameters List:  value=5",
                            "trace EXITING: work() in Unit.cpp [Line: 7],Parameters List:  value=5"));
}

}  // namespace
