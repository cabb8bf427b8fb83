#include <map>
#include <string>

#include "CimXmlServer.h"
#include "Target.h"
#include "cim/Names.h"
#include "cimxml/ElementReader.h"
#include "cimxml/Errors.h"
#include "schema/MofWriter.h"
#include "schema/ObjectPathText.h"

// A request body in CIM-XML: it is refused, or the response is well-formed XML. The instances that it creates or
// modifies are the same after they are written and read.

namespace {

using namespace cimhost;
using fuzz::requireSame;

/** Stores instances by the string of their path. */
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

void requireRoundTrip(const Schema& schema, const Instance& instance) {
    std::string xml;
    cimxml::ObjectWriter("host", "root/cimv2").append(xml, instance, cimxml::ObjectForm::namedInstance);
    const Instance read = cimxml::ElementReader(schema, "root/cimv2").namedInstance(cimxml::parseXml(xml));
    requireSame(formatMof(read), formatMof(instance), "instance that was written and read");
    requireSame(formatObjectPath(read.path), formatObjectPath(instance.path), "path that was written and read");
}

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Model model;
    fuzz::CimXmlServer server(model);
    if (const auto root = server.respond(fuzz::inputOf(data, size))) {
        requireSame(root->name, std::string("CIM"), "root of the response");
    }
    for (const auto& [name, instance] : model.instances) {
        try {
            cimxml::requireRepresentable(instance);
        } catch (const cimxml::CimError&) {
            continue;
        }
        requireRoundTrip(fuzz::CimXmlServer::classes(), instance);
    }
    return 0;
}
