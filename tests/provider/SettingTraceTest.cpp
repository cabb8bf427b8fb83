// Log records of the setting elements.

#include <gmock/gmock.h>

#include <sstream>

#include "SettingKinds.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;
using testing::ElementsAreArray;

/** Level and message of a log record. */
struct LoggedRecord {
    int level;
    std::string text;
    bool operator==(const LoggedRecord& other) const { return level == other.level && text == other.text; }
    friend std::ostream& operator<<(std::ostream& stream, const LoggedRecord& record) {
        return stream << record.level << ' ' << record.text;
    }
};

template <class Kind>
class SettingTrace : public SettingElement<Kind> {
protected:
    /** Returns the log records of a function. Expects that they use the source file's logger. */
    static std::vector<LoggedRecord> loggedBy(const std::string& function) {
        std::vector<LoggedRecord> found;
        for (const LogRecord& record : recordsOf(Kind::sourceFile, function)) {
            EXPECT_EQ(record.logger, "Tarvik.LeaseAndWarrantyProvider");
            found.push_back({record.level, withoutLine(record.text)});
        }
        return found;
    }

    static std::string listOf(const std::string& label, const Moniker& argument) {
        std::ostringstream list;
        list << label << &argument;
        return list.str();
    }
};

TYPED_TEST_SUITE(SettingTrace, SettingKinds, KindNames);

TYPED_TEST(SettingTrace, LogsConstructionAndDestruction) {
    agentEnvironment::forgetLog();
    { typename TypeParam::Setting fresh; }
    for (const char* before : {"", "~"}) {
        const std::string function = std::string(before) + TypeParam::name;
        EXPECT_THAT(logMessagesOf(TypeParam::sourceFile, function),
                    ElementsAre("METHOD: " + function + "() was invoked in " + TypeParam::sourceFile + " [Line: N]"));
        EXPECT_EQ(recordsOf(TypeParam::sourceFile, function).at(0).level, 4000);
    }
}

TYPED_TEST(SettingTrace, LogsTheTranslationToTheElement) {
    Moniker argument = moniker({{"Name", "beta"}});
    const std::string list = this->listOf(" monikerComputer=", argument);
    agentEnvironment::forgetLog();
    TypeParam::elementMoniker(this->setting, argument);
    std::vector<LoggedRecord> expected = {
        {3000, entering(TypeParam::toElement, TypeParam::sourceFile, list)},
        {4000, variable("Name", "beta", TypeParam::sourceFile)},
        {4000, variable("InstanceID", "/system/second%5Fbox", TypeParam::sourceFile)},
    };
    if (TypeParam::marksExitToElement) {
        expected.push_back({3000, exiting(TypeParam::toElement, TypeParam::sourceFile, list)});
    }
    EXPECT_THAT(this->loggedBy(TypeParam::toElement), ElementsAreArray(expected));
}

TYPED_TEST(SettingTrace, LogsTheTranslationToTheComputer) {
    Moniker argument = moniker({{"InstanceID", "/system/third"}});
    const std::string list = this->listOf(TypeParam::elementLabel, argument);
    agentEnvironment::forgetLog();
    this->setting.getComputerMoniker(argument);
    EXPECT_THAT(this->loggedBy("getComputerMoniker"),
                ElementsAre(LoggedRecord{3000, entering("getComputerMoniker", TypeParam::sourceFile, list)},
                            LoggedRecord{4000, variable("Name", "beta", TypeParam::sourceFile)},
                            LoggedRecord{3000, exiting("getComputerMoniker", TypeParam::sourceFile, list)}));
}

TYPED_TEST(SettingTrace, LogsTheElementsFilterWithTheIdentifier) {
    agentEnvironment::forgetLog();
    this->toElement({{"Name", "beta"}});
    const std::string list = " filterType=0 reference=/system/second%5Fbox";
    EXPECT_THAT(logMessagesOf(TypeParam::elementFile, "setFilter"),
                ElementsAre(entering("setFilter", TypeParam::elementFile, list),
                            exiting("setFilter", TypeParam::elementFile, list)));
}

TYPED_TEST(SettingTrace, LogsTheFilterWithTheEmptyPathForAnUnknownComputer) {
    agentEnvironment::forgetLog();
    this->toElement({{"Name", "gamma"}});
    EXPECT_EQ(logMessagesOf(TypeParam::elementFile, "setFilter").at(0),
              entering("setFilter", TypeParam::elementFile, " filterType=0 reference="));
}

TYPED_TEST(SettingTrace, LogsFailuresAtErrorLevelAndNoExit) {
    agentEnvironment::forgetLog();
    Moniker empty;
    EXPECT_THROW(TypeParam::elementMoniker(this->setting, empty), FrameworkException);
    EXPECT_THROW(this->setting.getComputerMoniker(empty), FrameworkException);
    EXPECT_THAT(
        this->loggedBy(TypeParam::toElement),
        ElementsAre(LoggedRecord{3000, entering(TypeParam::toElement, TypeParam::sourceFile,
                                                this->listOf(" monikerComputer=", empty))},
                    LoggedRecord{3000, message("Could not find 'Name' Key in Moniker", TypeParam::sourceFile)}));
    EXPECT_THAT(
        this->loggedBy("getComputerMoniker"),
        ElementsAre(LoggedRecord{3000, entering("getComputerMoniker", TypeParam::sourceFile,
                                                this->listOf(TypeParam::elementLabel, empty))},
                    LoggedRecord{3000, message("Could not find 'InstanceID' Key in Moniker", TypeParam::sourceFile)}));
}

}  // namespace
