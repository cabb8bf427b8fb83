#include "logging/Levels.h"

#include <algorithm>

namespace RZLog {

bool Levels::set(std::string_view logger, ChannelLevels levels) {
    if (count == mostLoggers || logger.size() > longestName) {
        return false;
    }
    Entry& entry = entries[count++];
    std::copy(logger.begin(), logger.end(), entry.name.begin());
    entry.length = logger.size();
    entry.levels = levels;
    return true;
}

int Levels::highest() const {
    int highest = fallback.highest();
    for (std::size_t index = 0; index < count; ++index) {
        highest = std::max(highest, entries[index].levels.highest());
    }
    return highest;
}

const ChannelLevels& Levels::of(std::string_view logger) const {
    const auto* const end = entries.begin() + count;
    const auto* const own = std::find_if(entries.begin(), end, [&](const Entry& entry) {
        return logger == std::string_view(entry.name.data(), entry.length);
    });
    return own != end ? own->levels : fallback;
}

}  // namespace RZLog
