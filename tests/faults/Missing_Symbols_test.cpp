#include "broker/Local_Server.h"
#include "tests/support/In_Child.h"
#include "tests/support/Log_Lines.h"
#include "tests/support/Temp_Folder.h"

#include <gtest/gtest.h>

#include <cstring>
#include <dlfcn.h>
#include <link.h>

namespace KPRV {
namespace {

const char* const symbols[] = {
#define ENTRY_POINT(symbol, variable, signature) #symbol,
#include "contracts/adapter/Entry_Points.def"
#undef ENTRY_POINT
};

std::string read_file(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

/// Where the names of the exported symbols stand in a shared library.
std::pair<std::size_t, std::size_t> symbol_names(const std::string& bytes)
{
    ElfW(Ehdr) head;
    std::memcpy(&head, bytes.data(), sizeof head);
    std::vector<ElfW(Shdr)> sections(head.e_shnum);
    std::memcpy(sections.data(), bytes.data() + head.e_shoff, sections.size() * sizeof sections[0]);
    for (const ElfW(Shdr) & section : sections)
        if (section.sh_type == SHT_DYNSYM) {
            const ElfW(Shdr)& names = sections[section.sh_link];
            return {names.sh_offset, names.sh_offset + names.sh_size};
        }
    return {};
}

/// The simulator, with one of its exported names spoiled.
std::string library_without(const std::string& symbol)
{
    std::string bytes = read_file(KLDR_SIMULATOR);
    const auto [begin, end] = symbol_names(bytes);
    const std::string nul(1, '\0');
    const std::size_t whole = bytes.find(nul + symbol + nul, begin);
    // The linker keeps a name that ends another one within it: then both go.
    const std::size_t at = whole < end ? whole + 1 : bytes.find(symbol + nul, begin);
    EXPECT_LT(at, end) << symbol;
    if (at < end)
        bytes[at] = '?';
    return bytes;
}

/// The module in a process of its own, over a library file whose bytes are given.
template <class Body>
void with_library(const std::string& bytes, bool opens, Body&& body)
{
    Temp_Folder folder;
    folder.write("libdzntj.so", bytes);
    folder.write(".cimplerc", "LOG_LEVEL=ERR\n");
    Environment_Override home("HOME", folder.path());
    // Found by its bare name, since it is there already; or by nobody, if the loader refuses it.
    void* library = dlopen(folder.path("libdzntj.so").c_str(), RTLD_NOW);
    EXPECT_EQ(opens, library != nullptr);
    std::string error;
    auto server = broker::Local_Server::open(KLDR_MODULE, {}, error);
    ASSERT_TRUE(server) << error;
    body(*server, parse_log(folder.read(".cimple/messages")));
    server->unload(true);
    EXPECT_EQ(0u, server->ledger().live());
}

/// The library is called once while the module is loaded; these two are.
bool is_called_at_load(const std::string& symbol)
{
    return symbol == "init_hba_lib" || symbol == "registerLogMsgCb" || symbol == "get_agt_version" ||
           symbol == "getNumberOfAdapters" || symbol == "free_hba_lib";
}

TEST(Missing_Symbols, EachIsNamedInTheLogAndLeavesTheOthersAlone)
{
    for (const std::string symbol : symbols) {
        if (is_called_at_load(symbol))
            continue;
        SCOPED_TRACE(symbol);
        in_child([&] {
            with_library(library_without(symbol), true, [&](broker::Local_Server& server, const auto& lines) {
                unsigned named = 0;
                for (const Log_Line& line : lines)
                    named += line.text.find(symbol + " not found.") == 0;
                EXPECT_EQ(1u, named);
                EXPECT_EQ(CMPI_RC_OK, server.enumerate_instances("KALDERA_ComputerSystem").rc);
            });
        });
    }
}

// The variable of a missing symbol is null, and is called all the same: a library must have them all.
TEST(Missing_Symbols, ACallOfOneEndsTheProcess)
{
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(with_library(library_without("getAllAdaptersIndexString"), true,
                             [](broker::Local_Server& server, const auto&) {
                                 signal(SIGSEGV, SIG_DFL);
                                 server.enumerate_instances("KALDERA_PortController");
                             }),
                testing::KilledBySignal(SIGSEGV), "");
}

/// The head of a library for the other word size, which is all that the loader looks at.
std::string library_of_other_word_size()
{
    std::string bytes = read_file(KLDR_SIMULATOR);
    constexpr std::size_t class_byte = 4;
    bytes[class_byte] = bytes[class_byte] == 1 ? 2 : 1;
    return bytes;
}

TEST(Missing_Symbols, ALibraryOfTheOtherWordSizeIsAsGoodAsNone)
{
    in_child([] {
        with_library(library_of_other_word_size(), false, [](broker::Local_Server& server, const auto&) {
            for (const char* name : {"KALDERA_ComputerSystem", "KALDERA_PortController", "KALDERA_FCPort"})
                EXPECT_EQ(CMPI_RC_OK, server.enumerate_instances(name).rc) << name;
            EXPECT_TRUE(server.enumerate_instances("KALDERA_FCPort").instances.empty());
        });
    });
}

} // namespace
} // namespace KPRV
