#include "Request.h"

#include "Calls.h"
#include "Objects.h"

namespace gate {

namespace {

void requireTaken(const CMPIStatus& status) {
    require(status.rc == CMPI_RC_OK, "take the answer", status);
}

}  // namespace

const Class& Request::requestedClass() const {
    const std::string name = classNameOf(path);
    const Class* found = findClass(name);
    if (found == nullptr || sameName(name, computerClass)) {
        fail(CMPI_RC_ERR_INVALID_CLASS, "This provider does not serve the class \"" + name + "\".");
    }
    return *found;
}

void Request::give(const CMPIInstance* instance) const {
    requireTaken(tell<&CMPIResultFT::returnInstance>(result, instance));
}

void Request::give(const CMPIObjectPath* answer) const {
    requireTaken(tell<&CMPIResultFT::returnObjectPath>(result, answer));
}

void Request::finish() const {
    requireTaken(tell<&CMPIResultFT::returnDone>(result));
}

}  // namespace gate
