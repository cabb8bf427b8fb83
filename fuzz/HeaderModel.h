#pragma once

#include <cstddef>
#include <set>
#include <string>
#include <vector>

#include "server/HttpRequest.h"

// A model of the rules for the headers of a CIM request: a table of values, each with the reason to refuse it. The
// model does not interpret values.

namespace fuzz {

/** The reason to refuse a request. */
struct Refusal {
    unsigned status = 0;  ///< of HTTP; 0: no reason
    std::string cimError{};

    bool operator<(const Refusal& other) const {
        return status != other.status ? status < other.status : cimError < other.cimError;
    }
};

/** A value of a header. */
struct HeaderValue {
    std::vector<std::string> sent{};  ///< empty: the header is absent; two: it occurs twice
    Refusal refusal{};
    std::string decoded{};  ///< only for CIMMethod and CIMObject
};

struct HeaderRow {
    std::string name{};
    bool hasPrefix = false;  ///< whether its name has a prefix in requests with an extension
    std::vector<HeaderValue> values{};
};

/** The rows of all headers that the rules mention. The first value of each row is accepted. */
const std::vector<HeaderRow>& headerRows();

constexpr std::size_t largestBody = 1000;

/** A request with one value per row. */
struct ModelRequest {
    std::string method = "POST";
    std::string prefix{};  ///< of the headers of the operation
    bool requiresLocalHost = true;
    std::vector<std::size_t> values = std::vector<std::size_t>(headerRows().size());

    cimhost::server::HttpRequest request() const;

    /** The value of a row, as the server must see it: a header without the prefix of the extension is absent. */
    const HeaderValue& valueOf(const std::string& name) const;

    bool isExtended() const { return method == "M-POST"; }

    /** Whether other software could find a different end of the request. Such a request is refused first. */
    bool isAmbiguous() const;

    /** The reasons to refuse the request; empty if it is accepted. The response has one of the reasons. */
    std::set<Refusal> refusals() const;
};

}  // namespace fuzz
