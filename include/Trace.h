#pragma once

#include <exception>
#include <string>
#include <tuple>
#include <utility>

#include "RZLog/RZLogger.h"
#include "RZLog/RZMessageBuffer.h"
#include "TraceFormat.h"

/**
 * Tracing of the provider's functions. Tracing never throws: a line that cannot be written is dropped.
 *
 * A source file defines a TraceSource named `traceSource` with its logger and file name. A function then traces its
 * entry and its exit with its first statement:
 *
 *     const Traced traced(at(traceSource), label::instanceId, instanceId);
 *
 * Every line is written to the log channel, then to the trace channel. Like the formatting functions, the functions in
 * the unnamed namespace exist once per translation unit, with separate buffers.
 */
namespace KO {

/** Levels of log records. */
namespace Level {
constexpr int error = 3000;   ///< failures, and control flow that operators should see
constexpr int flow = 4000;    ///< ordinary control flow
constexpr int detail = 6000;  ///< one message of the asset data; loggers rarely enable this level
}  // namespace Level

/** Logger and file name that all trace lines of a source file share. */
struct TraceSource {
    const std::string& logger;
    const char* file;
};

/** Source position and level of a trace line. */
struct CallSite {
    const TraceSource* source;
    int level;
    const char* function;
    unsigned int line;
};

/**
 * Returns the position of the call. The last two arguments are for code that is traced under the name of another
 * function.
 */
inline CallSite at(const TraceSource& source, int level = Level::flow, const char* function = __builtin_FUNCTION(),
                   unsigned int line = __builtin_LINE()) {
    return {&source, level, function, line};
}

/** Returns the position of the call, with the function name and level of the caller. */
inline CallSite here(const CallSite& caller, unsigned int line = __builtin_LINE()) {
    return {caller.source, caller.level, caller.function, line};
}

namespace {

/**
 * Returns whether either channel may write a line of this site; true if the logging library does not provide
 * RZLogger::admits.
 */
inline bool isWanted(const CallSite& site) noexcept {
    using RZLog::RZLogger;
    return RZLogger::admits == nullptr || RZLogger::admits(site.source->logger, site.level);
}

/**
 * Writes one line to both channels. Formats the line again for the second channel, since another call may overwrite the
 * buffer in between. Drops the line if formatting or writing fails.
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

/** Returns a parameter list: labels, each followed by its value. */
template <class... Parts>
std::string parameterList(const Parts&... parts) {
    RZLog::RZMessageBuffer list;
    ((list << parts), ...);
    return list.str(list);
}

/** Writes one line of a type, with a parameter list if there are parts. */
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
 * Traces a function's entry when constructed. Traces its exit when destroyed, unless an exception leaves the function.
 * Both lines have the line number of the constructor call. The parts are labels and values; the exit line contains the
 * current values of variables.
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
    int exceptions = unwanted;  ///< exceptions in flight at the entry
};

/** Stores references to variables and copies of temporaries. */
template <class... Arguments>
Traced(const CallSite&, Arguments&&...) -> Traced<Arguments...>;

/** Traces a call with one line instead of an entry line and an exit line. */
[[maybe_unused]] void traceMethod(const CallSite& site) noexcept {
    traceLine(site, MT_METHOD);
}

/** Traces a message. */
[[maybe_unused]] void traceMessage(const CallSite& site, const char* text) noexcept {
    writeLine(site, [&] { return trace(text, site.source->file, site.line, MT_MESSAGE); });
}

/** Traces a variable's value. */
[[maybe_unused]] void traceVariable(const CallSite& site, const char* name, const std::string& value) noexcept {
    writeLine(site, [&] { return trace(name, site.source->file, site.line, value.c_str()); });
}

/** Traces the value of a number, or of a flag as 1 or 0. */
[[maybe_unused]] void traceVariable(const CallSite& site, const char* name, unsigned int value) noexcept {
    writeLine(site, [&] { return trace(name, site.source->file, site.line, value); });
}

/** Logs a failure at error level and throws an exception with the same text. */
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

/** Separator line before and after each request in the log. */
constexpr const char* requestRule = "==============================================================================";

/** File name and line numbers of the lines that mark a request. They are those of the framework's trace header. */
constexpr const char* markerFile = "sdk/kolib/include/Trace.h";
constexpr unsigned int entryRuleLine = 336;
constexpr unsigned int entryLine = 337;
constexpr unsigned int exitLine = 348;
constexpr unsigned int exitRuleLine = 349;

/** Logs the separator and the ENTERING line of an entry point. */
[[maybe_unused]] void markProviderEntry(const std::string& logger, const char* function, const char* file,
                                        unsigned int line) noexcept {
    const TraceSource markers{logger, markerFile};
    writeLine({&markers, Level::flow, "markProviderEntry", entryRuleLine}, [] { return requestRule; });
    writeLine({&markers, Level::flow, "markProviderEntry", entryLine},
              [&] { return trace(function, file, line, MT_ENTERING); });
}

/** Logs the EXITING line of an entry point and the separator. */
[[maybe_unused]] void markProviderExit(const std::string& logger, const char* function, const char* file,
                                       unsigned int line) noexcept {
    const TraceSource markers{logger, markerFile};
    writeLine({&markers, Level::flow, "markProviderExit", exitLine},
              [&] { return trace(function, file, line, MT_EXITING); });
    writeLine({&markers, Level::flow, "markProviderExit", exitRuleLine}, [] { return requestRule; });
}

}  // namespace

}  // namespace KO

/** Names of the provider's loggers, for which the agent's configuration sets levels. */
namespace KO::LeaseWarrantyProvider::LoggerNames {

/** Logger of all translation units except those that use `shortened`. */
constexpr const char* provider = "Tarvik.LeaseAndWarrantyProvider";

/** Logger of OstrelAgent.cpp and AssetIDDetails.cpp. The shorter name is intentional. */
constexpr const char* shortened = "Tarvik.LeaseWarrantyProvider";

/**
 * Returns a logger's name as a string. The names are initialized while the library is loaded, which must not fail: if
 * memory is short, returns a shorter name that needs no allocation.
 */
inline std::string loggerName(const char* name) noexcept {
    try {
        return name;
    } catch (const std::exception&) {
        return "Tarvik";
    }
}

}  // namespace KO::LeaseWarrantyProvider::LoggerNames
