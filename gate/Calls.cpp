#include "Calls.h"

namespace gate {

std::string textOf(const CMPIString* string) {
    const char* characters = ask<&CMPIStringFT::getCharPtr>(string).value;
    return characters != nullptr ? characters : "";
}

bool saysAbsent(const CMPIStatus& status) {
    return status.rc == CMPI_RC_ERR_NOT_FOUND || status.rc == CMPI_RC_ERR_NO_SUCH_PROPERTY;
}

void require(bool couldBeDone, const char* what, const CMPIStatus& status) {
    if (couldBeDone) {
        return;
    }
    std::string text = std::string("The object manager could not ") + what;
    if (status.rc != CMPI_RC_OK) {
        text += ": code " + std::to_string(status.rc);
        const std::string reason = textOf(status.msg);
        text += reason.empty() ? "" : ", " + reason;
    }
    fail(CMPI_RC_ERR_FAILED, text + ".");
}

}  // namespace gate
