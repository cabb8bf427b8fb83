#include <map>

#include "GateFixture.h"

// The associations of computers with their leases and warranties. All requests that return them must agree.

namespace gatetest {
namespace {

using cimhost::AssociationFilter;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testing::UnorderedElementsAre;

constexpr const char* alpha = "root/cimv2:VELKO_ComputerSystem.Name=\"alpha\"";
constexpr const char* beta = "root/cimv2:VELKO_ComputerSystem.Name=\"beta\"";
constexpr const char* firstLease = "root/cimv2:VELKO_Lease.InstanceID=\"/system/computer1\"";
constexpr const char* secondLease = "root/cimv2:VELKO_Lease.InstanceID=\"/system/computer2\"";
constexpr const char* firstWarranty = "root/cimv2:VELKO_Warranty.InstanceID=\"/system/computer1\"";

/** alpha has a lease and a warranty; beta has a lease. Another lease belongs to no computer. */
class AssociationTest : public GateTest {
protected:
    AssociationTest() {
        create("stray");
        create(firstNode, {named("Lessor", text("ACME"))});
        create(secondNode);
        create(firstNode, {}, warranty);
    }

    std::vector<std::string> names(const ObjectPath& path, const AssociationFilter& filter = {}) {
        const Outcome outcome = gate().associatorNames(path, filter);
        EXPECT_EQ(outcome.rc, CMPI_RC_OK) << outcome.message;
        EXPECT_EQ(outcome.doneCount, 1);
        return formattedPaths(outcome.paths());
    }

    /** Returns the ends of each association as "computer -> element". */
    static std::vector<std::string> ends(const std::vector<std::vector<NamedValue>>& associations) {
        std::vector<std::string> shown;
        for (const auto& values : associations) {
            const auto computer = testsupport::referenceOf(values, "Antecedent");
            const auto element = testsupport::referenceOf(values, "Dependent");
            EXPECT_TRUE(computer && element);
            shown.push_back(testsupport::toText(*computer) + " -> " + testsupport::toText(*element));
        }
        return shown;
    }

    static std::vector<std::string> ends(const std::vector<ObjectPath>& paths) {
        std::vector<std::vector<NamedValue>> values;
        for (const ObjectPath& path : paths) {
            values.push_back(path.keys);
        }
        return ends(values);
    }

    static std::vector<std::string> ends(const std::vector<Instance>& instances) {
        std::vector<std::vector<NamedValue>> values;
        for (const Instance& instance : instances) {
            EXPECT_EQ(ends(std::vector<ObjectPath>{instance.path}),
                      ends(std::vector<std::vector<NamedValue>>{instance.properties}));
            values.push_back(instance.properties);
        }
        return ends(values);
    }
};

TEST_F(AssociationTest, FindsComputersRegardlessOfTheStateOfEnumeratedElements) {
    for (const int state : {CMPI_goodValue, CMPI_nullValue, CMPI_keyValue, CMPI_notFound, CMPI_badValue}) {
        broker.answerState("CMPIEnumerationFT.getNext", static_cast<CMPIValueState>(state));
        EXPECT_THAT(names(computerPath("alpha")), UnorderedElementsAre(firstLease, firstWarranty));
        EXPECT_THAT(names(keyedPath(lease, firstNode)), ElementsAre(alpha));
    }
}

TEST_F(AssociationTest, FindsTheLeaseAndWarrantyOfAComputer) {
    EXPECT_THAT(names(computerPath("alpha")), UnorderedElementsAre(firstLease, firstWarranty));
    EXPECT_THAT(names(computerPath("beta")), ElementsAre(secondLease));
    const Outcome outcome = gate().associators(computerPath("alpha"), {});
    EXPECT_THAT(outcome, isAnswered(2));
    EXPECT_EQ(valueIn(outcome.instances().front(), "Lessor"), "ACME");
}

TEST_F(AssociationTest, FindsTheComputerOfARecordEvenIfThatComputerIsEnumeratedLast) {
    EXPECT_THAT(names(keyedPath(lease, firstNode)), ElementsAre(alpha));
    EXPECT_THAT(names(keyedPath(lease, secondNode)), ElementsAre(beta));
    EXPECT_THAT(names(keyedPath(warranty, firstNode)), ElementsAre(alpha));
    const Outcome outcome = gate().associators(keyedPath(lease, secondNode), {});
    EXPECT_THAT(outcome, isAnswered(1));
    EXPECT_EQ(valueIn(outcome.instances().front(), "Model"), "Model of beta");
}

TEST_F(AssociationTest, FindsNothingForUnassociatedOrMissingObjects) {
    for (const ObjectPath& path : {keyedPath(lease, "stray"), keyedPath(warranty, secondNode), keyedPath(lease, "none"),
                                   computerPath("gamma")}) {
        EXPECT_THAT(names(path), IsEmpty()) << testsupport::toText(path);
        EXPECT_THAT(gate().references(path, {}), isAnswered(0));
    }
}

TEST_F(AssociationTest, EnumerationsAndReferencesAgree) {
    const std::string one = std::string(alpha) + " -> " + firstLease;
    const std::string other = std::string(beta) + " -> " + secondLease;
    const Outcome instances = gate().enumerateInstances(classPath(leaseSetting));
    EXPECT_THAT(ends(instances.instances()), ElementsAre(one, other));
    EXPECT_EQ(instances.doneCount, 1);
    EXPECT_THAT(ends(gate().enumerateInstanceNames(classPath(leaseSetting)).paths()), ElementsAre(one, other));
    const AssociationFilter leases{{}, leaseSetting, {}, {}};
    for (const auto& [source, link] : std::map<std::string, std::string>{{"alpha", one}, {"beta", other}}) {
        EXPECT_THAT(ends(gate().references(computerPath(source), leases).instances()), ElementsAre(link));
        EXPECT_THAT(ends(gate().referenceNames(computerPath(source), leases).paths()), ElementsAre(link));
    }
    for (const auto& [source, link] : std::map<std::string, std::string>{{firstNode, one}, {secondNode, other}}) {
        EXPECT_THAT(ends(gate().references(keyedPath(lease, source), {}).instances()), ElementsAre(link));
        EXPECT_THAT(ends(gate().referenceNames(keyedPath(lease, source), {}).paths()), ElementsAre(link));
    }
    EXPECT_THAT(gate().enumerateInstances(classPath(warrantySetting)), isAnswered(1));
}

TEST_F(AssociationTest, ReturnsAnAssociationInstanceByItsPath) {
    const std::vector<ObjectPath> paths = gate().enumerateInstanceNames(classPath(leaseSetting)).paths();
    ASSERT_THAT(paths, SizeIs(2));
    for (const ObjectPath& path : paths) {
        const Outcome outcome = gate().getInstance(path, {{"Dependent"}});
        EXPECT_THAT(outcome, isAnswered(1));
        EXPECT_EQ(ends(outcome.instances()), ends(std::vector<ObjectPath>{path}))
            << "keys are returned although not listed";
    }
}

TEST_F(AssociationTest, DoesNotFindAMissingAssociation) {
    const auto path = [](const std::string& computer, const std::string& element) {
        return testsupport::objectPath(nameSpace, leaseSetting,
                                       {named("Antecedent", testsupport::reference(computerPath(computer))),
                                        named("Dependent", testsupport::reference(keyedPath(lease, element)))});
    };
    EXPECT_THAT(gate().getInstance(path("alpha", firstNode)), isAnswered(1));
    EXPECT_THAT(gate().getInstance(path("alpha", secondNode)), isRefused(CMPI_RC_ERR_NOT_FOUND, leaseSetting));
    ObjectPath longer = path("alpha", firstNode);
    longer.keys.push_back(named("Other", text("o")));
    EXPECT_THAT(gate().getInstance(longer), isRefused(CMPI_RC_ERR_NOT_FOUND, leaseSetting));
    ObjectPath half = path("alpha", firstNode);
    half.keys.pop_back();
    EXPECT_THAT(gate().getInstance(half), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "Dependent"));
    EXPECT_THAT(gate().getInstance(classPath(leaseSetting)), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "Antecedent"));
}

TEST_F(AssociationTest, AcceptsReferencesWithoutNamespaceAndInAnyLetterCase) {
    ObjectPath computer = computerPath("ALPHA");
    computer = testsupport::objectPath("", "velko_computersystem", {named("NAME", text("alpha"))});
    const ObjectPath element = testsupport::objectPath("", "velko_lease", {named("instanceid", text(firstNode))});
    const ObjectPath path = testsupport::objectPath(
        nameSpace, "velko_LEASEsetting",
        {named("DEPENDENT", testsupport::reference(element)), named("antecedent", testsupport::reference(computer))});
    EXPECT_THAT(gate().getInstance(path), isAnswered(1));
}

TEST_F(AssociationTest, FiltersByClassesAndRolesInAnyLetterCase) {
    const ObjectPath source = computerPath("alpha");
    EXPECT_THAT(names(source, {"velko_LEASEsetting", {}, {}, {}}), ElementsAre(firstLease));
    EXPECT_THAT(names(source, {{}, "velko_WARRANTY", {}, {}}), ElementsAre(firstWarranty));
    EXPECT_THAT(names(source, {{}, {}, "ANTECEDENT", "dependent"}), UnorderedElementsAre(firstLease, firstWarranty));
    EXPECT_THAT(names(source, {"", "", "", ""}), UnorderedElementsAre(firstLease, firstWarranty));
    EXPECT_THAT(names(source, {{}, {}, "Dependent", {}}), IsEmpty());
    EXPECT_THAT(names(source, {{}, {}, {}, "Antecedent"}), IsEmpty());
    EXPECT_THAT(names(source, {"VELKO_LeaseSetting", "VELKO_Warranty", {}, {}}), IsEmpty());
    EXPECT_THAT(names(source, {"VELKO_Other", {}, {}, {}}), IsEmpty());
    const ObjectPath element = keyedPath(lease, firstNode);
    EXPECT_THAT(names(element, {{}, "VELKO_ComputerSystem", "Dependent", "Antecedent"}), ElementsAre(alpha));
    EXPECT_THAT(names(element, {"VELKO_WarrantySetting", {}, {}, {}}), IsEmpty());
    EXPECT_THAT(names(element, {{}, {}, "Antecedent", {}}), IsEmpty());
    EXPECT_THAT(gate().references(source, {{}, "VELKO_LeaseSetting", "Antecedent", {}}), isAnswered(1));
    EXPECT_THAT(gate().references(source, {{}, {}, "Dependent", {}}), isAnswered(0));
    EXPECT_THAT(gate().referenceNames(element, {{}, "VELKO_WarrantySetting", {}, {}}), isAnswered(0));
}

TEST_F(AssociationTest, AppliesPropertyListsAtBothEnds) {
    const Outcome toLease = gate().associators(computerPath("alpha"), {leaseSetting, {}, {}, {}}, {{"lessor"}});
    ASSERT_THAT(toLease, isAnswered(1));
    EXPECT_THAT(testsupport::namesOf(toLease.instances().front().properties),
                UnorderedElementsAre("InstanceID", "Lessor"));
    const Outcome toComputer = gate().associators(keyedPath(lease, firstNode), {}, {{"Vendor"}});
    ASSERT_THAT(toComputer, isAnswered(1));
    EXPECT_THAT(testsupport::namesOf(toComputer.instances().front().properties),
                UnorderedElementsAre("Name", "Vendor"));
}

TEST_F(AssociationTest, RefusesAPathWithoutKeys) {
    EXPECT_THAT(gate().associatorNames(classPath("VELKO_ComputerSystem"), {}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "keys"));
    EXPECT_THAT(gate().references(classPath(lease), {}), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "keys"));
}

TEST_F(AssociationTest, FindsTheOnlyComputer) {
    broker.serve("VELKO_ComputerSystem", {testsupport::instance(computerPath("alpha"))});
    EXPECT_THAT(names(keyedPath(lease, firstNode)), ElementsAre(alpha));
    EXPECT_THAT(names(keyedPath(lease, secondNode)), IsEmpty());
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), isAnswered(1));
}

TEST_F(AssociationTest, RecognizesAComputerWhosePathHasNoNamespace) {
    const ObjectPath bare = testsupport::objectPath("", "VELKO_ComputerSystem", {named("Name", text("alpha"))});
    broker.serve("VELKO_ComputerSystem", {testsupport::instance(bare, {named("Name", text("alpha"))})});
    const Outcome computers = gate().associators(keyedPath(lease, firstNode), {});
    ASSERT_THAT(computers, isAnswered(1));
    EXPECT_EQ(testsupport::toText(computers.instances().front().path), alpha);
    const Outcome listed = gate().associators(keyedPath(lease, firstNode), {}, {{"Name"}});
    ASSERT_THAT(listed, isAnswered(1));
    EXPECT_EQ(testsupport::toText(listed.instances().front().path), alpha);
    EXPECT_THAT(names(keyedPath(lease, firstNode)), ElementsAre(alpha));
}

TEST_F(AssociationTest, ReturnsAComputerOnceIfItIsEnumeratedTwice) {
    const Instance twice = testsupport::instance(computerPath("alpha"));
    broker.serve("VELKO_ComputerSystem", {twice, twice});
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), isAnswered(1));
    EXPECT_THAT(names(keyedPath(lease, firstNode)), ElementsAre(alpha));
}

TEST_F(AssociationTest, FindsNothingWithoutComputers) {
    broker.serve("VELKO_ComputerSystem", {});
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), isAnswered(0));
    EXPECT_THAT(names(keyedPath(lease, firstNode)), IsEmpty());
}

TEST_F(AssociationTest, ReportsThatComputersCannotBeEnumerated) {
    broker.failEnumeration("VELKO_ComputerSystem", CMPI_RC_ERR_ACCESS_DENIED);
    const auto refused = isRefused(CMPI_RC_ERR_FAILED, "enumerate VELKO_ComputerSystem");
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), refused);
    EXPECT_THAT(gate().enumerateInstanceNames(classPath(warrantySetting)), refused);
    EXPECT_THAT(gate().associatorNames(keyedPath(lease, firstNode), {}), refused);
    EXPECT_THAT(gate().associators(computerPath("alpha"), {}), refused);
    EXPECT_THAT(gate().references(computerPath("alpha"), {}), refused);
    EXPECT_THAT(gate().referenceNames(computerPath("alpha"), {}), refused);
}

TEST_F(AssociationTest, ReportsAndLogsTheStatusOfAFailedEnumeration) {
    broker.failEnumeration("VELKO_ComputerSystem", CMPI_RC_ERR_ACCESS_DENIED);
    agentEnvironment::forgetLog();
    const Outcome outcome = gate().enumerateInstances(classPath(leaseSetting));
    EXPECT_THAT(outcome.message, testing::HasSubstr("code 2, "));
    std::vector<std::string> logged;
    for (const agentEnvironment::LogRecord& record : agentEnvironment::log()) {
        if (record.logger == "Tarvik.LeaseAndWarrantyGate") {
            EXPECT_EQ(record.level, 3000);
            EXPECT_EQ(record.file, "Associations.cpp");
            logged.push_back(record.channel + ": " + record.text);
        }
    }
    EXPECT_THAT(logged, ElementsAre("log: " + outcome.message, "trace: " + outcome.message));
}

TEST_F(AssociationTest, FindsNothingForOtherClasses) {
    EXPECT_THAT(names(testsupport::objectPath(nameSpace, agent, {named("Name", text("x"))})), IsEmpty());
    EXPECT_THAT(names(testsupport::objectPath(nameSpace, "VELKO_Unknown", {named("Name", text("x"))})), IsEmpty());
}

}  // namespace
}  // namespace gatetest
