#include "src/platform/system_info.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <functional>
#include <optional>
#include <random>

#include "basalt/platform/error.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/version_block.h"
#include "tests/support/with_failing_allocations.h"

namespace {

using namespace basalt::test;
using basalt::platform::wide_from_utf16;

constexpr wchar_t PRODUCT_NAME[] = L"\\StringFileInfo\\040904b0\\ProductName";

struct Found {
    const unsigned char* value;
    UINT length;
};

// Asks in a copy of exactly the block's size, so that a read beyond it is seen.
std::optional<Found> query(const Bytes& block, const wchar_t* path) {
    void* value = nullptr;
    UINT length = 0;
    SetLastError(0);
    if (VerQueryValueW(block.data(), path, &value, &length) == 0) {
        EXPECT_EQ(GetLastError(), 1813U);
        EXPECT_EQ(value, nullptr);
        return std::nullopt;
    }
    return Found{static_cast<const unsigned char*>(value), length};
}

std::wstring text_at(const Bytes& block, const wchar_t* path) {
    const std::optional<Found> found = query(block, path);
    return found ? wide_from_utf16(found->value, found->length) : L"(none)";
}

// A resource with nothing but these below StringFileInfo, and where the first of them stands.
Bytes below_strings(const std::vector<VersionNode>& nodes) {
    return block_of({u"VS_VERSION_INFO", {}, false, {{u"StringFileInfo", {}, true, nodes}}});
}
constexpr std::size_t FIRST_BELOW_STRINGS = 40 + 36;

TEST(VersionQuery, finds_values_by_their_path) {
    const Bytes block = block_of(survey_resource());
    for (const wchar_t* const root : {L"\\", L""}) {
        const auto fixed = query(block, root);
        ASSERT_TRUE(fixed);
        EXPECT_EQ(fixed->value - block.data(), 40);
        EXPECT_EQ(fixed->length, 52U);
    }
    const auto translation = query(block, L"\\VarFileInfo\\Translation");
    ASSERT_TRUE(translation);
    EXPECT_EQ(translation->length, 8U);
    EXPECT_EQ(translation->value[0], 0x09);
    EXPECT_EQ(text_at(block, PRODUCT_NAME), L"Survey");
    EXPECT_EQ(text_at(block, L"\\stringfileinfo\\040904B0\\PRODUCTNAME"), L"Survey");
    EXPECT_EQ(text_at(block, L"\\StringFileInfo\\040704e4\\ProductName"), L"Vermessung");
    EXPECT_EQ(text_at(block, L"\\StringFileInfo\\040904b0\\LegalCopyright"), L"\xA9 \x1F30D");
    EXPECT_EQ(text_at(block, L"\\StringFileInfo\\040904b0\\FileDescription"), L"");
    for (const wchar_t* const missing :
         {L"\\StringFileInfo\\040904b0\\Comment", L"\\StringFileInfo\\040904b0\\ProductNam", L"\\ProductName",
          L"\\StringFileInfo\\ProductName", L"\\\\StringFileInfo", L"\\VarFileInfo\\Translation\\x"}) {
        EXPECT_FALSE(query(block, missing));
    }
}

TEST(VersionQuery, text_ends_at_its_terminator_or_where_its_length_says) {
    const auto text_of = [](const Bytes& value, std::size_t claimed) {
        Bytes block = below_strings({{u"Key", value, true, {text_node(u"x", u"y")}}});
        put_word(block, FIRST_BELOW_STRINGS + 2, claimed);
        return text_at(block, L"\\StringFileInfo\\Key");
    };
    EXPECT_EQ(text_of(utf16(u"ab"), 2), L"ab") << "no terminator";
    EXPECT_EQ(text_of(utf16(u"abcd"), 3), L"abc") << "cut by its length";
    EXPECT_EQ(text_of(utf16({u'a', u'b', 0, u'd'}), 4), L"ab") << "ends early";
    EXPECT_EQ(text_of(utf16({u'a', u'b', 0, 0}), 0xFFFF), L"ab") << "claims too much";
    const Bytes halves = utf16({0xDC00, u'a', 0xD83C, u'b', 0xD83C});
    EXPECT_EQ(wide_from_utf16(halves.data(), 5), L"\uFFFDa\uFFFDb\uFFFD");
}

TEST(VersionQuery, length_of_a_text_that_says_it_is_none_is_in_units_all_the_same) {
    VersionNode resource = survey_resource();
    resource.children[0].children[1].children[0].is_text = false;
    resource.children.resize(1);
    resource.children[0].children[1].children.resize(1);  // nothing follows what could be read too far
    const Bytes block = block_of(resource);
    EXPECT_EQ(query(block, PRODUCT_NAME)->length, 7U);
    EXPECT_EQ(text_at(block, PRODUCT_NAME), L"Survey");
}

TEST(VersionQuery, nodes_that_do_not_fit_end_the_search) {
    // Two children; the first one's length is spoilt, and with it the way to the second.
    const Bytes good = below_strings({text_node(u"A", u"first"), text_node(u"B", u"second")});
    EXPECT_EQ(text_at(good, L"\\StringFileInfo\\B"), L"second");
    const std::size_t first = FIRST_BELOW_STRINGS;
    const std::size_t length = good[first];
    struct Row {
        std::size_t length;
        const wchar_t *a, *b;
    };
    for (const Row& row :
         {Row{0, L"(none)", L"(none)"}, Row{5, L"(none)", L"(none)"},
          Row{9, L"(none)", L"(none)"},  // no room for the key's terminator
          Row{length - 1, L"first", L"second"}, Row{length - 3, L"firs", L"second"},
          Row{good.size() - first, L"first", L"(none)"},  // covers its sibling
          Row{good.size() - first + 1, L"(none)", L"(none)"}, Row{0xFFFF, L"(none)", L"(none)"}}) {
        SCOPED_TRACE(row.length);
        Bytes block = good;
        put_word(block, first, row.length);
        EXPECT_EQ(text_at(block, L"\\StringFileInfo\\A"), row.a);
        EXPECT_EQ(text_at(block, L"\\StringFileInfo\\B"), row.b);
    }
    Bytes block = block_of(survey_resource());
    put_word(block, 2, 0xFFFF);
    EXPECT_FALSE(query(block, L"\\")) << "a value of that size does not fit";
    for (const std::size_t spoilt : {std::size_t{2}, std::size_t{40}}) {  // value's size, signature
        block = block_of(survey_resource());
        --block[spoilt];
        EXPECT_FALSE(query(block, L"\\"));
    }
}

// Whatever the bytes, an answer lies within the block. Under the address sanitizer this sees every wild read.
TEST(VersionQuery, spoilt_blocks_give_nothing_outside_themselves) {
    const unsigned seed = std::random_device{}();
    SCOPED_TRACE(seed);
    std::mt19937 random(seed);
    const Bytes good = block_of(survey_resource());
    const auto check = [](const Bytes& block) {
        for (const wchar_t* const path :
             {L"\\", L"\\VarFileInfo\\Translation", PRODUCT_NAME, L"\\StringFileInfo\\040904b0\\Comment"}) {
            if (const std::optional<Found> found = query(block, path)) {
                const bool is_text = path[1] == L'S';
                ASSERT_GE(found->value, block.data());
                ASSERT_LE(found->value + (is_text ? 2 : 1) * found->length, block.data() + block.size());
            }
        }
    };
    for (std::size_t size = 2; size <= good.size(); ++size) {
        Bytes block(good.begin(), good.begin() + static_cast<std::ptrdiff_t>(size));
        put_word(block, 0, size);
        check(block);
    }
    for (int round = 0; round < 20'000; ++round) {
        Bytes block = good;
        for (auto left = 1 + random() % 4; left > 0; --left) {
            block[2 + random() % (block.size() - 2)] = static_cast<unsigned char>(random() >> (random() % 8));
        }
        check(block);
    }
}

class VersionResourceFile : public testing::Test {
protected:
    DWORD size_of(const ProgramFile& program) const {
        program.write(path);
        DWORD handle = 1;
        SetLastError(0);
        const DWORD size = GetFileVersionInfoSizeW(path.wstring().c_str(), &handle);
        EXPECT_EQ(handle, 0U);
        EXPECT_EQ(GetLastError(), size == 0 ? 1812U : 0U);
        return size;
    }

    const ScratchFolder folder;
    const std::filesystem::path path = folder / "program";
    const Bytes block = block_of(survey_resource());
};

TEST_F(VersionResourceFile, is_read_from_its_section) {
    Bytes section = block;
    section.resize(section.size() + 100, 0xAA);  // what another object file put there
    const ProgramFile program(section);
    ASSERT_EQ(size_of(program), block.size());
    Bytes data(block.size() + 1, 0x55);
    const auto read = [&](std::size_t room) {
        return GetFileVersionInfoW(path.wstring().c_str(), 0, static_cast<DWORD>(room), data.data());
    };
    EXPECT_NE(read(data.size()), 0);
    EXPECT_EQ(data.back(), 0x55);
    data.pop_back();
    EXPECT_EQ(data, block);
    EXPECT_EQ(read(block.size() - 1), 0);
    EXPECT_EQ(GetLastError(), 122U);
}

TEST_F(VersionResourceFile, files_that_do_not_hold_one) {
    struct Row {
        const char* what;
        std::function<void(ProgramFile&)> spoil;
    };
    const std::uint64_t huge = ~std::uint64_t{0};
    for (const Row& row : {
             Row{"not a program", [](ProgramFile& p) { p.header.e_ident[0] = 'M'; }},
             Row{"of another system", [](ProgramFile& p) { p.header.e_ident[EI_CLASS] = ELFCLASS32; }},
             Row{"other sizes", [](ProgramFile& p) { p.header.e_shentsize = 40; }},
             Row{"no section table", [](ProgramFile& p) { p.header.e_shnum = 0; }},
             Row{"table beyond the end", [](ProgramFile& p) { p.header.e_shnum = 0xFFFF; }},
             Row{"table far beyond", [&](ProgramFile& p) { p.header.e_shoff = huge - 100; }},
             Row{"no names", [](ProgramFile& p) { p.header.e_shstrndx = 3; }},
             Row{"names beyond the end", [](ProgramFile& p) { p.sections[1].sh_size += 1u << 20; }},
             Row{"names far beyond", [&](ProgramFile& p) { p.sections[1].sh_offset = huge; }},
             Row{"name beyond the names", [](ProgramFile& p) { p.sections[2].sh_name = 0xFFFFFFFF; }},
             Row{"name cut by the names", [](ProgramFile& p) { p.sections[1].sh_size -= 1; }},
             Row{"no bytes in the file", [](ProgramFile& p) { p.sections[2].sh_type = SHT_NOBITS; }},
             Row{"section beyond the end", [](ProgramFile& p) { p.sections[2].sh_size += 1; }},
             Row{"section far beyond", [&](ProgramFile& p) { p.sections[2].sh_offset = huge; }},
             Row{"block beyond its section", [](ProgramFile& p) { p.sections[2].sh_size -= 1; }},
             Row{"block too small", [](ProgramFile& p) { put_word(p.contents, 0, 5); }},
             Row{"empty section", [](ProgramFile& p) { p.sections[2].sh_size = 0; }},
         }) {
        SCOPED_TRACE(row.what);
        ProgramFile program(block);
        ASSERT_EQ(size_of(program), block.size());
        row.spoil(program);
        EXPECT_EQ(size_of(program), 0U);
    }
    EXPECT_EQ(size_of(ProgramFile(block, ".version_resources")), 0U);
    for (const unsigned size : {0U, 3U, 63U, 64U, 100U}) {
        ProgramFile(block).write(path);
        std::filesystem::resize_file(path, size);
        EXPECT_EQ(GetFileVersionInfoSizeW(path.wstring().c_str(), nullptr), 0U);
    }
    EXPECT_EQ(GetFileVersionInfoSizeW(L"/", nullptr), 0U) << "a folder";
    EXPECT_EQ(GetFileVersionInfoSizeW(L"/dev/zero", nullptr), 0U) << "a device";
    std::filesystem::remove(path);
    EXPECT_EQ(GetFileVersionInfoSizeW(path.wstring().c_str(), nullptr), 0U);
    EXPECT_EQ(GetLastError(), 2U);
}

TEST_F(VersionResourceFile, lack_of_memory_is_an_error) {
    ProgramFile(block).write(path);
    const std::wstring name = path.wstring();
    Bytes data(block.size());
    const auto room = static_cast<DWORD>(data.size());
    DWORD size = 0;
    const auto ask_size = [&] {
        SetLastError(0);
        size = GetFileVersionInfoSizeW(name.c_str(), nullptr);
    };
    EXPECT_GT(with_failing_allocations(ask_size,
                                       [&](bool failed) {
                                           EXPECT_EQ(size, failed ? 0U : room);
                                           EXPECT_EQ(GetLastError(), failed ? 8U : 0U);
                                           size = 1;
                                       }),
              0);
    BOOL done = 0;
    const auto read = [&] {
        SetLastError(0);
        done = GetFileVersionInfoW(name.c_str(), 0, room, data.data());
    };
    EXPECT_GT(with_failing_allocations(read,
                                       [&](bool failed) {
                                           EXPECT_EQ(done, failed ? 0 : 1);
                                           EXPECT_EQ(GetLastError(), failed ? 8U : 0U);
                                           done = -1;
                                       }),
              0);
}

TEST(ModuleFileName, lack_of_memory_is_an_error) {
    wchar_t name[4096];
    DWORD length = 0;
    const auto ask = [&] {
        SetLastError(0);
        length = GetModuleFileNameW(nullptr, name, 4096);
    };
    const auto check = [&](bool failed) {
        EXPECT_EQ(length == 0, failed);
        EXPECT_EQ(GetLastError(), failed ? 8U : 0U);
        length = 1;
    };
    EXPECT_GT(with_failing_allocations(ask, check), 0);
}

TEST(ModuleFileName, is_the_running_programs) {
    const std::wstring expected = std::filesystem::read_symlink("/proc/self/exe").wstring();
    wchar_t name[4096];
    EXPECT_EQ(GetModuleFileNameW(nullptr, name, 4096), expected.size());
    EXPECT_EQ(name, expected);
    const auto fits = static_cast<DWORD>(expected.size() + 1);
    EXPECT_EQ(GetModuleFileNameW(nullptr, name, fits), expected.size());
    SetLastError(0);
    name[fits - 1] = L'#';
    EXPECT_EQ(GetModuleFileNameW(nullptr, name, fits - 1), fits - 1);
    EXPECT_EQ(GetLastError(), 122U);
    EXPECT_EQ(name, expected.substr(0, expected.size() - 1));
    EXPECT_EQ(name[fits - 1], L'#');
    EXPECT_EQ(GetModuleFileNameW(nullptr, name, 0), 0U);
    EXPECT_EQ(GetModuleFileNameW(name, name, fits), 0U);
}

}  // namespace
