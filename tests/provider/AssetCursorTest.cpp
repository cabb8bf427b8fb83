// Tests the asset element as a cursor over the computers, and the properties of each computer.

#include <gmock/gmock.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <optional>
#include <utility>

#include "AssetSupport.h"

namespace {

using namespace providerTest;
using testing::ElementsAre;
using testing::IsEmpty;

class AssetCursor : public AssetFile {
protected:
    static std::string name(const AssetIDDetails& element) {
        std::string text = "(none)";
        element.getName(text);
        return text;
    }

    static std::vector<std::string> visited(AssetIDDetails& element) {
        std::vector<std::string> names;
        for (; element; ++element) {
            names.push_back(name(element));
        }
        return names;
    }

    static void filter(AssetIDDetails& element, int type, const std::string& value) {
        element.setFilter(static_cast<AssetIDDetails::FilterType>(type), value);
    }

    /** Reads the product name of the computer with that name. */
    static bool productName(const std::string& computer, std::string& text) {
        AssetIDDetails element;
        filter(element, AssetIDDetails::FILTER_NAME, computer);
        EXPECT_EQ(name(element), computer);
        return element.getProductName(text);
    }
};

TEST_F(AssetCursor, VisitsEveryComputerWithoutAFilter) {
    AssetIDDetails element;
    EXPECT_THAT(visited(element), ElementsAre("spaced", "tight", "dashless", "dash first", "dash second", "many dashes",
                                              "empty", "productless", "(none)"));
    EXPECT_THAT(logMessagesOf("AssetIDDetails.cpp", "evaluate"), IsEmpty());
    EXPECT_TRUE(element.evaluate());
}

TEST_F(AssetCursor, SelectsComputersWithTheNameAndComputersWithoutAName) {
    AssetIDDetails element;
    filter(element, AssetIDDetails::FILTER_NAME, "tight");
    EXPECT_THAT(visited(element), ElementsAre("tight", "(none)"));
}

TEST_F(AssetCursor, StaysAtTheEnd) {
    AssetIDDetails element;
    visited(element);
    ++element;
    EXPECT_FALSE(hasCurrent(element));
}

TEST_F(AssetCursor, FiltersByTheVendorOfTheSystem) {
    AssetIDDetails matching;
    filter(matching, AssetIDDetails::FILTER_VENDOR, "Example Maker");
    EXPECT_EQ(visited(matching).size(), 9U);
    for (const char* vendor : {"EXAMPLE MAKER", "Computer Maker", "Other Maker", "Example Maker ", ""}) {
        AssetIDDetails element;
        filter(element, AssetIDDetails::FILTER_VENDOR, vendor);
        EXPECT_FALSE(hasCurrent(element)) << vendor;
    }
}

TEST_F(AssetCursor, FiltersByTheVersionOfTheProduct) {
    AssetIDDetails matching;
    filter(matching, AssetIDDetails::FILTER_VERSION, "4.2.0");
    EXPECT_EQ(visited(matching).size(), 9U);
    AssetIDDetails other;
    filter(other, AssetIDDetails::FILTER_VERSION, "4.2");
    EXPECT_FALSE(hasCurrent(other));
}

TEST_F(AssetCursor, FiltersByIdentifyingNumberForAllOtherTypes) {
    for (const int type : {0, 4, 7, -1}) {
        AssetIDDetails matching;
        filter(matching, type, "/system%20one");
        EXPECT_EQ(visited(matching).size(), 9U) << type;
        AssetIDDetails other;
        filter(other, type, "/system one");
        EXPECT_FALSE(hasCurrent(other)) << type;
    }
}

TEST_F(AssetCursor, RequiresAllFiltersToMatch) {
    AssetIDDetails element;
    filter(element, AssetIDDetails::FILTER_VENDOR, "Example Maker");
    filter(element, AssetIDDetails::FILTER_NAME, "dashless");
    EXPECT_EQ(name(element), "dashless");
    EXPECT_TRUE(element.evaluate());
    filter(element, AssetIDDetails::FILTER_VERSION, "another");
    EXPECT_FALSE(hasCurrent(element));
    EXPECT_FALSE(element.evaluate());
}

TEST_F(AssetCursor, FiltersFromTheCurrentComputerOnward) {
    AssetIDDetails element;
    ++element;
    ++element;
    filter(element, AssetIDDetails::FILTER_NAME, "tight");
    EXPECT_THAT(visited(element), ElementsAre("(none)"));
}

TEST_F(AssetCursor, ReturnsTheComputersNameFromBothGetters) {
    AssetIDDetails element;
    std::string text;
    EXPECT_TRUE(element.getCSName(text));
    EXPECT_EQ(text, "spaced");
    text.clear();
    EXPECT_TRUE(element.getName(text));
    EXPECT_EQ(text, "spaced");
    while (hasCurrent(element)) {
        ++element;
    }
    text = "before";
    EXPECT_FALSE(element.getCSName(text));
    EXPECT_FALSE(element.getName(text));
    EXPECT_EQ(text, "before");
}

TEST_F(AssetCursor, ReturnsTheSameSystemAndProductForEveryComputer) {
    AssetIDDetails element;
    for (; element; ++element) {
        std::string vendor;
        EXPECT_TRUE(element.getVendor(vendor));
        EXPECT_EQ(vendor, "Example Maker");
        EXPECT_EQ(element.getIdentifyingNumber(), "/system%20one");
        EXPECT_EQ(element.getVersion(), "4.2.0");
        EXPECT_EQ(element.getCaption(), "Asset ID Information");
        EXPECT_EQ(element.getDescription(), "Asset ID Information");
        EXPECT_EQ(element.getAssetIDStringArea(), 1024U);
    }
}

TEST_F(AssetCursor, TruncatesTheProductNameOneCharacterBeforeTheFirstDash) {
    const std::pair<const char*, const char*> cut[] = {
        {"spaced", "Model X"}, {"tight", "Mode"}, {"many dashes", "Model X"}, {"dash second", ""}};
    for (const auto& [computer, expected] : cut) {
        std::string text = "before";
        EXPECT_TRUE(productName(computer, text));
        EXPECT_EQ(text, expected) << computer;
    }
}

TEST_F(AssetCursor, ReturnsAProductNameWithALeadingDashUnchanged) {
    std::string text = "before";
    EXPECT_TRUE(productName("dash first", text));
    EXPECT_EQ(text, "-Tower - Red");
}

TEST_F(AssetCursor, ReturnsTrueAndNoValueForAProductNameWithoutADash) {
    for (const char* computer : {"dashless", "empty"}) {
        std::string text = "before";
        EXPECT_TRUE(productName(computer, text));
        EXPECT_EQ(text, "before");
    }
}

TEST_F(AssetCursor, ReturnsFalseAndNoValueWithoutAProductName) {
    std::string text = "before";
    EXPECT_FALSE(productName("productless", text));
    EXPECT_EQ(text, "before");
}

/** Converts a CIM datetime string to seconds since 1970. */
std::time_t secondsOf(const std::string& text) {
    std::tm fields{};
    int micro = 0;
    char sign = ' ';
    int offset = 0;
    EXPECT_EQ(std::sscanf(text.c_str(), "%4d%2d%2d%2d%2d%2d.%6d%c%3d", &fields.tm_year, &fields.tm_mon, &fields.tm_mday,
                          &fields.tm_hour, &fields.tm_min, &fields.tm_sec, &micro, &sign, &offset),
              9)
        << text;
    fields.tm_year -= 1900;
    fields.tm_mon -= 1;
    return timegm(&fields) - (sign == '-' ? -offset : offset) * 60;
}

/** Sets the environment variable TZ during the lifetime of this object. */
class TimeZone {
public:
    explicit TimeZone(const char* zone) {
        const char* present = std::getenv("TZ");
        before = present == nullptr ? std::nullopt : std::optional<std::string>(present);
        setenv("TZ", zone, 1);
        tzset();
    }
    ~TimeZone() {
        before ? setenv("TZ", before->c_str(), 1) : unsetenv("TZ");
        tzset();
    }
    TimeZone(const TimeZone&) = delete;
    TimeZone& operator=(const TimeZone&) = delete;

private:
    std::optional<std::string> before;
};

TEST_F(AssetCursor, ReturnsTheCurrentTimeInTheTimeZoneOfTheProcess) {
    const AssetIDDetails element;
    for (const auto& [zone, offset] :
         {std::pair("EAST-5:30", "+330"), std::pair("WEST3", "-180"), std::pair("UTC0", "+000")}) {
        const TimeZone here(zone);
        const std::time_t before = std::time(nullptr);
        const std::string text = element.getLocalDateTime();
        const std::time_t after = std::time(nullptr);
        ASSERT_EQ(text.size(), 25U);
        EXPECT_EQ(text.substr(21), offset);
        EXPECT_GE(secondsOf(text), before);
        EXPECT_LE(secondsOf(text), after);
    }
}

TEST_F(AssetCursor, ReturnsTheCurrentTime) {
    const AssetIDDetails element;
    const std::time_t before = std::time(nullptr);
    const std::string text = element.getLocalDateTime();
    const std::time_t after = std::time(nullptr);
    EXPECT_EQ(text.size(), 25U);
    EXPECT_GE(secondsOf(text), before);
    EXPECT_LE(secondsOf(text), after);
}

}  // namespace
