#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <functional>
#include <stdexcept>
#include <thread>

#include "GateFixture.h"
#include "SimulatedTime.h"
#include "durable/DirectoryLock.h"
#include "support/Files.h"

// Two processes with the gate on one data directory: one owns it and makes changes, the other reads.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/** Another process, which runs a task on request. */
class OtherProcess {
public:
    explicit OtherProcess(std::vector<std::function<bool()>> tasks) {
        if (pipe(toOther) != 0 || pipe(fromOther) != 0) {
            throw std::runtime_error("no pipe");
        }
        process = fork();
        if (process == 0) {
            close(toOther[1]);
            for (char task = 0; read(toOther[0], &task, 1) == 1;) {
                const char isRight = tasks.at(static_cast<std::size_t>(task))() ? 1 : 0;
                if (write(fromOther[1], &isRight, 1) != 1) {
                    break;
                }
            }
            _exit(0);
        }
    }

    ~OtherProcess() { end(); }
    OtherProcess(const OtherProcess&) = delete;
    OtherProcess& operator=(const OtherProcess&) = delete;

    /** Runs a task and returns its result. */
    bool does(int number) {
        const char task = static_cast<char>(number);
        char isRight = 0;
        return write(toOther[1], &task, 1) == 1 && read(fromOther[0], &isRight, 1) == 1 && isRight == 1;
    }

    pid_t id() const { return process; }

    void end() {
        if (process != 0) {
            for (const int each : {toOther[0], toOther[1], fromOther[0], fromOther[1]}) {
                close(each);
            }
            waitpid(process, nullptr, 0);
            process = 0;
        }
    }

private:
    int toOther[2]{};
    int fromOther[2]{};
    pid_t process = 0;
};

using TwoProcessesTest = GateTest;

TEST_F(TwoProcessesTest, AReaderReadsTheRecordsThatTheOwnerStores) {
    OtherProcess owner({[&] { return create("L1", {named("LeaseTerm", uint32(1))}).rc == CMPI_RC_OK; },
                        [&] { return modify("L1", {named("LeaseTerm", uint32(2))}).rc == CMPI_RC_OK; }});
    ASSERT_TRUE(owner.does(0));
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "1");
    ASSERT_TRUE(owner.does(1));
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "2");
}

TEST_F(TwoProcessesTest, AReaderIsRefusedUntilTheOwnerHasWrittenTheFile) {
    OtherProcess owner({[&] { return create("L1").rc == CMPI_RC_OK; }});
    ASSERT_TRUE(owner.does(0));
    const std::string complete = testsupport::readFile(dataFile("Lease.dat"));
    testsupport::writeFile(dataFile("Lease.dat"), complete.substr(0, complete.size() / 2));
    for (int time = 0; time < 2; ++time) {
        const SimulatedTime waiting;
        EXPECT_THAT(gate().enumerateInstanceNames(classPath(lease)),
                    isRefused(CMPI_RC_ERR_FAILED, "another process is writing them"));
    }
    testsupport::writeFile(dataFile("Lease.dat"), complete);
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    testsupport::writeFile(dataFile("Lease.dat"), complete.substr(0, complete.size() / 2));
    EXPECT_THAT(identifiers(), ElementsAre("L1")) << "the records that were read before";
}

TEST_F(TwoProcessesTest, AReaderReturnsTheRecordsReadBeforeWhileTheOwnerWritesContinuously) {
    OtherProcess owner({[&] { return create("L1").rc == CMPI_RC_OK; }, [&] { return create("L2").rc == CMPI_RC_OK; }});
    ASSERT_TRUE(owner.does(0));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    ASSERT_TRUE(owner.does(1));
    std::atomic<bool> isWriting{true};
    const auto touch = [&] {
        constexpr auto ahead = std::chrono::milliseconds(500);
        std::filesystem::last_write_time(dataFile("Lease.dat"), std::filesystem::file_time_type::clock::now() + ahead);
    };
    touch();
    std::thread writer([&] {
        while (isWriting) {
            touch();
        }
    });
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    isWriting = false;
    writer.join();
    std::filesystem::last_write_time(dataFile("Lease.dat"),
                                     std::filesystem::file_time_type::clock::now() - std::chrono::minutes(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
}

TEST_F(TwoProcessesTest, AReaderRestoresTheRecordsOfAnOwnerThatEndedDuringAChange) {
    OtherProcess owner({[&] { return create("L1").rc == CMPI_RC_OK; }, [&] { return create("L2").rc == CMPI_RC_OK; }});
    ASSERT_TRUE(owner.does(0));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    ASSERT_TRUE(owner.does(1));
    const std::string complete = testsupport::readFile(dataFile("Lease.dat"));
    testsupport::writeFile(dataFile("Lease.dat"), complete.substr(0, complete.size() / 2));
    owner.end();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
    EXPECT_EQ(testsupport::readFile(dataFile("Lease.dat")), complete);
}

TEST_F(TwoProcessesTest, AForkedChildOfTheOwnerReadsTheRecordsThatTheOwnerStores) {
    create("L1");
    OtherProcess child({[&] {
                            return identifiers() == std::vector<std::string>{"L1", "L2"};
                        },
                        [&] {
                            const SimulatedTime waiting;
                            return create("L3").message.find("is in use by process") != std::string::npos;
                        }});
    create("L2");
    EXPECT_TRUE(child.does(0));
    EXPECT_TRUE(child.does(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
}

TEST_F(TwoProcessesTest, AChangeIsRefusedWithTheNameOfTheOwnerUntilTheOwnerEnds) {
    OtherProcess owner({[&] { return create("L1").rc == CMPI_RC_OK; }, [&] { return create("L2").rc == CMPI_RC_OK; }});
    ASSERT_TRUE(owner.does(0));
    const Outcome refused = [&] {
        const SimulatedTime waiting;
        return create("L3");
    }();
    EXPECT_THAT(refused, isRefused(CMPI_RC_ERR_FAILED, "process " + std::to_string(owner.id()) + " (gate_test)"));
    EXPECT_THAT(refused.message, HasSubstr(agentEnvironment::dataDirectory().string()));
    ASSERT_TRUE(owner.does(1));
    owner.end();
    EXPECT_THAT(create("L4"), isAnswered(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L4"));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L4"));
}

TEST_F(TwoProcessesTest, AnOwnerThatLosesTheLockReadsTheFilesAgain) {
    OtherProcess other({[&] { return create("L2").rc == CMPI_RC_OK; }});
    create("L1");
    std::filesystem::remove(dataFile("owner"));
    ASSERT_TRUE(other.does(0));
    {
        const SimulatedTime waiting;
        EXPECT_THAT(create("L3"), isRefused(CMPI_RC_ERR_FAILED, "is in use by process"));
    }
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
    other.end();
    EXPECT_THAT(create("L3"), isAnswered(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
}

TEST_F(TwoProcessesTest, AnOwnerThatRegainsALostLockReadsTheFilesAgain) {
    OtherProcess other({[&] { return create("L2").rc == CMPI_RC_OK; }});
    create("L1");
    std::filesystem::remove(dataFile("owner"));
    ASSERT_TRUE(other.does(0));
    other.end();
    EXPECT_THAT(create("L3"), isAnswered(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
}

TEST_F(TwoProcessesTest, AnOwnerThatRegainsALostLockReadsTheSavedCopies) {
    OtherProcess other({[&] { return create("L2").rc == CMPI_RC_OK; }});
    create("L1");
    std::filesystem::remove(dataFile("owner"));
    ASSERT_TRUE(other.does(0));
    other.end();
    std::filesystem::remove(dataFile("Lease.dat"));
    EXPECT_THAT(create("L3"), isAnswered(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2", "L3"));
}

TEST_F(TwoProcessesTest, TheLockFileOfAnEarlierOwnerLocksNothing) {
    create("L1");
    unload();
    EXPECT_THAT(testsupport::readFile(dataFile("owner")), HasSubstr("gate_test"));
    OtherProcess other({[&] { return create("L2").rc == CMPI_RC_OK; }});
    EXPECT_TRUE(other.does(0));
}

TEST_F(TwoProcessesTest, AForkedChildDoesNotKeepTheLock) {
    create("L1");
    OtherProcess child({[&] { return true; }});  // has inherited all open files of this process
    unload();
    OtherProcess other({[&] { return create("L2").rc == CMPI_RC_OK; }});
    EXPECT_TRUE(other.does(0));
    EXPECT_TRUE(child.does(0)) << "the child is still running";
}

}  // namespace
}  // namespace gatetest
