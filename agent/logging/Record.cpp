#include "logging/Record.h"

#include <cstdio>
#include <ctime>

#include "cim/Utf8.h"

namespace RZLog {

namespace {

/** ISO 8601 with microseconds and the offset from UTC: 2024-05-06T07:08:09.123456+02:00. */
void appendTime(std::string& line, std::chrono::system_clock::time_point time) {
    using std::chrono::duration_cast;
    const auto sinceEpoch = duration_cast<std::chrono::microseconds>(time.time_since_epoch()).count();
    const std::time_t seconds = static_cast<std::time_t>(sinceEpoch / 1000000);
    std::tm fields{};
    if (::localtime_r(&seconds, &fields) == nullptr) {
        return;
    }
    const long offset = fields.tm_gmtoff / 60;
    const long distance = offset < 0 ? -offset : offset;
    char text[96];
    const int length =
        std::snprintf(text, sizeof text, "%04d-%02d-%02dT%02d:%02d:%02d.%06ld%c%02ld:%02ld", fields.tm_year + 1900,
                      fields.tm_mon + 1, fields.tm_mday, fields.tm_hour, fields.tm_min, fields.tm_sec,
                      static_cast<long>(sinceEpoch % 1000000), offset < 0 ? '-' : '+', distance / 60, distance % 60);
    line.append(text, static_cast<std::size_t>(length));
}

const char* nameOf(Channel channel) {
    return channel == Channel::log ? "log" : "trace";
}

bool isPrintable(char byte) {
    return byte >= ' ' && byte < '\x7f' && byte != '\\';
}

void appendEscapedByte(std::string& line, char byte) {
    static const char digits[] = "0123456789ABCDEF";
    const auto number = static_cast<unsigned char>(byte);
    line += "\\x";
    line += digits[number >> 4U];
    line += digits[number & 15U];
}

void appendEscapedCharacter(std::string& line, std::string_view character) {
    const std::size_t named = std::string_view("\t\n\r\\").find(character.front());
    if (named != std::string_view::npos) {
        line += '\\';
        line += "tnr\\"[named];
        return;
    }
    for (const char byte : character) {
        appendEscapedByte(line, byte);
    }
}

}  // namespace

void appendEscaped(std::string& line, std::string_view field) {
    while (!field.empty()) {
        const cim::Utf8Character character = cim::firstCharacter(field);
        const std::string_view bytes = field.substr(0, character.length);
        const bool c1Control = character.valid && character.codePoint >= 0x80 && character.codePoint < 0xA0;
        if (isPrintable(bytes.front()) || (character.valid && character.codePoint > 0x7f && !c1Control)) {
            line += bytes;
        } else {
            appendEscapedCharacter(line, bytes);
        }
        field.remove_prefix(character.length);
    }
}

std::string fileLine(const Record& record, std::chrono::system_clock::time_point time) {
    std::string line;
    line.reserve(128 + record.text.size());
    appendTime(line, time);
    line += '\t';
    line += nameOf(record.channel);
    line += '\t';
    line += std::to_string(record.level);
    for (const std::string_view field : {record.logger, record.function, record.file}) {
        line += '\t';
        appendEscaped(line, field);
    }
    line += '\t';
    line += std::to_string(record.line);
    line += '\t';
    appendEscaped(line, record.text);
    return line;
}

std::string systemLogLine(const Record& record) {
    std::string line = nameOf(record.channel);
    line += ' ' + std::to_string(record.level) + ' ';
    appendEscaped(line, record.logger);
    line += ' ';
    appendEscaped(line, record.function);
    line += "() in ";
    appendEscaped(line, record.file);
    line += ':' + std::to_string(record.line) + ": ";
    appendEscaped(line, record.text);
    return line;
}

}  // namespace RZLog
