#include "KO/Utils.h"

#include "cim/DateTime.h"
#include "framework/DateTimeAccess.h"
#include "framework/PropertyFileAccess.h"

namespace KO {

std::string Utils::ReadStringFromFile(PropertyFile& file, const std::string& key) {
    return PropertyFileAccess::read(file, key);
}

DateTime Utils::ReadDateFromFile(PropertyFile& file, const std::string& key) {
    return DateTimeAccess::fromText(PropertyFileAccess::read(file, key));
}

void Utils::WriteStringToFile(PropertyFile& file, const std::string& key, const std::string& value) {
    PropertyFileAccess::write(file, key, value);
}

void Utils::WriteDateToFile(PropertyFile& file, const std::string& key, const DateTime& value) {
    PropertyFileAccess::write(file, key, DateTimeAccess::text(value));
}

std::string Utils::convertCIMDateTime(DateTime value) {
    const std::string text = DateTimeAccess::text(value);
    return text.empty() ? std::string(cim::noDate) : text;
}

DateTime Utils::convertStringToDateTime(std::string text) {
    return DateTimeAccess::fromText(text);
}

}  // namespace KO
