#pragma once

#include <string>

#include "cimxml/Errors.h"
#include "cimxml/Operations.h"

namespace cimhost::cimxml {

/** Writes the text of a response message in pieces, so that memory never holds the complete text. */
class ResponseText {
public:
    ResponseText(const Message& request, OperationResult itsResult);
    ResponseText(const Message& request, const CimError& error);

    /** Appends to a string until it has at least `size` bytes or the text ends. @return false at the end */
    bool append(std::string& text, std::size_t size);

    int status() const { return code; }
    std::size_t count() const { return result.count; }

private:
    bool isIntrinsic;
    std::string head;  ///< start of the message; empty after it is written
    OperationResult result;
    int code = 0;
    bool hasEnded = false;
};

}  // namespace cimhost::cimxml
