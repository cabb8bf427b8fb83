#pragma once

#include <cstddef>
#include <initializer_list>

namespace KO::LeaseWarrantyProvider {

/** A string of at most 63 characters that is concatenated at compile time. */
class FixedString {
public:
    constexpr FixedString(std::initializer_list<const char*> parts) {
        std::size_t length = 0;
        for (const char* part : parts) {
            for (; *part != '\0'; ++part) {
                characters[length++] = *part;
            }
        }
    }

    constexpr operator const char*() const { return characters; }

private:
    char characters[64]{};
};

}  // namespace KO::LeaseWarrantyProvider
