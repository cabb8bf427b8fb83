#include "CimXmlServer.h"

#include <string>

#include "Target.h"
#include "cimxml/Errors.h"
#include "cimxml/ResponseText.h"
#include "schema/MofReader.h"

namespace fuzz {

namespace {

using namespace cimhost;

/** All classes are served in one namespace. */
const ProviderRegistry& providers() {
    static const ProviderRegistry registry = [] {
        ProviderRegistry made;
        for (const Class* each : CimXmlServer::classes().classes()) {
            made.add({each->name, "Model", "Model", true, each->isAssociation(), {"root/cimv2"}, "", "", ""});
        }
        return made;
    }();
    return registry;
}

cimxml::XmlElement rootOf(cimxml::ResponseText response) {
    std::string text;
    while (response.append(text, text.size() + 1000)) {
    }
    try {
        return cimxml::parseXml(text);
    } catch (const cimxml::XmlError& error) {
        throw Violation(std::string("the response is not well-formed: ") + error.what());
    }
}

}  // namespace

const Schema& CimXmlServer::classes() {
    static const Schema schema = [] {
        Schema read;
        MofReader(read).readFile(SCHEMA_MOF);
        return read;
    }();
    return schema;
}

CimXmlServer::CimXmlServer(UpCalls& manager) : operations(classes(), providers(), manager, {host, "1", {}}) {}

std::optional<cimxml::XmlElement> CimXmlServer::respond(std::string_view document) {
    try {
        const cimxml::Message message = cimxml::readMessage(document);
        try {
            return rootOf({message, operations.perform(message, {"user", true})});
        } catch (const cimxml::CimError& error) {
            require(error.code > 0, "an error has a code");
            return rootOf({message, error});
        }
    } catch (const cimxml::RequestRefused& refused) {
        require(refused.httpStatus == 400 || refused.httpStatus == 501, "a refusal has its status");
        require(!refused.cimError.empty(), "a refusal has a reason");
        return std::nullopt;
    }
}

}  // namespace fuzz
