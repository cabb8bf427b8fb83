#pragma once

#include <string>

#include "cimxml/Errors.h"
#include "cimxml/Operations.h"

namespace cimhost::cimxml {

/** The text of a response message, written piece by piece, so that memory holds one piece and not the complete text. */
class ResponseText {
public:
    ResponseText(const Message& request, OperationResult itsResult);
    ResponseText(const Message& request, const CimError& error);

    /** Appends text until the string has that many bytes or the text ends. @return false at the end */
    bool append(std::string& text, std::size_t size);

    int status() const { return code; }
    std::size_t count() const { return result.count; }

private:
    bool isIntrinsic;
    std::string head;  ///< empty once it is written
    OperationResult result;
    int code = 0;
    bool hasEnded = false;
};

}  // namespace cimhost::cimxml
