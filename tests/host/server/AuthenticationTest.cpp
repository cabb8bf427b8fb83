#include <gmock/gmock.h>
#include <grp.h>
#include <gtest/gtest.h>
#include <pwd.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "server/Authentication.h"
#include "server/UserDatabase.h"
#include "support/TemporaryDirectory.h"

using namespace cimhost::server;

namespace {

TEST(CredentialsTest, AreDecodedFromTheBasicScheme) {
    const auto found = credentialsFrom("Basic dXNlcjpwYTpzcw==");  // user:pa:ss
    ASSERT_TRUE(found);
    EXPECT_EQ(found->user, "user");
    EXPECT_EQ(found->password, "pa:ss");
    EXPECT_TRUE(credentialsFrom("basic  dTo="));  // u:
}

TEST(CredentialsTest, OtherValuesAreRefused) {
    for (const char* value : {"", "Basic", "Basic ", "Bearer dXNlcjpwYTpzcw==", "Basic dXNlcg==", "Basic OnBhc3M=",
                              "Basic dXNlcjpwYTpzcw=", "Basic dXNl*jpwYTpzcw==", "Basic ====", "Basic dTpwAHg="}) {
        EXPECT_FALSE(credentialsFrom(value)) << value;
    }
}

/** A PAM service that runs a program, which accepts one user with one password from one client. */
class PamTest : public testing::Test {
protected:
    PamTest() {
        const std::string program = directory.withSlash() + "check";
        std::ofstream(program) << "#!/bin/sh\nread -r password\n"
                                  "[ \"$PAM_USER\" = alice ] && [ \"$password\" = \"right one\" ] && "
                                  "[ \"$PAM_RHOST\" = 192.0.2.7 ]\n";
        std::filesystem::permissions(program, std::filesystem::perms::owner_all);
        std::ofstream(directory.withSlash() + "test-service")
            << "auth required pam_exec.so expose_authtok quiet " << program << "\naccount required pam_permit.so\n";
        std::ofstream(directory.withSlash() + "no-account")
            << "auth required pam_permit.so\naccount required pam_deny.so\n";
    }

    testsupport::TemporaryDirectory directory;
    const std::string client = "192.0.2.7";
};

TEST_F(PamTest, TheServiceDecides) {
    PamAuthenticator authenticator("test-service", directory.path());
    EXPECT_TRUE(authenticator.accepts({"alice", "right one"}, client));
    EXPECT_FALSE(authenticator.accepts({"alice", "wrong"}, client));
    EXPECT_FALSE(authenticator.accepts({"bob", "right one"}, client));
    EXPECT_FALSE(authenticator.accepts({"alice", ""}, client));
    EXPECT_FALSE(authenticator.accepts({"alice", "right one"}, "192.0.2.8"));
}

TEST_F(PamTest, AccountsMustBeValid) {
    EXPECT_FALSE(PamAuthenticator("no-account", directory.path()).accepts({"alice", "right one"}, client));
}

TEST(AccessRulesTest, UsersAndGroupsHaveRights) {
    EXPECT_EQ(rightOf("root", AccessRules{}), Right::write);
    EXPECT_EQ(rightOf("alice", AccessRules{}), Right::none);
    const AccessRules rules{{"alice", "bob"}, {"bob"}};
    EXPECT_EQ(rightOf("alice", rules), Right::read);
    EXPECT_EQ(rightOf("bob", rules), Right::write);
    EXPECT_EQ(rightOf("root", rules), Right::none);
}

TEST(AccessRulesTest, MembersOfAGroupHaveItsRight) {
    const passwd* user = ::getpwuid(::getuid());
    ASSERT_NE(user, nullptr);
    const group* ownGroup = ::getgrgid(user->pw_gid);
    ASSERT_NE(ownGroup, nullptr);
    const AccessRules rules{{std::string("@") + ownGroup->gr_name}, {"@no-such-group"}};
    EXPECT_EQ(rightOf(user->pw_name, rules), Right::read);
    EXPECT_EQ(rightOf("no-such-user", rules), Right::none);
    EXPECT_EQ(rightOf(std::string("@") + ownGroup->gr_name, {}), Right::none);
}

TEST(UserDatabaseTest, EntriesOfAnySizeAreRead) {
    for (const std::size_t needed : {std::size_t{1}, std::size_t{1} << 20U}) {
        std::vector<char> buffer;
        EXPECT_TRUE(readEntry(buffer, [&](char* data, std::size_t size) {
            if (size < needed) {
                return ERANGE;
            }
            data[needed - 1] = 'x';
            return 0;
        })) << needed;
    }
    std::vector<char> buffer;
    EXPECT_FALSE(readEntry(buffer, [](char*, std::size_t) { return ERANGE; }));
    EXPECT_FALSE(readEntry(buffer, [](char*, std::size_t) { return EIO; }));
}

}  // namespace
