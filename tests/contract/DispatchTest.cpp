#include <functional>

#include "ProviderFixture.h"

// Operations by class, and operations with a fixed status.

namespace contract {
namespace {

using testing::IsEmpty;

constexpr CMPIrc ok = CMPI_RC_OK;
constexpr CMPIrc invalidClass = CMPI_RC_ERR_INVALID_CLASS;
constexpr CMPIrc notSupported = CMPI_RC_ERR_NOT_SUPPORTED;

/** Expected status of an operation and number of calls to returnDone. */
struct Answer {
    CMPIrc rc;
    int doneCount;
};

constexpr Answer served{ok, 1};
constexpr Answer servedInSilence{ok, 0};
constexpr Answer refused{invalidClass, 0};
constexpr Answer unsupported{notSupported, 0};

/** A class and the expected response of each operation if the class has no records. */
struct DispatchRow {
    std::vector<const char*> names;  ///< spellings of the class name; null if the path has no class name
    Answer enumerateInstanceNames;
    Answer enumerateInstances;
    Answer getInstance;
    Answer createInstance;
    Answer modifyInstance;
    Answer deleteInstance;
    Answer associators;  ///< Associators and AssociatorNames with this association class
};

// clang-format off
const std::vector<DispatchRow> rows{
    {{"VELKO_Lease", "velko_lease", "VELKO_LEASE", "Velko_lEASE"},
     served, served, served, served, servedInSilence, servedInSilence, refused},
    {{"VELKO_Warranty", "velko_warranty", "VELKO_WARRANTY"},
     served, served, served, served, servedInSilence, servedInSilence, refused},
    {{"VELKO_LeaseSetting", "velko_leasesetting", "VELKO_LEASESETTING"},
     served, served, unsupported, refused, refused, refused, served},
    {{"VELKO_WarrantySetting", "velko_warrantysetting", "VELKO_WARRANTYSETTING"},
     served, served, unsupported, refused, refused, refused, served},
    {{"VELKO_OstrelAgent", "velko_ostrelagent", "VELKO_OSTRELAGENT"},
     served, served, served, refused, refused, refused, refused},
    {{"VELKO_AssetIDDetails", "velko_assetiddetails", "VELKO_ASSETIDDETAILS"},
     served, served, served, refused, servedInSilence, refused, refused},
    {{"VELKO_ComputerSystem", "velko_computersystem", "VELKO_Unknown", "CIM_ManagedElement", "VELKO_Leas", "VELKO_Lease ",
      "VELKO_LeaseX", "", nullptr},
     refused, refused, refused, refused, refused, refused, refused},
};
// clang-format on

std::string shownName(const char* name) {
    return name == nullptr ? "(null)" : "'" + std::string(name) + "'";
}

class DispatchTest : public ProviderTest {
protected:
    /** Serves one computer system, without which requests for association classes fail. */
    DispatchTest() {
        broker.serve("VELKO_ComputerSystem", {clientInstance(computerPath(), {})});
        provider();
    }

    void expect(const Answer& answer, const Outcome& outcome, const char* className, const char* operation) {
        EXPECT_EQ(outcome.rc, answer.rc) << operation << ' ' << shownName(className);
        EXPECT_EQ(outcome.doneCount, answer.doneCount) << operation << ' ' << shownName(className);
        EXPECT_FALSE(outcome.hasMessage) << operation << ' ' << shownName(className);
        EXPECT_FALSE(outcome.threw) << operation << ' ' << shownName(className);
        if (answer.doneCount == 0) {
            EXPECT_THAT(outcome.events, IsEmpty()) << operation << ' ' << shownName(className);
        }
        const int expected = answer.rc == ok ? answer.doneCount : 0;
        EXPECT_EQ(broker.count("CMPIResultFT.returnDone"), expected) << operation << ' ' << shownName(className);
        broker.forget();
    }

    /** Returns a path of the class; for null, a path without a class name. */
    ObjectPath pathOf(const char* className) {
        if (className == nullptr) {
            broker.answerNothingEver("CMPIObjectPathFT.getClassName");
        }
        return classPath(className == nullptr ? "VELKO_Lease" : className);
    }

    void expectInstanceAnswers(const DispatchRow& row, const char* className) {
        const ObjectPath path = pathOf(className);
        const Instance instance = clientInstance(path, {});
        expect(row.enumerateInstanceNames, provider().enumerateInstanceNames(path), className,
               "enumerateInstanceNames");
        expect(row.enumerateInstances, provider().enumerateInstances(path), className, "enumerateInstances");
        expect(row.getInstance, provider().getInstance(path), className, "getInstance");
        expect(row.createInstance, provider().createInstance(path, instance), className, "createInstance");
        expect(row.modifyInstance, provider().modifyInstance(path, instance), className, "modifyInstance");
        expect(row.deleteInstance, provider().deleteInstance(path), className, "deleteInstance");
        broker.cancelFailures();
    }

    void expectAssociationAnswers(const DispatchRow& row, const char* className) {
        const ObjectPath path = testsupport::objectPath(nameSpace, "VELKO_ComputerSystem");
        cimhost::AssociationFilter filter;
        if (className != nullptr) {
            filter.associationClass = className;
        }
        expect(row.associators, provider().associators(path, filter), className, "associators");
        expect(row.associators, provider().associatorNames(path, filter), className, "associatorNames");
    }
};

TEST_F(DispatchTest, InstanceOperationsServeTheirClasses) {
    for (const DispatchRow& row : rows) {
        for (const char* className : row.names) {
            expectInstanceAnswers(row, className);
        }
    }
}

TEST_F(DispatchTest, AssociationOperationsServeTheTwoAssociationClasses) {
    for (const DispatchRow& row : rows) {
        for (const char* className : row.names) {
            expectAssociationAnswers(row, className);
        }
    }
}

TEST_F(DispatchTest, OnlyTheClassNameOfARejectedPathIsRead) {
    provider().enumerateInstances(classPath("VELKO_ComputerSystem"));
    for (const std::string& function : broker.functions()) {
        EXPECT_TRUE(function == "CMPIObjectPathFT.getClassName" || function == "CMPIStringFT.getCharPtr") << function;
    }
}

TEST_F(DispatchTest, TheClassOfTheSourcePathIsNotUsedAsAssociationClass) {
    const ObjectPath path = classPath("VELKO_LeaseSetting");
    EXPECT_THAT(provider().associators(path, {}), isRefused(invalidClass));
    EXPECT_THAT(provider().associatorNames(path, {}), isRefused(invalidClass));
}

TEST_F(DispatchTest, ReferencesAreNotSupportedForAnyClass) {
    for (const DispatchRow& row : rows) {
        for (const char* className : row.names) {
            cimhost::AssociationFilter filter;
            if (className != nullptr) {
                filter.resultClass = className;
            }
            EXPECT_THAT(provider().references(computerPath(), filter), isRefused(notSupported));
            EXPECT_THAT(provider().referenceNames(computerPath(), filter), isRefused(notSupported));
        }
    }
    EXPECT_THAT(broker.calls(), IsEmpty());
}

TEST_F(DispatchTest, QueriesAreNotSupportedForAnyClass) {
    for (const DispatchRow& row : rows) {
        for (const char* className : row.names) {
            const ObjectPath path = classPath(className == nullptr ? "" : className);
            EXPECT_THAT(provider().execQuery(path, "WQL", "SELECT * FROM VELKO_Lease"), isRefused(notSupported));
        }
    }
    EXPECT_THAT(broker.calls(), IsEmpty());
}

TEST_F(DispatchTest, CleanupSucceedsWithoutCallingTheBroker) {
    for (const bool terminating : {false, true}) {
        EXPECT_THAT(provider().cleanupInstanceMI(terminating), isOk(0));
        EXPECT_THAT(provider().cleanupAssociationMI(terminating), isOk(0));
    }
    EXPECT_THAT(broker.calls(), IsEmpty());
}

TEST_F(DispatchTest, OperationsWithAFixedStatusNeedNoArguments) {
    CMPIInstanceMI* instances = provider().instanceMI();
    CMPIAssociationMI* associations = provider().associationMI();
    EXPECT_EQ(instances->ft->cleanup(nullptr, nullptr, 1).rc, ok);
    EXPECT_EQ(associations->ft->cleanup(nullptr, nullptr, 0).rc, ok);
    EXPECT_EQ(instances->ft->execQuery(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr).rc, notSupported);
    EXPECT_EQ(associations->ft->references(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr, nullptr).rc,
              notSupported);
    EXPECT_EQ(associations->ft->referenceNames(nullptr, nullptr, nullptr, nullptr, nullptr, nullptr).rc, notSupported);
}

/**
 * Returns the function, level and message of each record of the log channel. Omits the part of the message from the
 * line number on.
 */
std::vector<std::string> logLines() {
    std::vector<std::string> lines;
    for (const LogRecord& record : logOf()) {
        lines.push_back(record.function + " " + std::to_string(record.level) + " " +
                        record.text.substr(0, record.text.find(" [Line")));
    }
    return lines;
}

TEST_F(DispatchTest, OperationsWithAFixedStatusLogOneLineEach) {
    const auto logged = [&](const std::function<void()>& request) {
        agentEnvironment::forgetLog();
        request();
        EXPECT_EQ(logOf("trace").size(), 1U);
        return logLines();
    };
    const auto method = [](const std::string& name) {
        return std::vector<std::string>{name + " 4000 METHOD: " + name +
                                        "() was invoked in LeaseAndWarrantyProvider.cpp"};
    };
    const ObjectPath path = computerPath();
    EXPECT_EQ(logged([&] { provider().cleanupInstanceMI(false); }), method("LeaseAndWarranty_Cleanup"));
    EXPECT_EQ(logged([&] { provider().cleanupAssociationMI(false); }), method("LeaseAndWarranty_AssociationCleanup"));
    EXPECT_EQ(logged([&] { provider().execQuery(path, "", ""); }), method("LeaseAndWarranty_ExecQuery"));
    EXPECT_EQ(logged([&] { provider().references(path, {}); }), method("LeaseAndWarranty_References"));
    EXPECT_EQ(logged([&] { provider().referenceNames(path, {}); }), method("LeaseAndWarranty_ReferenceNames"));
}

/** A class and its logged number. */
struct ClassIdCase {
    const char* className;
    const char* classId;
};

TEST_F(DispatchTest, TheClassIdIsLoggedAfterTheEntry) {
    for (const ClassIdCase& each : {ClassIdCase{"VELKO_Lease", "20"}, ClassIdCase{"VELKO_Warranty", "21"},
                                    ClassIdCase{"VELKO_LeaseSetting", "25"}, ClassIdCase{"VELKO_WarrantySetting", "32"},
                                    ClassIdCase{"VELKO_OstrelAgent", "208"}, ClassIdCase{"VELKO_AssetIDDetails", "209"},
                                    ClassIdCase{"VELKO_ComputerSystem", "1"}}) {
        agentEnvironment::forgetLog();
        provider().getInstance(classPath(each.className));
        const std::vector<LogRecord> records = logOf();
        ASSERT_GE(records.size(), 3U);
        EXPECT_EQ(records[2].text, "VARIABLE: 'classId' has Value '" + std::string(each.classId) + "' at line " +
                                       std::to_string(records[2].line) + " in LeaseAndWarrantyProvider.cpp");
    }
}

}  // namespace
}  // namespace contract
