#include <cmpimacs.h>
#include <gtest/gtest.h>

#include "compat/Recorder.h"

namespace {

CMPIStatus* const rc = recorder::answer<CMPIStatus*>();
const char* const nameSpace = "NameSpace";
const char* const language = "Language";
const char* const owner = "Owner";
const char* const id = "Id";
const char* const message = "Message";
const char* const className = "Class";
const char* const assocClass = "AssocClass";
const char* const role = "Role";
const char* const resultRole = "ResultRole";

/** A broker whose tables are empty except for the slot under test. */
class BrokerMacros : public testing::Test {
protected:
    CMPIBrokerFT services{};
    CMPIBrokerEncFT makers{};
    CMPIBroker brokerObject{nullptr, &services, &makers, nullptr, nullptr};
    const CMPIBroker* broker = &brokerObject;
    const CMPIContext context{};
    const CMPIObjectPath path{};
    const CMPIInstance instance{};
    const char* list[2] = {"A", nullptr};
    const char* name = "Name";
};

TEST_F(BrokerMacros, CreateObjects) {
    EXPECT_CALL_OF(makers.newInstance, CMNewInstance(broker, &path, rc), broker, &path, rc);
    EXPECT_CALL_OF(makers.newObjectPath, CMNewObjectPath(broker, nameSpace, name, rc), broker, nameSpace, name, rc);
    EXPECT_CALL_OF(makers.newArgs, CMNewArgs(broker, rc), broker, rc);
    EXPECT_CALL_OF(makers.newString, CMNewString(broker, name, rc), broker, name, rc);
    EXPECT_CALL_OF(makers.newArray, CMNewArray(broker, 5, CMPI_uint8, rc), broker, 5, CMPI_uint8, rc);
    EXPECT_CALL_OF(makers.newDateTime, CMNewDateTime(broker, rc), broker, rc);
    EXPECT_CALL_OF(makers.newDateTimeFromBinary, CMNewDateTimeFromBinary(broker, 9, 1, rc), broker, 9, 1, rc);
    EXPECT_CALL_OF(makers.newDateTimeFromChars, CMNewDateTimeFromChars(broker, name, rc), broker, name, rc);
    CMPIArray* projection = nullptr;
    EXPECT_CALL_OF(makers.newSelectExp, CMNewSelectExp(broker, name, language, &projection, rc), broker, name, language,
                   &projection, rc);
    EXPECT_CALL_OF(makers.newCMPIError,
                   CMNewCMPIError(broker, owner, id, message, ErrorSevLow, ErrorProbCauseOther, CMPI_RC_ERROR, rc),
                   broker, owner, id, message, ErrorSevLow, ErrorProbCauseOther, CMPI_RC_ERROR, rc);
}

TEST_F(BrokerMacros, ReturnInformationAboutObjects) {
    EXPECT_CALL_OF(makers.toString, CDToString(broker, &path, rc), broker, &path, rc);
    EXPECT_CALL_OF(makers.isOfType, CDIsOfType(broker, &path, name, rc), broker, &path, name, rc);
    EXPECT_CALL_OF(makers.getType, CDGetType(broker, &path, rc), broker, &path, rc);
    EXPECT_CALL_OF(makers.classPathIsA, CMClassPathIsA(broker, &path, name, rc), broker, &path, name, rc);
}

TEST_F(BrokerMacros, LogAndTrace) {
    const CMPIString string{};
    EXPECT_CALL_OF(makers.logMessage, CMLogMessage(broker, CMPI_SEV_INFO, id, name, &string), broker, CMPI_SEV_INFO, id,
                   name, &string);
    EXPECT_CALL_OF(makers.trace, CMTraceMessage(broker, CMPI_LEV_VERBOSE, className, name, &string), broker,
                   CMPI_LEV_VERBOSE, className, name, &string);
}

TEST_F(BrokerMacros, ManageThreads) {
    EXPECT_CALL_OF(services.prepareAttachThread, CBPrepareAttachThread(broker, &context), broker, &context);
    EXPECT_CALL_OF(services.attachThread, CBAttachThread(broker, &context), broker, &context);
    EXPECT_CALL_OF(services.detachThread, CBDetachThread(broker, &context), broker, &context);
}

TEST_F(BrokerMacros, DeliverIndicationsAndInvokeMethods) {
    const CMPIArgs in{};
    CMPIArgs out{};
    EXPECT_CALL_OF(services.deliverIndication, CBDeliverIndication(broker, &context, nameSpace, &instance), broker,
                   &context, nameSpace, &instance);
    EXPECT_CALL_OF(services.invokeMethod, CBInvokeMethod(broker, &context, &path, name, &in, &out, rc), broker,
                   &context, &path, name, &in, &out, rc);
}

TEST_F(BrokerMacros, ReadInstances) {
    EXPECT_CALL_OF(services.enumerateInstanceNames, CBEnumInstanceNames(broker, &context, &path, rc), broker, &context,
                   &path, rc);
    EXPECT_CALL_OF(services.enumerateInstances, CBEnumInstances(broker, &context, &path, list, rc), broker, &context,
                   &path, list, rc);
    EXPECT_CALL_OF(services.getInstance, CBGetInstance(broker, &context, &path, list, rc), broker, &context, &path,
                   list, rc);
    EXPECT_CALL_OF(services.execQuery, CBExecQuery(broker, &context, &path, name, language, rc), broker, &context,
                   &path, name, language, rc);
    EXPECT_CALL_OF(services.getProperty, CBGetProperty(broker, &context, &path, name, rc), broker, &context, &path,
                   name, rc);
}

TEST_F(BrokerMacros, WriteInstances) {
    EXPECT_CALL_OF(services.createInstance, CBCreateInstance(broker, &context, &path, &instance, rc), broker, &context,
                   &path, &instance, rc);
    EXPECT_CALL_OF(services.modifyInstance, CBModifyInstance(broker, &context, &path, &instance, list), broker,
                   &context, &path, &instance, list);
    EXPECT_CALL_OF(services.deleteInstance, CBDeleteInstance(broker, &context, &path), broker, &context, &path);
    EXPECT_CALL_OF(services.setProperty, CBSetProperty(broker, &context, &path, name, message, CMPI_chars), broker,
                   &context, &path, name, message, CMPI_chars);
}

TEST_F(BrokerMacros, FollowAssociations) {
    EXPECT_CALL_OF(services.associators,
                   CBAssociators(broker, &context, &path, assocClass, className, role, resultRole, list, rc), broker,
                   &context, &path, assocClass, className, role, resultRole, list, rc);
    EXPECT_CALL_OF(services.associatorNames,
                   CBAssociatorNames(broker, &context, &path, assocClass, className, role, resultRole, rc), broker,
                   &context, &path, assocClass, className, role, resultRole, rc);
    EXPECT_CALL_OF(services.references, CBReferences(broker, &context, &path, className, role, list, rc), broker,
                   &context, &path, className, role, list, rc);
    EXPECT_CALL_OF(services.referenceNames, CBReferenceNames(broker, &context, &path, className, role, rc), broker,
                   &context, &path, className, role, rc);
}

CMPIStatus returned(CMPIrc code) {
    CMReturn(code);
}

CMPIStatus returnedWithString(CMPIrc code, CMPIString* string) {
    CMReturnWithString(code, string);
}

CMPIStatus returnedWithChars(const CMPIBroker* broker, CMPIrc code, const char* characters) {
    CMReturnWithChars(broker, code, characters);
}

TEST_F(BrokerMacros, ReturnAStatus) {
    CMPIString string{};
    EXPECT_EQ(recorder::words(returned(CMPI_RC_ERR_FAILED)), recorder::words(CMPI_RC_ERR_FAILED, 0));
    EXPECT_EQ(recorder::words(returnedWithString(CMPI_RC_ERROR, &string)), recorder::words(CMPI_RC_ERROR, &string));

    CMPIStatus status{};
    const auto made = [&] {
        status = returnedWithChars(broker, CMPI_RC_ERR_NOT_FOUND, name);
        return status.msg;
    };
    EXPECT_EQ(recorder::callsOf(makers.newString, made),
              recorder::words(broker, name, static_cast<CMPIStatus*>(nullptr)));
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(BrokerMacros, SetAStatus) {
    CMPIString string{};
    CMPIStatus status{CMPI_RC_OK, &string};
    CMSetStatus(&status, CMPI_RC_ERROR);
    EXPECT_EQ(recorder::words(status), recorder::words(CMPI_RC_ERROR, 0));
    CMSetStatusWithString(&status, CMPI_RC_ERR_FAILED, &string);
    EXPECT_EQ(recorder::words(status), recorder::words(CMPI_RC_ERR_FAILED, &string));

    const auto made = [&] {
        CMSetStatusWithChars(broker, &status, CMPI_RC_ERR_NOT_FOUND, name);
        return status.msg;
    };
    EXPECT_EQ(recorder::callsOf(makers.newString, made),
              recorder::words(broker, name, static_cast<CMPIStatus*>(nullptr)));
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(BrokerMacros, IgnoreANullStatus) {
    CMPIStatus* const noStatus = nullptr;
    recorder::calls.clear();
    makers.newString = recorder::record<CMPIString*, const CMPIBroker*, const char*, CMPIStatus*>;
    CMSetStatus(noStatus, CMPI_RC_ERROR);
    CMSetStatusWithChars(broker, noStatus, CMPI_RC_ERROR, name);
    EXPECT_TRUE(recorder::calls.empty());
}

}  // namespace
