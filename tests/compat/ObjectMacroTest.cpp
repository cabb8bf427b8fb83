#include <cmpimacs.h>
#include <gtest/gtest.h>

#include "compat/Recorder.h"

namespace {

CMPIStatus* const rc = recorder::answer<CMPIStatus*>();
const char* const name = "Name";
const char* const other = "Other";
const char* const third = "Third";
const CMPICount index = 3;
CMPIString** const out = recorder::answer<CMPIString**>();

/** An object whose table is empty except for the slot under test. */
template <class Object, class Table>
struct Empty {
    Table table{};
    Object object{nullptr, &table};
};

TEST(ContextMacros, CallTheContext) {
    Empty<CMPIContext, CMPIContextFT> made;
    auto& table = made.table;
    auto& object = made.object;
    CMPIValue value{};
    EXPECT_CALL_OF(table.getEntry, CMGetContextEntry(&object, name, rc), &object, name, rc);
    EXPECT_CALL_OF(table.getEntryAt, CMGetContextEntryAt(&object, index, out, rc), &object, index, out, rc);
    EXPECT_CALL_OF(table.getEntryCount, CMGetContextEntryCount(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.addEntry, CMAddContextEntry(&object, name, &value, CMPI_sint8), &object, name, &value,
                   CMPI_sint8);
}

TEST(ResultMacros, CallTheResult) {
    Empty<CMPIResult, CMPIResultFT> made;
    auto& table = made.table;
    auto& object = made.object;
    CMPIUint32 number = 7;
    const CMPIInstance instance{};
    const CMPIObjectPath path{};
    const CMPIError error{};
    EXPECT_CALL_OF(table.returnData, CMReturnData(&object, &number, CMPI_uint32), &object, &number, CMPI_uint32);
    EXPECT_CALL_OF(table.returnInstance, CMReturnInstance(&object, &instance), &object, &instance);
    EXPECT_CALL_OF(table.returnObjectPath, CMReturnObjectPath(&object, &path), &object, &path);
    EXPECT_CALL_OF(table.returnDone, CMReturnDone(&object), &object);
    EXPECT_CALL_OF(table.returnError, CMReturnError(&object, &error), &object, &error);
}

TEST(InstanceMacros, CallTheInstance) {
    Empty<CMPIInstance, CMPIInstanceFT> made;
    auto& table = made.table;
    auto& object = made.object;
    const CMPIObjectPath path{};
    const char* list[] = {"A", nullptr};
    EXPECT_CALL_OF(table.getProperty, CMGetProperty(&object, name, rc), &object, name, rc);
    EXPECT_CALL_OF(table.getPropertyAt, CMGetPropertyAt(&object, index, out, rc), &object, index, out, rc);
    EXPECT_CALL_OF(table.getPropertyCount, CMGetPropertyCount(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.setProperty, CMSetProperty(&object, name, other, CMPI_chars), &object, name, other,
                   CMPI_chars);
    EXPECT_CALL_OF(table.setPropertyWithOrigin, CMSetPropertyWithOrigin(&object, name, other, CMPI_chars, third),
                   &object, name, other, CMPI_chars, third);
    EXPECT_CALL_OF(table.setPropertyFilter, CMSetPropertyFilter(&object, list, nullptr), &object, list,
                   static_cast<const char**>(nullptr));
    EXPECT_CALL_OF(table.getObjectPath, CMGetObjectPath(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.setObjectPath, CMSetObjectPath(&object, &path), &object, &path);
}

TEST(ObjectPathMacros, CallThePathForItsParts) {
    Empty<CMPIObjectPath, CMPIObjectPathFT> made;
    auto& table = made.table;
    auto& object = made.object;
    const CMPIObjectPath source{};
    EXPECT_CALL_OF(table.setNameSpace, CMSetNameSpace(&object, name), &object, name);
    EXPECT_CALL_OF(table.getNameSpace, CMGetNameSpace(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.setHostname, CMSetHostname(&object, name), &object, name);
    EXPECT_CALL_OF(table.getHostname, CMGetHostname(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.setClassName, CMSetClassName(&object, name), &object, name);
    EXPECT_CALL_OF(table.getClassName, CMGetClassName(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.setNameSpaceFromObjectPath, CMSetNameSpaceFromObjectPath(&object, &source), &object, &source);
    EXPECT_CALL_OF(table.setHostAndNameSpaceFromObjectPath, CMSetHostAndNameSpaceFromObjectPath(&object, &source),
                   &object, &source);
    EXPECT_CALL_OF(table.toString, CMObjectPathToString(&object, rc), &object, rc);
}

TEST(ObjectPathMacros, CallThePathForKeysAndQualifiers) {
    Empty<CMPIObjectPath, CMPIObjectPathFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.addKey, CMAddKey(&object, name, other, CMPI_chars), &object, name, other, CMPI_chars);
    EXPECT_CALL_OF(table.getKey, CMGetKey(&object, name, rc), &object, name, rc);
    EXPECT_CALL_OF(table.getKeyAt, CMGetKeyAt(&object, index, out, rc), &object, index, out, rc);
    EXPECT_CALL_OF(table.getKeyCount, CMGetKeyCount(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getClassQualifier, CMGetClassQualifier(&object, name, rc), &object, name, rc);
    EXPECT_CALL_OF(table.getPropertyQualifier, CMGetPropertyQualifier(&object, name, other, rc), &object, name, other,
                   rc);
    EXPECT_CALL_OF(table.getMethodQualifier, CMGetMethodQualifier(&object, name, other, rc), &object, name, other, rc);
    EXPECT_CALL_OF(table.getParameterQualifier, CMGetParameterQualifier(&object, name, third, other, rc), &object, name,
                   third, other, rc);
}

TEST(ArgsMacros, CallTheArguments) {
    Empty<CMPIArgs, CMPIArgsFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.addArg, CMAddArg(&object, name, other, CMPI_chars), &object, name, other, CMPI_chars);
    EXPECT_CALL_OF(table.getArg, CMGetArg(&object, name, rc), &object, name, rc);
    EXPECT_CALL_OF(table.getArgAt, CMGetArgAt(&object, index, out, rc), &object, index, out, rc);
    EXPECT_CALL_OF(table.getArgCount, CMGetArgCount(&object, rc), &object, rc);
}

TEST(StringMacros, ReturnTheCharactersWithAndWithoutAStatus) {
    Empty<CMPIString, CMPIStringFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.getCharPtr, CMGetCharsPtr(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getCharPtr, CMGetCharPtr(&object), &object, static_cast<CMPIStatus*>(nullptr));
}

TEST(ArrayMacros, CallTheArray) {
    Empty<CMPIArray, CMPIArrayFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.getSize, CMGetArrayCount(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getSimpleType, CMGetArrayType(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getElementAt, CMGetArrayElementAt(&object, index, rc), &object, index, rc);
    EXPECT_CALL_OF(table.setElementAt, CMSetArrayElementAt(&object, index, other, CMPI_chars), &object, index, other,
                   CMPI_chars);
}

TEST(EnumerationMacros, CallTheEnumeration) {
    Empty<CMPIEnumeration, CMPIEnumerationFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.getNext, CMGetNext(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.hasNext, CMHasNext(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.toArray, CMToArray(&object, rc), &object, rc);
}

TEST(DateTimeMacros, CallTheDateTime) {
    Empty<CMPIDateTime, CMPIDateTimeFT> made;
    auto& table = made.table;
    auto& object = made.object;
    EXPECT_CALL_OF(table.getBinaryFormat, CMGetBinaryFormat(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getStringFormat, CMGetStringFormat(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.isInterval, CMIsInterval(&object, rc), &object, rc);
}

CMPIData read(const char*, void*) {
    return {};
}

TEST(QueryMacros, CallTheExpression) {
    Empty<CMPISelectExp, CMPISelectExpFT> made;
    auto& table = made.table;
    auto& object = made.object;
    const CMPIInstance instance{};
    EXPECT_CALL_OF(table.evaluate, CMEvaluateSelExp(&object, &instance, rc), &object, &instance, rc);
    EXPECT_CALL_OF(table.evaluateUsingAccessor, CMEvaluateSelExpUsingAccessor(&object, read, &made, rc), &object, &read,
                   &made, rc);
    EXPECT_CALL_OF(table.getString, CMGetSelExpString(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getDOC, CMGetDoc(&object, rc), &object, rc);
    EXPECT_CALL_OF(table.getCOD, CMGetCod(&object, rc), &object, rc);
}

TEST(QueryMacros, CallConditionsAndSubConditions) {
    Empty<CMPISelectCond, CMPISelectCondFT> condition;
    Empty<CMPISubCond, CMPISubCondFT> part;
    int type = 0;
    EXPECT_CALL_OF(condition.table.getCountAndType, CMGetSubCondCountAndType(&condition.object, &type, rc),
                   &condition.object, &type, rc);
    EXPECT_CALL_OF(condition.table.getSubCondAt, CMGetSubCondAt(&condition.object, index, rc), &condition.object, index,
                   rc);
    EXPECT_CALL_OF(part.table.getCount, CMGetPredicateCount(&part.object, rc), &part.object, rc);
    EXPECT_CALL_OF(part.table.getPredicateAt, CMGetPredicateAt(&part.object, index, rc), &part.object, index, rc);
    EXPECT_CALL_OF(part.table.getPredicate, CMGetPredicate(&part.object, name, rc), &part.object, name, rc);
}

TEST(QueryMacros, CallThePredicate) {
    Empty<CMPIPredicate, CMPIPredicateFT> made;
    auto& table = made.table;
    auto& object = made.object;
    CMPIType type = CMPI_null;
    CMPIPredOp operation = CMPI_PredOp_Equals;
    EXPECT_CALL_OF(table.getData, CMGetPredicateData(&object, &type, &operation, out, out), &object, &type, &operation,
                   out, out);
    EXPECT_CALL_OF(table.evaluateUsingAccessor, CMEvaluatePredicateUsingAccessor(&object, read, &made, rc), &object,
                   &read, &made, rc);
}

TEST(ObjectMacros, ReleaseAndCloneAnyObject) {
    Empty<CMPIInstance, CMPIInstanceFT> instance;
    EXPECT_CALL_OF(instance.table.release, CMRelease(&instance.object), &instance.object);
    EXPECT_CALL_OF(instance.table.clone, CMClone(&instance.object, rc), &instance.object, rc);
    Empty<CMPIString, CMPIStringFT> string;
    EXPECT_CALL_OF(string.table.release, CMRelease(&string.object), &string.object);
    EXPECT_CALL_OF(string.table.clone, CMClone(&string.object, rc), &string.object, rc);
}

TEST(ObjectMacros, DetectNullObjects) {
    Empty<CMPIString, CMPIStringFT> made;
    CMPIString* object = nullptr;
    EXPECT_TRUE(CMIsNullObject(object));
    object = &made.object;
    EXPECT_TRUE(CMIsNullObject(object)) << "an object without a handle";
    object->hdl = &made;
    EXPECT_FALSE(CMIsNullObject(object));
}

TEST(ObjectMacros, DetectNullValuesKeysAndArrays) {
    CMPIData data{};
    data.type = CMPI_stringA;
    EXPECT_FALSE(CMIsNullValue(data));
    EXPECT_FALSE(CMIsKeyValue(data));
    EXPECT_TRUE(CMIsArray(data));
    data.type = CMPI_string;
    data.state = CMPI_keyValue;
    EXPECT_FALSE(CMIsNullValue(data));
    EXPECT_TRUE(CMIsKeyValue(data));
    EXPECT_FALSE(CMIsArray(data));
    data.state = CMPI_nullValue | CMPI_keyValue;
    EXPECT_TRUE(CMIsNullValue(data));
}

}  // namespace
