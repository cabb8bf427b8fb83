#include <KO/Exceptions.h>
#include <KO/File.h>

#include <cstdio>
#include <exception>
#include <string>

// An external program that catches the framework's exceptions, and throws and catches them itself.

namespace {

bool catchesFromTheFramework() {
    try {
        KO::File(L"/nowhere/at/all").open(KO::FILE_MODE_READ);
    } catch (const KO::FrameworkException& exception) {
        return *exception.what() != '\0';
    }
    return false;
}

template <class Exception>
bool catchesItsOwn() {
    try {
        throw Exception("reason");
    } catch (const std::exception& exception) {
        return dynamic_cast<const Exception*>(&exception) != nullptr && std::string(exception.what()) == "reason";
    }
}

bool report(const char* what, bool isTrue) {
    std::printf("%s: %s\n", what, isTrue ? "yes" : "no");
    return isTrue;
}

}  // namespace

int main() {
    const bool all[] = {
        report("catches the framework's exception", catchesFromTheFramework()),
        report("catches its FrameworkException", catchesItsOwn<KO::FrameworkException>()),
        report("catches its InstrumentationException", catchesItsOwn<KO::InstrumentationException>()),
        report("catches its ProviderException", catchesItsOwn<KO::ProviderException>()),
    };
    for (const bool each : all) {
        if (!each) {
            return 1;
        }
    }
    return 0;
}
