#include "src/platform/drawing/bmp_file.h"

#include <fcntl.h>
#include <stdlib.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstring>

#include "src/platform/errors/error_from_errno.h"
#include "src/platform/pixels/pixel_format.h"
#include "src/platform/pixels/pixel_rows.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/output.h"
#include "src/platform/text/file_name.h"

namespace basalt::platform {

namespace {

constexpr std::uint32_t FILE_HEADER_BYTES = 14;
constexpr std::uint32_t IMAGE_HEADER_BYTES = 40;

// A file being written, with a buffer of its own: once opening has truncated a file, nothing may run out of
// memory. Keeps the first error and writes nothing after it.
class Writer {
public:
    explicit Writer(int file) noexcept : m_file(file) {}

    void bytes(const void* from, std::size_t count) {
        if (count > sizeof m_buffer - m_size) {
            flush();
            if (count > sizeof m_buffer) {
                write(static_cast<const char*>(from), count);
                return;
            }
        }
        std::memcpy(m_buffer + m_size, from, count);
        m_size += count;
    }
    void word16(std::uint32_t value) {
        const unsigned char both[] = {static_cast<unsigned char>(value & 0xFF),
                                      static_cast<unsigned char>(value >> 8 & 0xFF)};
        bytes(both, sizeof both);
    }
    void word32(std::uint32_t value) {
        word16(value & 0xFFFF);
        word16(value >> 16);
    }

    void flush() {
        write(m_buffer, m_size);
        m_size = 0;
    }
    // 0, or the errno value of the first failure.
    int error() const { return m_error; }

private:
    void write(const char* from, std::size_t count) {
        if (m_error == 0 && !write_output(m_file, from, count)) {
            m_error = errno;
        }
    }

    const int m_file;
    int m_error = 0;
    std::size_t m_size = 0;
    char m_buffer[16384];
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
    writer.word32(0);  // pixels per metre, unknown
    writer.word32(0);
    writer.word32(static_cast<std::uint32_t>(table.size()));
    writer.word32(0);  // all colours are important
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

// Deletes the path if it is that file, links not followed; whether it was.
bool delete_if_it_is(const char* path, const struct stat& file) {
    struct stat there = {};
    if (::lstat(path, &there) != 0 || there.st_dev != file.st_dev || there.st_ino != file.st_ino) {
        return false;
    }
    ::unlink(path);
    return true;
}

// Deletes a regular file that was begun, also behind links, unless another has taken its place. Devices and
// pipes stay.
void delete_begun(const char* name, const struct stat& begun) {
    char path[PATH_MAX];
    if (S_ISREG(begun.st_mode) && !delete_if_it_is(name, begun) && ::realpath(name, path) != nullptr) {
        delete_if_it_is(path, begun);
    }
}

}  // namespace

bool write_bmp_file(const Surface& surface, const wchar_t* name) {
    FileName file_name;
    if (!file_name.set(name)) {
        return fail_with(ERROR_INVALID_NAME, false);
    }
    const int file = open_output(file_name.c_str(), 0);
    if (file < 0) {
        return fail_with(error_from_errno(errno), false);
    }
    struct stat begun = {};
    (void)::fstat(file, &begun);  // if it fails, the file stays, empty
    const OutputSignalBlocker blocker;
    Writer writer(file);
    write_headers(surface, writer);
    for (int y = surface.height - 1; y >= 0 && writer.error() == 0; --y) {
        write_row(surface, y, writer);
    }
    writer.flush();
    int error = writer.error();
    // Closing may be what fails; a second descriptor keeps the inode number from being reused until the
    // deletion.
    const int last = ::fcntl(file, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
    if (last >= 0 && ::close(file) != 0 && error == 0) {
        error = errno;
    }
    const int open = last >= 0 ? last : file;
    if (error != 0) {
        (void)!::ftruncate(open, 0);  // also for its other names; fails harmlessly on devices and pipes
        delete_begun(file_name.c_str(), begun);
    }
    if (::close(open) != 0 && error == 0 && last < 0) {
        error = errno;
    }
    return error == 0 || fail_with(error_from_errno(error), false);
}

}  // namespace basalt::platform
