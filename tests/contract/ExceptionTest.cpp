#include <functional>
#include <stdexcept>

#include "RecordFixture.h"
#include "ThrowingObjects.h"

// Object manager functions that throw C++ exceptions.

namespace contract {
namespace {

using testing::AllOf;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;
using testsupport::named;
using testsupport::text;

constexpr const char* thrownMessage = "the broker throws";

/** A string whose getCharPtr throws. Global, since functions of the tables have no other access to it. */
CMPIString* throwingString = nullptr;

CMPIString* returnThrowingString(const CMPIObjectPath*, CMPIStatus*) {
    return throwingString;
}

/** The part of a request's path that throws. */
struct ThrowingPart {
    const char* name;
    void (*alter)(CMPIObjectPathFT& table);
};

constexpr ThrowingPart throwingParts[] = {
    {"class name", [](CMPIObjectPathFT& table) { throwFrom<std::runtime_error>(table.getClassName); }},
    {"characters of the class name", [](CMPIObjectPathFT& table) { table.getClassName = &returnThrowingString; }},
    {"namespace", [](CMPIObjectPathFT& table) { throwFrom<std::runtime_error>(table.getNameSpace); }},
    {"characters of the namespace", [](CMPIObjectPathFT& table) { table.getNameSpace = &returnThrowingString; }},
};

class ExceptionTest : public RecordTest {
protected:
    using Alter = std::function<void(CMPIResultFT&)>;

    /** Enumerates instances into a result with replaced functions. */
    Outcome enumerateInto(const Alter& alter) {
        return call(
            [&](CMPIInstanceMI* interface, const CMPIContext* context, const CMPIResult* result,
                const CMPIObjectPath* path) {
                return interface->ft->enumerateInstances(interface, context, result, path, nullptr);
            },
            alter, allPath());
    }

    /** Creates a record with a result that has replaced functions. */
    Outcome createInto(const std::string& instanceId, const Alter& alter) {
        return call(
            [&](CMPIInstanceMI* interface, const CMPIContext* context, const CMPIResult* result,
                const CMPIObjectPath* path) {
                return interface->ft->createInstance(interface, context, result, path, nullptr);
            },
            alter, path(instanceId));
    }

    template <class Call>
    Outcome call(Call request, const Alter& alter, const ObjectPath& path) {
        CMPIInstanceMI* interface = provider().instanceMI();
        return provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
            Altered<CMPIResult> altered(result);
            alter(altered.table);
            return request(interface, context, altered.handle(), scope.objectPath(path));
        });
    }

    /** Returns the int that an action throws; -1 if it throws none. */
    template <class Action>
    static int thrownNumber(Action action) {
        try {
            action();
        } catch (int number) {
            return number;
        }
        return -1;
    }

    /** Calls createInstance without catching exceptions. */
    void createDirectly(const std::string& instanceId, const Alter& alter) {
        CMPIInstanceMI* interface = provider().instanceMI();
        cimhost::ResultEvents events;
        cimhost::RequestScope scope(broker.broker());
        Altered<CMPIResult> altered(scope.result(events));
        alter(altered.table);
        interface->ft->createInstance(interface, scope.context({}), altered.handle(),
                                      scope.objectPath(path(instanceId)), nullptr);
    }

    /** A named request. */
    struct RequestCase {
        const char* name;
        std::function<CMPIStatus(const CMPIContext*, const CMPIResult*, const CMPIObjectPath*)> run;
    };

    /** Returns every request that is dispatched by class. */
    std::vector<RequestCase> dispatchedRequests() {
        CMPIInstanceMI* mi = provider().instanceMI();
        CMPIAssociationMI* ai = provider().associationMI();
        const std::string setting = std::string(kind().className) + "Setting";
        return {
            {"names", [=](auto* c, auto* r, auto* p) { return mi->ft->enumerateInstanceNames(mi, c, r, p); }},
            {"instances", [=](auto* c, auto* r, auto* p) { return mi->ft->enumerateInstances(mi, c, r, p, nullptr); }},
            {"get", [=](auto* c, auto* r, auto* p) { return mi->ft->getInstance(mi, c, r, p, nullptr); }},
            {"create", [=](auto* c, auto* r, auto* p) { return mi->ft->createInstance(mi, c, r, p, nullptr); }},
            {"modify",
             [=](auto* c, auto* r, auto* p) { return mi->ft->modifyInstance(mi, c, r, p, nullptr, nullptr); }},
            {"delete", [=](auto* c, auto* r, auto* p) { return mi->ft->deleteInstance(mi, c, r, p); }},
            {"associators",
             [=](auto* c, auto* r, auto* p) {
                 return ai->ft->associators(ai, c, r, p, setting.c_str(), nullptr, nullptr, nullptr, nullptr);
             }},
            {"associator names",
             [=](auto* c, auto* r, auto* p) {
                 return ai->ft->associatorNames(ai, c, r, p, setting.c_str(), nullptr, nullptr, nullptr);
             }},
        };
    }

    /** Makes a request with a path "A" of which one part throws. */
    Outcome callWithThrowing(const ThrowingPart& part, const RequestCase& request) {
        return provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
            Altered<CMPIString> text(broker.string("root/cimv2"));
            throwFrom<std::runtime_error>(text.table.getCharPtr);
            throwingString = text.handle();
            Altered<CMPIObjectPath> altered(scope.objectPath(path("A")));
            part.alter(altered.table);
            return request.run(context, result, altered.handle());
        });
    }

    static std::vector<std::string> functionsLogged() {
        std::vector<std::string> functions;
        for (const LogRecord& record : logOf()) {
            functions.push_back(record.function);
        }
        return functions;
    }

    static void throwError(CMPIResultFT& table) { throwFrom<std::runtime_error>(table.returnInstance); }
    static void throwNumber(CMPIResultFT& table) { throwNumberFrom(table.returnInstance); }
};

TEST_P(ExceptionTest, AStandardExceptionEndsTheRequestSuccessfullyWithoutACallToReturnDone) {
    createAll({"A", "B"});
    const Outcome outcome = enumerateInto(throwError);
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
}

TEST_P(ExceptionTest, CaughtExceptionsAreLoggedAtErrorLevelOnBothChannels) {
    createAll({"A"});
    agentEnvironment::forgetLog();
    enumerateInto(throwError);
    for (const char* channel : {"log", "trace"}) {
        const std::vector<LogRecord> records = logOf(channel);
        int found = 0;
        for (const LogRecord& record : records) {
            if (record.level == 3000) {
                ++found;
                EXPECT_EQ(record.text, "MESSAGE [File: LeaseAndWarrantyProvider.cpp, Line: " +
                                           std::to_string(record.line) + "]: " + thrownMessage);
                EXPECT_EQ(record.file, "LeaseAndWarrantyProvider.cpp");
                EXPECT_EQ(record.logger, "Tarvik.LeaseAndWarrantyProvider");
                EXPECT_EQ(record.function, "LeaseAndWarranty_EnumInstances");
            }
        }
        EXPECT_EQ(found, 1);
        ASSERT_GE(records.size(), 2U);
        EXPECT_THAT(records[records.size() - 2].text, HasSubstr("EXITING: LeaseAndWarranty_EnumInstances()"));
        EXPECT_EQ(records.back().text, std::string(78, '='));
    }
}

TEST_P(ExceptionTest, ResultsBeforeTheExceptionAreKept) {
    createAll({"A", "B", "C"});
    static int calls;
    calls = 0;
    static CMPIStatus (*original)(const CMPIResult*, const CMPIInstance*);
    const Outcome outcome = enumerateInto([](CMPIResultFT& table) {
        original = table.returnInstance;
        table.returnInstance = [](const CMPIResult* result, const CMPIInstance* instance) -> CMPIStatus {
            if (++calls == 3) {
                throw std::logic_error("third");
            }
            return original(result, instance);
        };
    });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A", "B"));
    EXPECT_THAT(caughtFailures(), ElementsAre("third"));
}

TEST_P(ExceptionTest, AnExceptionFromReturnDoneIsCaught) {
    createAll({"A"});
    const Outcome outcome = enumerateInto([](CMPIResultFT& table) { throwFrom<std::runtime_error>(table.returnDone); });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.instances(), SizeIs(1));
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
}

TEST_P(ExceptionTest, ExceptionsFromTheBrokersFactoryFunctionsAreCaught) {
    createAll({"A"});
    AlteredBroker altered(broker.handle());
    throwFrom<std::runtime_error>(altered.factories.newInstance);
    throwFrom<std::invalid_argument>(altered.factories.newObjectPath);
    provider().createInstanceMI(altered.handle(), nullptr);
    EXPECT_THAT(provider().enumerateInstances(allPath()), isOk(0));
    EXPECT_THAT(provider().enumerateInstanceNames(allPath()), isOk(0));
    EXPECT_THAT(remove("A"), isOk(0));
    provider().createInstanceMI(broker.handle(), nullptr);
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage, thrownMessage, thrownMessage));
    EXPECT_THAT(identifiers(), ElementsAre("A")) << "the deletion reads the record before removing it";
}

TEST_P(ExceptionTest, ExceptionsFromTheRequestsPathAreCaught) {
    createAll({"A"});
    CMPIInstanceMI* interface = provider().instanceMI();
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        Altered<CMPIObjectPath> altered(scope.objectPath(path("A")));
        throwFrom<std::runtime_error>(altered.table.getKey);
        return interface->ft->getInstance(interface, context, result, altered.handle(), nullptr);
    });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
}

TEST_P(ExceptionTest, ExceptionsFromClassNameAndNamespaceAreCaughtInEveryRequest) {
    createAll({"A"});
    for (const ThrowingPart& part : throwingParts) {
        for (const RequestCase& request : dispatchedRequests()) {
            SCOPED_TRACE(std::string(part.name) + ", " + request.name);
            agentEnvironment::forgetLog();
            const Outcome outcome = callWithThrowing(part, request);
            EXPECT_THAT(outcome, isOk(0));
            EXPECT_THAT(outcome.events, IsEmpty());
            EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
            EXPECT_EQ(logOf().back().function, "markProviderExit");
        }
    }
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

TEST_P(ExceptionTest, ANamespaceStatusThatIsSetBeforeAnExceptionIsReturned) {
    CMPIInstanceMI* interface = provider().instanceMI();
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        Altered<CMPIObjectPath> altered(scope.objectPath(path("A")));
        throwingString = broker.string("a message");
        altered.table.getNameSpace = [](const CMPIObjectPath*, CMPIStatus* status) -> CMPIString* {
            *status = {CMPI_RC_ERR_ACCESS_DENIED, throwingString};
            throw std::runtime_error(thrownMessage);
        };
        return interface->ft->createInstance(interface, context, result, altered.handle(), nullptr);
    });
    EXPECT_THAT(outcome, isRefused(CMPI_RC_ERR_ACCESS_DENIED));
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
    EXPECT_THAT(identifiers(), IsEmpty());
}

TEST_P(ExceptionTest, ValuesSetBeforeAnExceptionAreWritten) {
    createAll({"A"});
    CMPIInstanceMI* interface = provider().instanceMI();
    static CMPIData (*original)(const CMPIInstance*, const char*, CMPIStatus*);
    static std::string lastProperty;
    lastProperty = std::string(kind().name) == "Lease" ? "NetMonthlyLeaseRateFactor" : "Warrantor";
    const Outcome outcome = provider().call([&](auto& scope, const CMPIContext* context, const CMPIResult* result) {
        Altered<CMPIInstance> altered(
            scope.instance(clientInstance(path("A"), {named(kind().numberProperty, testsupport::uint32(7))})));
        original = altered.table.getProperty;
        altered.table.getProperty = [](const CMPIInstance* instance, const char* name, CMPIStatus* status) -> CMPIData {
            if (lastProperty == name) {
                throw std::runtime_error("last property");
            }
            return original(instance, name, status);
        };
        return interface->ft->modifyInstance(interface, context, result, scope.objectPath(path("A")), altered.handle(),
                                             nullptr);
    });
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(caughtFailures(), ElementsAre("last property"));
    const std::string stored = *data();
    const auto changed = recordOf("A");
    EXPECT_EQ(changed, kind().shownRecord("A", {std::string(kind().numberProperty) + "=7"}));
    unload();
    EXPECT_EQ(recordOf("A"), changed) << stored;
}

TEST_P(ExceptionTest, ARecordCreatedBeforeAnExceptionIsWritten) {
    const Outcome outcome = createInto("A", throwError);
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

TEST_P(ExceptionTest, AFailedRewriteDuringUnwindingIsLoggedAndTheFirstExceptionPropagates) {
    blockData(kind().dataFile);
    const Outcome outcome = createInto("A", throwError);
    EXPECT_THAT(outcome, isOk(0));
    EXPECT_THAT(outcome.events, IsEmpty());
    EXPECT_THAT(caughtFailures(), ElementsAre(thrownMessage));
    EXPECT_THAT(loggedFailures(), Contains(kind().cannotOpen));
    EXPECT_THAT(loggedFailures("trace"), Contains(kind().cannotOpen));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
}

TEST_P(ExceptionTest, ANonstandardExceptionPropagatesFromTheEntryPoint) {
    EXPECT_EQ(thrownNumber([&] { createDirectly("A", throwNumber); }), 42);
    EXPECT_THAT(loggedFailures(), IsEmpty());
    EXPECT_THAT(functionsLogged(), AllOf(Contains("markProviderEntry"), Not(Contains("markProviderExit"))));
    EXPECT_EQ(data(), dataOfNew({"A"})) << "the record is written while the exception propagates";
    EXPECT_THAT(identifiers(), ElementsAre("A")) << "the provider continues to serve requests";
    createAll({"B"});
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
}

TEST_P(ExceptionTest, AFailedRewriteDuringUnwindingOfANonstandardExceptionIsLogged) {
    blockData(kind().dataFile);
    EXPECT_EQ(thrownNumber([&] { createDirectly("A", throwNumber); }), 42);
    EXPECT_THAT(loggedFailures(), Contains(kind().cannotOpen));
    EXPECT_THAT(caughtFailures(), IsEmpty());
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    freeData(kind().dataFile);
    createAll({"B"});
    EXPECT_EQ(data(), dataOfNew({"A", "B"}));
}

TEST_P(ExceptionTest, ARequestDuringUnwindingOfTheCallerIsServed) {
    provider().instanceMI();
    struct RequestAtEnd {
        std::function<void()> request;
        ~RequestAtEnd() { request(); }
    };
    Outcome outcome;
    try {
        const RequestAtEnd atEnd{[&] { outcome = create("A"); }};
        throw std::runtime_error("the caller's");
    } catch (const std::runtime_error&) {
        EXPECT_THAT(identifiersOf(outcome.instances()), ElementsAre("A"));
    }
    EXPECT_THAT(outcome, isOk(1));
    EXPECT_EQ(data(), dataOfNew({"A"}));
}

INSTANTIATE_RECORD_TEST(ExceptionTest);

}  // namespace
}  // namespace contract
