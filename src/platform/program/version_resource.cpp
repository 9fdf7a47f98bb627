#include "src/platform/system_info.h"

#include <elf.h>
#include <fcntl.h>
#include <link.h>
#include <sys/stat.h>
#include <unistd.h>

#include <bit>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <optional>

#include "basalt/platform/error.h"
#include "src/platform/errors/error_from_errno.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/output.h"
#include "src/platform/text/file_name.h"

using namespace basalt::platform;

namespace {

constexpr DWORD SMALLEST_BLOCK = 6;  // three words

struct Range {
    std::uint64_t offset;
    std::uint64_t size;
};

// A file in which no read goes beyond its size.
class BoundedFile {
public:
    explicit BoundedFile(const std::string& name)
        // Non-blocking: the name may be a pipe's.
        : m_descriptor(above_standard(::open(name.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK))) {
        struct stat status {};
        if (m_descriptor >= 0 && ::fstat(m_descriptor, &status) == 0 && S_ISREG(status.st_mode)) {
            m_size = static_cast<std::uint64_t>(status.st_size);
        }
    }
    ~BoundedFile() {
        if (m_descriptor >= 0) {
            ::close(m_descriptor);
        }
    }
    BoundedFile(const BoundedFile&) = delete;
    BoundedFile& operator=(const BoundedFile&) = delete;

    bool is_open() const { return m_descriptor >= 0; }

    bool holds(const Range& range) const {
        return range.offset <= m_size && range.size <= m_size - range.offset;
    }

    bool read(std::uint64_t offset, void* data, std::size_t size) const {
        if (!holds({offset, size})) {
            return false;
        }
        auto* const bytes = static_cast<char*>(data);
        for (std::size_t done = 0; done < size;) {
            const ssize_t count =
                ::pread(m_descriptor, bytes + done, size - done, static_cast<off_t>(offset + done));
            if (count <= 0 && (count == 0 || errno != EINTR)) {
                return false;
            }
            done += count > 0 ? static_cast<std::size_t>(count) : 0;
        }
        return true;
    }

private:
    int m_descriptor;
    std::uint64_t m_size = 0;
};

using FileHeader = ElfW(Ehdr);
using SectionHeader = ElfW(Shdr);

bool is_program_of_this_system(const FileHeader& header) {
    constexpr unsigned char CLASS = sizeof(void*) == 8 ? ELFCLASS64 : ELFCLASS32;
    constexpr unsigned char ORDER = std::endian::native == std::endian::little ? ELFDATA2LSB : ELFDATA2MSB;
    return std::memcmp(header.e_ident, ELFMAG, SELFMAG) == 0 && header.e_ident[EI_CLASS] == CLASS &&
           header.e_ident[EI_DATA] == ORDER && header.e_shentsize == sizeof(SectionHeader);
}

bool read_section_header(const BoundedFile& file, const FileHeader& header, unsigned index,
                         SectionHeader& section) {
    const Range table{header.e_shoff, std::uint64_t{header.e_shnum} * sizeof section};
    return index < header.e_shnum && file.holds(table) &&
           file.read(table.offset + index * sizeof section, &section, sizeof section);
}

// By name: the block's keys also occur in other sections of programs with this library.
std::optional<Range> find_section(const BoundedFile& file) {
    FileHeader header;
    SectionHeader names;
    if (!file.read(0, &header, sizeof header) || !is_program_of_this_system(header) ||
        !read_section_header(file, header, header.e_shstrndx, names) ||
        !file.holds({names.sh_offset, names.sh_size})) {
        return std::nullopt;
    }
    SectionHeader section;
    for (unsigned i = 0; read_section_header(file, header, i, section); ++i) {
        char name[sizeof VERSION_RESOURCE_SECTION];
        if (section.sh_type == SHT_PROGBITS && section.sh_name <= names.sh_size &&
            sizeof name <= names.sh_size - section.sh_name &&
            file.read(names.sh_offset + section.sh_name, name, sizeof name) &&
            std::memcmp(name, VERSION_RESOURCE_SECTION, sizeof name) == 0) {
            const Range range{section.sh_offset, section.sh_size};
            return file.holds(range) ? std::optional(range) : std::nullopt;
        }
    }
    return std::nullopt;
}

DWORD block_length(const unsigned char* block) {
    return static_cast<DWORD>(block[0] | block[1] << 8);
}

// The block within its section, which may be longer.
std::optional<Range> find_block(const BoundedFile& file) {
    std::optional<Range> block = find_section(file);
    unsigned char length[2];
    if (!block || block->size < SMALLEST_BLOCK || !file.read(block->offset, length, sizeof length) ||
        block_length(length) < SMALLEST_BLOCK || block_length(length) > block->size) {
        return std::nullopt;
    }
    block->size = block_length(length);
    return block;
}

std::optional<Range> open_block(const BoundedFile& file) {
    if (!file.is_open()) {
        return fail_with(error_from_errno(errno), std::nullopt);
    }
    const std::optional<Range> block = find_block(file);
    return block ? block : fail_with(ERROR_RESOURCE_DATA_NOT_FOUND, std::nullopt);
}

}  // namespace

DWORD GetFileVersionInfoSizeW(const wchar_t* file_name, DWORD* handle) {
    *handle = 0;
    return or_out_of_memory(DWORD{0}, [&] {
        const BoundedFile file(file_name_from_wide(file_name));
        const std::optional<Range> block = open_block(file);
        return block ? static_cast<DWORD>(block->size) : 0;
    });
}

BOOL GetFileVersionInfoW(const wchar_t* file_name, DWORD, DWORD length, void* data) {
    return or_out_of_memory(0, [&] {
        const BoundedFile file(file_name_from_wide(file_name));
        const std::optional<Range> block = open_block(file);
        if (!block) {
            return 0;
        }
        if (block->size > length) {
            return fail_with(ERROR_INSUFFICIENT_BUFFER, 0);
        }
        // Checked again: the file may have been written to in the meantime.
        if (!file.read(block->offset, data, static_cast<std::size_t>(block->size)) ||
            block_length(static_cast<unsigned char*>(data)) > length) {
            return fail_with(ERROR_RESOURCE_DATA_NOT_FOUND, 0);
        }
        return 1;
    });
}
