#pragma once

#include <cstddef>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "GateModel.h"
#include "cimxml/XmlElement.h"
#include "model/Response.h"

// CIM-XML messages of a client, written and read without the code of the server.

namespace fuzz {

/** The attribute ID of all messages. */
constexpr const char* messageId = "<7>";

/** The characters that represent a value in a request; none for null, arrays and references. */
std::optional<std::string> charactersOf(const cimhost::Value& value);

/** Ways of writing the same request. */
struct Spelling {
    bool hasCharacterReferences = false;  ///< for all ASCII characters of values
    bool hasCdata = false;                ///< sections for values
    bool hasComments = false;             ///< and blanks between elements
    bool hasOtherCase = false;            ///< names of operations, parameters and keys are in lower case
    bool hasTypes = false;                ///< attributes of properties and keys
    bool namesSingleKey = false;          ///< in a KEYBINDING, if the path has one key
};

Spelling nextSpelling(Bytes& bytes);

/** A request message. */
struct XmlRequest {
    std::string operation{};  ///< as in the message
    std::string document{};
};

/** The request for a call. */
XmlRequest requestFor(const Call& call, const Spelling& spelling);

/** @name Pull operations, which return the results of a call in parts */
///@{
XmlRequest openingRequest(const Call& call, const Spelling& spelling, std::size_t most);
XmlRequest pullRequest(bool ofPaths, const std::string& nameSpace, const std::string& context, std::size_t most);
XmlRequest closingRequest(const std::string& nameSpace, const std::string& context);
///@}

/** The content of a response message. */
struct XmlResponse {
    cimhost::Status status{};
    bool hasReturnValue = false;
    std::vector<cimhost::cimxml::XmlElement> results{};
    std::map<std::string, std::string> parameters{};
};

/** Reads the response to an operation. @throws Violation if the message is not such a response */
XmlResponse responseIn(const cimhost::cimxml::XmlElement& root, const std::string& operation);

/** Reads the results of a call as events. @throws Violation if the call cannot return an element */
cimhost::ResultEvents eventsIn(const std::vector<cimhost::cimxml::XmlElement>& results, const Call& call,
                               bool isPulled);

}  // namespace fuzz
