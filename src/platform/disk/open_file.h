// A file that is open and locked, and how it is deleted.
#ifndef BASALT_SRC_PLATFORM_DISK_OPEN_FILE_H
#define BASALT_SRC_PLATFORM_DISK_OPEN_FILE_H

#include <dirent.h>

#include <cstddef>
#include <cstdint>
#include <string>

#include "basalt/platform/types.h"
#include "src/platform/system/forks.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/system/lock.h"

namespace basalt::platform {

// The lock belongs to the system's open file, which lives as long as anything refers to it: first a
// descriptor, then the view, and after that one page of the view until the handle is closed. The file is
// deleted before the lock goes, so no other file of its name can be deleted by mistake.
class OpenFile final : public HandleObject {
public:
    static constexpr Kind KIND = Kind::FILE;
    enum class Mode : std::uint8_t { CREATE, EXISTING };

    OpenFile() noexcept : HandleObject(KIND) {}
    ~OpenFile() override { OpenFile::close(); }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    // Opens and locks a file, once. ERROR_SUCCESS, or an error with nothing left behind.
    DWORD open(const std::string& path, Mode mode, bool delete_on_close);

    // When this thread opens the path next, it has to be this file.
    void expect_at(const std::string& path) const noexcept;

    // Makes a file that is not mapped at least this long, with disk space for all of it. ERROR_SUCCESS or an
    // error.
    DWORD reserve(std::size_t size) noexcept;

    // Maps the start of the file and closes the descriptor; once. ERROR_SUCCESS or an error.
    DWORD map(std::size_t size, std::byte*& view) noexcept;

    // Unmaps the result of map(). False when the system refuses.
    bool unmap(std::byte* view, std::size_t size) noexcept;

    // The end of the handle: deletes a delete-on-close file. The lock stays with a view.
    void close() noexcept override;

    // Deletes a delete-on-close file at the end of the process.
    void delete_at_exit() noexcept;

private:
    void delete_if_requested() noexcept;

    Lock m_guard;                      // handle and view may be closed by different threads
    int m_descriptor = -1;             // until it is mapped
    std::byte* m_lock_page = nullptr;  // the page that is left of an unmapped view
    bool m_is_open = false;            // the handle
    std::string m_delete_path;         // absolute; empty when the file is to stay
    std::uint64_t m_device = 0;
    std::uint64_t m_inode = 0;
    ProcessMark m_process = 0;
};

// Deletes a file that is not open. ERROR_SUCCESS or an error.
DWORD delete_file(const std::string& path);

// Opens a folder for reading its entries; null with errno.
DIR* open_folder(const char* path) noexcept;

}  // namespace basalt::platform

#endif
