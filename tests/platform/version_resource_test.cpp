#include <gtest/gtest.h>

#include <filesystem>
#include <utility>

#include "basalt/platform/error.h"
#include "src/platform/system_info.h"
#include "tests/support/scratch_folder.h"
#include "tests/support/version_block.h"

namespace {

using namespace basalt::test;
namespace fs = std::filesystem;

constexpr wchar_t PRODUCT_NAME[] = L"\\StringFileInfo\\040904b0\\ProductName";

// A value as offset:length in the block.
std::string place(const Bytes& block, const wchar_t* path) {
    void* value = nullptr;
    UINT length = 0;
    SetLastError(0);
    return VerQueryValueW(block.data(), path, &value, &length) == 0
               ? "error " + std::to_string(GetLastError())
               : std::to_string(static_cast<unsigned char*>(value) - block.data()) + ':' +
                     std::to_string(length);
}
std::wstring text_at(const Bytes& block, const wchar_t* path) {
    void* value = nullptr;
    UINT length = 0;
    return VerQueryValueW(block.data(), path, &value, &length) == 0
               ? L"(none)"
               : basalt::platform::wide_from_utf16(value, length);
}

// A resource with nothing but these below StringFileInfo, and the offset of the first.
Bytes below_strings(const std::vector<VersionNode>& nodes) {
    return block_of({u"VS_VERSION_INFO", {}, false, {{u"StringFileInfo", {}, true, nodes}}});
}
constexpr std::size_t FIRST = 40 + 36;

TEST(VersionQuery, finds_values_by_their_path) {
    Bytes block = block_of(survey_resource());
    EXPECT_EQ(place(block, L"\\"), "40:52");
    EXPECT_EQ(place(block, L""), "40:52");
    EXPECT_EQ(place(block, L"\\VarFileInfo\\Translation").substr(3), ":8");
    const wchar_t* const rows[][2] = {{PRODUCT_NAME, L"Survey"},
                                      {L"\\stringfileinfo\\040904B0\\PRODUCTNAME", L"Survey"},
                                      {L"\\StringFileInfo\\040704e4\\ProductName", L"Vermessung"},
                                      {L"\\StringFileInfo\\040904b0\\LegalCopyright", L"\xA9 \x1F30D"},
                                      {L"\\StringFileInfo\\040904b0\\FileDescription", L""}};
    for (const auto& [path, text] : rows) {
        EXPECT_EQ(text_at(block, path), text);
    }
    for (const wchar_t* const missing :
         {L"\\StringFileInfo\\040904b0\\Comment", L"\\StringFileInfo\\040904b0\\ProductNam", L"\\ProductName",
          L"\\StringFileInfo\\ProductName", L"\\\\StringFileInfo", L"\\VarFileInfo\\Translation\\x"}) {
        EXPECT_EQ(place(block, missing), "error 1813") << missing;
    }
    for (const std::size_t spoilt : {2U, 40U}) {  // the root value's size, its signature
        --block[spoilt];
        EXPECT_EQ(place(block, L"\\"), "error 1813") << spoilt;
        ++block[spoilt];
    }
    put_word(block, 2, 0xFFFF);
    EXPECT_EQ(place(block, L"\\"), "error 1813");
}

TEST(VersionQuery, a_text_ends_at_its_terminator_or_its_length_in_units) {
    const std::tuple<Bytes, std::size_t, const wchar_t*> rows[] = {
        {utf16(u"ab"), 2, L"ab"},
        {utf16(u"abcd"), 3, L"abc"},
        {utf16({u'a', u'b', 0, u'd'}), 4, L"ab"},
        {utf16({u'a', u'b', 0, 0}), 0xFFFF, L"ab"},
        {utf16({0xDC00, u'a', 0xD83C, u'b', 0xD83C}), 5, L"\uFFFDa\uFFFDb\uFFFD"}};
    for (const auto& [value, claimed, text] : rows) {
        Bytes block = below_strings({{u"Key", value, true, {text_node(u"x", u"y")}}});
        put_word(block, FIRST + 2, claimed);
        EXPECT_EQ(text_at(block, L"\\StringFileInfo\\Key"), text);
    }
    Bytes last = below_strings({text_node(u"Key", u"Survey")});
    put_word(last, FIRST + 2, 14);
    put_word(last, FIRST + 4, 0);  // claims to be bytes
    EXPECT_EQ(place(last, L"\\StringFileInfo\\Key"), "92:7");
}

TEST(VersionQuery, nodes_that_do_not_fit_end_the_search) {
    const Bytes good = below_strings({text_node(u"A", u"first"), text_node(u"B", u"second")});
    const std::size_t length = good[FIRST], rest = good.size() - FIRST;
    const std::tuple<std::size_t, const wchar_t*, const wchar_t*> rows[] = {
        {length, L"first", L"second"}, {0, L"(none)", L"(none)"},         {5, L"(none)", L"(none)"},
        {9, L"(none)", L"(none)"},     {length - 1, L"first", L"second"}, {length - 3, L"firs", L"second"},
        {rest, L"first", L"(none)"},   {rest + 1, L"(none)", L"(none)"},  {0xFFFF, L"(none)", L"(none)"}};
    for (const auto& [claimed, a, b] : rows) {
        Bytes block = good;
        put_word(block, FIRST, claimed);
        EXPECT_EQ(text_at(block, L"\\StringFileInfo\\A"), a) << claimed;
        EXPECT_EQ(text_at(block, L"\\StringFileInfo\\B"), b) << claimed;
    }
}

TEST(VersionResourceFile, is_read_from_its_section_or_refused) {
    const ScratchFolder folder;
    const fs::path path = folder / "program";
    const auto size_of = [&](const ProgramFile& program) {
        program.write(path);
        DWORD handle = 1;
        SetLastError(0);
        const DWORD size = GetFileVersionInfoSizeW(path.wstring().c_str(), &handle);
        EXPECT_TRUE(handle == 0 && GetLastError() == (size == 0 ? 1812U : 0U)) << GetLastError();
        return size;
    };
    const Bytes block = block_of(survey_resource());
    Bytes section = block;
    section.resize(section.size() + 100, 0xAA);  // of another object file
    ASSERT_EQ(size_of(ProgramFile(section)), block.size());
    Bytes data(block.size() + 1, 0x55);
    const auto read = [&](std::size_t size) {
        return GetFileVersionInfoW(path.wstring().c_str(), 0, static_cast<DWORD>(size), data.data());
    };
    EXPECT_TRUE(read(data.size()) != 0 && data.back() == 0x55);
    data.pop_back();
    EXPECT_EQ(data, block);
    EXPECT_TRUE(read(block.size() - 1) == 0 && GetLastError() == 122);

    ProgramFile p(block);
    const auto refuses = [&](auto& field, auto value) {
        const auto before =
            std::exchange(field, static_cast<std::remove_reference_t<decltype(field)>>(value));
        EXPECT_EQ(size_of(p), 0U) << before << " became " << value;
        field = before;
    };
    refuses(p.header.e_ident[0], 'M');
    refuses(p.header.e_ident[EI_CLASS], ELFCLASS32);
    refuses(p.header.e_shentsize, 40);
    refuses(p.header.e_shstrndx, 3);
    refuses(p.header.e_shoff, -100);
    refuses(p.sections[2].sh_name, -1);
    refuses(p.sections[2].sh_type, SHT_NOBITS);
    p.contents[1] = 0;
    refuses(p.contents[0], 5);
    p.contents = block;
    refuses(p.names[10], 'V');
    for (const int value : {0, -1}) {
        refuses(p.header.e_shnum, value);
    }
    for (const long more : {1L << 20, -1L}) {
        refuses(p.sections[1].sh_size, p.sections[1].sh_size + static_cast<std::uint64_t>(more));
    }
    for (const long size : {0L, static_cast<long>(block.size()) - 1, static_cast<long>(block.size()) + 1}) {
        refuses(p.sections[2].sh_size, size);
    }
    refuses(p.sections[1].sh_offset, -1);
    refuses(p.sections[2].sh_offset, -1);
    for (const unsigned size : {0U, 3U, 63U, 64U, 100U}) {
        p.write(path);
        fs::resize_file(path, size);
        EXPECT_EQ(GetFileVersionInfoSizeW(path.wstring().c_str(), nullptr), 0U) << size;
    }
    for (const wchar_t* const other : {L"/", L"/dev/zero", L"", L"/none"}) {
        EXPECT_EQ(GetFileVersionInfoSizeW(other, nullptr), 0U) << other;
    }
    EXPECT_EQ(GetLastError(), 2U);
}

TEST(ModuleFileName, is_the_running_programs) {
    const std::wstring expected = fs::read_symlink("/proc/self/exe").wstring();
    const auto length = static_cast<DWORD>(expected.size());
    std::wstring name(length + 1, L'#');
    EXPECT_EQ(GetModuleFileNameW(nullptr, name.data(), length + 1), length);
    EXPECT_EQ(name, expected + L'\0');
    name[length] = L'#';
    EXPECT_EQ(GetModuleFileNameW(nullptr, name.data(), length), length);
    EXPECT_EQ(GetLastError(), 122U);
    EXPECT_EQ(name, expected.substr(0, length - 1) + L'\0' + L'#');
    EXPECT_EQ(
        GetModuleFileNameW(nullptr, name.data(), 0) + GetModuleFileNameW(name.data(), name.data(), length),
        0U);
}

}  // namespace
