#include "Calls.h"

namespace gate {

std::string textOf(const CMPIString* string) {
    return cim::charactersOf(string).value_or(std::string());
}

bool saysAbsent(const CMPIStatus& status) {
    return status.rc == CMPI_RC_ERR_NOT_FOUND || status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY;
}

std::string failureText(const char* what, const CMPIStatus& status) {
    std::string text = std::string("The object manager could not ") + what;
    if (status.rc != CMPI_RC_OK) {
        text += ": code " + std::to_string(status.rc);
        const std::string reason = textOf(status.msg);
        text += reason.empty() ? "" : ", " + reason;
    }
    return text + ".";
}

void require(bool couldBeDone, const char* what, const CMPIStatus& status) {
    if (!couldBeDone) {
        fail(CMPI_RC_ERR_FAILED, failureText(what, status));
    }
}

}  // namespace gate
