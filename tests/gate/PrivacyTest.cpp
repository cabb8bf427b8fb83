#include "GateFixture.h"

// What a client is told when its request is refused is about its request, and nobody else's.

namespace gatetest {
namespace {

using testing::HasSubstr;
using testing::Not;

class PrivacyTest : public GateTest {
protected:
    /** Requests that are refused, all with a client's own texts. */
    std::vector<Outcome> refusalsOf(const std::string& client) {
        const std::string mine = client + "-lease";
        return {
            create(mine, {named("Lessor", text(client + "_of_the_file"))}),
            create("shared", {named("Lessor", text(client + " the second"))}),
            modify(mine, {named("Lessor", text(client + " Leasing"))}),
            modify("shared", {named("BaseRent", text(client + "\tmoney"))}),
            modify("shared", {named("LeaseTerm", text(client))}),
            modify("shared", {named("ElementName", text(client))}),
            remove(mine),
            gate().getInstance(keyedPath(warranty, client)),
            create("", {named("Lessor", text(client))}),
        };
    }
};

TEST_F(PrivacyTest, ARefusalTellsNothingOfAnotherClientsRequests) {
    ASSERT_THAT(create("shared"), isAnswered(1));
    for (const auto& [first, second] : {std::pair{"alice", "bob"}, {"a-client-with-a-longer-name", "carol"}}) {
        refusalsOf(first);
        for (const Outcome& refusal : refusalsOf(second)) {
            EXPECT_NE(refusal.rc, CMPI_RC_OK) << refusal.message;
            EXPECT_TRUE(refusal.hasMessage);
            EXPECT_THAT(refusal.message, Not(HasSubstr(first)));
            EXPECT_THAT(refusal.message, Not(HasSubstr(std::string(first).substr(1))));
        }
    }
}

}  // namespace
}  // namespace gatetest
