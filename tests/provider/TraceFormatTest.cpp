#include <gtest/gtest.h>

#include <algorithm>
#include <ostream>
#include <string>
#include <utility>

#include "OtherTraceUnit.h"
#include "TraceFormat.h"

namespace {

using KO::MessageType;
using KO::trace;
using KO::tracepara;

struct KindRow {
    int kind;
    const char* plain;
    const char* withList;
};

/** Prints the kind. By default, GoogleTest prints all bytes, including uninitialized padding. */
void PrintTo(const KindRow& row, std::ostream* stream) {
    *stream << row.kind;
}

class TraceKind : public testing::TestWithParam<KindRow> {};

TEST_P(TraceKind, HasItsFormat) {
    const auto kind = static_cast<MessageType>(GetParam().kind);
    EXPECT_STREQ(trace("createLease", "LeaseBase.cpp", 240, kind), GetParam().plain);
}

TEST_P(TraceKind, HasItsFormatWithTheParameterListLast) {
    const auto kind = static_cast<MessageType>(GetParam().kind);
    EXPECT_STREQ(tracepara("createLease", "LeaseBase.cpp", 240, " instanceId=A", kind), GetParam().withList);
}

const KindRow enteringRow{0, "ENTERING: createLease() in LeaseBase.cpp [Line: 240]",
                          "ENTERING: createLease() in LeaseBase.cpp [Line: 240],Parameters List:  instanceId=A"};

KindRow countingAsEntering(int kind) {
    return {kind, enteringRow.plain, enteringRow.withList};
}

INSTANTIATE_TEST_SUITE_P(
    Listed, TraceKind,
    testing::Values(enteringRow,
                    KindRow{1, "EXITING: createLease() in LeaseBase.cpp [Line: 240]",
                            "EXITING: createLease() in LeaseBase.cpp [Line: 240],Parameters List:  instanceId=A"},
                    KindRow{2, "METHOD: createLease() was invoked in LeaseBase.cpp [Line: 240]",
                            "METHOD: createLease() was invoked in LeaseBase.cpp [Line: 240],Parameters List:  "
                            "instanceId=A"},
                    KindRow{3, "MESSAGE [File: LeaseBase.cpp, Line: 240]: createLease",
                            "MESSAGE [File: LeaseBase.cpp, Line: 240]: createLease,Parameters List:  instanceId=A"}));

INSTANTIATE_TEST_SUITE_P(UnlistedIsEntering, TraceKind,
                         testing::Values(countingAsEntering(7), countingAsEntering(4), countingAsEntering(-1)));

TEST(TraceFormat, StartsAMessageWithTheFileAndEndsWithTheString) {
    EXPECT_STREQ(trace("Lease record not available", "LeaseAndWarrantyProvider.cpp", 240, KO::MT_MESSAGE),
                 "MESSAGE [File: LeaseAndWarrantyProvider.cpp, Line: 240]: Lease record not available");
}

TEST(TraceFormat, FormatsAStringVariable) {
    EXPECT_STREQ(trace("Name", "LeaseSetting.cpp", 61, "testhost"),
                 "VARIABLE: 'Name' has Value 'testhost' at line 61 in LeaseSetting.cpp");
}

TEST(TraceFormat, FormatsANumberVariable) {
    EXPECT_STREQ(trace("classId", "LeaseAndWarrantyProvider.cpp", 7, 209U),
                 "VARIABLE: 'classId' has Value '209' at line 7 in LeaseAndWarrantyProvider.cpp");
}

TEST(TraceFormat, FormatsNumbersAsSigned) {
    EXPECT_STREQ(trace("count", "A.cpp", 4294967295U, 4294967294U),
                 "VARIABLE: 'count' has Value '-2' at line -1 in A.cpp");
}

TEST(TraceFormat, KeepsBytesOfAnyEncoding) {
    EXPECT_STREQ(trace("name", "A.cpp", 1, "M\xC3\xBCller \xFF\x01"),
                 "VARIABLE: 'name' has Value 'M\xC3\xBCller \xFF\x01' at line 1 in A.cpp");
}

TEST(TraceFormat, CopiesPercentSignsLiterally) {
    EXPECT_STREQ(tracepara("f", "A.cpp", 1, " value=%s%n", KO::MT_ENTERING),
                 "ENTERING: f() in A.cpp [Line: 1],Parameters List:  value=%s%n");
}

/** Returns a nonrepeating string, so that a shift is detected. */
std::string longString(std::size_t length) {
    std::string text;
    while (text.size() < length) {
        text += std::to_string(text.size()) + "\xC3\xA9,";
    }
    return text.substr(0, length);
}

TEST(TraceFormat, TruncatesStringsAt511Characters) {
    const std::string text = longString(2000);
    const std::pair<std::string, const char*> cases[] = {
        {"ENTERING: " + text, trace(text.c_str(), "A.cpp", 1, KO::MT_ENTERING)},
        {"ENTERING: f() in A.cpp [Line: 1],Parameters List: " + text,
         tracepara("f", "A.cpp", 1, text.c_str(), KO::MT_ENTERING)},
        {"VARIABLE: 'v' has Value '" + text, trace("v", "A.cpp", 1, text.c_str())},
        {"VARIABLE: '" + text, trace(text.c_str(), "A.cpp", 1, 5U)},
    };
    for (const auto& [whole, shown] : cases) {
        EXPECT_EQ(shown, whole.substr(0, 511));
    }
}

TEST(TraceFormat, KeepsStringsOf511Characters) {
    const std::string head = "MESSAGE [File: A.cpp, Line: 1]: ";
    const std::string text = longString(511 - head.size());
    EXPECT_EQ(trace(text.c_str(), "A.cpp", 1, KO::MT_MESSAGE), head + text);
    EXPECT_EQ(trace((text + "x").c_str(), "A.cpp", 1, KO::MT_MESSAGE), head + text);
}

TEST(TraceFormat, WritesEachFunctionsResultToItsOwnBuffer) {
    const char* const list = tracepara("f", "A.cpp", 1, "list", KO::MT_EXITING);
    const char* const text = trace("v", "A.cpp", 1, "text");
    const char* const number = trace("v", "A.cpp", 1, 5U);
    trace(longString(5000).c_str(), "A.cpp", 1, KO::MT_MESSAGE);
    EXPECT_STREQ(list, "EXITING: f() in A.cpp [Line: 1],Parameters List: list");
    EXPECT_STREQ(text, "VARIABLE: 'v' has Value 'text' at line 1 in A.cpp");
    EXPECT_STREQ(number, "VARIABLE: 'v' has Value '5' at line 1 in A.cpp");
}

TEST(TraceFormat, ClearsTheBufferBeforeEachString) {
    trace(longString(600).c_str(), "A.cpp", 1, KO::MT_MESSAGE);
    const char* const buffer = trace("f", "A.cpp", 1, KO::MT_METHOD);
    const char* const end = buffer + std::string(buffer).size();
    EXPECT_TRUE(std::all_of(end, buffer + 512, [](char byte) { return byte == '\0'; }));
}

TEST(TraceFormat, UsesOneBufferPerFunction) {
    const char* const first = trace("f", "A.cpp", 1, KO::MT_ENTERING);
    EXPECT_EQ(first, trace("g", "B.cpp", 2, KO::MT_MESSAGE));
    EXPECT_NE(first, tracepara("f", "A.cpp", 1, "", KO::MT_ENTERING));
    EXPECT_NE(trace("v", "A.cpp", 1, "text"), trace("v", "A.cpp", 1, 5U));
}

TEST(TraceFormat, UsesSeparateBuffersPerTranslationUnit) {
    const char* const own = trace("own", "A.cpp", 1, KO::MT_ENTERING);
    const char* const others = traceOfOtherUnit("theirs");
    EXPECT_STREQ(own, "ENTERING: own() in A.cpp [Line: 1]");
    EXPECT_STREQ(others, "ENTERING: theirs() in Other.cpp [Line: 1]");
}

}  // namespace
