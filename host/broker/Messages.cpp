#include <string>
#include <vector>

#include "broker/Broker.h"
#include "broker/ErrorTranslation.h"
#include "broker/FunctionTables.h"

namespace cimhost {
namespace {

constexpr CMPICount mostArguments = 10;

/** Reads the arguments of a message. */
class MessageArguments {
public:
    explicit MessageArguments(va_list itsList) { va_copy(list, itsList); }
    ~MessageArguments() { va_end(list); }
    MessageArguments(const MessageArguments&) = delete;
    MessageArguments& operator=(const MessageArguments&) = delete;

    /** Formats the next argument. @throws Failure with CMPI_RC_ERR_TYPE_MISMATCH for an unknown type */
    std::string next() {
        switch (va_arg(list, int)) {
            case CMPI_sint32:
                return std::to_string(va_arg(list, CMPISint32));
            case CMPI_uint32:
                return std::to_string(va_arg(list, CMPIUint32));
            case CMPI_sint64:
                return std::to_string(va_arg(list, CMPISint64));
            case CMPI_uint64:
                return std::to_string(va_arg(list, CMPIUint64));
            case CMPI_real64:
                return std::to_string(va_arg(list, CMPIReal64));
            case CMPI_boolean:
                return va_arg(list, int) != 0 ? "true" : "false";
            case CMPI_chars:
                return argument(va_arg(list, const char*));
            case CMPI_string:
                return argument(va_arg(list, const CMPIString*));
            default:
                throw Failure(CMPI_RC_ERR_TYPE_MISMATCH);
        }
    }

private:
    va_list list;
};

/** Replaces $0 to $9 with the arguments that exist. */
std::string expanded(const std::string& pattern, const std::vector<std::string>& arguments) {
    std::string result;
    for (std::size_t i = 0; i < pattern.size(); ++i) {
        const bool isReference =
            pattern[i] == '$' && i + 1 < pattern.size() && pattern[i + 1] >= '0' && pattern[i + 1] <= '9';
        const std::size_t index = isReference ? static_cast<std::size_t>(pattern[i + 1] - '0') : arguments.size();
        if (index < arguments.size()) {
            result += arguments[index];
            ++i;
        } else {
            result += pattern[i];
        }
    }
    return result;
}

std::string message(const char* defaultTemplate, CMPICount count, va_list list) {
    const std::string pattern = argument(defaultTemplate);
    if (count > mostArguments) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    MessageArguments reader(list);
    std::vector<std::string> arguments;
    while (arguments.size() < count) {
        arguments.push_back(reader.next());
    }
    return expanded(pattern, arguments);
}

}  // namespace

CMPIString* messageFromList(const CMPIBroker* broker, const char* defaultTemplate, CMPIStatus* rc, CMPICount count,
                            va_list list) {
    CMPIString* result = guarded<CMPIString*>(rc, nullptr, [&] {
        return Broker::of(broker).arena().make<CMPIString>(message(defaultTemplate, count, list));
    });
    if (result == nullptr && defaultTemplate != nullptr) {
        result = guarded<CMPIString*>(nullptr, nullptr,
                                      [&] { return Broker::of(broker).arena().make<CMPIString>(defaultTemplate); });
    }
    return result;
}

CMPIString* getMessage(const CMPIBroker* broker, const char*, const char* defaultTemplate, CMPIStatus* rc,
                       CMPICount count, ...) {
    va_list list;
    va_start(list, count);
    CMPIString* result = messageFromList(broker, defaultTemplate, rc, count, list);
    va_end(list);
    return result;
}

CMPIString* getMessage2(const CMPIBroker* broker, const char*, CMPIMsgFileHandle, const char* defaultTemplate,
                        CMPIStatus* rc, CMPICount count, ...) {
    va_list list;
    va_start(list, count);
    CMPIString* result = messageFromList(broker, defaultTemplate, rc, count, list);
    va_end(list);
    return result;
}

}  // namespace cimhost
