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
using Place = std::pair<std::ptrdiff_t, UINT>;

constexpr std::size_t FIRST = 40 + 36;  // offset of the first node below StringFileInfo
constexpr Place NONE = {1813, 0};

Bytes patched(Bytes block, std::size_t offset, std::size_t word) {
    return put_word(block, offset, word), block;
}
// A value's offset and length in the block, or an error.
Place place(const Bytes& block, const std::wstring& path) {
    void* value = nullptr;
    UINT length = 0;
    return VerQueryValueW(block.data(), path.c_str(), &value, &length) == 0
               ? Place(GetLastError(), 0)
               : Place(static_cast<unsigned char*>(value) - block.data(), length);
}
std::wstring text_at(const Bytes& block, const std::wstring& path) {
    const Place found = place(block, L"\\StringFileInfo\\" + path);
    return found == NONE ? L"none"
                         : basalt::platform::wide_from_utf16(block.data() + found.first, found.second);
}

TEST(VersionQuery, finds_values_by_their_path) {
    const Bytes block = survey_resource();
    EXPECT_EQ(place(block, L"\\"), Place(40, 52));
    EXPECT_EQ(place(block, L"\\VarFileInfo\\Translation").second, 8U);
    const wchar_t* const rows[][2] = {{L"040904b0\\ProductName", L"Survey"},
                                      {L"040704e4\\PRODUCTNAME", L"Vermessung"},
                                      {L"040904b0\\LegalCopyright", L"\xA9 \x1F30D"},
                                      {L"040904b0\\FileDescription", L""},
                                      {L"040904b0\\Comment", L"none"},
                                      {L"040904b0\\ProductNam", L"none"},
                                      {L"ProductName", L"none"}};
    for (const auto& [path, text] : rows) {
        EXPECT_EQ(text_at(block, path), text);
    }
    // Another signature, and sizes of the root's value.
    for (const Bytes& bad : {patched(block, 40, 0x04BE), patched(block, 2, 51), patched(block, 2, 0xFFFF)}) {
        EXPECT_EQ(place(bad, L"\\"), NONE);
    }
}

TEST(VersionQuery, a_text_ends_at_its_terminator_or_its_length_in_units) {
    const std::tuple<std::u16string, std::size_t, const wchar_t*> rows[] = {
        {u"ab", 2, L"ab"},
        {u"abcd", 3, L"abc"},
        {{u'a', u'b', 0, u'd'}, 4, L"ab"},
        {{u'a', u'b', 0, 0}, 0xFFFF, L"ab"},
        {{0xDC00, u'a', 0xD83C, u'b', 0xD83C}, 5, L"\uFFFDa\uFFFDb\uFFFD"}};
    for (const auto& [value, claimed, text] : rows) {
        const Bytes block = resource({}, {node(u"Key", utf16(value), true, {text_node(u"x", u"y")})}, {});
        EXPECT_EQ(text_at(patched(block, FIRST + 2, claimed), L"Key"), text);
    }
    const Bytes last = patched(resource({}, {text_node(u"Key", u"Survey")}, {}), FIRST + 2, 14);
    EXPECT_EQ(place(patched(last, FIRST + 4, 0), L"\\StringFileInfo\\Key"), Place(92, 7)) << "in bytes";
}

TEST(VersionResourceFile, is_read_from_its_section_or_refused) {
    const ScratchFolder folder;
    const std::wstring path = folder.wide(L"program");
    const auto size_of = [&](const Bytes& bytes) {
        write_file(folder / "program", bytes);
        DWORD handle = 1;
        SetLastError(0);
        const DWORD size = GetFileVersionInfoSizeW(path.c_str(), &handle);
        EXPECT_TRUE(handle == 0 && GetLastError() == (size > 0 ? 0U : 1812U));
        return size;
    };
    const Bytes block = survey_resource(), good = program_file(block);
    Bytes section = block, data(block.size() + 1, 0x55);
    section.resize(section.size() + 100, 0xAA);  // of another object file
    ASSERT_EQ(size_of(program_file(section)), block.size());
    const auto read = [&](std::size_t size) {
        return GetFileVersionInfoW(path.c_str(), 0, static_cast<DWORD>(size), data.data());
    };
    EXPECT_TRUE(read(data.size()) != 0 && data.back() == 0x55);
    data.pop_back();
    EXPECT_EQ(data, block);
    EXPECT_TRUE(read(block.size() - 1) == 0 && GetLastError() == 122);
    // Bytes of the file's header, of the section of names, of that of the information, and of their contents.
    const std::size_t size = block.size() & 0xFF;
    const std::size_t spoilt[][2] = {{0, 'M'},        {4, 1},      {47, 0xFF},  {58, 40},    {60, 0},
                                     {61, 0xFF},      {62, 3},     {159, 0xFF}, {160, 25},   {162, 0x10},
                                     {167, 0xFF},     {195, 0xFF}, {196, 8},    {223, 0xFF}, {224, size - 1},
                                     {224, size + 1}, {231, 0xFF}, {266, 'V'}};
    for (const auto& [offset, value] : spoilt) {
        Bytes bytes = good;
        bytes[offset] = static_cast<unsigned char>(value);
        EXPECT_EQ(size_of(bytes), 0U) << offset << " became " << value;
    }
    for (const std::size_t left : {0U, 3U, 63U, 64U, 100U, 282U}) {
        EXPECT_EQ(size_of(Bytes(good.begin(), good.begin() + static_cast<long>(left))), 0U) << left;
    }
    EXPECT_EQ(size_of(program_file(patched(block, 0, 5))) + size_of(program_file({})), 0U);
    for (const wchar_t* const other : {L"/", L"/dev/zero", L"", L"/none"}) {
        DWORD handle = 1;
        EXPECT_EQ(GetFileVersionInfoSizeW(other, &handle), 0U);
    }
    EXPECT_EQ(GetLastError(), 2U);
}

TEST(ModuleFileName, is_the_running_programs) {
    const std::wstring expected = fs::read_symlink("/proc/self/exe").wstring();
    const auto length = static_cast<DWORD>(expected.size());
    std::wstring name(length + 1, L'#');
    EXPECT_TRUE(GetModuleFileNameW(nullptr, name.data(), length + 1) == length && name == expected + L'\0');
    EXPECT_TRUE(GetModuleFileNameW(nullptr, name.data(), length) == length && GetLastError() == 122);
    EXPECT_EQ(name, expected.substr(0, length - 1) + L'\0' + L'\0');
}

}  // namespace
