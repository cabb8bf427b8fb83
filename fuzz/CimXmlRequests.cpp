#include <algorithm>
#include <cstdlib>
#include <optional>
#include <string>

#include "AssociationModel.h"
#include "CimXmlMessages.h"
#include "CimXmlServer.h"
#include "Target.h"
#include "cim/Names.h"
#include "cimxml/XmlWriter.h"
#include "operations/ResponseMapping.h"
#include "support/AssetModel.h"
#include "support/Values.h"

// Sequences of CIM-XML requests to the server, with the gate as its provider: the responses and the stored data match
// the gate's model, for all ways of writing a request and if results are pulled in parts. A request with random changes
// has a well-formed response, and changes data only if the response reports success.

namespace {

using namespace fuzz;
using cimhost::Operation;
using cimhost::Value;
using testsupport::Form;

constexpr std::size_t mostRequests = 30;
constexpr const char* servedNameSpace = "root/cimv2";
constexpr int refused = -1;  // instead of a CIM status
constexpr int invalidEnumerationContext = 21;

/** Forwards the server's requests to the gate. */
class GateManager : public cimhost::UpCalls {
public:
    explicit GateManager(SystemUnderTest& itsGate) : gate(itsGate) {}

    cimhost::Response perform(cimhost::Request request) override {
        std::vector<cimhost::ProviderResponse> responses;
        if (cimhost::isAssociationOperation(request.operation)) {
            for (const char* name : {"VELKO_LeaseSetting", "VELKO_WarrantySetting"}) {
                auto& wanted = cimhost::isReferenceOperation(request.operation) ? request.filter.resultClass
                                                                                : request.filter.associationClass;
                if (!wanted || cim::sameName(*wanted, name)) {
                    Call call{{}, request, false, false};
                    (cimhost::isReferenceOperation(request.operation) ? call.request.filter.resultClass
                                                                      : call.request.filter.associationClass) = name;
                    responses.push_back(gate.perform(call));
                }
            }
        } else {
            const bool hasInstance =
                request.operation == Operation::createInstance || request.operation == Operation::modifyInstance;
            responses.push_back(gate.perform({{}, request, hasInstance, false}));
        }
        return cimhost::mapResponses(cimhost::ManagerBehaviour::standard(), request, std::move(responses), false);
    }

private:
    SystemUnderTest& gate;
};

std::optional<std::uint32_t> numberIn(const std::string& characters) {
    const int base = characters.find_first_of("xX") == std::string::npos ? 10 : 16;
    const long long number = std::strtoll(characters.c_str(), nullptr, base);
    const bool fits = number >= 0 && number <= std::int64_t{UINT32_MAX};
    return fits ? std::optional(static_cast<std::uint32_t>(number)) : std::nullopt;
}

/** The value that the server reads if it accepts the characters of a sent value. */
Value received(const Value& sent, Form form) {
    const auto characters = charactersOf(sent);
    if (!characters) {
        return sent.lacksCharacters ? testsupport::nullOf(CMPI_string) : sent;
    }
    switch (form) {
        case Form::number: {
            const auto number = numberIn(*characters);
            return number ? testsupport::uint32(*number) : testsupport::nullOf(CMPI_uint32);
        }
        case Form::flag:
            return testsupport::boolean(characters->find_first_of("tT") != std::string::npos);
        case Form::date:
            return testsupport::dateTime(*characters);
        default:
            return testsupport::text(*characters);
    }
}

/** The form of a property in the schema. */
Form formOf(const std::string& className, const std::string& property) {
    if (const Store* store = storeOf(className)) {
        for (const testsupport::ModelField& field : store->fields()) {
            if (cim::sameName(field.property, property)) {
                return field.form;
            }
        }
    }
    for (const testsupport::AssetField& field : testsupport::assetFields) {
        if (field.kind == testsupport::AssetKind::date && cim::sameName(field.property, property)) {
            return Form::date;
        }
    }
    return Form::text;
}

bool isIdentifier(const cimhost::NamedValue& each) {
    return cim::sameName(each.name, "InstanceID");
}

/** In CIM-XML, the keys of a new instance are among its properties. */
void moveKeysToProperties(Call& call) {
    if (!call.performs(Operation::createInstance) || !call.hasInstance) {
        return;
    }
    auto& properties = call.request.instance.properties;
    for (const cimhost::NamedValue& key : call.request.path.keys) {
        const auto isSame = [&](const auto& each) { return cim::sameName(each.name, key.name); };
        if (std::none_of(properties.begin(), properties.end(), isSame)) {
            properties.push_back(key);
        }
    }
}

/** The call that the server reads from the request: values have the types of the schema. */
Call receivedCall(Call call) {
    for (cimhost::NamedValue& key : call.request.path.keys) {
        key.value = received(key.value, Form::text);
    }
    for (cimhost::NamedValue& property : call.request.instance.properties) {
        property.value = received(property.value, formOf(call.request.path.className, property.name));
    }
    if (call.performs(Operation::createInstance)) {
        const auto& properties = call.request.instance.properties;
        const auto identifier = std::find_if(properties.begin(), properties.end(), isIdentifier);
        call.request.path.keys.clear();
        if (identifier != properties.end()) {
            call.request.path.keys.push_back(*identifier);
        }
    }
    return call;
}

bool isKnownClass(const std::optional<std::string>& name) {
    return !name || CimXmlServer::classes().findClass(*name) != nullptr;
}

/** The status of a request that the server does not send to a provider; none for other requests. */
std::optional<int> statusOfServer(const Call& call) {
    const cimhost::Request& request = call.request;
    const bool isChange = call.performs(Operation::createInstance) || call.performs(Operation::modifyInstance);
    if (request.path.nameSpace.empty() || !cimhost::cimxml::isRepresentable(requestFor(call, {}).document)) {
        return refused;
    }
    if (request.path.nameSpace != servedNameSpace) {
        return CMPI_RC_ERR_INVALID_NAMESPACE;
    }
    if (call.performs(Operation::execQuery)) {
        return CMPI_RC_ERR_NOT_SUPPORTED;
    }
    if (isChange && !call.hasInstance) {
        return CMPI_RC_ERR_INVALID_PARAMETER;
    }
    const bool isEnumeration = request.operation <= Operation::enumerateInstanceNames;
    return isEnumeration && !isKnownClass(request.path.className) ? std::optional<int>(CMPI_RC_ERR_INVALID_CLASS)
                                                                  : std::nullopt;
}

/** Whether the server may refuse a request that the gate would accept: the path or the filter does not match the
 * schema.
 */
bool mayBeRefused(const Call& call) {
    const cimhost::Request& request = call.request;
    const bool isOfOneRecord = request.path.keys.size() == 1 && isIdentifier(request.path.keys.front());
    const bool isReference = cimhost::isReferenceOperation(request.operation);
    return (call.performs(Operation::getInstance) && storeOf(request.path.className) != nullptr && !isOfOneRecord) ||
           (cimhost::isAssociationOperation(request.operation) &&
            (!isKnownClass(request.filter.resultClass) ||
             (!isReference && !isKnownClass(request.filter.associationClass))));
}

std::string changedAtRandom(std::string document, Bytes& bytes) {
    for (std::size_t changes = 1 + bytes.below(4); changes > 0; --changes) {
        const std::size_t low = bytes.byte();
        const std::size_t at = (low | std::size_t{bytes.byte()} << 8U) % document.size();
        switch (bytes.below(3)) {
            case 0:
                document[at] = static_cast<char>(bytes.byte());
                break;
            case 1:
                document.insert(at, 1, static_cast<char>(bytes.byte()));
                break;
            default:
                document.erase(at, bytes.below(32));
        }
        document += document.empty() ? " " : "";
    }
    return document;
}

/** A sequence of requests. */
class TestCase {
public:
    explicit TestCase(Bytes& itsBytes)
        : bytes(itsBytes), computers(bytes.below(SystemUnderTest::kindsOfComputers)), gate(computers) {}

    void performNext() {
        Call call = bytes.below(4) == 0 ? nextTraversal(bytes) : nextCall(bytes);
        if (call.event) {
            gate.perform(call);
            return;
        }
        moveKeysToProperties(call);
        const Spelling spelling = nextSpelling(bytes);
        const std::size_t kind = bytes.below(8);
        try {
            if (kind == 0) {
                sendChanged(requestFor(call, spelling).document);
            } else if (kind > 4 && isPullable(call)) {
                sendAndCompare(call, [&] { return pulled(call, spelling); });
            } else {
                sendAndCompare(call, [&] { return answered(call, spelling); });
            }
        } catch (const Violation& violation) {
            throw Violation(violation.what() + ("\nafter " + describe(call)) + requestFor(call, spelling).document);
        }
    }

private:
    static bool isPullable(const Call& call) {
        return call.request.operation <= Operation::enumerateInstanceNames ||
               cimhost::isAssociationOperation(call.request.operation);
    }

    template <class Send>
    void sendAndCompare(const Call& sent, Send send) {
        const Snapshot before;
        const Call call = receivedCall(sent);
        const std::optional<cimhost::ProviderResponse> response = send();
        if (!response || (response->status.rc != CMPI_RC_OK && mayBeRefused(call))) {
            return requireUnchanged(before);
        }
        if (response->status.rc != CMPI_RC_OK && call.isChange()) {
            gate.perform(harmlessRead());
        }
        if (const auto status = statusOfServer(sent)) {
            requireSame(response->status.rc, *status, "status: " + response->status.message);
            return requireUnchanged(before);
        }
        requireRight(call, *response, before);
        requireAssociations(call, *response, before, computers);
    }

    static void requireUnchanged(const Snapshot& before) {
        require(Snapshot() == before, "only a change that returns OK changes data");
    }

    XmlResponse send(const XmlRequest& request) {
        const auto root = server.respond(request.document);
        return root ? responseIn(*root, request.operation) : XmlResponse{{refused, "The request is refused."}};
    }

    cimhost::ProviderResponse answered(const Call& call, const Spelling& spelling) {
        const XmlResponse response = send(requestFor(call, spelling));
        const bool returns = !call.performs(Operation::modifyInstance) && !call.performs(Operation::deleteInstance);
        require(response.hasReturnValue == (returns && response.status.ok()), "an operation has its return value");
        return responseWith(response.status, response.results, call, false);
    }

    static cimhost::ProviderResponse responseWith(const cimhost::Status& status,
                                                  const std::vector<cimhost::cimxml::XmlElement>& results,
                                                  const Call& call, bool isPulled) {
        cimhost::ProviderResponse response{status, !status.message.empty()};
        if (status.ok()) {
            response.events = eventsIn(results, receivedCall(call), isPulled);
            response.events.emplace_back(cimhost::Done{});
        }
        return response;
    }

    /** The results of an enumeration that is pulled to its end; none if it is closed earlier. */
    std::optional<cimhost::ProviderResponse> pulled(const Call& call, const Spelling& spelling) {
        const bool ofPaths = cimhost::returnsPaths(call.request.operation);
        const std::string& nameSpace = call.request.path.nameSpace;
        std::size_t most = bytes.below(4);
        std::vector<cimhost::cimxml::XmlElement> results;
        for (XmlResponse part = send(openingRequest(call, spelling, most));;) {
            if (!part.status.ok()) {
                require(results.empty(), "an open enumeration can be pulled: " + part.status.message);
                return responseWith(part.status, {}, call, true);
            }
            require(part.hasReturnValue && part.results.size() <= most, "a part has at most MaxObjectCount objects");
            results.insert(results.end(), part.results.begin(), part.results.end());
            const std::string context = part.parameters["EnumerationContext"];
            const std::string isAtEnd = part.parameters["EndOfSequence"];
            require(isAtEnd == "TRUE" || isAtEnd == "FALSE", "EndOfSequence is a boolean");
            require((isAtEnd == "TRUE") == context.empty(), "an open enumeration has a context");
            if (isAtEnd == "TRUE") {
                return responseWith({}, results, call, true);
            }
            if (isClosed(ofPaths, nameSpace, context)) {
                return std::nullopt;
            }
            most = 1 + bytes.below(3);
            part = send(pullRequest(ofPaths, nameSpace, context, most));
        }
    }

    /** Sometimes sends a pull of the other kind, or closes the enumeration. @return whether it is now closed */
    bool isClosed(bool ofPaths, const std::string& nameSpace, const std::string& context) {
        const std::size_t choice = bytes.below(8);
        if (choice == 1) {
            requireSame(send(pullRequest(!ofPaths, nameSpace, context, 1)).status.rc, invalidEnumerationContext,
                        "pull of the other kind");
        } else if (choice == 2) {
            requireSame(send(closingRequest(nameSpace, context)).status.rc, int{CMPI_RC_OK}, "closing");
            requireSame(send(pullRequest(ofPaths, nameSpace, context, 1)).status.rc, invalidEnumerationContext,
                        "pull of a closed enumeration");
        }
        return choice == 2;
    }

    /** Sends a request with random changes. Its effect is unknown if the response reports success. */
    void sendChanged(const std::string& document) {
        const Snapshot before;
        const auto root = server.respond(changedAtRandom(document, bytes));
        const Call read = harmlessRead();
        const cimhost::ProviderResponse response = gate.perform(read);
        if (!root || !isSuccessOfChange(*root)) {
            requireUnchanged(before);
        }
        requireRight(read, response, Snapshot());
    }

    static bool isSuccessOfChange(const cimhost::cimxml::XmlElement& root) {
        const auto& response = root.children.at(0).children.at(0).children.at(0);
        const std::string* name = response.attribute("NAME");
        const auto isSame = [&](const char* each) { return name != nullptr && cim::sameName(*name, each); };
        return response.child("ERROR") == nullptr &&
               (isSame("CreateInstance") || isSame("ModifyInstance") || isSame("DeleteInstance"));
    }

    Bytes& bytes;
    std::size_t computers;
    SystemUnderTest gate;
    GateManager manager{gate};
    CimXmlServer server{manager};
};

}  // namespace

int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    Bytes bytes(data, size);
    TestCase test(bytes);
    for (std::size_t requests = 0; requests < mostRequests && !bytes.isAtEnd(); ++requests) {
        test.performNext();
    }
    return 0;
}
