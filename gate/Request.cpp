#include "Request.h"

#include "Calls.h"
#include "Objects.h"

namespace gate {

namespace {

template <auto function, class... Answer>
void tellResult(const Request& request, Answer... answer) {
    request.requireManager();
    const CMPIStatus status = tell<function>(request.result, answer...);
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
    tellResult<&CMPIResultFT::returnInstance>(*this, instance);
}

void Request::give(const CMPIObjectPath* answer) const {
    tellResult<&CMPIResultFT::returnObjectPath>(*this, answer);
}

void Request::finish() const {
    tellResult<&CMPIResultFT::returnDone>(*this);
}

}  // namespace gate
