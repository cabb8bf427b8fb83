#include "GateFixture.h"
#include "broker/RequestScope.h"
#include "support/Command.h"
#include "support/TemporaryDirectory.h"
#include "support/UnderTest.h"

// The built library file, its factories, loading and unloading.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testsupport::runCommand;

std::string gateFile() {
    return testsupport::underTest(GATE_LIBRARY);
}

using LibraryTest = GateTest;

TEST_F(LibraryTest, ExportsExactlyTheTwoFactories) {
    EXPECT_EQ(
        runCommand("nm --dynamic --defined-only --format=posix " + gateFile() + " | cut -d' ' -f1,2 | sort").output,
        "LeaseAndWarrantyGate_Create_AssociationMI T\nLeaseAndWarrantyGate_Create_InstanceMI T\n");
}

TEST_F(LibraryTest, LoadsTheProviderAtTheFirstFactoryCall) {
    EXPECT_THAT(runCommand("readelf --dynamic " + gateFile()).output,
                Not(HasSubstr("[libLeaseAndWarrantyProvider.so]")))
        << "a linked provider would be loaded before its files are recovered";
    EXPECT_FALSE(isLoaded(testsupport::underTest(PROVIDER_LIBRARY)));
    gate().instanceMI();
    EXPECT_TRUE(isLoaded(testsupport::underTest(PROVIDER_LIBRARY)));
}

TEST_F(LibraryTest, ReportsAMissingProvider) {
    namespace fs = std::filesystem;
    const testsupport::TemporaryDirectory others;
    const fs::path built = gateFile();
    fs::create_directory(others.path() / "cmpi");
    // In an installation, the libraries that the gate is linked with are in the parent directory.
    for (const fs::path& source : {built.parent_path(), built.parent_path().parent_path()}) {
        for (const auto& each : fs::directory_iterator(source)) {
            const std::string name = each.path().filename();
            if (name.find(".so") != std::string::npos && name.find("LeaseAndWarrantyProvider") == std::string::npos) {
                fs::copy(each.path(), others.path() / "cmpi" / name, fs::copy_options::skip_existing);
                fs::copy(each.path(), others.path() / name, fs::copy_options::skip_existing);
            }
        }
    }
    testsupport::ProviderLibrary alone(others.path() / "cmpi" / built.filename(), "LeaseAndWarrantyGate", broker);
    CMPIStatus status{CMPI_RC_OK, nullptr};
    EXPECT_EQ(alone.createInstanceMI(broker.handle(), &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_THAT(cimhost::statusFrom(status).message, HasSubstr("libLeaseAndWarrantyProvider.so"));
}

TEST_F(LibraryTest, HasNoUndefinedSymbol) {
    const std::string relocations = runCommand("LD_PRELOAD= ldd -r " + gateFile()).output;
    EXPECT_THAT(relocations, HasSubstr("libkoframework.so"));
    // In a build with sanitizers, the test program defines their functions.
    if (runCommand("nm --dynamic " + gateFile()).output.find("san_init") == std::string::npos) {
        EXPECT_THAT(relocations, Not(HasSubstr("undefined symbol")));
    }
    EXPECT_THAT(relocations, Not(HasSubstr("not found")));
}

TEST_F(LibraryTest, AFactoryCallWithoutBrokerFailsWithAMessage) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    EXPECT_EQ(gate().createInstanceMI(nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(cimhost::statusFrom(status).message, HasSubstr("without a broker"));
    status = {CMPI_RC_OK, nullptr};
    EXPECT_EQ(gate().createAssociationMI(nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_THAT(cimhost::statusFrom(status).message, HasSubstr("without a broker"));
    EXPECT_EQ(gate().createInstanceMI(nullptr, nullptr), nullptr);
    EXPECT_THAT(create("L1"), isAnswered(1)) << "after a valid factory call";
}

TEST_F(LibraryTest, FactoriesCanBeCalledRepeatedly) {
    CMPIStatus status{CMPI_RC_ERR_FAILED, nullptr};
    CMPIInstanceMI* first = gate().createInstanceMI(broker.handle(), &status);
    EXPECT_NE(first, nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(gate().createInstanceMI(broker.handle(), nullptr), first);
    EXPECT_NE(gate().createAssociationMI(broker.handle(), &status), nullptr);
    EXPECT_EQ(first->ft->ftVersion, CMPIVersion200);
    EXPECT_EQ(first->ft->miVersion, CMPIVersion200);
}

TEST_F(LibraryTest, UsesTheBrokerOfTheLatestFactoryCall) {
    gate().createInstanceMI(broker.handle(), nullptr);
    create("L1");
    testsupport::RecordingBroker other;
    gate().createInstanceMI(other.handle(), nullptr);
    other.forget();
    broker.forget();
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_GT(other.count("CMPIBrokerEncFT.newObjectPath"), 0);
    EXPECT_EQ(broker.count("CMPIBrokerEncFT.newObjectPath"), 0);
    unload();  // before the other broker is destroyed
}

TEST_F(LibraryTest, RefusesToUnloadWhileIdle) {
    create("L1");
    EXPECT_THAT(gate().cleanupInstanceMI(false), isRefused(CMPI_RC_DO_NOT_UNLOAD, "memory"));
    EXPECT_THAT(gate().cleanupAssociationMI(false), isRefused(CMPI_RC_DO_NOT_UNLOAD, "memory"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(LibraryTest, CanBeLoadedAndUnloadedRepeatedly) {
    for (int round = 0; round < 3; ++round) {
        EXPECT_THAT(identifiers(), testing::SizeIs(round));
        create("L" + std::to_string(round));
        unload();
    }
}

TEST_F(LibraryTest, DoesNotCallTheBrokerBeforeTheFirstRequest) {
    EXPECT_NE(gate().instanceMI(), nullptr);
    EXPECT_NE(gate().associationMI(), nullptr);
    EXPECT_THAT(broker.calls(), IsEmpty());
}

}  // namespace
}  // namespace gatetest
