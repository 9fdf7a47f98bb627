// Version resources and program files around them, built by hand.
#ifndef BASALT_TESTS_SUPPORT_VERSION_BLOCK_H
#define BASALT_TESTS_SUPPORT_VERSION_BLOCK_H

#include <algorithm>
#include <fstream>
#include <string>
#include <vector>

namespace basalt::test {

using Bytes = std::vector<unsigned char>;

inline void put_word(Bytes& bytes, std::size_t offset, std::size_t value) {
    bytes[offset] = static_cast<unsigned char>(value & 0xFF);
    bytes[offset + 1] = static_cast<unsigned char>(value >> 8 & 0xFF);
}
inline Bytes utf16(const std::u16string& text) {
    Bytes bytes(2 * text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        put_word(bytes, 2 * i, text[i]);
    }
    return bytes;
}

// A node of a resource: its value, then its children, each from a multiple of four bytes.
inline Bytes node(const std::u16string& key, const Bytes& value, bool is_text,
                  std::vector<Bytes> children = {}) {
    Bytes bytes = utf16(std::u16string(3, u'\0') + key + u'\0');
    children.insert(children.begin(), value);
    for (const Bytes& part : children) {
        bytes.resize((bytes.size() + 3) / 4 * 4);
        bytes.insert(bytes.end(), part.begin(), part.end());
    }
    put_word(bytes, 0, bytes.size());
    put_word(bytes, 2, value.size() / (is_text ? 2 : 1));
    put_word(bytes, 4, is_text ? 1 : 0);
    return bytes;
}
inline Bytes text_node(const std::u16string& key, const std::u16string& text) {
    return node(key, utf16(text + u'\0'), true);
}
inline Bytes resource(const Bytes& fixed, const std::vector<Bytes>& strings, const Bytes& translations) {
    return node(u"VS_VERSION_INFO", fixed, false,
                {node(u"StringFileInfo", {}, true, strings),
                 node(u"VarFileInfo", {}, true, {node(u"Translation", translations, false)})});
}

// Fixed information with the file version 9.8.7.6 and this product version.
inline Bytes fixed_information(char16_t a, char16_t b, char16_t c, char16_t d) {
    Bytes bytes = utf16({0x04BD, 0xFEEF, 0, 1, 8, 9, 6, 7, b, a, d, c});
    bytes.resize(52);
    return bytes;
}

// Version 4.1.2.305 of "Survey", its texts under the key of a language table, and that language as the first
// of the translations.
inline Bytes survey_resource() {
    const std::vector<Bytes> texts = {
        text_node(u"ProductName", u"Survey"), text_node(u"InternalName", u"survey"),
        text_node(u"LegalCopyright", u"\xA9 \xD83C\xDF0D"), text_node(u"ProductVersion", u"4.1"),
        text_node(u"FileDescription", u"")};
    const Bytes other = node(u"040704E4", {}, true, {text_node(u"ProductName", u"Vermessung")});
    return resource(fixed_information(4, 1, 2, 305), {other, node(u"040904B0", {}, true, texts)},
                    utf16({0x0409, 0x04B0, 0x0407, 0x04E4}));
}

// The smallest program file with version information: the file's header, three sections' from 64, 128 (their
// names) and 192 (the version information), the names from 256.
inline constexpr char NAMES[26] = "\0.names\0.version_resource";
inline Bytes program_file(const Bytes& contents) {
    const std::size_t size = contents.size();
    Bytes file(282 + size);
    const std::size_t words[][2] = {{0, 0x457F}, {2, 0x464C}, {4, 0x0102}, {40, 64},   {58, 64},
                                    {60, 3},     {62, 1},     {128, 1},    {132, 3},   {152, 256},
                                    {160, 26},   {192, 8},    {196, 1},    {216, 282}, {224, size}};
    for (const auto& [offset, word] : words) {
        put_word(file, offset, word);
    }
    std::copy_n(NAMES, sizeof(NAMES), file.begin() + 256);
    std::copy(contents.begin(), contents.end(), file.begin() + 282);
    return file;
}
inline void write_file(const std::string& path, const Bytes& bytes) {
    std::ofstream(path, std::ios::binary) << std::string(bytes.begin(), bytes.end());
}

}  // namespace basalt::test

#endif
