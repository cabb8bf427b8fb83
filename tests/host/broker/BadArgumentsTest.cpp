#include <algorithm>
#include <array>
#include <cstring>

#include "BrokerFixture.h"
#include "broker/FunctionTables.h"

// The broker returns a status for any argument, and does not crash.

namespace {

/** Whether all functions of a table are set. The version numbers before them have the size of one pointer. */
template <class Table>
bool isFilled(const Table& table) {
    std::array<const void*, sizeof(Table) / sizeof(void*)> words{};
    static_assert(sizeof words == sizeof table);
    std::memcpy(words.data(), &table, sizeof table);
    return std::find(words.begin() + 1, words.end(), nullptr) == words.end();
}

TEST(FunctionTablesTest, HaveNoNullFunctions) {
    const cimhost::FunctionTables& tables = cimhost::standardTables();
    EXPECT_TRUE(isFilled(tables.broker));
    EXPECT_TRUE(isFilled(tables.encapsulation));
    EXPECT_TRUE(isFilled(tables.threads));
    EXPECT_TRUE(isFilled(tables.memory));
    EXPECT_TRUE(isFilled(tables.string));
    EXPECT_TRUE(isFilled(tables.objectPath));
    EXPECT_TRUE(isFilled(tables.instance));
    EXPECT_TRUE(isFilled(tables.dateTime));
    EXPECT_TRUE(isFilled(tables.array));
    EXPECT_TRUE(isFilled(tables.enumeration));
    EXPECT_TRUE(isFilled(tables.args));
    EXPECT_TRUE(isFilled(tables.context));
    EXPECT_TRUE(isFilled(tables.result));
    EXPECT_TRUE(isFilled(tables.error));
}

/** A null argument; for a status parameter, a status. */
template <class Argument>
Argument nothing(CMPIStatus& status) {
    if constexpr (std::is_same_v<Argument, CMPIStatus*>) {
        return &status;
    } else {
        return Argument{};
    }
}

/** Calls a function of an object with null arguments. @return its status */
template <class Result, class First, class... Others>
CMPIrc rcOn(Result (*function)(First, Others...), std::decay_t<First> first) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    if constexpr (std::is_same_v<Result, CMPIStatus>) {
        return function(first, nothing<Others>(status)...).rc;
    } else {
        function(first, nothing<Others>(status)...);
        return status.rc;
    }
}

/** The statuses of functions of one object, in order. */
template <class Handle, class... Functions>
std::vector<CMPIrc> statusesOn(Handle* object, Functions... functions) {
    return {rcOn(functions, object)...};
}

template <class Handle, class... Functions>
void expectNullRefused(Functions... functions) {
    Handle empty{};
    Handle* const none = nullptr;
    EXPECT_THAT(statusesOn(none, functions...), testing::Each(CMPI_RC_ERR_INVALID_HANDLE));
    EXPECT_THAT(statusesOn(&empty, functions...), testing::Each(CMPI_RC_ERR_INVALID_HANDLE));
}

template <class Handle, class... Functions>
void expectNothingRefused(Handle* object, Functions... functions) {
    EXPECT_THAT(statusesOn(object, functions...), testing::Each(testing::Ne(CMPI_RC_OK)));
}

class BadArgumentsTest : public BrokerTest {
protected:
    const cimhost::FunctionTables& tables = cimhost::standardTables();
};

TEST_F(BadArgumentsTest, ANullObjectIsAnInvalidHandle) {
    const auto& s = tables.string;
    expectNullRefused<CMPIString>(s.release, s.clone, s.getCharPtr);
    const auto& p = tables.objectPath;
    expectNullRefused<CMPIObjectPath>(p.release, p.clone, p.setNameSpace, p.getNameSpace, p.setHostname, p.getHostname,
                                      p.setClassName, p.getClassName, p.addKey, p.getKey, p.getKeyAt, p.getKeyCount,
                                      p.setNameSpaceFromObjectPath, p.setHostAndNameSpaceFromObjectPath,
                                      p.getClassQualifier, p.getPropertyQualifier, p.getMethodQualifier,
                                      p.getParameterQualifier, p.toString);
    const auto& i = tables.instance;
    expectNullRefused<CMPIInstance>(i.release, i.clone, i.getProperty, i.getPropertyAt, i.getPropertyCount,
                                    i.setProperty, i.getObjectPath, i.setPropertyFilter, i.setObjectPath,
                                    i.setPropertyWithOrigin);
    const auto& d = tables.dateTime;
    expectNullRefused<CMPIDateTime>(d.release, d.clone, d.getBinaryFormat, d.getStringFormat, d.isInterval);
    const auto& a = tables.array;
    expectNullRefused<CMPIArray>(a.release, a.clone, a.getSize, a.getSimpleType, a.getElementAt, a.setElementAt);
    const auto& e = tables.enumeration;
    expectNullRefused<CMPIEnumeration>(e.release, e.clone, e.getNext, e.hasNext, e.toArray);
    const auto& g = tables.args;
    expectNullRefused<CMPIArgs>(g.release, g.clone, g.addArg, g.getArg, g.getArgAt, g.getArgCount);
    const auto& c = tables.context;
    expectNullRefused<CMPIContext>(c.release, c.clone, c.getEntry, c.getEntryAt, c.getEntryCount, c.addEntry);
    const auto& r = tables.result;
    expectNullRefused<CMPIResult>(r.release, r.clone, r.returnData, r.returnInstance, r.returnObjectPath, r.returnDone,
                                  r.returnError);
}

TEST_F(BadArgumentsTest, ANullErrorObjectIsAnInvalidHandle) {
    const auto& e = tables.error;
    expectNullRefused<CMPIError>(
        e.release, e.clone, e.getErrorType, e.getOtherErrorType, e.getOwningEntity, e.getMessageID, e.getMessage,
        e.getPerceivedSeverity, e.getProbableCause, e.getProbableCauseDescription, e.getRecommendedActions,
        e.getErrorSource, e.getErrorSourceFormat, e.getOtherErrorSourceFormat, e.getCIMStatusCode,
        e.getCIMStatusCodeDescription, e.getMessageArguments, e.setErrorType, e.setOtherErrorType,
        e.setProbableCauseDescription, e.setRecommendedActions, e.setErrorSource, e.setErrorSourceFormat,
        e.setOtherErrorSourceFormat, e.setCIMStatusCodeDescription, e.setMessageArguments);
}

TEST_F(BadArgumentsTest, ANullBrokerIsAnInvalidHandle) {
    const auto& b = tables.broker;
    expectNullRefused<CMPIBroker>(b.attachThread, b.detachThread, b.deliverIndication, b.enumerateInstanceNames,
                                  b.getInstance, b.createInstance, b.modifyInstance, b.deleteInstance, b.execQuery,
                                  b.enumerateInstances, b.associators, b.associatorNames, b.references,
                                  b.referenceNames, b.invokeMethod, b.setProperty, b.getProperty);
    EXPECT_EQ(b.prepareAttachThread(nullptr, nullptr), nullptr);
    const auto& e = tables.encapsulation;
    expectNullRefused<CMPIBroker>(e.newInstance, e.newObjectPath, e.newArgs, e.newString, e.newArray, e.newDateTime,
                                  e.newDateTimeFromBinary, e.newDateTimeFromChars, e.newSelectExp, e.classPathIsA,
                                  e.toString, e.isOfType, e.getType, e.logMessage, e.trace, e.newCMPIError,
                                  e.openMessageFile, e.closeMessageFile);
    EXPECT_EQ(e.getMessage(nullptr, "id", "text", &status, 0), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    const auto& m = tables.memory;
    expectNullRefused<CMPIBroker>(m.mark, m.release);
    EXPECT_EQ(m.cmpiMalloc(nullptr, 1), nullptr);
    EXPECT_EQ(m.cmpiStrDup(nullptr, "text"), nullptr);
    m.cmpiFree(nullptr, nullptr);
    m.freeString(nullptr, nullptr);
    m.freeSelectExp(nullptr, nullptr);
}

TEST_F(BadArgumentsTest, ObjectsRejectNullArguments) {
    const auto& p = tables.objectPath;
    expectNothingRefused(newPath(), p.setNameSpace, p.setHostname, p.setClassName, p.addKey, p.getKey, p.getKeyAt,
                         p.setNameSpaceFromObjectPath, p.setHostAndNameSpaceFromObjectPath);
    const auto& i = tables.instance;
    expectNothingRefused(newInstance(), i.getProperty, i.getPropertyAt, i.setProperty, i.setObjectPath,
                         i.setPropertyWithOrigin);
    expectNothingRefused(make().newArgs(handle(), nullptr), tables.args.addArg, tables.args.getArg);
    expectNothingRefused(scope->context({}), tables.context.addEntry, tables.context.getEntry);
}

TEST_F(BadArgumentsTest, TheBrokerRejectsNullArguments) {
    const auto& b = tables.broker;
    expectNothingRefused(handle(), b.attachThread, b.detachThread, b.deliverIndication, b.enumerateInstanceNames,
                         b.getInstance, b.createInstance, b.modifyInstance, b.deleteInstance, b.execQuery,
                         b.enumerateInstances, b.associators, b.associatorNames, b.references, b.referenceNames,
                         b.invokeMethod, b.setProperty, b.getProperty);
    const auto& e = tables.encapsulation;
    expectNothingRefused(handle(), e.newInstance, e.newObjectPath, e.newString, e.newArray, e.newDateTimeFromChars,
                         e.newSelectExp, e.classPathIsA, e.toString, e.isOfType, e.getType, e.openMessageFile);
}

TEST_F(BadArgumentsTest, ThreadFunctionsRejectNullArguments) {
    const auto& x = tables.threads;
    EXPECT_EQ(x.resolveFileName(nullptr), nullptr);
    EXPECT_EQ(x.newThread(nullptr, nullptr, 0), nullptr);
    EXPECT_NE(x.joinThread(nullptr, nullptr), 0);
    EXPECT_NE(x.cancelThread(nullptr), 0);
    EXPECT_NE(x.threadOnce(nullptr, nullptr), 0);
    EXPECT_NE(x.createThreadKey(nullptr, nullptr), 0);
    x.destroyMutex(nullptr);
    x.lockMutex(nullptr);
    x.unlockMutex(nullptr);
    x.destroyCondition(nullptr);
    EXPECT_NE(x.condWait(nullptr, nullptr), 0);
    EXPECT_NE(x.timedCondWait(nullptr, nullptr, nullptr), 0);
    EXPECT_NE(x.signalCondition(nullptr), 0);
}

TEST_F(BadArgumentsTest, AnObjectOfAnotherTypeIsAnInvalidHandle) {
    auto* string = reinterpret_cast<CMPIString*>(newPath());
    tables.string.getCharPtr(string, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(tables.string.release(string).rc, CMPI_RC_ERR_INVALID_HANDLE);
}

TEST_F(BadArgumentsTest, TheStatusPointerMayBeNull) {
    EXPECT_EQ(tables.string.getCharPtr(nullptr, nullptr), nullptr);
    EXPECT_EQ(make().newString(handle(), nullptr, nullptr), nullptr);
    EXPECT_EQ(make().newObjectPath(nullptr, nullptr, nullptr, nullptr), nullptr);
}

}  // namespace
