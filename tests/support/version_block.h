// Version resources and program files around them, built by hand.
#ifndef BASALT_TESTS_SUPPORT_VERSION_BLOCK_H
#define BASALT_TESTS_SUPPORT_VERSION_BLOCK_H

#include <elf.h>

#include <cstdint>
#include <cstring>
#include <fstream>
#include <string>
#include <vector>

namespace basalt::test {

using Bytes = std::vector<unsigned char>;

struct VersionNode {
    std::u16string key;
    Bytes value;
    bool is_text = false;
    std::vector<VersionNode> children;
};

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

inline VersionNode text_node(const std::u16string& key, const std::u16string& text) {
    return {key, utf16(text + u'\0'), true, {}};
}

inline void append(Bytes& bytes, const Bytes& more) {
    bytes.resize((bytes.size() + 3) / 4 * 4);
    bytes.insert(bytes.end(), more.begin(), more.end());
}

inline Bytes block_of(const VersionNode& node) {
    Bytes bytes(6);
    put_word(bytes, 2, node.value.size() / (node.is_text ? 2 : 1));
    put_word(bytes, 4, node.is_text ? 1 : 0);
    const Bytes key = utf16(node.key + u'\0');
    bytes.insert(bytes.end(), key.begin(), key.end());
    if (!node.value.empty()) {
        append(bytes, node.value);
    }
    for (const VersionNode& child : node.children) {
        append(bytes, block_of(child));
    }
    put_word(bytes, 0, bytes.size());
    return bytes;
}

// Fixed information with the file version 9.8.7.6 and this product version.
inline Bytes fixed_information(unsigned a, unsigned b, unsigned c, unsigned d) {
    Bytes bytes(52);
    const unsigned words[] = {0x04BD, 0xFEEF, 0, 1, 8, 9, 6, 7, b, a, d, c};
    for (std::size_t i = 0; i < std::size(words); ++i) {
        put_word(bytes, 2 * i, words[i]);
    }
    return bytes;
}

// Version 4.1.2.305 of "Survey", its texts under the key of a language table, and that language as the first
// of the translations.
inline VersionNode survey_resource() {
    const VersionNode other = {u"040704E4", {}, true, {text_node(u"ProductName", u"Vermessung")}};
    const VersionNode table = {u"040904B0",
                               {},
                               true,
                               {text_node(u"ProductName", u"Survey"), text_node(u"InternalName", u"survey"),
                                text_node(u"LegalCopyright", u"\xA9 \xD83C\xDF0D"),
                                text_node(u"ProductVersion", u"4.1"), text_node(u"FileDescription", u"")}};
    const VersionNode translation = {
        u"Translation", {0x09, 0x04, 0xB0, 0x04, 0x07, 0x04, 0xE4, 0x04}, false, {}};
    return {u"VS_VERSION_INFO",
            fixed_information(4, 1, 2, 305),
            false,
            {{u"StringFileInfo", {}, true, {other, table}}, {u"VarFileInfo", {}, true, {translation}}}};
}

// The smallest program file with a section of that name and these contents.
struct ProgramFile {
    Elf64_Ehdr header{};
    std::string names;
    Elf64_Shdr sections[3] = {};  // null, the names, the section
    Bytes contents;

    explicit ProgramFile(Bytes section_contents, const std::string& name = ".version_resource")
        : names(std::string("\0.names\0", 8) + name + '\0'), contents(std::move(section_contents)) {
        std::memcpy(header.e_ident, ELFMAG, SELFMAG);
        header.e_ident[EI_CLASS] = ELFCLASS64;
        header.e_ident[EI_DATA] = ELFDATA2LSB;
        header.e_shentsize = sizeof(Elf64_Shdr);
        header.e_shnum = 3;
        header.e_shstrndx = 1;
        header.e_shoff = sizeof header;
        sections[1].sh_name = 1;
        sections[1].sh_type = SHT_STRTAB;
        sections[1].sh_offset = sizeof header + sizeof sections;
        sections[1].sh_size = names.size();
        sections[2].sh_name = 8;
        sections[2].sh_type = SHT_PROGBITS;
        sections[2].sh_offset = sections[1].sh_offset + names.size();
        sections[2].sh_size = contents.size();
    }

    void write(const std::string& path) const {
        std::ofstream file(path, std::ios::binary);
        file.write(reinterpret_cast<const char*>(&header), sizeof header);
        file.write(reinterpret_cast<const char*>(sections), sizeof sections);
        file << names;
        file.write(reinterpret_cast<const char*>(contents.data()),
                   static_cast<std::streamsize>(contents.size()));
    }
};

}  // namespace basalt::test

#endif
