#include "BrokerFixture.h"
#include "model/ResultEvent.h"

namespace {

using cimhost::ErrorInfo;
using cimhost::eventsOf;
using cimhost::Instance;
using cimhost::ObjectPath;
using cimhost::resultOf;
using cimhost::Value;

class ResultTest : public BrokerTest {
protected:
    cimhost::ResultEvents events;
    const CMPIResult* result = scope->result(events);

    CMPIError* newError() {
        return make().newCMPIError(handle(), "Owner", "ID1", "It broke", ErrorSevHigh, ErrorProbCauseOther,
                                   CMPI_RC_ERR_NOT_FOUND, &status);
    }
};

TEST_F(ResultTest, CollectsEverythingInOrder) {
    result->ft->returnObjectPath(result, newPath("P"));
    result->ft->returnInstance(result, newInstance("I"));
    const CMPIValue value = uint32Value(7);
    result->ft->returnData(result, &value, CMPI_uint32);
    result->ft->returnError(result, newError());
    result->ft->returnDone(result);
    result->ft->returnDone(result);
    ASSERT_EQ(events.size(), 6U);
    EXPECT_EQ(cimhost::resultOf<ObjectPath>(events[0])->className, "P");
    EXPECT_EQ(resultOf<Instance>(events[1])->path.className, "I");
    EXPECT_EQ(std::get<std::uint32_t>(std::get<Value>(events[2]).single), 7U);
    EXPECT_EQ(resultOf<ErrorInfo>(events[3])->message, "It broke");
    EXPECT_EQ(cimhost::doneCount(events), 2);
}

TEST_F(ResultTest, CopiesResultsWhenTheyAreReturned) {
    CMPIInstance* instance = newInstance();
    instance->ft->setProperty(instance, "P", charsValue("before"), CMPI_chars);
    result->ft->returnInstance(result, instance);
    instance->ft->setProperty(instance, "P", charsValue("after"), CMPI_chars);
    instance->ft->release(instance);
    scope.reset();
    const auto returned = eventsOf<Instance>(events);
    ASSERT_EQ(returned.size(), 1U);
    EXPECT_EQ(testsupport::stringOf(returned.front().properties, "P"), "before");
}

TEST_F(ResultTest, RejectsInvalidObjects) {
    EXPECT_EQ(result->ft->returnInstance(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(result->ft->returnObjectPath(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(result->ft->returnError(result, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    const CMPIValue value{};
    EXPECT_EQ(result->ft->returnData(result, &value, CMPI_filter).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(events.size(), 3U);
    EXPECT_EQ(eventsOf<cimhost::NullResult>(events).size(), 3U) << "each null pointer is recorded, nothing is returned";
}

TEST_F(ResultTest, CannotBeCloned) {
    EXPECT_EQ(result->ft->clone(result, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(ResultTest, AnErrorHasItsAttributes) {
    CMPIError* error = newError();
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(characters(error->ft->getOwningEntity(error, nullptr)), "Owner");
    EXPECT_EQ(characters(error->ft->getMessageID(error, nullptr)), "ID1");
    EXPECT_EQ(characters(error->ft->getMessage(error, nullptr)), "It broke");
    EXPECT_EQ(error->ft->getPerceivedSeverity(error, nullptr), ErrorSevHigh);
    EXPECT_EQ(error->ft->getProbableCause(error, nullptr), ErrorProbCauseOther);
    EXPECT_EQ(error->ft->getCIMStatusCode(error, nullptr), CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(error->ft->getErrorSource(error, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(ResultTest, AttributesOfAnErrorCanBeSet) {
    CMPIError* error = newError();
    error->ft->setErrorType(error, SoftwareError);
    error->ft->setErrorSource(error, "there");
    error->ft->setErrorSourceFormat(error, CIMObjectHandle);
    CMPIArray* actions = make().newArray(handle(), 1, CMPI_string, nullptr);
    actions->ft->setElementAt(actions, 0, charsValue("retry"), CMPI_chars);
    EXPECT_EQ(error->ft->setRecommendedActions(error, actions).rc, CMPI_RC_OK);
    EXPECT_EQ(error->ft->getErrorType(error, nullptr), SoftwareError);
    EXPECT_EQ(characters(error->ft->getErrorSource(error, nullptr)), "there");
    EXPECT_EQ(error->ft->getErrorSourceFormat(error, nullptr), CIMObjectHandle);
    const CMPIArray* kept = error->ft->getRecommendedActions(error, nullptr);
    EXPECT_EQ(characters(kept->ft->getElementAt(kept, 0, nullptr).value.string), "retry");
    error->ft->setErrorSource(error, nullptr);
    EXPECT_EQ(error->ft->getErrorSource(error, nullptr), nullptr);
    CMPIArray* numbers = make().newArray(handle(), 1, CMPI_uint32, nullptr);
    EXPECT_EQ(error->ft->setMessageArguments(error, numbers).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

}  // namespace
