#include <unistd.h>

#include <atomic>
#include <cstdlib>
#include <cwchar>
#include <string>
#include <string_view>

#include "basalt/platform/error.h"
#include "src/platform/clock.h"
#include "src/platform/disk/open_file.h"
#include "src/platform/file.h"
#include "src/platform/path_split.h"
#include "src/platform/system/failure.h"
#include "src/platform/text/file_name.h"

using namespace basalt::platform;

namespace {

constexpr std::size_t PREFIX_LENGTH = 3;
constexpr std::size_t LONGEST_FOLDER = MAX_PATH - 14;
constexpr UINT NUMBERS = 0xFFFF;

// Where to look for a free number, 1 to NUMBERS: behind the last one, after a start that differs between
// processes, so the first is usually free.
UINT next_start() {
    static constinit std::atomic<UINT> s_last = 0;
    UINT last = s_last.load();
    UINT next;
    do {
        next = (last == 0 ? GetTickCount() ^ static_cast<UINT>(getpid()) << 4 : last) % NUMBERS + 1;
    } while (!s_last.compare_exchange_weak(last, next));
    return next;
}

}  // namespace

DWORD GetTempPathW(DWORD length, wchar_t* buffer) {
    return or_out_of_memory(DWORD{0}, [&] {
        const char* const configured = std::getenv("TMPDIR");
        const bool is_set = configured != nullptr && *configured != '\0';
        std::wstring folder = wide_from_file_name(is_set ? configured : "/tmp");
        if (!is_separator(folder.back())) {
            folder += L'/';
        }
        const auto needed = static_cast<DWORD>(folder.size());
        if (needed >= length) {
            return needed + 1;
        }
        std::wmemcpy(buffer, folder.c_str(), folder.size() + 1);
        return needed;
    });
}

UINT GetTempFileNameW(const wchar_t* folder, const wchar_t* prefix, UINT /*unique*/, wchar_t* name) {
    return or_out_of_memory(UINT{0}, [&] {
        std::wstring stem = folder;
        if (stem.size() > LONGEST_FOLDER) {
            return fail_with(ERROR_FILENAME_EXCED_RANGE, UINT{0});
        }
        if (!stem.empty() && !is_separator(stem.back())) {
            stem += L'/';
        }
        stem += std::wstring_view(prefix).substr(0, PREFIX_LENGTH);
        UINT number = next_start();
        for (UINT attempt = 0; attempt < NUMBERS; ++attempt, number = number % NUMBERS + 1) {
            wchar_t digits[9];
            std::swprintf(digits, 9, L"%X.tmp", number);
            const std::wstring full = stem + digits;
            const std::string path = file_name_from_wide(full);
            OpenFile file;
            const DWORD error = file.open(path, OpenFile::Mode::CREATE, false);
            if (error == ERROR_SUCCESS) {
                file.expect_at(path);
                std::wmemcpy(name, full.c_str(), full.size() + 1);
                return number;
            }
            if (error != ERROR_FILE_EXISTS) {
                return fail_with(error, UINT{0});
            }
        }
        return fail_with(ERROR_FILE_EXISTS, UINT{0});
    });
}
