#include "RecordFixture.h"

// Creation of records.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::SizeIs;
using testsupport::named;
using testsupport::text;
using testsupport::uint32;

constexpr const char* getNameSpace = "CMPIObjectPathFT.getNameSpace";
constexpr const char* getKey = "CMPIObjectPathFT.getKey";
constexpr const char* getCharPtr = "CMPIStringFT.getCharPtr";

class CreateTest : public RecordTest {
protected:
    Outcome createByKeys(std::vector<NamedValue> keys) {
        const ObjectPath path = testsupport::objectPath(nameSpace, kind().className, std::move(keys));
        return provider().createInstance(path, clientInstance(path, {}));
    }

    /** Creates a record with a path whose key has these data. */
    Outcome createByData(const CMPIData& data, CMPIrc rc = CMPI_RC_OK) {
        broker.answerData(getKey, "InstanceID", data, rc);
        Outcome outcome = create("ignored");
        broker.cancelFailures();
        return outcome;
    }

    static CMPIData stringData(CMPIString* string) {
        CMPIData data{};
        data.type = CMPI_string;
        data.state = CMPI_keyValue;
        data.value.string = string;
        return data;
    }

    /** Expects that nothing was created and that the request succeeded without an instance. */
    void expectNothingCreated(const Outcome& outcome) {
        EXPECT_THAT(outcome, isOk(1));
        EXPECT_THAT(outcome.events, SizeIs(1));
        EXPECT_THAT(identifiers(), IsEmpty());
        EXPECT_EQ(data(), std::nullopt);
        EXPECT_THAT(loggedFailures(), IsEmpty());
    }

    /** Expects that the record "A" was created with an empty namespace, since the namespace could not be read. */
    void expectCreatedWithoutNamespace(const Outcome& outcome, CMPIrc rc) {
        EXPECT_EQ(outcome.rc, rc);
        EXPECT_FALSE(outcome.hasMessage);
        EXPECT_EQ(outcome.doneCount, 1);
        ASSERT_THAT(outcome.instances(), SizeIs(1));
        EXPECT_EQ(outcome.instances().front().path.nameSpace, "");
        EXPECT_EQ(data(), dataOfNew({"A"}));
    }

    /** Returns which getCharPtr call of a creation reads the namespace, counted from 1. */
    int callForNamespace() {
        EXPECT_THAT(create("probe"), isOk(1));
        EXPECT_THAT(remove("probe"), isOk(0));
        broker.forget();
        EXPECT_THAT(create("probe"), isOk(1));
        const auto calls = broker.calls();
        int strings = 0;
        bool asked = false;
        for (const auto& call : calls) {
            asked = asked || call.function == getNameSpace;
            strings += call.function == getCharPtr ? 1 : 0;
            if (asked && call.function == getCharPtr) {
                break;
            }
        }
        EXPECT_THAT(remove("probe"), isOk(0));
        return strings;
    }
};

TEST_P(CreateTest, ReturnsTheNewInstanceButNoPathAndCallsReturnDoneOnce) {
    const Outcome outcome = create("A");
    EXPECT_THAT(outcome, isOk(1));
    ASSERT_THAT(outcome.events, SizeIs(2));
    ASSERT_TRUE(cimhost::resultOf<Instance>(outcome.events.front()) != nullptr);
    const auto& made = *cimhost::resultOf<Instance>(outcome.events.front());
    EXPECT_EQ(shown(made.properties), kind().shownRecord("A"));
    EXPECT_EQ(testsupport::toText(made.path), testsupport::toText(path("A")));
    EXPECT_EQ(broker.count("CMPIResultFT.returnInstance"), 1);
    EXPECT_EQ(broker.count("CMPIResultFT.returnObjectPath"), 0);
    EXPECT_EQ(broker.count("CMPIResultFT.returnDone"), 1);
}

TEST_P(CreateTest, ReturnsTheNewInstanceAmongOtherRecords) {
    createAll({"A", "B"});
    const Outcome outcome = create("C");
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("C"));
    EXPECT_THAT(identifiers(), ElementsAre("A", "B", "C"));
}

TEST_P(CreateTest, TheSentInstanceIsIgnored) {
    const Instance sent =
        clientInstance(path("other"), {named("InstanceID", text("other")), named(kind().textProperty, text("sent")),
                                       named(kind().numberProperty, uint32(9))});
    EXPECT_THAT(identifiersOf(provider().createInstance(path("A"), sent).instances()), ElementsAre("A"));
    EXPECT_EQ(recordOf("A"), kind().shownRecord("A"));
    EXPECT_EQ(broker.count("CMPIInstanceFT.getProperty"), 0);
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

TEST_P(CreateTest, ANullInstanceIsAccepted) {
    CMPIInstanceMI* interface = provider().instanceMI();
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        return interface->ft->createInstance(interface, context, result, scope.objectPath(path("A")), nullptr);
    });
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A"));
}

TEST_P(CreateTest, ADuplicateIsOnlyLogged) {
    createAll({"A", "B"});
    const Outcome outcome = create("A");
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().exists));
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
    EXPECT_EQ(data(), dataOfNew({"A", "B"}));
}

TEST_P(CreateTest, AnIdentifierThatDiffersInCaseIsNoDuplicate) {
    createAll({"a", "A"});
    EXPECT_THAT(identifiers(), ElementsAre("a", "A"));
}

TEST_P(CreateTest, APathWithoutKeysCreatesNothing) {
    expectNothingCreated(provider().createInstance(allPath(), clientInstance(allPath(), {})));
}

TEST_P(CreateTest, APathWithAnotherKeyCreatesNothing) {
    expectNothingCreated(createByKeys({named("Name", text("A"))}));
}

TEST_P(CreateTest, AKeyOfAnotherTypeCreatesNothing) {
    for (const cimhost::Value& key :
         {uint32(1), testsupport::boolean(true), testsupport::uint64(1), testsupport::reference(path("A")),
          testsupport::dateTime("20240506070809.000000+000")}) {
        expectNothingCreated(createByKeys({named("InstanceID", key)}));
    }
}

TEST_P(CreateTest, ANullStringAsKeyCreatesNothing) {
    expectNothingCreated(createByData(stringData(nullptr)));
}

TEST_P(CreateTest, AKeyStringWithoutCharactersCreatesNothing) {
    expectNothingCreated(createByData(stringData(broker.stringWithoutCharacters())));
}

TEST_P(CreateTest, AKeyInTheNullStateCreatesNothing) {
    for (CMPIString* string : {broker.string("A"), broker.stringWithoutCharacters()}) {
        CMPIData data = stringData(string);
        data.state = CMPI_nullValue;
        expectNothingCreated(createByData(data));
    }
}

TEST_P(CreateTest, AKeyThatCannotBeReadCreatesNothing) {
    expectNothingCreated(createByData(stringData(nullptr), CMPI_RC_ERR_FAILED));
    expectNothingCreated(createByData(stringData(broker.string("A")), CMPI_RC_ERR_NOT_FOUND));
}

TEST_P(CreateTest, AnEmptyIdentifierCreatesARecord) {
    EXPECT_THAT(identifiersOf(create("").instances()), ElementsAre(""));
    EXPECT_THAT(identifiers(), ElementsAre(""));
    EXPECT_EQ(data(), dataOfNew({""})) << "the identifier is an empty line";
}

TEST_P(CreateTest, TheNewInstanceHasTheNamespaceOfThePath) {
    ObjectPath elsewhere = path("A");
    elsewhere.nameSpace = "root/elsewhere";
    const Outcome outcome = provider().createInstance(elsewhere, clientInstance(elsewhere, {}));
    ASSERT_THAT(outcome.instances(), SizeIs(1));
    EXPECT_EQ(outcome.instances().front().path.nameSpace, "root/elsewhere");
}

TEST_P(CreateTest, AFailureToReadTheNamespaceIsReturnedAndTheRecordIsCreated) {
    broker.failEvery(getNameSpace, CMPI_RC_ERR_INVALID_NAMESPACE);
    const Outcome outcome = create("A");
    broker.cancelFailures();
    expectCreatedWithoutNamespace(outcome, CMPI_RC_ERR_INVALID_NAMESPACE);
}

TEST_P(CreateTest, AFailureToReadTheNamespaceCharactersIsReturnedAndTheRecordIsCreated) {
    const int call = callForNamespace();
    broker.failCall(getCharPtr, call, CMPI_RC_ERR_FAILED);
    const Outcome outcome = create("A");
    broker.cancelFailures();
    expectCreatedWithoutNamespace(outcome, CMPI_RC_ERR_FAILED);
}

TEST_P(CreateTest, NullNamespaceCharactersMeanTheEmptyNamespace) {
    const int call = callForNamespace();
    broker.answerNothing(getCharPtr, call);
    const Outcome outcome = create("A");
    broker.cancelFailures();
    expectCreatedWithoutNamespace(outcome, CMPI_RC_OK);
}

TEST_P(CreateTest, ANullNamespaceStringMeansTheEmptyNamespace) {
    broker.answerNothingEver(getNameSpace);
    const Outcome outcome = create("A");
    broker.cancelFailures();
    expectCreatedWithoutNamespace(outcome, CMPI_RC_OK);
}

TEST_P(CreateTest, TheNamespaceFailureIsReturnedIfNothingIsCreated) {
    broker.failEvery(getNameSpace, CMPI_RC_ERR_ACCESS_DENIED);
    const Outcome outcome = createByKeys({});
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_FALSE(outcome.hasMessage);
    EXPECT_EQ(outcome.doneCount, 1);
    EXPECT_THAT(outcome.instances(), IsEmpty());
}

TEST_P(CreateTest, TheNamespaceFailureIsReturnedIfTheIdentifierExists) {
    createAll({"A"});
    broker.failEvery(getNameSpace, CMPI_RC_ERR_ACCESS_DENIED);
    const Outcome outcome = create("A");
    EXPECT_EQ(outcome.rc, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_FALSE(outcome.hasMessage);
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre(kind().exists));
}

TEST_P(CreateTest, AFailureOfReturnInstanceIsIgnored) {
    broker.failEvery("CMPIResultFT.returnInstance", CMPI_RC_ERR_NOT_SUPPORTED);
    const Outcome outcome = create("A");
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_THAT(outcome.events, SizeIs(1));
    EXPECT_EQ(broker.count("CMPIResultFT.returnDone"), 1);
    broker.cancelFailures();
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_THAT(loggedFailures(), IsEmpty());
}

TEST_P(CreateTest, OnlyLeasesLogTheCreation) {
    create("A");
    int lines = 0;
    for (const LogRecord& record : logOf()) {
        lines += record.text.find("'Instance Created' has Value '1'") != std::string::npos ? 1 : 0;
    }
    EXPECT_EQ(lines, std::string(kind().name) == "Lease" ? 1 : 0);
}

INSTANTIATE_RECORD_TEST(CreateTest);

TEST_F(ProviderTest, CreationOfAnUnservedClassReturnsInvalidClassEvenWithoutANamespace) {
    broker.failEvery(getNameSpace, CMPI_RC_ERR_ACCESS_DENIED);
    for (const char* className : {"VELKO_OstrelAgent", "VELKO_AssetIDDetails", "VELKO_LeaseSetting", "VELKO_Unknown"}) {
        const ObjectPath path = keyedPath(className, "A");
        EXPECT_THAT(provider().createInstance(path, clientInstance(path, {})), isRefused(CMPI_RC_ERR_INVALID_CLASS));
    }
}

}  // namespace
}  // namespace contract
