#include "CimXmlFixture.h"

namespace cimhost::cimxml::test {
namespace {

using ResponseTextTest = CimXmlTest;

TEST_F(ResponseTextTest, ResultsAreWrittenOnDemand) {
    const Message message = readMessage(request("EnumerateInstances", className("ClassName", "Other")));
    std::size_t written = 0;
    OperationResult result;
    result.next = [&](std::string& xml) {
        xml += "<VALUE.NAMEDINSTANCE></VALUE.NAMEDINSTANCE>";
        return ++written <= 1000;
    };
    ResponseText text(message, std::move(result));
    std::string block;
    EXPECT_TRUE(text.append(block, 1000));
    EXPECT_LT(written, 30U);
    EXPECT_LT(block.size(), 1100U);
    std::size_t total = block.size();
    for (bool more = true; more; total += block.size()) {
        block.clear();
        more = text.append(block, 1000);
        EXPECT_LT(block.size(), 1200U);
    }
    EXPECT_EQ(written, 1001U);
    EXPECT_GT(total, 43'000U);
}

TEST_F(ResponseTextTest, TheRequestsIdentifierIsEscaped) {
    Message message = readMessage(request("EnumerateQualifiers", ""));
    message.id = "<\"1\">";
    ResponseText response(message, OperationResult{});
    std::string text;
    EXPECT_FALSE(response.append(text, 100'000));
    EXPECT_EQ(*parseXml(text).child("MESSAGE")->attribute("ID"), message.id);
}

}  // namespace
}  // namespace cimhost::cimxml::test
