// A file that is open and locked, and how it is deleted.
#ifndef BASALT_SRC_PLATFORM_DISK_OPEN_FILE_H
#define BASALT_SRC_PLATFORM_DISK_OPEN_FILE_H

#include <cstddef>
#include <cstdint>
#include <string>

#include "basalt/platform/types.h"
#include "src/platform/system/forks.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/system/lock.h"

namespace basalt::platform {

// The lock belongs to the system's open file, which lives as long as anything refers to it: at first a
// descriptor, then the view alone, after that one page of the view until the handle is closed. The file is
// deleted before the lock goes, so that no other file of its name can be hit.
class OpenFile final : public HandleObject {
public:
    static constexpr Kind KIND = Kind::FILE;
    enum class Mode : std::uint8_t { CREATE, EXISTING };

    OpenFile() noexcept : HandleObject(KIND) {}
    ~OpenFile() override { OpenFile::close(); }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    // Opens and locks a file, once. ERROR_SUCCESS, or what went wrong, with nothing left behind.
    DWORD open(const std::string& path, Mode mode, bool delete_on_close);

    // Makes the file at least so long, with space on the disk for all of it. ERROR_SUCCESS or what went
    // wrong.
    DWORD reserve(std::uint64_t size) noexcept;

    // Maps the file's start and gives the descriptor up; once. ERROR_SUCCESS or what went wrong.
    DWORD map(std::size_t size, std::byte*& view) noexcept;

    // Unmaps what map() gave. False when the system refuses.
    bool unmap(std::byte* view, std::size_t size) noexcept;

    // The end of the handle: deletes the file if that was asked for. The lock stays with a view.
    void close() noexcept override;

    // Deletes the file at the process's end if that was asked for.
    void delete_at_exit() noexcept;

private:
    void delete_if_asked() noexcept;

    Lock m_guard;                      // handle and view may be given up by different threads
    int m_descriptor = -1;             // until it is mapped
    std::byte* m_lock_page = nullptr;  // what is left of the view
    bool m_is_open = false;            // whether the handle is
    std::string m_delete_path;         // absolute; empty when the file is to stay
    std::uint64_t m_device = 0;
    std::uint64_t m_inode = 0;
    ProcessMark m_process;
};

// Deletes a file that nobody has open. ERROR_SUCCESS, or what went wrong.
DWORD delete_file(const std::string& path);

}  // namespace basalt::platform

#endif
