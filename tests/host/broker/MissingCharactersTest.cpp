#include "BrokerFixture.h"

// Values as some object managers pass them: strings without characters, keys without values.

namespace {

class MissingCharacters : public BrokerTest {
protected:
    CMPIInstance* instanceWith(cimhost::Value value) {
        return scope->instance({{}, {testsupport::named("Text", std::move(value))}});
    }

    CMPIData get(const CMPIInstance* instance) { return instance->ft->getProperty(instance, "Text", &status); }
};

TEST_F(MissingCharacters, AStringObjectMayHaveNoCharacters) {
    const CMPIData data = get(instanceWith(cimhost::Value::stringWithoutCharacters()));
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.state, CMPI_goodValue);
    ASSERT_NE(data.value.string, nullptr);
    EXPECT_EQ(data.value.string->ft->getCharPtr(data.value.string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(MissingCharacters, ANullStringMayBeAnObject) {
    const CMPIData data = get(instanceWith(cimhost::Value::nullStringObject()));
    EXPECT_EQ(data.state, CMPI_nullValue);
    ASSERT_NE(data.value.string, nullptr);
    EXPECT_EQ(data.value.string->ft->getCharPtr(data.value.string, nullptr), nullptr);
}

TEST_F(MissingCharacters, ACloneOfSuchAStringHasNoCharactersEither) {
    const CMPIData data = get(instanceWith(cimhost::Value::stringWithoutCharacters()));
    CMPIString* copy = data.value.string->ft->clone(data.value.string, nullptr);
    EXPECT_EQ(copy->ft->getCharPtr(copy, nullptr), nullptr);
    copy->ft->release(copy);
}

TEST_F(MissingCharacters, APropertyThatIsSetToSuchAStringIsNull) {
    const CMPIData data = get(instanceWith(cimhost::Value::stringWithoutCharacters()));
    CMPIInstance* other = newInstance();
    EXPECT_EQ(other->ft->setProperty(other, "Text", &data.value, CMPI_string).rc, CMPI_RC_OK);
    EXPECT_EQ(get(other).state, CMPI_nullValue);
    EXPECT_EQ(get(other).value.string, nullptr);
}

TEST_F(MissingCharacters, AKeyWithoutAValueIsCountedAndNotFound) {
    const CMPIObjectPath* path = scope->objectPath({{}, "root", "X", {{"Name", testsupport::nullOf(CMPI_string)}}});
    EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 1U);
    const CMPIData byName = path->ft->getKey(path, "Name", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_NE(byName.state & CMPI_nullValue, 0);
    EXPECT_EQ(byName.value.string, nullptr);
    CMPIString* name = nullptr;
    path->ft->getKeyAt(path, 0, &name, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(characters(name), "Name");
    EXPECT_EQ(path->ft->getKey(path, "Name", nullptr).value.string, nullptr) << "the status may be null";
}

}  // namespace
