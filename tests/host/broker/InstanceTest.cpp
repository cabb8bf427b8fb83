#include "BrokerFixture.h"

namespace {

using cimhost::ClassInfo;

class InstanceTest : public BrokerTest {
protected:
    CMPIStatus set(CMPIInstance* instance, const char* name, const char* text) {
        return instance->ft->setProperty(instance, name, charsValue(text), CMPI_chars);
    }

    std::vector<std::string> names(const CMPIInstance* instance) {
        std::vector<std::string> all;
        for (CMPICount i = 0; i < instance->ft->getPropertyCount(instance, nullptr); ++i) {
            CMPIString* name = nullptr;
            instance->ft->getPropertyAt(instance, i, &name, nullptr);
            all.push_back(characters(name));
        }
        return all;
    }
};

TEST_F(InstanceTest, OfAnUnknownClassStartsEmpty) {
    CMPIObjectPath* path = newPath();
    path->ft->addKey(path, "Name", charsValue("n"), CMPI_chars);
    const CMPIInstance* instance = make().newInstance(handle(), path, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 0U);
}

TEST_F(InstanceTest, ReturnsItsPathUnchanged) {
    CMPIObjectPath* path = newPath("VELKO_Thing");
    path->ft->addKey(path, "Name", charsValue("n"), CMPI_chars);
    const CMPIInstance* instance = make().newInstance(handle(), path, nullptr);
    path->ft->setClassName(path, "Changed");
    const CMPIObjectPath* own = instance->ft->getObjectPath(instance, &status);
    EXPECT_EQ(characters(own->ft->toString(own, nullptr)), "root/cimv2:VELKO_Thing.Name=\"n\"");
}

TEST_F(InstanceTest, SetsAnotherPath) {
    CMPIInstance* instance = newInstance();
    EXPECT_EQ(instance->ft->setObjectPath(instance, newPath("Other")).rc, CMPI_RC_OK);
    const CMPIObjectPath* own = instance->ft->getObjectPath(instance, nullptr);
    EXPECT_EQ(characters(own->ft->getClassName(own, nullptr)), "Other");
    EXPECT_EQ(instance->ft->setObjectPath(instance, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(InstanceTest, ReturnsPropertiesInTheOrderOfTheirFirstSetting) {
    CMPIInstance* instance = newInstance();
    set(instance, "B", "1");
    set(instance, "A", "2");
    set(instance, "b", "3");
    EXPECT_THAT(names(instance), testing::ElementsAre("B", "A"));
    const CMPIData first = instance->ft->getProperty(instance, "B", &status);
    EXPECT_EQ(characters(first.value.string), "3");
}

TEST_F(InstanceTest, SetsATypedNull) {
    CMPIInstance* instance = newInstance();
    EXPECT_EQ(instance->ft->setProperty(instance, "D", nullptr, CMPI_dateTime).rc, CMPI_RC_OK);
    const CMPIData data = instance->ft->getProperty(instance, "D", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_dateTime);
    EXPECT_EQ(data.state, CMPI_nullValue);
}

TEST_F(InstanceTest, TreatsANullStringPointerAsNull) {
    CMPIInstance* instance = newInstance();
    const CMPIValue value{};
    EXPECT_EQ(instance->ft->setProperty(instance, "S", &value, CMPI_string).rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->getProperty(instance, "S", nullptr).state, CMPI_nullValue);
}

TEST_F(InstanceTest, StoresEveryPlainType) {
    CMPIInstance* instance = newInstance();
    CMPIValue value{};
    value.sint64 = -5;
    instance->ft->setProperty(instance, "S64", &value, CMPI_sint64);
    value.uint64 = ~0ULL;
    instance->ft->setProperty(instance, "U64", &value, CMPI_uint64);
    value.boolean = 1;
    instance->ft->setProperty(instance, "B", &value, CMPI_boolean);
    value.char16 = 0x263A;
    instance->ft->setProperty(instance, "C", &value, CMPI_char16);
    value.real32 = 0.5F;
    instance->ft->setProperty(instance, "R", &value, CMPI_real32);
    value.sint8 = -1;
    instance->ft->setProperty(instance, "S8", &value, CMPI_sint8);
    EXPECT_EQ(instance->ft->getProperty(instance, "S64", nullptr).value.sint64, -5);
    EXPECT_EQ(instance->ft->getProperty(instance, "U64", nullptr).value.uint64, ~0ULL);
    EXPECT_EQ(instance->ft->getProperty(instance, "B", nullptr).value.boolean, 1);
    EXPECT_EQ(instance->ft->getProperty(instance, "C", nullptr).value.char16, 0x263A);
    EXPECT_EQ(instance->ft->getProperty(instance, "R", nullptr).value.real32, 0.5F);
    EXPECT_EQ(instance->ft->getProperty(instance, "S8", nullptr).value.sint8, -1);
    EXPECT_EQ(instance->ft->getProperty(instance, "S8", nullptr).type, CMPI_sint8);
}

TEST_F(InstanceTest, StoresAnEmbeddedInstance) {
    CMPIInstance* inner = newInstance("Inner");
    set(inner, "P", "1");
    CMPIInstance* outer = newInstance();
    CMPIValue value{};
    value.inst = inner;
    EXPECT_EQ(outer->ft->setProperty(outer, "E", &value, CMPI_instance).rc, CMPI_RC_OK);
    set(inner, "P", "2");
    const CMPIInstance* kept = outer->ft->getProperty(outer, "E", nullptr).value.inst;
    EXPECT_EQ(characters(kept->ft->getProperty(kept, "P", nullptr).value.string), "1");
}

TEST_F(InstanceTest, RejectsInvalidTypes) {
    CMPIInstance* instance = newInstance();
    const CMPIValue value{};
    EXPECT_EQ(instance->ft->setProperty(instance, "P", &value, CMPI_enumeration).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(instance->ft->setProperty(instance, "P", &value, 77).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
    EXPECT_EQ(instance->ft->getPropertyCount(instance, nullptr), 0U);
}

TEST_F(InstanceTest, RejectsAnObjectOfAnotherType) {
    CMPIInstance* instance = newInstance();
    CMPIValue value{};
    value.ref = newPath();
    EXPECT_EQ(instance->ft->setProperty(instance, "P", &value, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(InstanceTest, ReportsAMissingProperty) {
    const CMPIInstance* instance = newInstance();
    EXPECT_EQ(instance->ft->getProperty(instance, "P", &status).state, CMPI_badValue);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    instance->ft->getPropertyAt(instance, 0, nullptr, &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(InstanceTest, AFilterDropsPropertiesSetBeforeAndAfter) {
    CMPIInstance* instance = newInstance();
    set(instance, "A", "1");
    set(instance, "B", "1");
    const char* list[] = {"b", "D", nullptr};
    EXPECT_EQ(instance->ft->setPropertyFilter(instance, list, nullptr).rc, CMPI_RC_OK);
    EXPECT_EQ(set(instance, "C", "1").rc, CMPI_RC_OK);
    set(instance, "D", "1");
    EXPECT_THAT(names(instance), testing::ElementsAre("B", "D"));
    instance->ft->setPropertyFilter(instance, nullptr, nullptr);
    set(instance, "C", "1");
    EXPECT_THAT(names(instance), testing::ElementsAre("B", "D", "C"));
}

/** A broker with the class Known, whose key is Name. */
class KnownClassTest : public InstanceTest {
protected:
    static cimhost::BrokerOptions options() {
        auto shape = std::make_shared<ClassInfo>();
        shape->name = "Known";
        shape->properties = {{"Other", CMPI_uint32, false, false}, {"Name", CMPI_string, false, true}};
        shape->superclasses = {"Middle", "Top"};
        cimhost::BrokerOptions made;
        made.classInfo = [shape](const std::string& name) { return name == "Known" ? shape : nullptr; };
        return made;
    }

    KnownClassTest() : knowing(options()), request(knowing) {}

    CMPIObjectPath* knownPath() {
        CMPIObjectPath* path = knowing.handle()->eft->newObjectPath(knowing.handle(), "root/cimv2", "Known", nullptr);
        path->ft->addKey(path, "name", charsValue("n"), CMPI_chars);
        path->ft->addKey(path, "Stray", charsValue("s"), CMPI_chars);
        return path;
    }

    CMPIInstance* known() { return knowing.handle()->eft->newInstance(knowing.handle(), knownPath(), &status); }

    cimhost::Broker knowing;
    cimhost::RequestScope request;
};

TEST_F(KnownClassTest, AnInstanceStartsWithTheKeysOfItsPath) {
    const CMPIInstance* instance = known();
    EXPECT_THAT(names(instance), testing::ElementsAre("Name"));
    EXPECT_EQ(instance->ft->getProperty(instance, "Name", nullptr).state, CMPI_keyValue);
}

TEST_F(KnownClassTest, AKeyMovesToThePositionWhereItIsSet) {
    CMPIInstance* instance = known();
    const CMPIValue number = uint32Value(7);
    instance->ft->setProperty(instance, "Other", &number, CMPI_uint32);
    EXPECT_THAT(names(instance), testing::ElementsAre("Name", "Other"));
    EXPECT_EQ(set(instance, "Name", "set").rc, CMPI_RC_OK);
    EXPECT_THAT(names(instance), testing::ElementsAre("Other", "Name"));
    const CMPIData key = instance->ft->getProperty(instance, "Name", &status);
    EXPECT_EQ(characters(key.value.string), "set");
    EXPECT_EQ(key.state, CMPI_keyValue);
}

TEST_F(KnownClassTest, AKeySetAgainKeepsItsPosition) {
    CMPIInstance* instance = known();
    const CMPIValue number = uint32Value(7);
    set(instance, "Name", "first");
    instance->ft->setProperty(instance, "Other", &number, CMPI_uint32);
    set(instance, "Name", "second");
    EXPECT_THAT(names(instance), testing::ElementsAre("Name", "Other"));
    const CMPIData key = instance->ft->getProperty(instance, "Name", &status);
    EXPECT_EQ(characters(key.value.string), "second");
}

TEST_F(KnownClassTest, AKeyOfACloneMovesWhenTheCloneSetsIt) {
    CMPIInstance* original = known();
    CMPIInstance* clone = original->ft->clone(original, &status);
    ASSERT_NE(clone, nullptr);
    const CMPIValue number = uint32Value(7);
    clone->ft->setProperty(clone, "Other", &number, CMPI_uint32);
    set(clone, "Name", "set");
    EXPECT_THAT(names(clone), testing::ElementsAre("Other", "Name"));
    EXPECT_THAT(names(original), testing::ElementsAre("Name"));
    EXPECT_EQ(clone->ft->release(clone).rc, CMPI_RC_OK);
}

TEST_F(KnownClassTest, APropertySetAgainIsReplaced) {
    CMPIInstance* instance = request.instance({{{}, "root/cimv2", "Known", {}}, {{"Other", cimhost::Value::of(1U)}}});
    for (const CMPIUint32 value : {7U, 8U}) {
        const CMPIValue number = uint32Value(value);
        instance->ft->setProperty(instance, "OTHER", &number, CMPI_uint32);
        EXPECT_THAT(names(instance), testing::ElementsAre("Other"));
        EXPECT_EQ(instance->ft->getProperty(instance, "Other", nullptr).value.uint32, value);
    }
}

TEST_F(KnownClassTest, ChecksNamesAndTypes) {
    CMPIInstance* instance = known();
    const CMPIValue number = uint32Value(7);
    EXPECT_EQ(instance->ft->setProperty(instance, "other", &number, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(instance->ft->setProperty(instance, "Other", &number, CMPI_uint16).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(instance->ft->setProperty(instance, "Other", nullptr, CMPI_null).rc, CMPI_RC_OK);
    EXPECT_EQ(set(instance, "Unknown", "1").rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(KnownClassTest, AFilterKeepsTheKeys) {
    CMPIInstance* instance = known();
    const CMPIValue number = uint32Value(7);
    instance->ft->setProperty(instance, "Other", &number, CMPI_uint32);
    const char* none[] = {nullptr};
    instance->ft->setPropertyFilter(instance, none, nullptr);
    EXPECT_THAT(names(instance), testing::ElementsAre("Name"));
}

TEST_F(KnownClassTest, APathIsAnInstanceOfItsClassAndSuperclasses) {
    const auto isA = [&](const char* name) {
        return knowing.handle()->eft->classPathIsA(knowing.handle(), knownPath(), name, &status);
    };
    EXPECT_TRUE(isA("KNOWN"));
    EXPECT_TRUE(isA("top"));
    EXPECT_FALSE(isA("Elsewhere"));
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

}  // namespace
