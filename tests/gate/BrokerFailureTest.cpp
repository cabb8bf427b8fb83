#include <functional>
#include <map>
#include <set>
#include <stdexcept>

#include "GateFixture.h"
#include "schema/MofWriter.h"

// Brokers whose functions fail, return null or throw.

namespace gatetest {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

constexpr CMPIrc brokerCode = CMPI_RC_ERR_ACCESS_DENIED;

/** Broker functions that the gate calls, directly or through the provider, except those for error messages. */
const std::vector<std::string> brokerFunctions{
    "CMPIBrokerEncFT.newObjectPath",    "CMPIBrokerEncFT.newInstance",   "CMPIBrokerEncFT.newDateTimeFromChars",
    "CMPIBrokerFT.enumerateInstances",  "CMPIObjectPathFT.addKey",       "CMPIObjectPathFT.getNameSpace",
    "CMPIObjectPathFT.getClassName",    "CMPIObjectPathFT.getKeyCount",  "CMPIObjectPathFT.getKey",
    "CMPIObjectPathFT.getKeyAt",        "CMPIInstanceFT.getObjectPath",  "CMPIInstanceFT.getProperty",
    "CMPIInstanceFT.getPropertyCount",  "CMPIInstanceFT.getPropertyAt",  "CMPIInstanceFT.setProperty",
    "CMPIInstanceFT.setPropertyFilter", "CMPIEnumerationFT.hasNext",     "CMPIEnumerationFT.getNext",
    "CMPIResultFT.returnInstance",      "CMPIResultFT.returnObjectPath", "CMPIResultFT.returnDone",
};

/** Functions whose failures the provider ignores, so that the gate cannot detect them. */
const std::set<std::string> ignoredByProvider{"CMPIObjectPathFT.addKey",    "CMPIObjectPathFT.getKeyCount",
                                              "CMPIObjectPathFT.getKey",    "CMPIObjectPathFT.getKeyAt",
                                              "CMPIInstanceFT.setProperty", "CMPIBrokerEncFT.newDateTimeFromChars"};

/** Returns whether a function belongs to the result, which keeps the objects that it accepted before a failing call. */
bool isOfResult(const std::string& function) {
    return function.find("CMPIResultFT.") == 0;
}

/** Two leases. The requests of these tests do not change the first one. */
class BrokerFailureTest : public GateTest {
protected:
    using RequestCall = std::function<Outcome()>;

    BrokerFailureTest() {
        create("other lease", {named("Lessor", text("First"))});
        create(secondNode, {named("Lessor", text("ACME")), named("LeaseTerm", uint32(1)),
                            named("BaseTermCommencementDate", testsupport::dateTime("20260101000000.000000+060"))});
    }

    std::map<std::string, RequestCall> requests() {
        const ObjectPath path = keyedPath(lease, secondNode);
        const cimhost::PropertyList list{{"Lessor"}};
        return {
            {"enumerate", [=] { return gate().enumerateInstances(classPath(lease), list); }},
            {"enumerateNames", [=] { return gate().enumerateInstanceNames(classPath(lease)); }},
            {"get", [=] { return gate().getInstance(path, list); }},
            {"create", [=] { return create("L3", {named("Lessor", text("New"))}); }},
            {"modify", [=] { return modify(secondNode, {named("Lessor", text("Other"))}); }},
            {"delete", [=] { return remove(secondNode); }},
            {"associators", [=] { return gate().associators(path, {}, list); }},
            {"associatorNames", [=] { return gate().associatorNames(computerPath("beta"), {}); }},
            {"references", [=] { return gate().references(path, {}); }},
            {"enumerateAssociations", [=] { return gate().enumerateInstances(classPath(leaseSetting)); }},
        };
    }

    /**
     * Runs the request without failures, stores its results in `good`, and reverts its changes. Returns the number of
     * calls to the function.
     */
    int callsOf(const std::string& function, const RequestCall& request) {
        broker.forget();
        const Outcome outcome = request();
        EXPECT_EQ(outcome.rc, CMPI_RC_OK);
        good = answersOf(outcome);
        const int count = broker.count(function);
        restore();
        return count;
    }

    /** Returns all returned objects as strings. */
    static std::vector<std::string> answersOf(const Outcome& outcome) {
        std::vector<std::string> answers = formattedPaths(outcome.paths());
        for (const Instance& instance : outcome.instances()) {
            answers.push_back(testsupport::toText(instance.path));
            for (const NamedValue& property : instance.properties) {
                answers.push_back(property.name.string() + " = " + cimhost::formatMof(property.value));
            }
        }
        return answers;
    }

    /** Deletes the new lease, and restores the second lease with its initial values. */
    void restore() {
        gate().deleteInstance(keyedPath(lease, "L3"));
        create(secondNode);
        EXPECT_THAT(
            modify(secondNode, {named("Lessor", text("ACME")), named("LeaseTerm", uint32(1)),
                                named("BaseTermCommencementDate", testsupport::dateTime("20260101000000.000000+060"))}),
            isDone());
    }

    std::vector<std::string> state() {
        std::vector<std::string> shown;
        for (const Instance& instance : gate().enumerateInstances(classPath(lease)).instances()) {
            shown.push_back(*valueIn(instance, "InstanceID") + " " + valueIn(instance, "Lessor").value_or("(none)"));
        }
        return shown;
    }

    void expectValidResponse(const Outcome& outcome, const std::string& what) {
        EXPECT_FALSE(outcome.threw) << what;
        if (outcome.rc != CMPI_RC_OK) {
            EXPECT_FALSE(outcome.message.empty()) << what;
        }
        EXPECT_THAT(state(), testing::Contains("other lease First")) << what;
    }

    std::vector<std::string> good{};  ///< results of the request if no call fails
};

class EachOperationTest : public BrokerFailureTest, public testing::WithParamInterface<const char*> {};

TEST_P(EachOperationTest, ReturnsTheCompleteResultOrAnErrorIfACallFails) {
    const RequestCall request = requests().at(GetParam());
    const std::vector<std::string> before = state();
    for (const std::string& function : brokerFunctions) {
        const int calls = callsOf(function, request);
        for (int call = 1; call <= calls; ++call) {
            const std::string what = function + " fails at call " + std::to_string(call);
            broker.failCall(function, call, brokerCode);
            const Outcome outcome = request();
            broker.cancelFailures();
            expectValidResponse(outcome, what);
            if (outcome.rc == CMPI_RC_OK) {
                EXPECT_TRUE(answersOf(outcome) == good || ignoredByProvider.count(function) != 0)
                    << what << ": OK with a partial result";
            } else {
                EXPECT_EQ(state(), before) << what << ": " << outcome.message;
                EXPECT_TRUE(answersOf(outcome).empty() || isOfResult(function))
                    << what << ": a partial result was returned";
            }
            restore();
            ASSERT_FALSE(HasFailure()) << what;
        }
    }
}

TEST_P(EachOperationTest, SurvivesFunctionsThatReturnNull) {
    const RequestCall request = requests().at(GetParam());
    for (const std::string& function : brokerFunctions) {
        broker.answerNothingEver(function);
        const Outcome outcome = request();
        broker.cancelFailures();
        expectValidResponse(outcome, function + " returns null");
        restore();
    }
}

INSTANTIATE_TEST_SUITE_P(Gate, EachOperationTest,
                         testing::Values("enumerate", "enumerateNames", "get", "create", "modify", "delete",
                                         "associators", "associatorNames", "references", "enumerateAssociations"),
                         [](const auto& parameter) { return std::string(parameter.param); });

TEST_F(BrokerFailureTest, ReturnsNothingIfAnObjectCannotBeCreated) {
    for (const char* maker : {"CMPIBrokerEncFT.newObjectPath", "CMPIBrokerEncFT.newInstance"}) {
        broker.failCall(maker, 2, brokerCode);
        EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isRefused(CMPI_RC_ERR_FAILED, "object manager"));
        broker.cancelFailures();
    }
}

TEST_F(BrokerFailureTest, FailsIfNotAllComputersCanBeEnumerated) {
    const auto refused = isRefused(CMPI_RC_ERR_FAILED, "enumerate VELKO_ComputerSystem");
    broker.failCall("CMPIEnumerationFT.hasNext", 2, brokerCode);
    EXPECT_THAT(gate().associatorNames(computerPath("alpha"), {}), refused);
    broker.cancelFailures();
    broker.answerNothingEver("CMPIBrokerFT.enumerateInstances");
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), refused);
    broker.cancelFailures();
    broker.failEvery("CMPIObjectPathFT.getKeyCount", brokerCode);
    EXPECT_THAT(gate().references(keyedPath(lease, secondNode), {}), isRefused(CMPI_RC_ERR_FAILED, "count the keys"));
    EXPECT_THAT(gate().enumerateInstances(classPath(leaseSetting)), isRefused(CMPI_RC_ERR_FAILED, "count the keys"));
}

TEST_F(BrokerFailureTest, ReturnsAFixedMessageIfTheBrokerCannotCreateStrings) {
    broker.answerNothingEver("CMPIBrokerEncFT.newString");
    EXPECT_THAT(gate().getInstance(keyedPath(lease, "missing")),
                isRefused(CMPI_RC_ERR_NOT_FOUND, "error message could not be created"));
    EXPECT_THAT(gate().execQuery(classPath(lease), "WQL", "select"), isRefused(CMPI_RC_ERR_NOT_SUPPORTED, "Enumerate"));
}

/** A broker whose newObjectPath throws when callsUntilThrow reaches zero. */
struct ThrowingBroker {
    static inline int callsUntilThrow = 0;
    static inline bool throwsStandard = false;
    static inline CMPIObjectPath* (*original)(const CMPIBroker*, const char*, const char*, CMPIStatus*) = nullptr;

    explicit ThrowingBroker(const CMPIBroker& real) : makers(*real.eft), broker(real) {
        original = makers.newObjectPath;
        makers.newObjectPath = &newObjectPath;
        broker.eft = &makers;
    }

    static CMPIObjectPath* newObjectPath(const CMPIBroker* broker, const char* nameSpace, const char* className,
                                         CMPIStatus* rc) {
        if (--callsUntilThrow == 0) {
            if (throwsStandard) {
                throw std::runtime_error("thrown by the broker");
            }
            throw 42;
        }
        return original(broker, nameSpace, className, rc);
    }

    CMPIBrokerEncFT makers;
    CMPIBroker broker;
};

TEST_F(BrokerFailureTest, CatchesAllExceptionsAndServesTheNextRequest) {
    ThrowingBroker throwing(*broker.handle());
    gate().createInstanceMI(&throwing.broker, nullptr);
    gate().createAssociationMI(&throwing.broker, nullptr);
    for (const bool isStandard : {false, true}) {
        ThrowingBroker::throwsStandard = isStandard;
        for (const auto& [name, request] : requests()) {
            for (int call = 1; call <= 3; ++call) {
                ThrowingBroker::callsUntilThrow = call;
                const Outcome outcome = request();
                ThrowingBroker::callsUntilThrow = 0;
                expectValidResponse(outcome, name);
                restore();
            }
        }
    }
    ThrowingBroker::callsUntilThrow = 1;
    ThrowingBroker::throwsStandard = false;
    EXPECT_THAT(gate().enumerateInstances(classPath(lease)), isRefused(CMPI_RC_ERR_FAILED, "exception"));
    unload();  // before the broker is destroyed
}

TEST_F(BrokerFailureTest, WorksWithBrokersThatSetNoValueStates) {
    for (const auto manager : {testsupport::Manager::sfcb, testsupport::Manager::openPegasus}) {
        testsupport::RecordingBroker loose;
        loose.emulate(manager);
        loose.serve("VELKO_ComputerSystem", {testsupport::instance(computerPath("beta"))});
        gate().createInstanceMI(loose.handle(), nullptr);
        gate().createAssociationMI(loose.handle(), nullptr);
        for (const auto& [name, request] : requests()) {
            EXPECT_EQ(request().rc, CMPI_RC_OK) << name;
            restore();
        }
        unload();
    }
}

}  // namespace
}  // namespace gatetest
