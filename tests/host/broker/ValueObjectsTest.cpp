#include "BrokerFixture.h"

namespace {

class ArrayTest : public BrokerTest {};

TEST_F(ArrayTest, StartsWithNullElements) {
    const CMPIArray* array = make().newArray(handle(), 3, CMPI_uint32, &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(array->ft->getSize(array, nullptr), 3U);
    EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_uint32);
    EXPECT_EQ(array->ft->getElementAt(array, 2, nullptr).state, CMPI_nullValue);
}

TEST_F(ArrayTest, StoresItsElements) {
    CMPIArray* array = make().newArray(handle(), 2, CMPI_chars, nullptr);
    EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_string);
    EXPECT_EQ(array->ft->setElementAt(array, 1, charsValue("x"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(characters(array->ft->getElementAt(array, 1, nullptr).value.string), "x");
    EXPECT_EQ(array->ft->setElementAt(array, 1, nullptr, CMPI_null).rc, CMPI_RC_OK);
    EXPECT_EQ(array->ft->getElementAt(array, 1, nullptr).state, CMPI_nullValue);
}

TEST_F(ArrayTest, RejectsWrongTypesAndPositions) {
    CMPIArray* array = make().newArray(handle(), 1, CMPI_uint32, nullptr);
    const CMPIValue value = uint32Value(1);
    EXPECT_EQ(array->ft->setElementAt(array, 0, &value, CMPI_uint16).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(array->ft->setElementAt(array, 1, &value, CMPI_uint32).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(array->ft->getElementAt(array, 1, &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(make().newArray(handle(), 1, CMPI_uint32A, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_F(ArrayTest, IsAPropertyByValue) {
    CMPIArray* array = make().newArray(handle(), 1, CMPI_uint32, nullptr);
    CMPIValue element = uint32Value(1);
    array->ft->setElementAt(array, 0, &element, CMPI_uint32);
    CMPIInstance* instance = newInstance();
    CMPIValue value{};
    value.array = array;
    EXPECT_EQ(instance->ft->setProperty(instance, "A", &value, CMPI_stringA).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(instance->ft->setProperty(instance, "A", &value, CMPI_uint32A).rc, CMPI_RC_OK);
    element.uint32 = 2;
    array->ft->setElementAt(array, 0, &element, CMPI_uint32);
    const CMPIData data = instance->ft->getProperty(instance, "A", nullptr);
    ASSERT_EQ(data.type, CMPI_uint32A);
    EXPECT_EQ(data.value.array->ft->getElementAt(data.value.array, 0, nullptr).value.uint32, 1U);
}

class DateTimeTest : public BrokerTest {
protected:
    CMPIDateTime* fromText(const char* text) { return make().newDateTimeFromChars(handle(), text, &status); }
    CMPIDateTime* fromBinary(CMPIUint64 binary, bool interval) {
        return make().newDateTimeFromBinary(handle(), binary, interval ? 1 : 0, &status);
    }
    static std::string text(const CMPIDateTime* time) { return characters(time->ft->getStringFormat(time, nullptr)); }
    CMPIUint64 binary(const CMPIDateTime* time) { return time->ft->getBinaryFormat(time, &status); }
};

TEST_F(DateTimeTest, KeepsItsString) {
    const CMPIDateTime* time = fromText("20240229235959.123456+060");
    ASSERT_NE(time, nullptr);
    EXPECT_EQ(text(time), "20240229235959.123456+060");
    EXPECT_FALSE(time->ft->isInterval(time, nullptr));
}

TEST_F(DateTimeTest, BinaryIsMicrosecondsOfUtc) {
    EXPECT_EQ(binary(fromText("19700101000001.000002+000")), 1000002U);
    EXPECT_EQ(binary(fromText("19700101010000.000000+060")), 0U);
    EXPECT_EQ(binary(fromText("19700101000000.000000-060")), 3600000000U);
    EXPECT_EQ(static_cast<CMPISint64>(binary(fromText("19691231235959.000000+000"))), -1000000);
}

TEST_F(DateTimeTest, FromBinaryIsInUtc) {
    EXPECT_EQ(text(fromBinary(0, false)), "19700101000000.000000+000");
    EXPECT_EQ(text(fromBinary(1709251199123456ULL, false)), "20240229235959.123456+000");
    EXPECT_EQ(text(fromBinary(static_cast<CMPIUint64>(-1), false)), "19691231235959.999999+000");
}

TEST_F(DateTimeTest, IntervalsHaveBothForms) {
    const CMPIDateTime* interval = fromBinary(90061000007ULL, true);
    EXPECT_EQ(text(interval), "00000001010101.000007:000");
    EXPECT_TRUE(interval->ft->isInterval(interval, nullptr));
    EXPECT_EQ(binary(fromText("00000001010101.000007:000")), 90061000007U);
    EXPECT_EQ(binary(fromText("99999999235959.999999:000")), 8639999999999999999ULL);
}

TEST_F(DateTimeTest, RejectsStringsThatAreNoDateTimes) {
    for (const char* bad : {"", "20241301000000.000000+000", "20230229000000.000000+000", "20240229235959.123456+06",
                            "20240229 35959.123456+060", "00000001250101.000007:000"}) {
        EXPECT_EQ(fromText(bad), nullptr) << bad;
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER) << bad;
    }
    EXPECT_EQ(fromText(nullptr), nullptr);
    EXPECT_EQ(fromBinary(~0ULL >> 1, false), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(fromBinary(~0ULL, true), nullptr);
}

TEST_F(DateTimeTest, WithUnknownFieldsHasNoBinaryForm) {
    for (const char* unknown :
         {"2024**********.******+000", "20240229235959.123***+000", "00000001******.******:000"}) {
        const CMPIDateTime* time = fromText(unknown);
        ASSERT_NE(time, nullptr) << unknown;
        EXPECT_EQ(binary(time), 0U) << unknown;
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED) << unknown;
    }
}

TEST_F(DateTimeTest, OfNowIsATimeInUtc) {
    const CMPIDateTime* first = make().newDateTime(handle(), &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    const CMPIDateTime* second = make().newDateTime(handle(), nullptr);
    EXPECT_EQ(text(first).substr(21), "+000");
    EXPECT_LE(binary(first), binary(second));
    EXPECT_GT(binary(first), 1700000000000000ULL);
}

class NamedListsTest : public BrokerTest {};

TEST_F(NamedListsTest, ContextEntriesAreFoundByNameAndPosition) {
    const CMPIContext* context = scope->context({testsupport::named(CMPIPrincipal, testsupport::text("me"))});
    const CMPIValue flags = uint32Value(CMPI_FLAG_LocalOnly);
    EXPECT_EQ(context->ft->addEntry(context, CMPIInvocationFlags, &flags, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(context->ft->getEntryCount(context, nullptr), 2U);
    EXPECT_EQ(characters(context->ft->getEntry(context, CMPIPrincipal, nullptr).value.string), "me");
    CMPIString* name = nullptr;
    EXPECT_EQ(context->ft->getEntryAt(context, 1, &name, nullptr).value.uint32, 1U);
    EXPECT_EQ(characters(name), CMPIInvocationFlags);
    context->ft->getEntry(context, CMPIRole, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(NamedListsTest, ArgumentsAreFoundByNameAndPosition) {
    const CMPIArgs* args = make().newArgs(handle(), &status);
    ASSERT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->addArg(args, "In", charsValue("x"), CMPI_chars).rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->getArgCount(args, nullptr), 1U);
    EXPECT_EQ(characters(args->ft->getArg(args, "IN", nullptr).value.string), "x");
    CMPIString* name = nullptr;
    args->ft->getArgAt(args, 0, &name, nullptr);
    EXPECT_EQ(characters(name), "In");
    args->ft->getArgAt(args, 1, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

}  // namespace
