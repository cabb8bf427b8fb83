#include "RecordDocument.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <set>
#include <sstream>
#include <variant>

#include "LeaseBase.h"
#include "RecordStream.h"
#include "WarrantyBase.h"
#include "cim/DateTime.h"
#include "cim/Utf8.h"

namespace KO::LeaseWarrantyProvider {

// This program does not trace.
template <>
RecordTrace<LeaseStoreTraits>::RecordTrace() = default;
template <>
RecordTrace<WarrantyStoreTraits>::RecordTrace() = default;

}  // namespace KO::LeaseWarrantyProvider

namespace data {

namespace {

namespace store = KO::LeaseWarrantyProvider;
using Pointer = Document::json_pointer;

constexpr const char* identifier = "InstanceID";

/** The names of the properties, in file order. */
constexpr std::array leaseNames{identifier,
                                "Lessor",
                                "BaseTermCommencementDate",
                                "LeaseTerm",
                                "EarlyTerminationOption",
                                "FixedPricePurchaseOption",
                                "RenewalOption",
                                "BargainRenewalOption",
                                "BaseRent",
                                "FairMarketRental",
                                "FairMarketValue",
                                "TerminationValue",
                                "NetMonthlyLeaseRateFactor"};
constexpr std::array warrantyNames{identifier, "Warrantor", "WarrantyStartDate", "WarrantyDuration"};

// --- values --------------------------------------------------------------------------------------------------------

std::string hexadecimal(const std::string& bytes) {
    constexpr const char* digits = "0123456789abcdef";
    std::string result;
    for (const char each : bytes) {
        const auto byte = static_cast<unsigned char>(each);
        result += digits[byte >> 4U];
        result += digits[byte & 15U];
    }
    return result;
}

Document jsonOf(const std::string& value, store::TextForm form) {
    if (form == store::TextForm::date && value == cim::noDate) {
        return nullptr;
    }
    const bool isUtf8 = cim::findInvalidUtf8(value) == std::string::npos;
    return isUtf8 ? Document(value) : Document::object({{"bytes", hexadecimal(value)}});
}

Document jsonOf(unsigned int value, store::TextForm) {
    return value;
}

Document jsonOf(bool value, store::TextForm) {
    return value;
}

void require(bool condition, const char* message) {
    if (!condition) {
        throw ConversionError(message);
    }
}

std::string bytesOf(const Document& value) {
    const auto found = value.find("bytes");
    const std::string digits = found != value.end() && found->is_string() ? found->get<std::string>() : "";
    const bool areDigits = digits.find_first_not_of("0123456789abcdef") == std::string::npos;
    require(areDigits && !digits.empty() && digits.size() % 2 == 0,
            "must be a string, or {\"bytes\": \"...\"} with two hexadecimal digits per byte");
    std::string bytes;
    for (std::size_t index = 0; index < digits.size(); index += 2) {
        bytes += static_cast<char>(std::stoi(digits.substr(index, 2), nullptr, 16));
    }
    return bytes;
}

void assign(std::string& target, const Document& value, store::TextForm form) {
    const bool isNull = form == store::TextForm::date && value.is_null();
    require(isNull || value.is_string() || value.is_object(),
            form == store::TextForm::date ? "must be a string or null" : "must be a string");
    target = isNull ? std::string(cim::noDate) : value.is_object() ? bytesOf(value) : value.get<std::string>();
}

void assign(unsigned int& target, const Document& value, store::TextForm) {
    constexpr std::uint64_t most = std::numeric_limits<std::uint32_t>::max();
    require(value.is_number_unsigned() && value.get<std::uint64_t>() <= most,
            "must be an integer from 0 to 4294967295");
    target = value.get<unsigned int>();
}

void assign(bool& target, const Document& value, store::TextForm) {
    require(value.is_boolean(), "must be true or false");
    target = value.get<bool>();
}

// --- records -------------------------------------------------------------------------------------------------------

template <class Traits, const auto& names>
Document readRecords(const std::string& content) {
    static_assert(names.size() == Traits::fields.size());
    std::istringstream stream(content);
    unsigned int count = 0;
    store::extract(stream, count);
    typename Traits::Unit unit;  // as in the provider, an unreadable field keeps the previous record's value
    Document records = Document::array();
    for (; count > 0; --count) {
        store::readRecord(stream, unit, Traits::fields);
        Document record = Document::object();
        for (std::size_t index = 0; index < names.size(); ++index) {
            const auto& field = Traits::fields[index];
            record[names[index]] =
                std::visit([&](auto member) { return jsonOf(unit.*member, field.form); }, field.member);
        }
        records.push_back(std::move(record));
    }
    return records;
}

template <class Traits, const auto& names>
std::string writeRecords(const Document& document) {
    std::ostringstream stream;
    const std::size_t count = document.at("records").size();
    stream << count;
    store::endLine(stream);
    for (std::size_t number = 0; number < count; ++number) {
        typename Traits::Unit unit;
        for (std::size_t index = 0; index < names.size(); ++index) {
            const auto& field = Traits::fields[index];
            const Pointer place = Pointer("/records") / number / names[index];
            try {
                require(document.contains(place), "is missing");
                std::visit([&](auto member) { assign(unit.*member, document.at(place), field.form); }, field.member);
            } catch (const ConversionError& error) {
                throw ConversionError(place.to_string() + " " + error.what() + ".");
            }
        }
        store::writeRecord(stream, unit, Traits::fields);
    }
    return stream.str();
}

template <class Traits, const auto& names>
constexpr RecordClass recordClass(const char* name, const char* fileName) {
    return {name, fileName, names.size(), readRecords<Traits, names>, writeRecords<Traits, names>};
}

/** Throws ConversionError, which names the first different line, if the two contents differ. */
void requireSameLines(const RecordClass& owner, const std::string& content, const std::string& written) {
    if (content == written) {
        return;
    }
    const auto end = std::mismatch(content.begin(), content.end(), written.begin(), written.end()).first;
    const auto number = std::count(content.begin(), end, '\n');
    const auto line = [&](const std::string& file) {
        std::istringstream lines(file);
        std::string found;
        for (auto each = number; each >= 0; --each) {
            if (!std::getline(lines, found)) {
                return std::string("no line");
            }
        }
        return Document(found).dump(-1, ' ', true, Document::error_handler_t::replace);
    };
    throw ConversionError(std::string(owner.fileName) + ", line " + std::to_string(number + 1) + ": the file has " +
                          line(content) + ", but the provider reads " + line(written) + ".");
}

}  // namespace

const std::array<RecordClass, 2> recordClasses{
    recordClass<store::LeaseStoreTraits, leaseNames>("VELKO_Lease", "Lease.dat"),
    recordClass<store::WarrantyStoreTraits, warrantyNames>("VELKO_Warranty", "Warranty.dat")};

const RecordClass& recordClassOf(const std::string& name) {
    const auto* found = std::find_if(recordClasses.begin(), recordClasses.end(),
                                     [&](const RecordClass& each) { return name == each.name; });
    if (found == recordClasses.end()) {
        throw ConversionError("/class must be VELKO_Lease or VELKO_Warranty, not " + Document(name).dump() + ".");
    }
    return *found;
}

Document documentOf(const RecordClass& owner, const std::string& content) {
    Document document{{"class", owner.name}, {"records", owner.read(content)}};
    const bool isUnended = content.back() != '\n';  // a file without records may lack the last line feed
    requireSameLines(owner, content + (isUnended ? "\n" : ""), owner.write(document));
    return document;
}

std::string contentOf(const RecordClass& owner, const Document& document) {
    if (!document.contains("records") || !document.at("records").is_array()) {
        throw ConversionError("/records must be a list.");
    }
    std::string content = owner.write(document);
    const Document found{{"class", owner.name}, {"records", owner.read(content)}};
    const Document differences = Document::diff(document, found);
    if (!differences.empty()) {
        const Pointer place(differences.at(0).at("path").get<std::string>());
        throw ConversionError(place.to_string() + " cannot be stored: the provider reads " +
                              (found.contains(place) ? found.at(place).dump() : "no such value") + ".");
    }
    requireUnique(document);
    return content;
}

void requireUnique(const Document& document) {
    std::set<std::string> identifiers;
    for (const Document& record : document.at("records")) {
        if (!identifiers.insert(record.at(identifier).dump()).second) {
            throw ConversionError("Two records have the identifier " + record.at(identifier).dump() + ".");
        }
    }
}

}  // namespace data
