#include "FixedMessage.h"

namespace gate {

namespace {

void answerOk(CMPIStatus* rc) {
    if (rc != nullptr) {
        *rc = {CMPI_RC_OK, nullptr};
    }
}

/** There is nothing to free: who releases it, or its clone, changes nothing. */
CMPIStatus release(CMPIString*) {
    return {CMPI_RC_OK, nullptr};
}

CMPIString* clone(const CMPIString* string, CMPIStatus* rc) {
    answerOk(rc);
    return const_cast<CMPIString*>(string);
}

const char* getCharPtr(const CMPIString* string, CMPIStatus* rc) {
    answerOk(rc);
    return static_cast<const char*>(string->hdl);
}

}  // namespace

CMPIStringFT FixedMessage::functions{CMPIVersion200, release, clone, getCharPtr};

}  // namespace gate
