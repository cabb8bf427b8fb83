#include "BrokerFixture.h"

namespace {

class ObjectPathTest : public BrokerTest {};

TEST_F(ObjectPathTest, HasTheNamespaceAndClassOfItsCreation) {
    const CMPIObjectPath* path = newPath("VELKO_Thing");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(characters(path->ft->getNameSpace(path, nullptr)), "root/cimv2");
    EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "VELKO_Thing");
    EXPECT_EQ(characters(path->ft->getHostname(path, nullptr)), "");
    EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 0U);
}

TEST_F(ObjectPathTest, SetsNamespaceClassAndHost) {
    CMPIObjectPath* path = newPath();
    path->ft->setNameSpace(path, "root/other");
    path->ft->setClassName(path, "Y");
    path->ft->setHostname(path, "h");
    EXPECT_EQ(characters(path->ft->getNameSpace(path, nullptr)), "root/other");
    EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "Y");
    EXPECT_EQ(characters(path->ft->getHostname(path, nullptr)), "h");
}

TEST_F(ObjectPathTest, CopiesNameSpaceAndClassFromAnotherPath) {
    CMPIObjectPath* source = make().newObjectPath(handle(), "root/a", "A", nullptr);
    source->ft->setHostname(source, "far");
    CMPIObjectPath* path = newPath();
    path->ft->setNameSpaceFromObjectPath(path, source);
    EXPECT_EQ(characters(path->ft->getNameSpace(path, nullptr)), "root/a");
    EXPECT_EQ(characters(path->ft->getClassName(path, nullptr)), "A");
    EXPECT_EQ(characters(path->ft->getHostname(path, nullptr)), "");
    path->ft->setHostAndNameSpaceFromObjectPath(path, source);
    EXPECT_EQ(characters(path->ft->getHostname(path, nullptr)), "far");
}

TEST_F(ObjectPathTest, FindsAKeyInAnyLetterCase) {
    CMPIObjectPath* path = newPath();
    EXPECT_EQ(path->ft->addKey(path, "InstanceID", charsValue("L1"), CMPI_chars).rc, CMPI_RC_OK);
    const CMPIData key = path->ft->getKey(path, "INSTANCEid", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(key.type, CMPI_string);
    EXPECT_EQ(key.state, CMPI_keyValue);
    EXPECT_EQ(characters(key.value.string), "L1");
}

TEST_F(ObjectPathTest, ReplacesAKeyAtItsPosition) {
    CMPIObjectPath* path = newPath();
    path->ft->addKey(path, "A", charsValue("1"), CMPI_chars);
    path->ft->addKey(path, "B", charsValue("2"), CMPI_chars);
    path->ft->addKey(path, "a", charsValue("3"), CMPI_chars);
    ASSERT_EQ(path->ft->getKeyCount(path, nullptr), 2U);
    CMPIString* name = nullptr;
    const CMPIData key = path->ft->getKeyAt(path, 0, &name, &status);
    EXPECT_EQ(characters(name), "A");
    EXPECT_EQ(characters(key.value.string), "3");
}

TEST_F(ObjectPathTest, RejectsAKeyWithoutNameOrValue) {
    CMPIObjectPath* path = newPath();
    EXPECT_EQ(path->ft->addKey(path, nullptr, charsValue("1"), CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(path->ft->addKey(path, "", charsValue("1"), CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(path->ft->addKey(path, "A", nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 0U);
}

TEST_F(ObjectPathTest, ReportsAMissingKey) {
    const CMPIObjectPath* path = newPath();
    EXPECT_EQ(path->ft->getKey(path, "A", &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(path->ft->getKeyAt(path, 0, nullptr, &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(ObjectPathTest, CopiesAReferenceWhenItIsAdded) {
    CMPIObjectPath* target = newPath("Target");
    CMPIObjectPath* path = newPath();
    CMPIValue value{};
    value.ref = target;
    path->ft->addKey(path, "Antecedent", &value, CMPI_ref);
    target->ft->setClassName(target, "Changed");
    const CMPIData key = path->ft->getKey(path, "Antecedent", nullptr);
    ASSERT_EQ(key.type, CMPI_ref);
    EXPECT_EQ(characters(key.value.ref->ft->getClassName(key.value.ref, nullptr)), "Target");
}

TEST_F(ObjectPathTest, IsFormattedAsAUri) {
    CMPIObjectPath* path = newPath("VELKO_Thing");
    path->ft->addKey(path, "Name", charsValue("a"), CMPI_chars);
    EXPECT_EQ(characters(path->ft->toString(path, nullptr)), "root/cimv2:VELKO_Thing.Name=\"a\"");
}

TEST_F(ObjectPathTest, HasNoQualifiers) {
    const CMPIObjectPath* path = newPath();
    path->ft->getClassQualifier(path, "Key", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    path->ft->getParameterQualifier(path, "m", "p", "Key", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(ObjectPathTest, NeedsAClassNameButNoNameSpace) {
    EXPECT_EQ(make().newObjectPath(handle(), "root", nullptr, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_NE(make().newObjectPath(handle(), nullptr, "X", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

}  // namespace
