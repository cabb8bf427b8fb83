#include "cimxml/ResponseText.h"

#include "cimxml/XmlWriter.h"

namespace cimhost::cimxml {
namespace {

const char* responseElement(bool isIntrinsic) {
    return isIntrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE";
}

std::string headFor(const Message& request) {
    std::string text =
        "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE";
    appendAttribute(text, "ID", request.id);
    appendAttribute(text, "PROTOCOLVERSION", "1.0");
    text += std::string("><SIMPLERSP><") + responseElement(request.isIntrinsic);
    appendAttribute(text, "NAME", request.method);
    return text + ">";
}

}  // namespace

ResponseText::ResponseText(const Message& request, OperationResult itsResult)
    : isIntrinsic(request.isIntrinsic), head(headFor(request)), result(std::move(itsResult)) {
    if (result.next) {
        head += "<IRETURNVALUE>";
        result.parameters.insert(0, "</IRETURNVALUE>");
    }
}

ResponseText::ResponseText(const Message& request, const CimError& error)
    : isIntrinsic(request.isIntrinsic), head(headFor(request)), code(error.code) {
    const Element element(head, "ERROR", [&] {
        appendAttribute(head, "CODE", std::to_string(error.code));
        appendAttribute(head, "DESCRIPTION", error.what());
    });
}

bool ResponseText::append(std::string& text, std::size_t size) {
    text += head;
    head.clear();
    while (text.size() < size) {
        if (hasEnded) {
            return false;
        }
        if (!result.next || !result.next(text)) {
            text += result.parameters + "</" + responseElement(isIntrinsic) + "></SIMPLERSP></MESSAGE></CIM>\n";
            hasEnded = true;
        }
    }
    return true;
}

}  // namespace cimhost::cimxml
