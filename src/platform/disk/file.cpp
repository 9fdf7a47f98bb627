#include "src/platform/file.h"

#include <atomic>
#include <memory>

#include "basalt/platform/error.h"
#include "src/platform/disk/open_file.h"
#include "src/platform/system/failure.h"
#include "src/platform/system/forks.h"
#include "src/platform/system/handle_table.h"
#include "src/platform/text/file_name.h"

using namespace basalt::platform;

namespace {

// The process that last opened a delete-on-close file. A forked child that has opened none leaves the handle
// table alone: its copy may be locked by a thread that does not exist.
constinit std::atomic<ProcessMark> s_owner = 0;
// The files have been deleted; one opened later is deleted by its opener.
constinit std::atomic<bool> s_are_deleted = false;

struct DeleteAtExit {
    ~DeleteAtExit() {
        if (s_owner.load() != this_process()) {
            return;
        }
        s_are_deleted.store(true);
        for_each_object([](HandleObject& object) {
            if (object.kind() == OpenFile::KIND) {
                static_cast<OpenFile&>(object).delete_at_exit();
            }
        });
    }
};

void register_deletion_at_exit() {
    static const DeleteAtExit s_at_exit;
    s_owner.store(this_process());
}

}  // namespace

HANDLE CreateFileW(const wchar_t* name, DWORD /*access*/, DWORD /*sharing*/,
                   SECURITY_ATTRIBUTES* /*security*/, DWORD disposition, DWORD flags, HANDLE /*pattern*/) {
    return or_out_of_memory(INVALID_HANDLE_VALUE, [&] {
        const bool deletes = (flags & FILE_FLAG_DELETE_ON_CLOSE) != 0;
        const auto file = std::make_shared<OpenFile>();
        NewHandle handle(file);
        const auto mode = disposition == CREATE_NEW ? OpenFile::Mode::CREATE : OpenFile::Mode::EXISTING;
        const DWORD error = file->open(file_name_from_wide(name), mode, deletes);
        if (error != ERROR_SUCCESS) {
            return fail_with(error, INVALID_HANDLE_VALUE);
        }
        if (deletes) {
            register_deletion_at_exit();  // after opening, which counts forks first
        }
        const HANDLE result = handle.give();
        if (deletes && s_are_deleted.load()) {
            file->delete_at_exit();
        }
        return result;
    });
}

BOOL CloseHandle(HANDLE handle) {
    const auto object = find_object(handle);
    if (object == nullptr || object->kind() == HandleObject::Kind::SEARCH) {
        return fail_with(ERROR_INVALID_HANDLE, 0);
    }
    drop_handle(handle);
    object->close();
    return 1;
}

BOOL DeleteFileW(const wchar_t* name) {
    return or_out_of_memory(0, [&] {
        const DWORD error = delete_file(file_name_from_wide(name));
        return error == ERROR_SUCCESS ? 1 : fail_with(error, 0);
    });
}
