#include "src/platform/bmp_file.h"

#include <stdio.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "basalt/platform/error.h"
#include "src/platform/error_from_errno.h"
#include "src/platform/file_name.h"
#include "src/platform/file_size_signal.h"
#include "src/platform/open_for_writing.h"
#include "src/platform/pixel_format.h"
#include "src/platform/pixel_rows.h"

namespace basalt::platform {

namespace {

constexpr std::uint32_t FILE_HEADER_BYTES = 14;
constexpr std::uint32_t IMAGE_HEADER_BYTES = 40;

// Bytes of numbers with the lowest first, and what they are written to.
class Writer {
public:
    explicit Writer(FILE* file) : m_file(file) {}

    void bytes(const void* from, std::size_t count) { ::fwrite_unlocked(from, 1, count, m_file); }
    void word16(std::uint32_t value) {
        const unsigned char both[] = {static_cast<unsigned char>(value & 0xFF),
                                      static_cast<unsigned char>(value >> 8 & 0xFF)};
        bytes(both, sizeof both);
    }
    void word32(std::uint32_t value) {
        word16(value & 0xFFFF);
        word16(value >> 16);
    }

private:
    FILE* m_file;
};

void write_headers(const Surface& surface, Writer& writer) {
    const auto table = colour_table(surface.depth);
    const std::uint32_t offset =
        FILE_HEADER_BYTES + IMAGE_HEADER_BYTES + static_cast<std::uint32_t>(table.size()) * 4;
    // A surface has less than 2^31 bytes.
    const auto image =
        static_cast<std::uint32_t>(surface.row_bytes) * static_cast<std::uint32_t>(surface.height);
    writer.bytes("BM", 2);
    writer.word32(offset + image);
    writer.word32(0);
    writer.word32(offset);

    writer.word32(IMAGE_HEADER_BYTES);
    writer.word32(static_cast<std::uint32_t>(surface.width));
    writer.word32(static_cast<std::uint32_t>(surface.height));
    writer.word16(1);  // plane
    writer.word16(static_cast<std::uint32_t>(surface.depth));
    writer.word32(0);  // uncompressed
    writer.word32(image);
    writer.word32(0);  // pixels per metre, both ways: not known
    writer.word32(0);
    writer.word32(static_cast<std::uint32_t>(table.size()));
    writer.word32(0);  // all colours matter
    for (const std::uint32_t word : table) {
        writer.word32(word);
    }
}

void write_row(const Surface& surface, int y, Writer& writer) {
    if (surface.depth != 32) {
        writer.bytes(surface.row(y), surface.row_bytes);
        return;
    }
    in_pieces(surface.width, false, [&](int offset, int size) {
        std::uint32_t values[PIECE];
        const std::span<std::uint32_t> piece(values, static_cast<std::size_t>(size));
        read_pixels(surface.depth, surface.row(y), offset, piece);
        for (std::uint32_t& value : piece) {
            value &= COLOUR_BITS;
        }
        writer.bytes(values, piece.size_bytes());
    });
}

FILE* open_file(const char* name) {
    const int file = open_for_writing(name, 0);
    if (file < 0) {
        return nullptr;
    }
    FILE* const stream = ::fdopen(file, "w");
    if (stream == nullptr) {
        const int error = errno;
        ::close(file);
        errno = error;
    }
    return stream;
}

// A device or pipe that was named is not this layer's to delete.
bool is_regular_file(FILE* file) {
    struct stat status = {};
    return ::fstat(::fileno(file), &status) == 0 && S_ISREG(status.st_mode);
}

}  // namespace

bool write_bmp_file(const Surface& surface, const wchar_t* name) {
    FileName file_name;
    if (!file_name.set(name)) {
        SetLastError(ERROR_INVALID_NAME);
        return false;
    }
    FILE* const file = open_file(file_name.c_str());
    if (file == nullptr) {
        set_last_error_from_errno();
        return false;
    }
    const bool may_be_deleted = is_regular_file(file);
    const FileSizeSignalHeld held;
    Writer writer(file);
    write_headers(surface, writer);
    for (int y = surface.height - 1; y >= 0 && ::ferror_unlocked(file) == 0; --y) {
        write_row(surface, y, writer);
    }
    // The stream's error outlives errno; the call that closes it may be the first to fail.
    const bool written = ::fflush_unlocked(file) == 0 && ::ferror_unlocked(file) == 0;
    const int error = errno;
    const bool closed = ::fclose(file) == 0;
    if (written && closed) {
        return true;
    }
    if (written) {
        set_last_error_from_errno();
    } else {
        SetLastError(error_from_errno(error));
    }
    if (may_be_deleted) {
        ::unlink(file_name.c_str());
    }
    return false;
}

}  // namespace basalt::platform
