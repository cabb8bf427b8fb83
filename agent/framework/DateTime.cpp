#include "KO/DateTime.h"

#include <ctime>
#include <utility>

#include "KO/Utils.h"
#include "cim/DateTime.h"

namespace KO {

namespace {

constexpr unsigned int localTime = 3;

/** Returns the offset of local time from UTC at a moment, in minutes. */
int localOffset(std::time_t moment) {
    std::tm fields{};
    return ::localtime_r(&moment, &fields) != nullptr ? static_cast<int>(fields.tm_gmtoff / 60) : 0;
}

}  // namespace

/** Stores the date as its CIM datetime string, to keep all digits that a client sent; empty for an unset date. */
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

std::string Utils::convertCIMDateTime(DateTime value) {
    const std::string& text = value.implementation->text;
    return text.empty() ? std::string(cim::noDate) : text;
}

DateTime Utils::convertStringToDateTime(std::string text) {
    DateTime date;
    if (cim::isPointInTime(text)) {
        date.implementation->text = std::move(text);
    }
    return date;
}

DateTime Utils::ReadDateFromFile(PropertyFile& file, const std::string& key) {
    return convertStringToDateTime(ReadStringFromFile(file, key));
}

void Utils::WriteDateToFile(PropertyFile& file, const std::string& key, const DateTime& value) {
    WriteStringToFile(file, key, value.implementation->text);
}

}  // namespace KO
