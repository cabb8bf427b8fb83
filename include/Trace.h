#pragma once

#include "RZLog/RZLogger.h"
#include "RZLog/RZMessageBuffer.h"
#include "TraceFormat.h"

#include <exception>
#include <string>
#include <tuple>
#include <utility>

/**
 * Tracing of the provider's functions. It throws nothing: a line that cannot be written is lost.
 *
 * A source unit binds its logger and file name once, in a TraceSource named `traceSource`. A function then
 * traces its entry and its exit with one line at its head:
 *
 *     const Traced traced(at(traceSource), label::instanceId, instanceId);
 *
 * Every line goes to the log channel and then to the trace channel. Like the formatting functions,
 * what stands in the unnamed namespace exists once a unit, with the unit's own buffers.
 */
namespace KO {

/** Levels of log records. */
namespace Level {
constexpr int error = 3000;   ///< failures, and the flow of control where an operator should see it
constexpr int flow = 4000;    ///< the ordinary flow of control
constexpr int detail = 6000;  ///< written only by a logger that is raised to it: one message of the asset data
}  // namespace Level

/** What all trace lines of a source unit share. */
struct TraceSource {
    const std::string& logger;
    const char* file;
};

/** Where in a unit a line comes from, and how loud it is. */
struct CallSite {
    const TraceSource* source;
    int level;
    const char* function;
    unsigned int line;
};

/** The place of the call itself. The last two arguments are for code that works under another's name. */
inline CallSite at(const TraceSource& source, int level = Level::flow, const char* function = __builtin_FUNCTION(),
                   unsigned int line = __builtin_LINE()) {
    return {&source, level, function, line};
}

/** The place of the call itself, under the name and at the level of the function that it works for. */
inline CallSite here(const CallSite& caller, unsigned int line = __builtin_LINE()) {
    return {caller.source, caller.level, caller.function, line};
}

namespace {

/** Whether somebody may read a line of the site. A logging library that cannot tell is given every line. */
inline bool isWanted(const CallSite& site) noexcept {
    using RZLog::RZLogger;
    return RZLogger::admits == nullptr || RZLogger::admits(site.source->logger, site.level);
}

/**
 * Writes one line to both channels. The text is formatted anew for each: the buffer that it stands
 * in belongs to nobody between two calls. A line that memory cannot hold is lost, never the request.
 */
template <class Format>
void writeLine(const CallSite& site, Format format) noexcept {
    if (!isWanted(site)) {
        return;
    }
    try {
        const char* file = site.source->file;
        const int line = static_cast<int>(site.line);
        const std::string& logger = site.source->logger;
        RZLog::RZMessageBuffer message;
        RZLog::RZLogger::logLevelMessage(site.function, file, line, logger, site.level, nullptr, 0, 0,
                                         message.str(message << format()));
        RZLog::RZLogger::traceLevelMessage(site.function, file, line, logger, site.level, nullptr, 0, 0,
                                           message.str(message << format()));
    } catch (const std::exception&) {
        return;
    }
}

/** A parameter list: labels, each followed by its value. */
template <class... Parts>
std::string parameterList(const Parts&... parts) {
    RZLog::RZMessageBuffer list;
    ((list << parts), ...);
    return list.str(list);
}

/** Writes one line of a kind, with a parameter list if there are parts. */
template <class... Parts>
void traceLine(const CallSite& site, MessageType type, const Parts&... parts) noexcept {
    if (!isWanted(site)) {
        return;
    }
    if constexpr (sizeof...(Parts) == 0) {
        writeLine(site, [&] { return trace(site.function, site.source->file, site.line, type); });
    } else {
        try {
            const std::string list = parameterList(parts...);
            writeLine(site, [&] { return tracepara(site.function, site.source->file, site.line, list.c_str(), type); });
        } catch (const std::exception&) {
            return;
        }
    }
}

/**
 * Traces a function's entry when made and its exit when the function is left normally; a function
 * left by an exception has no exit line. Both carry the line at which it is made. The parts are labels
 * and values; a variable is shown at exit with the value that it has then.
 */
template <class... Parts>
class Traced {
public:
    template <class... Arguments>
    explicit Traced(const CallSite& callSite, Arguments&&... arguments)
        : site(callSite), parts(std::forward<Arguments>(arguments)...) {
        if (isWanted(site)) {
            exceptions = std::uncaught_exceptions();
            write(MT_ENTERING);
        }
    }

    ~Traced() {
        if (exceptions != unwanted && std::uncaught_exceptions() == exceptions) {
            write(MT_EXITING);
        }
    }

    Traced(const Traced&) = delete;
    Traced& operator=(const Traced&) = delete;

private:
    void write(MessageType type) const noexcept {
        std::apply([&](const auto&... part) { traceLine(site, type, part...); }, parts);
    }

    static constexpr int unwanted = -1;

    CallSite site;
    std::tuple<Parts...> parts;
    int exceptions = unwanted;  ///< how many were leaving at the entry
};

/** Variables are referred to; what exists only in the call is kept. */
template <class... Arguments>
Traced(const CallSite&, Arguments&&...) -> Traced<Arguments...>;

/** Traces a call that is only noted. */
[[maybe_unused]] void traceMethod(const CallSite& site) noexcept {
    traceLine(site, MT_METHOD);
}

/** Traces a text. */
[[maybe_unused]] void traceMessage(const CallSite& site, const char* text) noexcept {
    writeLine(site, [&] { return trace(text, site.source->file, site.line, MT_MESSAGE); });
}

/** Traces a variable's value. */
[[maybe_unused]] void traceVariable(const CallSite& site, const char* name, const std::string& value) noexcept {
    writeLine(site, [&] { return trace(name, site.source->file, site.line, value.c_str()); });
}

/** Traces a number's value; a flag counts as 1 or 0. */
[[maybe_unused]] void traceVariable(const CallSite& site, const char* name, unsigned int value) noexcept {
    writeLine(site, [&] { return trace(name, site.source->file, site.line, value); });
}

/** Logs a failure at error level and throws it. */
template <class Exception>
[[noreturn]] void fail(CallSite site, const char* text) {
    site.level = Level::error;
    traceMessage(site, text);
    throw Exception(text);
}

/** The labels of parameter lists. */
namespace label {
constexpr const char* source = " source=";
constexpr const char* target = " target=";
constexpr const char* lease = " lease=";
constexpr const char* warranty = " warranty=";
constexpr const char* instance = " instance=";
constexpr const char* instanceId = " instanceId=";
constexpr const char* property = " property=";
constexpr const char* value = " value=";
constexpr const char* properties = " properties=";
constexpr const char* propertiesBare = " properties";
constexpr const char* reference = " reference=";
constexpr const char* referenceInstance = " referenceInstance=";
constexpr const char* objectPath = " objectPath=";
constexpr const char* desiredObjectPath = " desiredObjectPath=";
constexpr const char* filterType = " filterType=";
constexpr const char* filterTypeBare = "FilterType=";
constexpr const char* keyValue = " key_value=";
constexpr const char* monikerComputer = " monikerComputer=";
constexpr const char* broker = " _broker=";
constexpr const char* context = " _context=";
}  // namespace label

/** The rule. Every request stands between two of them in the log. */
constexpr const char* requestRule = "==============================================================================";

/** Where the marker lines of a request are filed: the framework's trace header, at lines of its own. */
constexpr const char* markerFile = "sdk/kolib/include/Trace.h";
constexpr unsigned int entryRuleLine = 336;
constexpr unsigned int entryLine = 337;
constexpr unsigned int exitLine = 348;
constexpr unsigned int exitRuleLine = 349;

/** Logs the rule and the ENTERING line of an entry point. */
[[maybe_unused]] void markProviderEntry(const std::string& logger, const char* function, const char* file,
                                        unsigned int line) noexcept {
    const TraceSource markers{logger, markerFile};
    writeLine({&markers, Level::flow, "markProviderEntry", entryRuleLine}, [] { return requestRule; });
    writeLine({&markers, Level::flow, "markProviderEntry", entryLine},
              [&] { return trace(function, file, line, MT_ENTERING); });
}

/** Logs the EXITING line of an entry point and the rule. */
[[maybe_unused]] void markProviderExit(const std::string& logger, const char* function, const char* file,
                                       unsigned int line) noexcept {
    const TraceSource markers{logger, markerFile};
    writeLine({&markers, Level::flow, "markProviderExit", exitLine},
              [&] { return trace(function, file, line, MT_EXITING); });
    writeLine({&markers, Level::flow, "markProviderExit", exitRuleLine}, [] { return requestRule; });
}

}  // namespace

}  // namespace KO
