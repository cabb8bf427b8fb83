#include <map>
#include <string>

#include "Target.h"
#include "cim/Names.h"
#include "cimxml/ElementReader.h"
#include "cimxml/Errors.h"
#include "cimxml/ResponseText.h"
#include "schema/MofReader.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

// A request body in CIM-XML: it is refused, or the response is well-formed XML and agrees with a model of the
// instances, which read the same once written.

namespace {

using namespace cimhost;
using fuzz::require;
using fuzz::requireSame;

/** Instances by the string of their path. */
class Model : public UpCalls {
public:
    Response perform(Request request) override {
        const std::string name = formatObjectPath(request.path);
        const auto found = instances.find(name);
        switch (request.operation) {
            case Operation::enumerateInstances:
            case Operation::enumerateInstanceNames:
                return listed(request);
            case Operation::createInstance:
                request.instance.path = request.path;
                return instances.emplace(name, request.instance).second
                           ? Response::ofPaths({request.path})
                           : Response::failed({CMPI_RC_ERR_ALREADY_EXISTS, "there already"});
            case Operation::getInstance:
            case Operation::modifyInstance:
            case Operation::deleteInstance:
                return found == instances.end() ? Response::failed({CMPI_RC_ERR_NOT_FOUND, name})
                                                : changed(request, found);
            default:
                return {};
        }
    }

    std::map<std::string, Instance> instances{};

private:
    Response listed(const Request& request) const {
        Response response;
        for (const auto& [name, instance] : instances) {
            if (cim::sameName(instance.path.className, request.path.className)) {
                response.instances.push_back(instance);
                response.paths.push_back(instance.path);
            }
        }
        (returnsPaths(request.operation) ? response.instances.clear() : response.paths.clear());
        return response;
    }

    Response changed(const Request& request, std::map<std::string, Instance>::iterator found) {
        if (request.operation == Operation::getInstance) {
            return Response::ofInstances({found->second});
        }
        if (request.operation == Operation::deleteInstance) {
            instances.erase(found);
        } else {
            found->second.properties = request.instance.properties;
        }
        return {};
    }
};

/** The server that the input is sent to. */
class Server {
public:
    Server() {
        MofReader(schema).readFile(SCHEMA_MOF);
        for (const Class* each : schema.classes()) {
            registry.add({each->name, "Model", "Model", true, each->isAssociation(), {"root/cimv2"}, "", "", ""});
        }
    }

    /** The text of the response; empty for a request that is refused. */
    std::string respond(std::string_view document) {
        try {
            const cimxml::Message message = cimxml::readMessage(document);
            std::string text;
            try {
                write(cimxml::ResponseText(message, operations.perform(message, {"user", true})), text);
            } catch (const cimxml::CimError& error) {
                require(error.code > 0, "an error has a code");
                write(cimxml::ResponseText(message, error), text);
            }
            return text;
        } catch (const cimxml::RequestRefused& refused) {
            require(refused.httpStatus == 400 || refused.httpStatus == 501, "a refusal has its status");
            require(!refused.cimError.empty(), "a refusal has a reason");
            return {};
        }
    }

    const Model& model() const { return manager; }
    const Schema& classes() const { return schema; }

private:
    static void write(cimxml::ResponseText response, std::string& text) {
        while (response.append(text, text.size() + 1000)) {
        }
    }

    Schema schema;
    ProviderRegistry registry;
    Model manager;
    cimxml::Operations operations{schema, registry, manager, {"host", "1", {}}};
};

void requireRoundTrip(const Schema& schema, const Instance& instance) {
    std::string xml;
    cimxml::ObjectWriter("host", "root/cimv2").append(xml, instance, cimxml::ObjectForm::namedInstance);
    const Instance read = cimxml::ElementReader(schema, "root/cimv2").namedInstance(cimxml::parseXml(xml));
    requireSame(formatMof(read), formatMof(instance), "instance that was written and read");
    requireSame(formatObjectPath(read.path), formatObjectPath(instance.path), "path that was written and read");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Server server;
    const std::string text = server.respond(fuzz::inputOf(data, size));
    if (!text.empty()) {
        const cimxml::XmlElement root = cimxml::parseXml(text);
        requireSame(root.name, std::string("CIM"), "root of the response");
    }
    for (const auto& [name, instance] : server.model().instances) {
        try {
            cimxml::requireRepresentable(instance);
        } catch (const cimxml::CimError&) {
            continue;
        }
        requireRoundTrip(server.classes(), instance);
    }
    return 0;
}
