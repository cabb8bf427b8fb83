#include <dlfcn.h>
#include <elf.h>

#include <cstring>
#include <stdexcept>

#include "RecordFixture.h"
#include "support/Command.h"
#include "support/Files.h"
#include "support/UnderTest.h"

// The built library as a file; loading and unloading.

namespace contract {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::UnorderedElementsAre;
using testsupport::readFile;

std::string libraryFile() {
    return testsupport::underTest(PROVIDER_LIBRARY);
}

/** A symbol of a library's dynamic symbol table. */
struct DynamicSymbol {
    std::string name;
    bool isDefined;
    int binding;
    int visibility;
};

/** Returns a table of structures in a file's bytes. */
template <class Entry>
std::vector<Entry> entriesAt(const std::string& bytes, std::size_t offset, std::size_t count) {
    std::vector<Entry> entries(count);
    if (offset + count * sizeof(Entry) > bytes.size()) {
        throw std::runtime_error("the library's file ends early");
    }
    std::memcpy(entries.data(), bytes.data() + offset, count * sizeof(Entry));
    return entries;
}

std::vector<DynamicSymbol> dynamicSymbols(const std::string& file) {
    const std::string bytes = readFile(file);
    const auto header = entriesAt<Elf64_Ehdr>(bytes, 0, 1).front();
    const auto sections = entriesAt<Elf64_Shdr>(bytes, header.e_shoff, header.e_shnum);
    std::vector<DynamicSymbol> symbols;
    for (const Elf64_Shdr& section : sections) {
        if (section.sh_type != SHT_DYNSYM) {
            continue;
        }
        const char* names = bytes.data() + sections.at(section.sh_link).sh_offset;
        for (const auto& entry : entriesAt<Elf64_Sym>(bytes, section.sh_offset, section.sh_size / sizeof(Elf64_Sym))) {
            symbols.push_back({names + entry.st_name, entry.st_shndx != SHN_UNDEF, ELF64_ST_BIND(entry.st_info),
                               ELF64_ST_VISIBILITY(entry.st_other)});
        }
    }
    return symbols;
}

TEST(LibraryFileTest, ExportsExactlyTheTwoFactories) {
    std::vector<std::string> exported;
    for (const DynamicSymbol& symbol : dynamicSymbols(libraryFile())) {
        if (symbol.isDefined && symbol.binding != STB_LOCAL) {
            exported.push_back(symbol.name);
            EXPECT_EQ(symbol.visibility, STV_DEFAULT) << symbol.name;
        }
    }
    EXPECT_THAT(exported, UnorderedElementsAre("LeaseAndWarrantyProvider_Create_InstanceMI",
                                               "LeaseAndWarrantyProvider_Create_AssociationMI"));
}

TEST(LibraryFileTest, HasNoSymbolThatPreventsUnloading) {
    for (const DynamicSymbol& symbol : dynamicSymbols(libraryFile())) {
        EXPECT_NE(symbol.binding, STB_GNU_UNIQUE) << symbol.name;
    }
}

TEST(LibraryFileTest, LeavesNoSymbolUnresolved) {
    // The functions of a sanitizer's runtime are in the program, not in the libraries.
    const std::string output =
        testsupport::runCommand("ldd -r '" + libraryFile() +
                                "' 2>&1 | grep -Ev 'undefined symbol: __(asan|lsan|tsan|ubsan|sanitizer|sancov)_'")
            .output;
    EXPECT_THAT(output, HasSubstr("libkoframework.so"));
    EXPECT_THAT(output, HasSubstr("librzlog.so"));
    EXPECT_THAT(output, Not(HasSubstr("undefined symbol")));
    EXPECT_THAT(output, Not(HasSubstr("not found")));
}

class LoadingTest : public RecordTest {
protected:
    /** Loads the library with these flags, returns the identifiers of all records, and unloads the library. */
    std::vector<std::string> identifiersThrough(int flags) {
        testsupport::ProviderLibrary own(libraryFile(), "LeaseAndWarrantyProvider", broker, flags);
        return identifiersOf(own.enumerateInstanceNames(allPath()).paths());
    }
};

TEST_P(LoadingTest, LoadsWithTheFlagsOfObjectManagers) {
    writeData(kind().dataFile, dataOfNew({"A", "B"}));
    for (const int flags : {RTLD_NOW | RTLD_GLOBAL, RTLD_LAZY | RTLD_GLOBAL, RTLD_NOW | RTLD_LOCAL, RTLD_LAZY}) {
        EXPECT_THAT(identifiersThrough(flags), ElementsAre("A", "B")) << flags;
        EXPECT_FALSE(isLoaded()) << flags;
    }
}

TEST_P(LoadingTest, EachLoadReadsTheFileAndEachUnloadRemovesTheLibrary) {
    for (int round = 0; round < 50; ++round) {
        const std::string existing = "round" + std::to_string(round);
        writeData(kind().dataFile, dataOfNew({existing}));
        EXPECT_THAT(identifiers(), ElementsAre(existing));
        createAll({"new"});
        EXPECT_THAT(remove(existing), isOk(0));
        EXPECT_EQ(data(), dataOfNew({"new"}));
        EXPECT_THAT(provider().cleanupInstanceMI(false), isOk(0));
        EXPECT_THAT(provider().cleanupAssociationMI(true), isOk(0));
        unload();
        ASSERT_FALSE(isLoaded());
    }
}

TEST_P(LoadingTest, UnloadingWritesNothing) {
    createAll({"A"});
    writeData(kind().dataFile, "another user's");
    unload();
    EXPECT_EQ(data(), "another user's");
}

TEST_P(LoadingTest, TheFileIsReadWhenTheLibraryIsLoaded) {
    writeData(kind().dataFile, dataOfNew({"A"}));
    provider();
    writeData(kind().dataFile, dataOfNew({"A", "B"}));
    EXPECT_THAT(identifiers(), ElementsAre("A"));
    unload();
    EXPECT_THAT(identifiers(), ElementsAre("A", "B"));
}

INSTANTIATE_RECORD_TEST(LoadingTest);

}  // namespace
}  // namespace contract
