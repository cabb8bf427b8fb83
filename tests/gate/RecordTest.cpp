#include "GateFixture.h"
#include "support/Files.h"

// Creates, reads, changes and deletes leases and warranties through the gate.

namespace gatetest {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testsupport::boolean;
using testsupport::dateTime;
using testsupport::nullOf;

using RecordTest = GateTest;

/** Returns null for properties of a lease. Managers send null for properties that a client omits. */
std::vector<NamedValue> allNull() {
    std::vector<NamedValue> properties;
    for (const char* name : {"Caption", "Description", "ElementName", "Lessor", "BaseRent", "FairMarketRental"}) {
        properties.push_back(named(name, nullOf(CMPI_string)));
    }
    properties.push_back(named("LeaseTerm", nullOf(CMPI_uint32)));
    properties.push_back(named("RenewalOption", nullOf(CMPI_boolean)));
    properties.push_back(named("BaseTermCommencementDate", nullOf(CMPI_dateTime)));
    return properties;
}

TEST_F(RecordTest, ACreationReturnsOnePathInTheRequestsNamespace) {
    const ObjectPath path = testsupport::objectPath("root/other", lease, {named("InstanceID", text("L1"))});
    const Outcome outcome = gate().createInstance(path, testsupport::instance(path));
    EXPECT_THAT(outcome, isAnswered(1));
    EXPECT_THAT(formattedPaths(outcome.paths()), ElementsAre("root/other:VELKO_Lease.InstanceID=\"L1\""));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(RecordTest, ANewRecordHasTheKeyOfTheInstanceIfThePathHasNone) {
    for (const auto& keys : {std::vector<NamedValue>{}, {named("InstanceID", text(""))}}) {
        const ObjectPath path = testsupport::objectPath(nameSpace, warranty, keys);
        const std::string id = "W" + std::to_string(keys.size());
        const Outcome outcome =
            gate().createInstance(path, testsupport::instance(path, {named("instanceid", text(id))}));
        EXPECT_THAT(outcome, isAnswered(1));
        EXPECT_THAT(identifiersOf(outcome.paths()), ElementsAre(id));
    }
    EXPECT_THAT(identifiers(warranty), ElementsAre("W0", "W1"));
}

TEST_F(RecordTest, ANewRecordNeedsAKey) {
    const ObjectPath keyless = classPath(lease);
    const std::vector<std::vector<NamedValue>> withoutKey{
        {}, {named("InstanceID", text(""))}, {named("InstanceID", nullOf(CMPI_string))}};
    for (const auto& properties : withoutKey) {
        EXPECT_THAT(gate().createInstance(keyless, testsupport::instance(keyless, properties)),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID"));
    }
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_FALSE(std::filesystem::exists(dataFile("Lease.dat"))) << "nothing was written";
}

TEST_F(RecordTest, TheKeyInThePathTakesPrecedenceOverTheKeyInTheInstance) {
    const Outcome outcome = create("L1", {named("InstanceID", text("L2")), named("Lessor", text("ACME"))});
    EXPECT_THAT(outcome, isAnswered(1));
    EXPECT_THAT(identifiersOf(outcome.paths()), ElementsAre("L1"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, AnExistingRecordIsNotCreatedAgain) {
    create("L1", {named("Lessor", text("ACME"))});
    EXPECT_THAT(create("L1", {named("Lessor", text("Other"))}), isRefused(CMPI_RC_ERR_ALREADY_EXISTS, "L1"));
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, ARecordWhoseIdentifierIsOnTheLineOfTheCountIsNotCreatedAgain) {
    testsupport::writeFile(dataFile("Warranty.dat"), "1abc\nACME\n00000000000000.000000-000\n12\na later line\n");
    EXPECT_THAT(create("abc", {}, warranty), isRefused(CMPI_RC_ERR_ALREADY_EXISTS, "abc"));
    EXPECT_THAT(identifiers(warranty), ElementsAre("abc"));
}

TEST_F(RecordTest, ACreationStoresTheValuesAndIgnoresNulls) {
    std::vector<NamedValue> properties = allNull();
    properties[3] = named("Lessor", text("ACME Leasing"));
    properties.push_back(named("FairMarketValue", text("99 EUR")));
    properties[6] = named("LeaseTerm", uint32(36));
    EXPECT_THAT(create("L1", properties), isAnswered(1));
    const Instance created = instanceOf("L1");
    EXPECT_EQ(valueIn(created, "Lessor"), "ACME Leasing");
    EXPECT_EQ(valueIn(created, "LeaseTerm"), "36");
    EXPECT_EQ(valueIn(created, "FairMarketValue"), "99 EUR");
    EXPECT_EQ(valueIn(created, "RenewalOption"), "FALSE");
    EXPECT_EQ(valueIn(created, "BaseTermCommencementDate"), std::nullopt);
}

TEST_F(RecordTest, ACreationWithAReadOnlyValueIsRefused) {
    EXPECT_THAT(create("L1", {named("Lessor", text("ACME")), named("Caption", text("mine"))}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "Caption"));
    EXPECT_THAT(identifiers(), IsEmpty());
    EXPECT_THAT(testsupport::readFile(dataFile("Lease.dat")), "0\n");
    EXPECT_THAT(create("L1", {named("ElementName", text("Lease Information"))}), isAnswered(1));
}

TEST_F(RecordTest, ReadOnlyValuesOfANewRecordAreComparedWithAnExistingRecordWithoutWriting) {
    create("L1", {named("Lessor", text("ACME"))});
    const auto written = std::filesystem::last_write_time(dataFile("Lease.dat"));
    const std::string stored = testsupport::readFile(dataFile("Lease.dat"));
    agentEnvironment::forgetLog();
    EXPECT_THAT(create("L2", {named("ElementName", text("mine"))}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "ElementName"));
    EXPECT_THAT(create("L2", {named("ChangeableType", testsupport::uint16(1))}),
                isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "ChangeableType"));
    EXPECT_EQ(testsupport::readFile(dataFile("Lease.dat")), stored);
    EXPECT_EQ(std::filesystem::last_write_time(dataFile("Lease.dat")), written);
    EXPECT_THAT(create("L2", {named("ElementName", text("Lease Information"))}), isAnswered(1));
    EXPECT_THAT(identifiers(), ElementsAre("L1", "L2"));
}

TEST_F(RecordTest, AMissingRecordIsNotFound) {
    create("L1", {named("Lessor", text("ACME"))});
    EXPECT_THAT(gate().getInstance(keyedPath(lease, "L2")), isRefused(CMPI_RC_ERR_NOT_FOUND, lease));
    EXPECT_THAT(modify("L2", {named("Lessor", text("Other"))}), isRefused(CMPI_RC_ERR_NOT_FOUND, lease));
    EXPECT_THAT(remove("L2"), isRefused(CMPI_RC_ERR_NOT_FOUND, lease));
    EXPECT_THAT(gate().getInstance(keyedPath(warranty, "L1")), isRefused(CMPI_RC_ERR_NOT_FOUND, warranty));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, APathWithoutTheKeyIsRefusedAndChangesNothing) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::vector<std::vector<NamedValue>> keyLists{
        {}, {named("Name", text("L1"))}, {named("InstanceID", uint32(1))}};
    for (const auto& keys : keyLists) {
        const ObjectPath path = testsupport::objectPath(nameSpace, lease, keys);
        const auto refused = isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID");
        EXPECT_THAT(gate().getInstance(path), refused);
        EXPECT_THAT(gate().modifyInstance(path, testsupport::instance(path, {named("Lessor", text("Other"))})),
                    refused);
        EXPECT_THAT(gate().deleteInstance(path), refused);
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, NamesOfClassesAndKeysIgnoreLetterCase) {
    create("L1");
    const ObjectPath path = testsupport::objectPath(nameSpace, "velko_LEASE", {named("INSTANCEID", text("L1"))});
    EXPECT_THAT(gate().getInstance(path), isAnswered(1));
    EXPECT_THAT(gate().enumerateInstances(classPath("velko_lease")), isAnswered(1));
    EXPECT_THAT(gate().deleteInstance(path), isDone());
    EXPECT_THAT(identifiers(), IsEmpty());
}

TEST_F(RecordTest, ANullKeyInAnyRepresentationIsRefused) {
    create("L1");
    const ObjectPath path = keyedPath(lease, "L1");
    CMPIData disguised{};
    disguised.type = CMPI_string;
    disguised.value.string = broker.string("L1");
    disguised.state = CMPI_nullValue;
    broker.answerData("CMPIObjectPathFT.getKey", "InstanceID", disguised);
    EXPECT_THAT(gate().deleteInstance(path), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID"));
    disguised.state = CMPI_goodValue;
    disguised.value.string = nullptr;
    broker.answerData("CMPIObjectPathFT.getKey", "InstanceID", disguised);
    EXPECT_THAT(gate().deleteInstance(path), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID"));
    disguised.value.string = broker.stringWithoutCharacters();
    broker.answerData("CMPIObjectPathFT.getKey", "InstanceID", disguised);
    EXPECT_THAT(gate().deleteInstance(path), isRefused(CMPI_RC_ERR_INVALID_PARAMETER, "InstanceID"));
    broker.cancelFailures();
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(RecordTest, AModificationIgnoresNullAndMissingProperties) {
    create("L1", {named("Lessor", text("ACME")), named("LeaseTerm", uint32(36)), named("RenewalOption", boolean(true)),
                  named("BaseTermCommencementDate", dateTime("20260101000000.000000+060"))});
    std::vector<NamedValue> properties = allNull();
    properties[4] = named("BaseRent", text("12 EUR"));
    EXPECT_THAT(modify("L1", properties), isDone());
    const Instance changed = instanceOf("L1");
    EXPECT_EQ(valueIn(changed, "BaseRent"), "12 EUR");
    EXPECT_EQ(valueIn(changed, "Lessor"), "ACME");
    EXPECT_EQ(valueIn(changed, "LeaseTerm"), "36");
    EXPECT_EQ(valueIn(changed, "RenewalOption"), "TRUE");
    EXPECT_EQ(valueIn(changed, "BaseTermCommencementDate"), "20260101000000.000000+060");
}

TEST_F(RecordTest, AModificationAppliesItsPropertyListInAnyLetterCase) {
    create("L1", {named("Lessor", text("ACME")), named("LeaseTerm", uint32(36))});
    const ObjectPath path = keyedPath(lease, "L1");
    const Instance sent =
        testsupport::instance(path, {named("InstanceID", text("L1")), named("Lessor", text("Other")),
                                     named("LeaseTerm", uint32(48)), named("Caption", text("not listed"))});
    EXPECT_THAT(gate().modifyInstance(path, sent, {{"instanceid", "LEASETERM"}}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "48");
    EXPECT_THAT(gate().modifyInstance(path, sent, cimhost::PropertyList(std::vector<std::string>{})), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, AReadInstanceWithOneChangedValueIsAccepted) {
    create("L1",
           {named("Lessor", text("ACME")), named("BaseTermCommencementDate", dateTime("20260101000000.000000+060"))});
    Instance sent = instanceOf("L1");
    for (NamedValue& property : sent.properties) {
        property = property.name == "Lessor" ? named("Lessor", text("Other")) : property;
    }
    EXPECT_THAT(gate().modifyInstance(keyedPath(lease, "L1"), sent), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Other");
}

TEST_F(RecordTest, AnOffsetOfZeroIsAcceptedWithEitherSign) {
    create("L1", {named("BaseTermCommencementDate", dateTime("20260101000000.000000+000"))});
    const std::string stored = testsupport::readFile(dataFile("Lease.dat"));
    EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", dateTime("20260101000000.000000-000"))}), isDone());
    EXPECT_EQ(testsupport::readFile(dataFile("Lease.dat")), stored) << "no change";
    EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", dateTime("20260102000000.000000-000"))}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "BaseTermCommencementDate"), "20260102000000.000000-000");
}

TEST_F(RecordTest, ZerosUnsetADate) {
    for (const char* zeros : {"00000000000000.000000-000", "00000000000000.000000+000"}) {
        create("L1", {named("BaseTermCommencementDate", dateTime("20260101000000.000000+060"))});
        EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", dateTime(zeros))}), isDone()) << zeros;
        EXPECT_EQ(valueIn(instanceOf("L1"), "BaseTermCommencementDate"), std::nullopt);
        EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", dateTime(zeros))}), isDone()) << "again";
        EXPECT_THAT(testsupport::readFile(dataFile("Lease.dat")), HasSubstr("\n00000000000000.000000-000\n"));
        unload();
        EXPECT_EQ(valueIn(instanceOf("L1"), "BaseTermCommencementDate"), std::nullopt);
        remove("L1");
    }
}

TEST_F(RecordTest, AModificationKeepsStoredStringsThatAreSentTrimmed) {
    testsupport::writeFile(dataFile("Lease.dat"),
                           "1\nL1\n_Bail_Ren\xc3\xa9\n00000000000000.000000-000\n0\n0\n0\n0\n0\nACME_\n*\n*\n*\n0\n");
    const Instance before = instanceOf("L1");
    ASSERT_EQ(valueIn(before, "Lessor"), " Bail Ren\xc3\xa9");
    ASSERT_EQ(valueIn(before, "BaseRent"), "ACME ");
    for (const char* lessor : {"Bail Ren", "Bail Ren\xc3\xa9"}) {
        EXPECT_THAT(modify("L1", {named("Lessor", text(lessor)), named("BaseRent", text("ACME")),
                                  named("LeaseTerm", uint32(3))}),
                    isDone());
        EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), valueIn(before, "Lessor"));
        EXPECT_EQ(valueIn(instanceOf("L1"), "BaseRent"), "ACME ");
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "3");
}

TEST_F(RecordTest, APropertyListPermitsRemovingATrailingNonAsciiLetter) {
    create("L1", {named("Lessor", text("Bail Ren\xc3\xa9"))});
    const ObjectPath path = keyedPath(lease, "L1");
    const Instance sent = testsupport::instance(path, {named("Lessor", text("Bail Ren"))});
    EXPECT_THAT(gate().modifyInstance(path, sent), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Bail Ren\xc3\xa9") << "a manager may have trimmed it";
    EXPECT_THAT(gate().modifyInstance(path, sent, {{"Lessor"}}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "Bail Ren");
}

TEST_F(RecordTest, AChangedReadOnlyPropertyIsRefusedAndNamedAndNothingChanges) {
    create("L1", {named("Lessor", text("ACME"))});
    const std::vector<NamedValue> readOnly{named("InstanceID", text("L2")), named("ElementName", text("mine")),
                                           named("ChangeableType", testsupport::uint16(1))};
    for (const NamedValue& property : readOnly) {
        EXPECT_THAT(modify("L1", {named("Lessor", text("Other")), property}),
                    isRefused(CMPI_RC_ERR_INVALID_PARAMETER, property.name));
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(RecordTest, UnknownPropertiesAreRefusedAndNamed) {
    create("L1", {named("Lessor", text("ACME"))});
    EXPECT_THAT(modify("L1", {named("Leasor", text("x"))}), isRefused(CMPI_RC_ERR_NO_SUCH_PROPERTY, "Leasor"));
    const ObjectPath path = keyedPath(lease, "L1");
    const Instance sent = testsupport::instance(path, {named("Lessor", text("Other"))});
    EXPECT_THAT(gate().modifyInstance(path, sent, {{"Leasor"}}), isRefused(CMPI_RC_ERR_NO_SUCH_PROPERTY, "Leasor"));
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
}

TEST_F(RecordTest, IntegersOfAnyTypeAreAcceptedIfTheyAreInRange) {
    create("L1");
    EXPECT_THAT(modify("L1", {named("LeaseTerm", testsupport::uint64(4294967295))}), isDone());
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "4294967295");
    for (const auto& value : {testsupport::uint64(4294967296), testsupport::sint32(-1), text("12"), boolean(true)}) {
        EXPECT_THAT(modify("L1", {named("LeaseTerm", value)}), isRefused(CMPI_RC_ERR_TYPE_MISMATCH, "LeaseTerm"));
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "LeaseTerm"), "4294967295");
}

TEST_F(RecordTest, PropertiesOfAnotherTypeAreRefusedAndNamed) {
    create("L1", {named("RenewalOption", boolean(true)), named("Lessor", text("ACME"))});
    const std::vector<NamedValue> wrong{named("RenewalOption", text("true")),
                                        named("RenewalOption", uint32(1)),
                                        named("Lessor", uint32(1)),
                                        named("Lessor", boolean(true)),
                                        named("BaseTermCommencementDate", uint32(20260101)),
                                        named("LeaseTerm", dateTime("20260101000000.000000+000"))};
    for (const NamedValue& value : wrong) {
        EXPECT_THAT(modify("L1", {value}), isRefused(CMPI_RC_ERR_TYPE_MISMATCH, value.name));
        EXPECT_THAT(create("L2", {value}), isRefused(CMPI_RC_ERR_TYPE_MISMATCH, value.name));
    }
    EXPECT_EQ(valueIn(instanceOf("L1"), "RenewalOption"), "TRUE");
    EXPECT_EQ(valueIn(instanceOf("L1"), "Lessor"), "ACME");
    EXPECT_THAT(modify("L1", {named("BaseTermCommencementDate", text("20260101000000.000000+060"))}), isDone())
        << "a string in datetime format";
    EXPECT_THAT(identifiers(), ElementsAre("L1"));
}

TEST_F(RecordTest, DeletedRecordsAreRemovedFromMemoryAndFile) {
    create("L1");
    create("L2");
    EXPECT_THAT(remove("L1"), isDone());
    EXPECT_THAT(identifiers(), ElementsAre("L2"));
    EXPECT_THAT(testsupport::readFile(dataFile("Lease.dat")), AllOf(HasSubstr("L2\n"), Not(HasSubstr("L1\n"))));
    EXPECT_THAT(remove("L1"), isRefused(CMPI_RC_ERR_NOT_FOUND, lease));
}

TEST_F(RecordTest, StoredValuesSurviveReloadingTheLibrary) {
    create("/system/computer1", {named("Lessor", text("ACME Leasing"))});
    create("W1", {named("Warrantor", text("Acme Service"))}, warranty);
    unload();
    EXPECT_EQ(valueIn(instanceOf("/system/computer1"), "Lessor"), "ACME Leasing");
    EXPECT_EQ(valueIn(instanceOf("W1", warranty), "Warrantor"), "Acme Service");
}

TEST_F(RecordTest, UnsupportedOperationsAreRefused) {
    const ObjectPath path = classPath(agent);
    const Instance none = testsupport::instance(path);
    EXPECT_THAT(gate().createInstance(path, none), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, agent));
    EXPECT_THAT(gate().deleteInstance(path), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, agent));
    EXPECT_THAT(gate().modifyInstance(path, none), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, agent));
    EXPECT_THAT(gate().createInstance(classPath(asset), none), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, asset));
    EXPECT_THAT(gate().deleteInstance(classPath(leaseSetting)), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, leaseSetting));
    EXPECT_THAT(gate().execQuery(classPath(lease), "WQL", "select * from VELKO_Lease"),
                isRefused(CMPI_RC_ERR_NOT_SUPPORTED, "queries"));
}

TEST_F(RecordTest, OtherClassesAreRefusedAsInvalid) {
    for (const char* other : {"VELKO_ComputerSystem", "VELKO_Leas", "VELKO_LeaseX", ""}) {
        const ObjectPath path = classPath(other);
        const auto refused = isRefused(CMPI_RC_ERR_INVALID_CLASS, other);
        EXPECT_THAT(gate().enumerateInstances(path), refused);
        EXPECT_THAT(gate().enumerateInstanceNames(path), refused);
        EXPECT_THAT(gate().getInstance(path), refused);
        EXPECT_THAT(gate().createInstance(path, testsupport::instance(path)), refused);
        EXPECT_THAT(gate().modifyInstance(path, testsupport::instance(path)), refused);
        EXPECT_THAT(gate().deleteInstance(path), refused);
    }
}

}  // namespace
}  // namespace gatetest
