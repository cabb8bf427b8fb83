#include "KO/DateTime.h"

#include "cim/DateTime.h"
#include "framework/DateTimeAccess.h"

#include <ctime>

namespace KO {

namespace {

constexpr unsigned int localTime = 3;

/** Returns the offset of local time from UTC in minutes at a moment. */
int localOffset(std::time_t moment) {
    std::tm fields{};
    return ::localtime_r(&moment, &fields) != nullptr ? static_cast<int>(fields.tm_gmtoff / 60) : 0;
}

}  // namespace

/** Stores the date as its CIM datetime string, to keep all digits of the client; empty for no date. */
struct DateTime::Implementation {
    std::string text;
};

DateTime::DateTime() : implementation(std::make_unique<Implementation>()) {}

DateTime::DateTime(long seconds, unsigned int kind) : DateTime() {
    implementation->text = cim::formatPointInTime(seconds, kind == localTime ? localOffset(seconds) : 0);
}

DateTime::DateTime(const DateTime& other) : implementation(std::make_unique<Implementation>(*other.implementation)) {}
DateTime::~DateTime() = default;

DateTime& DateTime::operator=(const DateTime& other) {
    implementation->text = other.implementation->text;
    return *this;
}

std::string DateTimeAccess::text(const DateTime& date) {
    return date.implementation->text;
}

DateTime DateTimeAccess::fromText(const std::string& text) {
    DateTime date;
    if (cim::isPointInTime(text)) {
        date.implementation->text = text;
    }
    return date;
}

}  // namespace KO
