#include "support/RecordModel.h"

#include <algorithm>
#include <cstdint>
#include <limits>

#include "cim/DateTime.h"
#include "schema/MofWriter.h"
#include "support/Values.h"

namespace testsupport {

namespace {

constexpr const char* noDate = "00000000000000.000000-000";
constexpr const char* whiteSpace = " \t\n\v\f\r";
constexpr const char* digits = "0123456789";

std::string lineOf(Form form, std::string value) {
    if (form == Form::date) {
        return value.size() < 25 ? noDate : value;
    }
    if (form == Form::text && value.size() < 2) {
        return "*";
    }
    if (form == Form::text || form == Form::identifier) {
        std::replace(value.begin(), value.end(), ' ', '_');
    }
    return value;
}

std::string valueOf(Form form, std::string word) {
    if (form == Form::text && word == "*") {
        return "";
    }
    if (form == Form::text || form == Form::identifier) {
        std::replace(word.begin(), word.end(), '_', ' ');
    }
    return word;
}

/** Reads words and numbers of a file. After a failure it reads nothing more. */
class Scanner {
public:
    explicit Scanner(std::string_view content) : text(content) {}

    /** Reads the next value, if it has this form. */
    void take(Form form, std::string& value) {
        if (form == Form::number || form == Form::flag) {
            takeNumber(form, value);
        } else {
            takeWord(value);
        }
    }

private:
    void takeWord(std::string& value) {
        if (skipToNext()) {
            const std::size_t end = std::min(text.find_first_of(whiteSpace, position), text.size());
            value = std::string(text.substr(position, end - position));
            position = end;
        }
    }

    void takeNumber(Form form, std::string& value) {
        if (!skipToNext()) {
            return;
        }
        const bool isNegative = text[position] == '-';
        position += isNegative || text[position] == '+' ? 1 : 0;
        const std::size_t end = std::min(text.find_first_not_of(digits, position), text.size());
        std::uint64_t number = 0;
        for (std::size_t at = position; at < end; ++at) {
            number = std::min<std::uint64_t>(number * 10 + static_cast<std::uint64_t>(text[at] - '0'), 1ULL << 40U);
        }
        const std::uint64_t largest = form == Form::number ? std::numeric_limits<std::uint32_t>::max()
                                      : isNegative         ? 0
                                                           : 1;
        hasFailed = end == position || number > largest || (isNegative && form == Form::number);
        position = end;
        if (!hasFailed) {
            value = std::to_string(number);
        }
    }

    /** Skips white space. @return whether there is more to read */
    bool skipToNext() {
        position = hasFailed ? std::string::npos : text.find_first_not_of(whiteSpace, position);
        hasFailed = position == std::string::npos;
        return !hasFailed;
    }

    std::string_view text;
    std::size_t position = 0;
    bool hasFailed = false;
};

/** Whether a datetime property can have the value: a date or an interval without asterisks. */
bool isShownDate(const std::string& text) {
    return cim::isPointInTime(text) || cim::isInterval(text);
}

/** The value of the property in MOF. Strings end at the first null character. */
std::string shownValue(Form form, const std::string& value) {
    switch (form) {
        case Form::number:
            return value;
        case Form::flag:
            return value == "1" ? "TRUE" : "FALSE";
        case Form::date:
            return isShownDate(value) ? '"' + value + '"' : "NULL";
        default:
            return cimhost::formatMof(text(value.c_str()));
    }
}

}  // namespace

// clang-format off
const ModelFields& leaseFields() {
    static const ModelFields fields{
        {"InstanceID", Form::identifier}, {"Lessor", Form::text}, {"BaseTermCommencementDate", Form::date},
        {"LeaseTerm", Form::number}, {"EarlyTerminationOption", Form::flag}, {"FixedPricePurchaseOption", Form::flag},
        {"RenewalOption", Form::flag}, {"BargainRenewalOption", Form::flag}, {"BaseRent", Form::text},
        {"FairMarketRental", Form::text}, {"FairMarketValue", Form::text}, {"TerminationValue", Form::text},
        {"NetMonthlyLeaseRateFactor", Form::number}};
    return fields;
}

const ModelFields& warrantyFields() {
    static const ModelFields fields{
        {"InstanceID", Form::identifier}, {"Warrantor", Form::text}, {"WarrantyStartDate", Form::date},
        {"WarrantyDuration", Form::number}};
    return fields;
}
// clang-format on

ModelRecord RecordModel::newRecord(const std::string& instanceId) const {
    ModelRecord record;
    for (const ModelField& field : fields) {
        record.emplace_back(field.form == Form::number || field.form == Form::flag ? "0" : "");
    }
    record.front() = instanceId;
    return record;
}

ModelRecord* RecordModel::find(const std::string& instanceId) {
    const auto found = std::find_if(records.begin(), records.end(),
                                    [&](const ModelRecord& record) { return record.front() == instanceId; });
    return found == records.end() ? nullptr : &*found;
}

bool RecordModel::remove(const std::string& instanceId) {
    const ModelRecord* record = find(instanceId);
    if (record != nullptr) {
        records.erase(records.begin() + (record - records.data()));
    }
    return record != nullptr;
}

std::string RecordModel::written() const {
    std::string content = std::to_string(records.size()) + "\n";
    for (const ModelRecord& record : records) {
        for (std::size_t index = 0; index < fields.size(); ++index) {
            content += lineOf(fields[index].form, record[index]) + "\n";
        }
    }
    return content;
}

std::size_t RecordModel::announcedIn(std::string_view content) {
    std::string count = "0";
    Scanner(content).take(Form::number, count);
    return std::stoul(count);
}

void RecordModel::read(std::string_view content) {
    Scanner scanner(content);
    std::string count = "0";
    scanner.take(Form::number, count);
    ModelRecord record = newRecord("");
    records.clear();
    for (unsigned long left = std::stoul(count); left > 0; --left) {
        for (std::size_t index = 0; index < fields.size(); ++index) {
            scanner.take(fields[index].form, record[index]);
        }
        for (std::size_t index = 0; index < fields.size(); ++index) {
            record[index] = valueOf(fields[index].form, record[index]);
        }
        records.push_back(record);
    }
}

std::vector<std::string> RecordModel::shown(const ModelRecord& record) const {
    std::vector<std::string> values;
    for (std::size_t index = 0; index < fields.size(); ++index) {
        values.push_back(std::string(fields[index].property) + "=" + shownValue(fields[index].form, record[index]));
    }
    return values;
}

std::vector<std::vector<std::string>> RecordModel::shownRecords() const {
    std::vector<std::vector<std::string>> all;
    for (const ModelRecord& record : records) {
        all.push_back(shown(record));
    }
    return all;
}

std::vector<std::string> RecordModel::shownFields(const cimhost::Instance& instance) const {
    std::vector<std::string> values;
    for (const ModelField& field : fields) {
        const cimhost::Value* value = testsupport::find(instance.properties, field.property);
        values.push_back(std::string(field.property) + "=" + (value == nullptr ? "" : cimhost::formatMof(*value)));
    }
    return values;
}

}  // namespace testsupport
