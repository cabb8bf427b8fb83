#include "LogDouble.h"

#include <sstream>

#include "RZLog/RZLogger.h"
#include "RZLog/RZMessageBuffer.h"

namespace logDouble {

std::vector<std::string> records;
int buffersCreated = 0;
int admittedLevel = 0;

}  // namespace logDouble

namespace RZLog {

void RZLogger::logLevelMessage(const char*, const char*, int, const std::string&, int, char*, int, int,
                               const std::string& text) {
    logDouble::records.push_back("log " + text);
}

void RZLogger::traceLevelMessage(const char*, const char*, int, const std::string&, int, char*, int, int,
                                 const std::string& text) {
    logDouble::records.push_back("trace " + text);
}

#ifdef LOG_ADMITS
bool RZLogger::admits(const std::string&, int level) noexcept {
    return level <= logDouble::admittedLevel;
}
#endif

struct RZMessageBuffer::Implementation {
    std::ostringstream stream;
};

RZMessageBuffer::RZMessageBuffer() : implementation(std::make_unique<Implementation>()) {
    ++logDouble::buffersCreated;
}

RZMessageBuffer::~RZMessageBuffer() = default;

std::ostream& RZMessageBuffer::operator<<(const char* text) {
    return implementation->stream << text;
}

RZMessageBuffer::operator std::ostream&() {
    return implementation->stream;
}

std::string RZMessageBuffer::str(RZMessageBuffer& buffer) {
    const std::string text = buffer.implementation->stream.str();
    buffer.implementation->stream.str("");
    return text;
}

std::string RZMessageBuffer::str(std::ostream&) {
    return str(*this);
}

}  // namespace RZLog
