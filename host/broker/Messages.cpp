#include "broker/Messages.h"

#include <string>
#include <vector>

#include "broker/Broker.h"
#include "broker/ErrorTranslation.h"

namespace cimhost {
namespace {

constexpr CMPICount mostInserts = 10;

/** The inserts of a message, read one after the other. */
class Inserts {
public:
    explicit Inserts(va_list itsList) { va_copy(list, itsList); }
    ~Inserts() { va_end(list); }
    Inserts(const Inserts&) = delete;
    Inserts& operator=(const Inserts&) = delete;

    /** The next one as text. Failure with CMPI_RC_ERR_TYPE_MISMATCH for a type that is none of an insert's. */
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

/** The template with its inserts; triggers without an insert stay. */
std::string expanded(const std::string& text, const std::vector<std::string>& inserts) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool isTrigger = text[i] == '$' && i + 1 < text.size() && text[i + 1] >= '0' && text[i + 1] <= '9';
        const std::size_t index = isTrigger ? static_cast<std::size_t>(text[i + 1] - '0') : inserts.size();
        if (index < inserts.size()) {
            result += inserts[index];
            ++i;
        } else {
            result += text[i];
        }
    }
    return result;
}

std::string message(const char* text, CMPICount count, va_list list) {
    const std::string unexpanded = argument(text);
    if (count > mostInserts) {
        throw Failure(CMPI_RC_ERR_INVALID_PARAMETER);
    }
    Inserts given(list);
    std::vector<std::string> inserts;
    while (inserts.size() < count) {
        inserts.push_back(given.next());
    }
    return expanded(unexpanded, inserts);
}

}  // namespace

CMPIString* messageFromList(const CMPIBroker* broker, const char* text, CMPIStatus* rc, CMPICount count, va_list list) {
    CMPIString* result = guarded<CMPIString*>(
        rc, nullptr, [&] { return Broker::of(broker).arena().make<CMPIString>(message(text, count, list)); });
    if (result == nullptr && text != nullptr) {
        result =
            guarded<CMPIString*>(nullptr, nullptr, [&] { return Broker::of(broker).arena().make<CMPIString>(text); });
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
