#include <cxxabi.h>
#include <dlfcn.h>
#include <elf.h>
#include <gmock/gmock.h>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "KO/Exceptions.h"

using testing::Each;
using testing::StartsWith;

namespace {

const std::vector<std::string> libraries = {RZLOG_LIBRARY, KOFRAMEWORK_LIBRARY};

bool isLoaded(const std::string& library) {
    void* handle = ::dlopen(library.c_str(), RTLD_NOW | RTLD_NOLOAD);
    if (handle != nullptr) {
        ::dlclose(handle);
    }
    return handle != nullptr;
}

struct Symbol {
    std::string name;  ///< demangled
    unsigned char binding;
};

std::string demangled(const char* name) {
    const std::unique_ptr<char, decltype(&std::free)> text(abi::__cxa_demangle(name, nullptr, nullptr, nullptr),
                                                           std::free);
    return text != nullptr ? text.get() : name;
}

/** Returns the symbols that a library exports, like nm or readelf. */
std::vector<Symbol> exportsOf(const std::string& library);

class Content {
public:
    explicit Content(const std::string& path) {
        std::FILE* file = std::fopen(path.c_str(), "rb");
        EXPECT_NE(file, nullptr);
        char block[65536];
        for (std::size_t count = 0; (count = std::fread(block, 1, sizeof block, file)) > 0;) {
            bytes.append(block, count);
        }
        std::fclose(file);
    }

    template <typename Part>
    const Part* at(std::size_t offset) const {
        return reinterpret_cast<const Part*>(bytes.data() + offset);
    }

private:
    std::string bytes;
};

std::vector<Symbol> exportsOf(const std::string& library) {
    std::vector<Symbol> symbols;
    const Content content(library);
    const auto* header = content.at<Elf64_Ehdr>(0);
    const auto* sections = content.at<Elf64_Shdr>(header->e_shoff);
    for (int section = 0; section < header->e_shnum; ++section) {
        if (sections[section].sh_type != SHT_DYNSYM) {
            continue;
        }
        const auto* names = content.at<char>(sections[sections[section].sh_link].sh_offset);
        const auto* entries = content.at<Elf64_Sym>(sections[section].sh_offset);
        for (std::size_t entry = 0; entry < sections[section].sh_size / sizeof(Elf64_Sym); ++entry) {
            if (entries[entry].st_shndx != SHN_UNDEF && entries[entry].st_shndx != SHN_ABS) {
                symbols.push_back({demangled(names + entries[entry].st_name),
                                   static_cast<unsigned char>(ELF64_ST_BIND(entries[entry].st_info))});
            }
        }
    }
    return symbols;
}

std::vector<std::string> namesOf(const std::vector<Symbol>& symbols) {
    std::vector<std::string> names;
    for (const Symbol& symbol : symbols) {
        names.push_back(symbol.name);
    }
    return names;
}

}  // namespace

TEST(Libraries, ExportTheirInterfaceAndNothingElse) {
    EXPECT_THAT(namesOf(exportsOf(RZLOG_LIBRARY)), Each(StartsWith("RZLog::RZ")));
    EXPECT_THAT(namesOf(exportsOf(RZLOG_LIBRARY)), testing::SizeIs(testing::Ge(8U)));
    const std::vector<std::string> framework = namesOf(exportsOf(KOFRAMEWORK_LIBRARY));
    EXPECT_THAT(framework, testing::SizeIs(testing::Ge(60U)));
    EXPECT_THAT(framework, Each(testing::AnyOf(StartsWith("KO::"), StartsWith("typeinfo for KO::"),
                                               StartsWith("typeinfo name for KO::"), StartsWith("vtable for KO::"))));
    EXPECT_THAT(framework, Each(testing::Not(testing::HasSubstr("Implementation"))));
}

TEST(Libraries, DefineNoSymbolThatPreventsUnloading) {
    for (const std::string& library : libraries) {
        for (const Symbol& symbol : exportsOf(library)) {
            EXPECT_NE(symbol.binding, STB_GNU_UNIQUE) << symbol.name;
        }
    }
}

TEST(Libraries, CanBeLoadedUsedAndUnloadedRepeatedly) {
    using DirectoryFunction = const char* (*)();
    for (int round = 0; round < 20; ++round) {
        void* library = ::dlopen(KOFRAMEWORK_LIBRARY, RTLD_NOW | RTLD_GLOBAL);
        ASSERT_NE(library, nullptr) << ::dlerror();
        const auto dataDirectory =
            reinterpret_cast<DirectoryFunction>(::dlsym(library, "_ZN2KO17PlatformUtilities15getKelsaDataDirEv"));
        ASSERT_NE(dataDirectory, nullptr);
        EXPECT_NE(std::string(dataDirectory()), "");
        EXPECT_TRUE(isLoaded(RZLOG_LIBRARY));
        ::dlclose(library);
        EXPECT_FALSE(isLoaded(KOFRAMEWORK_LIBRARY));
        EXPECT_FALSE(isLoaded(RZLOG_LIBRARY));
    }
}

TEST(Libraries, ThrowExceptionsThatOthersCatch) {
    void* library = ::dlopen(KOFRAMEWORK_LIBRARY, RTLD_NOW);
    ASSERT_NE(library, nullptr);
    using LockFunction = void (*)(void* mutex, unsigned long timeout);
    using MutexFunction = void (*)(void* mutex);
    const auto construct = reinterpret_cast<MutexFunction>(::dlsym(library, "_ZN2KO5MutexC1Ev"));
    const auto destroy = reinterpret_cast<MutexFunction>(::dlsym(library, "_ZN2KO5MutexD1Ev"));
    const auto lock = reinterpret_cast<LockFunction>(::dlsym(library, "_ZN2KO5Mutex4lockEm"));
    ASSERT_TRUE(construct != nullptr && destroy != nullptr && lock != nullptr);
    void* mutex[4] = {};
    construct(mutex);
    lock(mutex, 0);
    EXPECT_THROW(lock(mutex, 0), KO::FrameworkException);
    destroy(mutex);
    ::dlclose(library);
}
