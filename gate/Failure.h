#pragma once

#include <cmpidt.h>

#include <string>
#include <utility>

namespace gate {

/** Ends a request with a status; the text is for a person who can do something about it. */
struct Failure {
    CMPIrc rc;
    std::string text;
};

/** Ends a request whose object manager has ended: nothing of it may be used any more. */
struct Ended {};

[[noreturn]] inline void fail(CMPIrc rc, std::string text) {
    throw Failure{rc, std::move(text)};
}

}  // namespace gate
