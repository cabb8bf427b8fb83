#include <cmpift.h>
#include <gtest/gtest.h>

#include <string>

#include "KO/Moniker.h"
#include "KO/ProviderUtilities.h"

using KO::Moniker;
using KO::ProviderUtilities;

// Unusual values that object managers pass to providers. A function table has only the functions that a test needs,
// and the handle of a path or instance contains the values that it returns.

namespace {

/** A string object whose characters may be null. */
struct FakeString {
    explicit FakeString(const char* text) : characters(text) {
        table.getCharPtr = [](const CMPIString* self, CMPIStatus*) {
            return static_cast<const FakeString*>(self->hdl)->characters;
        };
        object = {this, &table};
    }
    FakeString(const FakeString&) = delete;
    FakeString& operator=(const FakeString&) = delete;

    const char* characters;
    CMPIStringFT table{};
    CMPIString object{};
};

/** The value that a path or instance returns for every key or property. */
struct Answers {
    CMPIData data{};
    CMPIrc rc = CMPI_RC_OK;
    CMPIString* keyName = nullptr;
    CMPICount keyCount = 1;
    int calls = 0;

    CMPIData give(CMPIStatus* status) {
        ++calls;
        if (status != nullptr) {
            status->rc = rc;
        }
        return data;
    }
};

Answers& answersOf(void* handle) {
    return *static_cast<Answers*>(handle);
}

struct FakePath {
    FakePath() {
        table.getKey = [](const CMPIObjectPath* self, const char*, CMPIStatus* status) {
            return answersOf(self->hdl).give(status);
        };
        table.getKeyAt = [](const CMPIObjectPath* self, CMPICount, CMPIString** name, CMPIStatus* status) {
            *name = answersOf(self->hdl).keyName;
            return answersOf(self->hdl).give(status);
        };
        table.getKeyCount = [](const CMPIObjectPath* self, CMPIStatus*) { return answersOf(self->hdl).keyCount; };
        table.getClassName = [](const CMPIObjectPath* self, CMPIStatus*) { return answersOf(self->hdl).keyName; };
        table.getNameSpace = table.getClassName;
        object = {&answers, &table};
    }
    FakePath(const FakePath&) = delete;
    FakePath& operator=(const FakePath&) = delete;

    Answers answers;
    CMPIObjectPathFT table{};
    CMPIObjectPath object{};
};

struct FakeInstance {
    FakeInstance() {
        table.getProperty = [](const CMPIInstance* self, const char*, CMPIStatus* status) {
            return answersOf(self->hdl).give(status);
        };
        object = {&answers, &table};
    }
    FakeInstance(const FakeInstance&) = delete;
    FakeInstance& operator=(const FakeInstance&) = delete;

    Answers answers;
    CMPIInstanceFT table{};
    CMPIInstance object{};
};

CMPIData stringData(CMPIString* string, CMPIValueState state) {
    CMPIData data{};
    data.type = CMPI_string;
    data.state = state;
    data.value.string = string;
    return data;
}

CMPIData charsData(const char* characters) {
    CMPIData data{};
    data.type = CMPI_chars;
    data.value.chars = const_cast<char*>(characters);
    return data;
}

class Quirks : public testing::Test {
protected:
    /** Returns whether a string is read, as a key and as a property; both must agree. */
    bool readsText(const CMPIData& data, CMPIrc rc = CMPI_RC_OK) {
        path.answers.data = data;
        path.answers.rc = rc;
        instance.answers.data = data;
        instance.answers.rc = rc;
        std::string ofInstance = "kept";
        text = "kept";
        const bool read = ProviderUtilities::getKeyProperty(&path.object, "Name", text);
        EXPECT_EQ(ProviderUtilities::getProperty(&instance.object, "Name", ofInstance, false), read);
        EXPECT_EQ(ofInstance, text);
        return read;
    }

    FakePath path;
    FakeInstance instance;
    FakeString good{"good"};
    FakeString withoutCharacters{nullptr};
    std::string text;
};

TEST_F(Quirks, ANullStateOverridesTheValue) {
    EXPECT_FALSE(readsText(stringData(&withoutCharacters.object, CMPI_nullValue)));
    EXPECT_FALSE(readsText(stringData(&good.object, CMPI_nullValue)));
    EXPECT_FALSE(readsText(stringData(&good.object, CMPI_notFound)));
    EXPECT_FALSE(readsText(stringData(&good.object, CMPI_badValue)));
    EXPECT_EQ(text, "kept");
}

TEST_F(Quirks, AGoodStateIsNotTrusted) {
    CMPIString withoutTable{nullptr, nullptr};
    CMPIStringFT emptyTable{};
    CMPIString withoutFunction{nullptr, &emptyTable};
    EXPECT_FALSE(readsText(stringData(nullptr, CMPI_goodValue)));
    EXPECT_FALSE(readsText(stringData(&withoutCharacters.object, CMPI_goodValue)));
    EXPECT_FALSE(readsText(stringData(&withoutTable, CMPI_goodValue)));
    EXPECT_FALSE(readsText(stringData(&withoutFunction, CMPI_goodValue)));
    EXPECT_FALSE(readsText(charsData(nullptr)));
    EXPECT_EQ(text, "kept");
}

TEST_F(Quirks, AKeyValueIsAValue) {
    EXPECT_TRUE(readsText(stringData(&good.object, CMPI_keyValue)));
    EXPECT_EQ(text, "good");
    EXPECT_FALSE(readsText(stringData(&good.object, CMPI_keyValue | CMPI_nullValue)));
}

TEST_F(Quirks, CharactersAreReadAsStrings) {
    EXPECT_TRUE(readsText(charsData("plain")));
    EXPECT_EQ(text, "plain");
}

TEST_F(Quirks, AFailedStatusOverridesTheValue) {
    EXPECT_FALSE(readsText(stringData(&good.object, CMPI_goodValue), CMPI_RC_ERR_NOT_FOUND));
    EXPECT_FALSE(readsText(charsData("plain"), CMPI_RC_ERR_NO_SUCH_PROPERTY));
}

TEST_F(Quirks, AnotherTypeIsNotReadAsAString) {
    CMPIData data = stringData(&good.object, CMPI_goodValue);
    for (const int type :
         {CMPI_null, CMPI_ref, CMPI_uint32, CMPI_boolean, CMPI_dateTimeA, CMPI_stringA, CMPI_instance}) {
        data.type = static_cast<CMPIType>(type);
        if (type != CMPI_ref) {
            EXPECT_FALSE(readsText(data)) << type;
        }
        CMPIObjectPath* reference = nullptr;
        path.answers.data = data;
        EXPECT_EQ(ProviderUtilities::getKeyProperty(&path.object, "Name", &reference), type == CMPI_ref) << type;
    }
}

TEST_F(Quirks, ADateTimeWithoutAStringIsAbsent) {
    CMPIData data{};
    data.type = CMPI_dateTime;
    EXPECT_FALSE(readsText(data)) << "null object";
    CMPIDateTimeFT table{};
    CMPIDateTime dateTime{nullptr, &table};
    data.value.dateTime = &dateTime;
    EXPECT_FALSE(readsText(data)) << "missing function";
    table.getStringFormat = [](const CMPIDateTime*, CMPIStatus*) -> CMPIString* { return nullptr; };
    EXPECT_FALSE(readsText(data)) << "null string";
}

TEST_F(Quirks, ANullReferenceIsAbsent) {
    path.answers.data.type = CMPI_ref;
    CMPIObjectPath* reference = &path.object;
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(&path.object, "Dependent", &reference));
    EXPECT_EQ(reference, &path.object) << "untouched";
    path.answers.data.value.ref = &path.object;
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(&path.object, "Dependent", static_cast<CMPIObjectPath**>(nullptr)));
}

TEST_F(Quirks, KeysWithoutNameAreSkippedInAMoniker) {
    path.answers.data = charsData("value");
    path.answers.keyCount = 2;
    Moniker moniker;
    ProviderUtilities::transformObjectPathToMoniker(&path.object, moniker);
    path.answers.keyName = &withoutCharacters.object;
    ProviderUtilities::transformObjectPathToMoniker(&path.object, moniker);
    EXPECT_EQ(moniker.getKeyCount(), 0U);
    path.answers.keyName = &good.object;
    ProviderUtilities::transformObjectPathToMoniker(&path.object, moniker);
    EXPECT_EQ(moniker.getKeyCount(), 2U);
}

TEST_F(Quirks, TheKeyCountIsLimitedByItsType) {
    path.answers.keyCount = 0x10001;
    EXPECT_EQ(ProviderUtilities::getKeyCount(&path.object), 0xFFFF);
}

TEST_F(Quirks, ClassNameAndNamespaceMayBeMissing) {
    EXPECT_EQ(ProviderUtilities::getClassId(&path.object), 0);
    EXPECT_EQ(ProviderUtilities::getNamespace(&path.object), "");
    path.answers.keyName = &withoutCharacters.object;
    EXPECT_EQ(ProviderUtilities::getClassId(&path.object), 0);
    EXPECT_EQ(ProviderUtilities::getNamespace(&path.object), "");
}

TEST_F(Quirks, ANullNameReadsAndWritesNothing) {
    path.answers.data = instance.answers.data = charsData("plain");
    std::string value = "kept";
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(&path.object, nullptr, value));
    EXPECT_FALSE(ProviderUtilities::getProperty(&instance.object, nullptr, value, false));
    EXPECT_EQ(value, "kept");
    EXPECT_EQ(path.answers.calls + instance.answers.calls, 0);
}

/** Calls all functions that take a path, an instance or a broker; none may crash. */
void exerciseEverything(CMPIObjectPath* path, CMPIInstance* instance, const CMPIBroker* broker) {
    std::string value = "kept";
    unsigned int number = 99;
    bool flag = true;
    CMPIObjectPath* reference = nullptr;
    Moniker moniker;
    EXPECT_EQ(ProviderUtilities::getClassId(path), 0);
    EXPECT_EQ(ProviderUtilities::getNamespace(path), "");
    EXPECT_EQ(ProviderUtilities::getKeyCount(path), 0);
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "Name", value));
    EXPECT_FALSE(ProviderUtilities::getKeyProperty(path, "Name", &reference));
    EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", value, true));
    EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", number));
    EXPECT_FALSE(ProviderUtilities::getProperty(instance, "Name", flag));
    ProviderUtilities::transformObjectPathToMoniker(path, moniker);
    EXPECT_EQ(moniker.getKeyCount(), 0U);
    moniker.addKey("Name", "value");
    ProviderUtilities::transformMonikerToObjectPath(moniker, &path);
    ProviderUtilities::transformMonikerToObjectPath(moniker, nullptr);
    ProviderUtilities::setKeyProperty(path, "Name", value);
    ProviderUtilities::setKeyProperty(path, "Name", path);
    ProviderUtilities::setProperty(instance, "Name", value);
    ProviderUtilities::setProperty(instance, "Name", static_cast<unsigned short>(1));
    ProviderUtilities::setProperty(instance, "Name", 1U);
    ProviderUtilities::setProperty(instance, "Name", true);
    ProviderUtilities::setProperty(instance, "Name", path);
    ProviderUtilities::setProperty(broker, instance, "Name", value, true);
    ProviderUtilities::setProperty(broker, instance, "Name", value, false);
    EXPECT_EQ(ProviderUtilities::createObjectPath(broker, "VELKO_Lease", "root"), nullptr);
    EXPECT_EQ(ProviderUtilities::createInstance(broker, path), nullptr);
    EXPECT_EQ(value, "kept");
    EXPECT_EQ(number, 99U);
    EXPECT_TRUE(flag);
}

TEST(MissingParts, NullObjectsAreHarmless) {
    exerciseEverything(nullptr, nullptr, nullptr);
    EXPECT_EQ(ProviderUtilities::getClassId(static_cast<const char*>(nullptr)), 0);
}

TEST(MissingParts, NullTablesAreHarmless) {
    CMPIObjectPath path{nullptr, nullptr};
    CMPIInstance instance{nullptr, nullptr};
    const CMPIBroker broker{};
    exerciseEverything(&path, &instance, &broker);
}

TEST(MissingParts, NullFunctionsAreHarmless) {
    CMPIObjectPathFT pathTable{};
    CMPIInstanceFT instanceTable{};
    CMPIBrokerEncFT brokerTable{};
    CMPIObjectPath path{nullptr, &pathTable};
    CMPIInstance instance{nullptr, &instanceTable};
    CMPIBroker broker{};
    broker.eft = &brokerTable;
    exerciseEverything(&path, &instance, &broker);
}

CMPIInstance* makeInstanceButFail(const CMPIBroker*, const CMPIObjectPath*, CMPIStatus* status) {
    static CMPIInstance instance{};
    status->rc = CMPI_RC_ERR_FAILED;
    return &instance;
}

CMPIDateTime* makeDateTimeButFail(const CMPIBroker*, const char*, CMPIStatus* status) {
    static CMPIDateTime dateTime{};
    status->rc = CMPI_RC_ERR_INVALID_PARAMETER;
    return &dateTime;
}

TEST(MissingParts, AnObjectCreatedWithAFailedStatusIsNull) {
    CMPIBrokerEncFT table{};
    table.newInstance = makeInstanceButFail;
    CMPIBroker broker{};
    broker.eft = &table;
    CMPIObjectPath path{};
    EXPECT_EQ(ProviderUtilities::createInstance(&broker, &path), nullptr);
}

TEST(MissingParts, ADateTimeThatTheBrokerRejectsIsSetToNull) {
    CMPIBrokerEncFT brokerTable{};
    brokerTable.newDateTimeFromChars = makeDateTimeButFail;
    CMPIBroker broker{};
    broker.eft = &brokerTable;
    struct Seen {
        int nulls = 0;
        CMPIType type = 0;
    } seen;
    CMPIInstanceFT instanceTable{};
    instanceTable.setProperty = [](const CMPIInstance* self, const char*, const CMPIValue* value, CMPIType type) {
        auto& record = *static_cast<Seen*>(self->hdl);
        record.nulls += value == nullptr ? 1 : 0;
        record.type = type;
        return CMPIStatus{};
    };
    CMPIInstance instance{&seen, &instanceTable};
    std::string date = "20240229123456.000789-330";
    ProviderUtilities::setProperty(&broker, &instance, "Date", date, true);
    EXPECT_EQ(seen.nulls, 1);
    EXPECT_EQ(seen.type, CMPI_dateTime);
}

}  // namespace
