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

bool Levels::admit(Channel channel, std::string_view logger, int level) const {
    for (std::size_t index = 0; index < count; ++index) {
        const Entry& entry = entries[index];
        if (logger == std::string_view(entry.name.data(), entry.length)) {
            return level <= entry.levels.of(channel);
        }
    }
    return level <= fallback.of(channel);
}

}  // namespace RZLog
