#pragma once

#include <optional>
#include <string_view>

#include "cimxml/Operations.h"

namespace fuzz {

/** The CIM-XML server without HTTP. */
class CimXmlServer {
public:
    /** @param manager receives the operations on instances; must outlive the server */
    explicit CimXmlServer(cimhost::UpCalls& manager);

    /**
     * The root element of the response; none for a request that is refused.
     * @throws Violation if the response is not well-formed, or the refusal has no reason
     */
    std::optional<cimhost::cimxml::XmlElement> respond(std::string_view document);

    static const cimhost::Schema& classes();

    static constexpr const char* host = "host";

private:
    cimhost::cimxml::Operations operations;
};

}  // namespace fuzz
