#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>
#include <thread>

#include "broker/RequestScope.h"
#include "support/RecordingBroker.h"
#include "support/Values.h"

namespace {

using testing::ElementsAre;
using testsupport::Manager;
using testsupport::RecordingBroker;

class RecordingBrokerTest : public testing::Test {
protected:
    const CMPIBroker* handle() const { return recorder.handle(); }
    CMPIObjectPath* newPath() { return handle()->eft->newObjectPath(handle(), "root/cimv2", "Thing", &status); }

    static const CMPIValue* chars(const char* text) { return reinterpret_cast<const CMPIValue*>(text); }

    RecordingBroker recorder;
    cimhost::RequestScope scope{recorder.broker()};
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
};

TEST_F(RecordingBrokerTest, RecordsCallsInOrderWithTheirArguments) {
    CMPIObjectPath* path = newPath();
    path->ft->addKey(path, "Name", chars("x"), CMPI_chars);
    CMPIInstance* instance = handle()->eft->newInstance(handle(), path, &status);
    instance->ft->setProperty(instance, "Nothing", nullptr, CMPI_uint32);
    const auto calls = recorder.calls();
    ASSERT_EQ(calls.size(), 4U);
    EXPECT_EQ(calls[0].function, "CMPIBrokerEncFT.newObjectPath");
    EXPECT_THAT(calls[0].arguments, ElementsAre("root/cimv2", "Thing"));
    EXPECT_EQ(calls[1].function, "CMPIObjectPathFT.addKey");
    EXPECT_THAT(calls[1].arguments, ElementsAre("Name", "\"x\"", std::to_string(CMPI_chars)));
    EXPECT_EQ(calls[2].function, "CMPIBrokerEncFT.newInstance");
    EXPECT_THAT(calls[2].arguments, ElementsAre("root/cimv2:Thing.Name=\"x\""));
    EXPECT_THAT(calls[3].arguments, ElementsAre("Nothing", "NULL", std::to_string(CMPI_uint32)));
}

TEST_F(RecordingBrokerTest, RecordsNullArgumentsAndPropertyLists) {
    const char* list[] = {"A", "B", nullptr};
    handle()->bft->enumerateInstances(handle(), nullptr, newPath(), list, &status);
    handle()->bft->enumerateInstances(handle(), nullptr, nullptr, nullptr, &status);
    const auto calls = recorder.calls("CMPIBrokerFT.enumerateInstances");
    EXPECT_THAT(calls[0].arguments, ElementsAre("root/cimv2:Thing", "{A,B}"));
    EXPECT_THAT(calls[1].arguments, ElementsAre("null", "null"));
}

TEST_F(RecordingBrokerTest, RecordsObjectsThatAreReturned) {
    cimhost::ResultEvents events;
    const CMPIResult* result = scope.result(events);
    result->ft->returnObjectPath(result, newPath());
    result->ft->returnDone(result);
    EXPECT_THAT(recorder.functions(), ElementsAre("CMPIBrokerEncFT.newObjectPath", "CMPIResultFT.returnObjectPath",
                                                  "CMPIResultFT.returnDone"));
    EXPECT_THAT(recorder.calls("CMPIResultFT.returnObjectPath").front().arguments, ElementsAre("root/cimv2:Thing"));
    EXPECT_EQ(cimhost::doneCount(events), 1);
}

TEST_F(RecordingBrokerTest, RemovesRecordedCalls) {
    newPath();
    recorder.forget();
    EXPECT_EQ(recorder.count("CMPIBrokerEncFT.newObjectPath"), 0);
}

TEST_F(RecordingBrokerTest, FailsTheChosenCall) {
    newPath();
    recorder.failCall("CMPIBrokerEncFT.newObjectPath", 2, CMPI_RC_ERR_FAILED);
    EXPECT_NE(newPath(), nullptr);
    EXPECT_EQ(newPath(), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_NE(newPath(), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(recorder.count("CMPIBrokerEncFT.newObjectPath"), 4) << "the failed call is recorded too";
}

TEST_F(RecordingBrokerTest, FailsEveryCallUntilItIsReset) {
    recorder.failEvery("CMPIResultFT.returnDone", CMPI_RC_ERR_INVALID_HANDLE);
    cimhost::ResultEvents events;
    const CMPIResult* result = scope.result(events);
    EXPECT_EQ(result->ft->returnDone(result).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_EQ(result->ft->returnDone(result).rc, CMPI_RC_ERR_INVALID_HANDLE);
    EXPECT_TRUE(events.empty());
    recorder.cancelFailures();
    EXPECT_EQ(result->ft->returnDone(result).rc, CMPI_RC_OK);
}

TEST_F(RecordingBrokerTest, FailingGettersReturnZeroOrABadValue) {
    const CMPIObjectPath* path = newPath();
    recorder.failEvery("CMPIObjectPathFT.getKeyCount", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(path->ft->getKeyCount(path, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    recorder.failEvery("CMPIObjectPathFT.getKeyAt", CMPI_RC_ERR_FAILED);
    EXPECT_EQ(path->ft->getKeyAt(path, 0, nullptr, &status).state, CMPI_badValue);
}

TEST_F(RecordingBrokerTest, ReturnsNullWithoutAnErrorOnRequest) {
    const CMPIObjectPath* path = newPath();
    recorder.answerNothing("CMPIObjectPathFT.getNameSpace", 1);
    EXPECT_EQ(path->ft->getNameSpace(path, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_NE(path->ft->getNameSpace(path, &status), nullptr);
    recorder.answerNothingEver("CMPIBrokerEncFT.newString");
    EXPECT_EQ(handle()->eft->newString(handle(), "x", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(RecordingBrokerTest, MakesStringsWithoutCharacters) {
    const CMPIString* none = recorder.stringWithoutCharacters();
    EXPECT_EQ(none->ft->getCharPtr(none, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    const CMPIString* some = recorder.string("some");
    EXPECT_STREQ(some->ft->getCharPtr(some, &status), "some");
}

TEST_F(RecordingBrokerTest, ReturnsTheInjectedKey) {
    CMPIData data{};
    data.type = CMPI_uint64;
    data.state = CMPI_keyValue;
    data.value.uint64 = 12;
    recorder.answerData("CMPIObjectPathFT.getKey", "InstanceID", data);
    CMPIObjectPath* path = newPath();
    path->ft->addKey(path, "Other", chars("real"), CMPI_chars);
    EXPECT_EQ(path->ft->getKey(path, "INSTANCEID", &status).value.uint64, 12U);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(path->ft->getKey(path, "Other", &status).type, CMPI_string);
    data.state = CMPI_badValue;
    recorder.answerData("CMPIObjectPathFT.getKey", "InstanceID", data, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(path->ft->getKey(path, "InstanceID", &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(RecordingBrokerTest, ReturnsTheInjectedStateFromEachFunction) {
    CMPIObjectPath* path = newPath();
    path->ft->addKey(path, "K", chars("v"), CMPI_chars);
    CMPIInstance* instance = handle()->eft->newInstance(handle(), path, nullptr);
    instance->ft->setProperty(instance, "P", chars("v"), CMPI_chars);
    recorder.serve("Computer", {testsupport::instance(testsupport::objectPath("root/cimv2", "Computer"))});
    const CMPIObjectPath* computers = handle()->eft->newObjectPath(handle(), "root/cimv2", "Computer", nullptr);
    for (const int state : {CMPI_goodValue, CMPI_nullValue, CMPI_keyValue, CMPI_notFound, CMPI_badValue}) {
        const auto ordered = static_cast<CMPIValueState>(state);
        for (const char* function :
             {"CMPIObjectPathFT.getKey", "CMPIObjectPathFT.getKeyAt", "CMPIInstanceFT.getProperty",
              "CMPIInstanceFT.getPropertyAt", "CMPIEnumerationFT.getNext"}) {
            recorder.answerState(function, ordered);
        }
        EXPECT_EQ(path->ft->getKey(path, "K", &status).state, ordered);
        EXPECT_EQ(path->ft->getKeyAt(path, 0, nullptr, &status).state, ordered);
        EXPECT_EQ(instance->ft->getProperty(instance, "P", &status).state, ordered);
        EXPECT_EQ(instance->ft->getPropertyAt(instance, 0, nullptr, &status).state, ordered);
        const CMPIEnumeration* found =
            handle()->bft->enumerateInstances(handle(), nullptr, computers, nullptr, &status);
        const CMPIData element = found->ft->getNext(found, &status);
        EXPECT_EQ(element.state, ordered);
        EXPECT_NE(element.value.inst, nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
    }
    recorder.cancelFailures();
    EXPECT_EQ(path->ft->getKeyAt(path, 0, nullptr, &status).state, CMPI_keyValue);
}

TEST_F(RecordingBrokerTest, ShowsTheNullPointersThatAProviderReturns) {
    cimhost::ResultEvents events;
    const CMPIResult* result = scope.result(events);
    EXPECT_EQ(result->ft->returnInstance(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(result->ft->returnObjectPath(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    ASSERT_EQ(events.size(), 2U);
    EXPECT_TRUE(std::holds_alternative<cimhost::NullResult>(events.front()));
    EXPECT_TRUE(std::holds_alternative<cimhost::NullResult>(events.back()));
}

TEST_F(RecordingBrokerTest, RejectsUnknownFunctionNames) {
    EXPECT_THROW(recorder.failEvery("CMPIStringFT.getChars", CMPI_RC_ERR_FAILED), std::invalid_argument);
    EXPECT_THROW(recorder.count("getCharPtr"), std::invalid_argument);
}

TEST_F(RecordingBrokerTest, ServesInstances) {
    recorder.serve("Computer", {testsupport::instance(testsupport::objectPath("root/cimv2", "Computer")),
                                testsupport::instance(testsupport::objectPath("root/cimv2", "Special"))});
    const CMPIObjectPath* path = handle()->eft->newObjectPath(handle(), "root/cimv2", "COMPUTER", nullptr);
    const CMPIEnumeration* found = handle()->bft->enumerateInstances(handle(), nullptr, path, nullptr, &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    recorder.failCall("CMPIEnumerationFT.getNext", 2, CMPI_RC_ERR_FAILED);
    EXPECT_NE(found->ft->getNext(found, &status).value.inst, nullptr);
    found->ft->getNext(found, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    const CMPIEnumeration* names = handle()->bft->enumerateInstanceNames(handle(), nullptr, path, &status);
    EXPECT_EQ(names->ft->getNext(names, nullptr).type, CMPI_ref);
    recorder.failEnumeration("Computer", CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(handle()->bft->enumerateInstances(handle(), nullptr, path, nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
    handle()->bft->enumerateInstances(handle(), nullptr, newPath(), nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
}

TEST_F(RecordingBrokerTest, EmulatesTheTablesOfSfcb) {
    recorder.emulate(Manager::sfcb);
    EXPECT_EQ(handle()->bft->brokerVersion, 0U);
    EXPECT_EQ(handle()->eft->ftVersion, 1);
    EXPECT_EQ(handle()->eft->newCMPIError, nullptr);
    EXPECT_EQ(handle()->eft->openMessageFile, nullptr);
    EXPECT_EQ(handle()->eft->closeMessageFile, nullptr);
    EXPECT_EQ(handle()->eft->getMessage2, nullptr);
    EXPECT_NE(handle()->mft->mark, nullptr);
    EXPECT_EQ(handle()->mft->cmpiMalloc, nullptr);
    EXPECT_NE(newPath(), nullptr);
}

TEST_F(RecordingBrokerTest, EmulatesTheTablesOfOpenPegasus) {
    recorder.emulate(Manager::openPegasus);
    EXPECT_EQ(handle()->mft, nullptr);
    EXPECT_EQ(handle()->bft->brokerVersion, 200U);
}

TEST_F(RecordingBrokerTest, EmulatingRecordsNoCalls) {
    recorder.emulate(Manager::sfcb);
    EXPECT_EQ(handle()->bft->brokerVersion, 0U);
    EXPECT_TRUE(recorder.calls().empty());
}

TEST_F(RecordingBrokerTest, ChecksPropertiesOfKnownClasses) {
    recorder.know([](const std::string& name) {
        auto info = std::make_shared<cimhost::ClassInfo>();
        info->name = name;
        info->properties = {{"Size", CMPI_uint32, false, false, {}}};
        return info;
    });
    CMPIInstance* instance = handle()->eft->newInstance(handle(), newPath(), &status);
    EXPECT_EQ(instance->ft->setProperty(instance, "Length", chars("x"), CMPI_chars).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(RecordingBrokerTest, RecordsMessages) {
    const CMPIString* message =
        handle()->eft->getMessage(handle(), "id", "number $0", &status, 1, CMPI_uint32, CMPIUint32{7});
    EXPECT_STREQ(message->ft->getCharPtr(message, nullptr), "number 7");
    EXPECT_THAT(recorder.calls("CMPIBrokerEncFT.getMessage").front().arguments, ElementsAre("id", "number $0", "1"));
    recorder.failEvery("CMPIBrokerEncFT.getMessage2", CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(handle()->eft->getMessage2(handle(), "id", nullptr, "text", &status, 0), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(RecordingBrokerTest, BrokersAreIndependent) {
    RecordingBroker other;
    CMPIObjectPath* mine = newPath();
    const CMPIObjectPath* theirs = other.handle()->eft->newObjectPath(other.handle(), "root", "Other", nullptr);
    mine->ft->setClassName(mine, "Renamed");
    theirs->ft->getClassName(theirs, nullptr);
    EXPECT_THAT(recorder.functions(), ElementsAre("CMPIBrokerEncFT.newObjectPath", "CMPIObjectPathFT.setClassName"));
    EXPECT_THAT(other.functions(), ElementsAre("CMPIBrokerEncFT.newObjectPath", "CMPIObjectPathFT.getClassName"));
}

TEST_F(RecordingBrokerTest, CreationOfObjectsForFailuresIsNotRecorded) {
    recorder.objectPath(testsupport::objectPath("root", "X"));
    recorder.instance(testsupport::instance(testsupport::objectPath("root", "X")));
    recorder.string("x");
    EXPECT_TRUE(recorder.calls().empty());
}

TEST_F(RecordingBrokerTest, RecordsFromSeveralThreads) {
    const auto work = [this] {
        for (int i = 0; i < 100; ++i) {
            const cimhost::RequestScope request(recorder.broker());
            handle()->eft->newString(handle(), "x", nullptr);
        }
    };
    std::thread first(work);
    std::thread second(work);
    first.join();
    second.join();
    EXPECT_EQ(recorder.count("CMPIBrokerEncFT.newString"), 200);
}

}  // namespace
