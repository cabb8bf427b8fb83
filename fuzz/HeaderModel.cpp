#include "HeaderModel.h"

#include <algorithm>
#include <stdexcept>

namespace fuzz {

namespace {

const Refusal right{};
const Refusal forbidden{403, ""};
const Refusal ambiguous{400, ""};
const Refusal tooLarge{413, ""};
const Refusal otherContent{415, ""};
const Refusal mismatch{400, "header-mismatch"};
const Refusal otherVersion{400, "unsupported-protocol-version"};
const Refusal withoutExtension{510, ""};

HeaderValue absent(const Refusal& refusal) {
    return {{}, refusal};
}

HeaderValue one(const std::string& value, const Refusal& refusal = right, const std::string& decoded = {}) {
    return {{value}, refusal, decoded};
}

HeaderValue twice(const std::string& value, const std::string& other, const Refusal& refusal) {
    return {{value, other}, refusal};
}

// clang-format off
HeaderRow hostRow() {
    return {"Host", false,
            {one("localhost"), one("LocalHost:5988"), one("127.0.0.1"), one("127.1.2.3:80"), one("[::1]"), one("[::1]:5988"),
             absent(forbidden), one("", forbidden), one("example.com", forbidden), one("localhost.example.com", forbidden),
             one("127.0.0.1.example.com", forbidden), one("example.com:127", forbidden), one("10.0.0.1", forbidden),
             one("[::2]", forbidden), one("localhost@example.com", forbidden), twice("localhost", "localhost", ambiguous)}};
}

HeaderRow contentTypeRow() {
    return {"Content-Type", false,
            {one(R"(application/xml; charset="utf-8")"), one("text/xml"), one("Application/XML;charset=UTF-8"),
             one("text/xml; charset=us-ascii"), one("text/xml; a=b; charset=utf-8"),
             absent(otherContent), one("", otherContent), one("application/json", otherContent),
             one("application/xmlx", otherContent), one("xml", otherContent), one("text/plain; a=text/xml", otherContent),
             one("application/xml; charset=iso-8859-1", otherContent), one("text/xml; a=b; charset=utf-16", otherContent),
             twice("text/xml", "text/xml", otherContent)}};
}

HeaderRow manRow() {
    const std::string mapping = "http://www.dmtf.org/cim/mapping/http/v1.0";
    return {"Man", false,
            {one(mapping + " ; ns=73"), one('"' + mapping + "\";ns=73"), one(mapping + "; a=b; NS=73"),
             absent(withoutExtension), one(mapping, withoutExtension), one(mapping + "; ns=7", withoutExtension),
             one(mapping + "; ns=7a", withoutExtension), one(mapping + "; ns=730", withoutExtension),
             one("http://example.com ; ns=73", withoutExtension),
             twice(mapping + "; ns=73", mapping + "; ns=74", withoutExtension)}};
}

std::vector<HeaderRow> bodyRows() {
    return {contentTypeRow(),
            {"Content-Length", false,
             {one("1000"), absent(right), one("0"), one("0001000"),
              one("1001", tooLarge), one("99999999999999999999999", tooLarge), one("-1", ambiguous), one("+1", ambiguous),
              one("1 000", ambiguous), one("0x10", ambiguous), one("", ambiguous), twice("10", "10", ambiguous)}},
            {"Transfer-Encoding", false,
             {absent(right), one("chunked"), one("gzip", ambiguous), one("", ambiguous), one("chunked, gzip", ambiguous),
              twice("chunked", "chunked", ambiguous)}},
            {"Content-Encoding", false,
             {absent(right), one("Identity"), one("gzip", otherContent), one("", otherContent),
              twice("identity", "gzip", otherContent)}}};
}

std::vector<HeaderRow> operationRows() {
    const Refusal noMessage{400, ""};
    const Refusal otherMessage{400, "unsupported-operation"};
    return {{"CIMOperation", true,
             {one("MethodCall"), one("methodcall"), absent(noMessage), one("", otherMessage),
              one("MethodCal", otherMessage), one("MethodResponse", otherMessage),
              twice("MethodCall", "MethodCall", otherMessage)}},
            {"CIMProtocolVersion", true,
             {absent(right), one("1.0"), one("1.4"), one("2.0", otherVersion), one("10.0", otherVersion),
              one("1", otherVersion), one("1.", otherVersion), one("1.x", otherVersion), one("", otherVersion), twice("1.0", "2.0", otherVersion)}},
            {"CIMBatch", true, {absent(right), one("", {501, "multiple-requests-unsupported"})}},
            {"CIMExport", true, {absent(right), one("x", {501, "unsupported-operation"})}},
            {"CIMMethod", true,
             {one("GetClass", right, "GetClass"), one("Get%43l%61ss", right, "GetClass"), absent(mismatch),
              one("GetClass%", mismatch), one("GetClass%4", mismatch), one("%4gGetClass", mismatch),
              one("%+1", mismatch), one("% 1", mismatch), twice("GetClass", "GetClass", mismatch)}},
            {"CIMObject", true,
             {one("root%2Fcimv2", right, "root/cimv2"), one("root%2fcimv2", right, "root/cimv2"),
              one("root/cimv2", right, "root/cimv2"), one("%25", right, "%"), absent(mismatch), one("root%", mismatch),
              one("root%2", mismatch), one("root%zz", mismatch), twice("root", "interop", mismatch)}}};
}
// clang-format on

}  // namespace

const std::vector<HeaderRow>& headerRows() {
    static const std::vector<HeaderRow> rows = [] {
        std::vector<HeaderRow> all{
            hostRow(),
            {"Origin", false, {absent(right), one("null", forbidden), one("", forbidden), one("http://a", forbidden)}},
            manRow()};
        for (const auto& more : {bodyRows(), operationRows()}) {
            all.insert(all.end(), more.begin(), more.end());
        }
        return all;
    }();
    return rows;
}

cimhost::server::HttpRequest ModelRequest::request() const {
    cimhost::server::HttpRequest made{method, {}};
    for (std::size_t row = 0; row < values.size(); ++row) {
        const HeaderRow& header = headerRows()[row];
        for (const std::string& value : header.values[values[row]].sent) {
            made.headers.emplace((header.hasPrefix ? prefix : "") + header.name, value);
        }
    }
    return made;
}

const HeaderValue& ModelRequest::valueOf(const std::string& name) const {
    const std::vector<HeaderRow>& rows = headerRows();
    const auto row = std::find_if(rows.begin(), rows.end(), [&](const HeaderRow& each) { return each.name == name; });
    if (row == rows.end()) {
        throw std::logic_error(name);
    }
    const bool isSeen = !row->hasPrefix || prefix == (isExtended() ? "73-" : "");
    if (isSeen) {
        return row->values[values[static_cast<std::size_t>(row - rows.begin())]];
    }
    return *std::find_if(row->values.begin(), row->values.end(),
                         [](const HeaderValue& each) { return each.sent.empty(); });
}

bool ModelRequest::isAmbiguous() const {
    const bool hasTwoLengths = !valueOf("Content-Length").sent.empty() && !valueOf("Transfer-Encoding").sent.empty();
    return hasTwoLengths || valueOf("Host").refusal.status == ambiguous.status ||
           valueOf("Content-Length").refusal.status == ambiguous.status ||
           valueOf("Transfer-Encoding").refusal.status != 0;
}

std::set<Refusal> ModelRequest::refusals() const {
    if (isAmbiguous()) {
        return {ambiguous};
    }
    const bool isLocal = !requiresLocalHost || valueOf("Host").refusal.status == 0;
    if (!isLocal || valueOf("Origin").refusal.status != 0) {
        return {forbidden};
    }
    if (method != "POST" && !isExtended()) {
        return {Refusal{method == "OPTIONS" ? 200U : 405U, ""}};
    }
    if (isExtended() && valueOf("Man").refusal.status != 0) {
        return {withoutExtension};
    }
    std::set<Refusal> reasons;
    for (const HeaderRow& row : headerRows()) {
        const bool isOfListener = row.name == "Host" || row.name == "Man";
        const Refusal& refusal = valueOf(row.name).refusal;
        if (!isOfListener && refusal.status != 0) {
            reasons.insert(refusal);
        }
    }
    return reasons;
}

}  // namespace fuzz
