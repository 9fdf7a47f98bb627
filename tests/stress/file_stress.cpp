// A log that all threads write, mapped blocks and block allocators during clean-ups, files made and deleted,
// queries of the disk, texts, and the settings and queries of the environment.
#include <fstream>
#include <string>

#include "basalt/basalt.h"
#include "src/platform/file.h"
#include "tests/stress/stress.h"
#include "tests/support/scratch_folder.h"

namespace basalt::stress {

namespace {

constexpr int THREADS = 6;

// A new file is neither lost to another thread's DeleteFileW nor does that hit it.
void make_and_delete(const std::wstring& name, int thread) {
    const bool makes = thread % 2 != 0;
    const HANDLE file = !makes ? INVALID_HANDLE_VALUE
                               : CreateFileW(name.c_str(), GENERIC_READ | GENERIC_WRITE, 0, nullptr,
                                             CREATE_NEW, FILE_FLAG_DELETE_ON_CLOSE, nullptr);
    require(file != INVALID_HANDLE_VALUE || !makes || GetLastError() == ERROR_FILE_EXISTS, "new");
    require(DeleteFileW(name.c_str()) == 0 || file == INVALID_HANDLE_VALUE, "held alone");
    CloseHandle(file);
}

void use_texts(const CString& name, int thread) {
    require(vex_util::CFilePath::FileExists(name) && !vex_util::CFilePath::IsDirectory(name), "a file");
    require(vex_util::Path::GetPath(name, 8) == L".log", "its extension");
    wchar_t wide[20];
    char narrow[20];
    _char2tchar("\xC3\xBC", wide, 19);
    _tchar2char(wide, narrow, 19);
    require(std::string(narrow) == "\xC3\xBC", "there and back");
    _setLanguageVersion(static_cast<basalt_language>(thread + 1));
    require(_languageVersion() >= 1 && _languageVersion() <= THREADS, "some thread's language");
    require(_operatingsystem() == 11 && _checkForHighResolution() == 1.0, "settled once");
    require(_random_uint16() < 65535 && HexStringToString(StringToHexString("abc")) == "abc", "reentrant");
}

// Every line is one thread's, whole.
long lines_of(const std::string& path) {
    std::ifstream file(path);
    long lines = 0;
    for (std::string line; std::getline(file, line); ++lines) {
        require(line.size() >= 2 && line.back() == '\r' && line[0] >= '0' && line[0] < '0' + THREADS &&
                    line.find_first_not_of(line[0]) == line.size() - 1,
                "each text of the log is whole");
    }
    return lines;
}

}  // namespace

long stress_files(double seconds) {
    const test::ScratchFolder folder;
    const std::string path = folder / "stress.log";
    const CString name(path.c_str());
    vex_util::FileLogger log(path.c_str());
    std::atomic<long> written = 0;
    const long rounds = run_threads(THREADS, seconds, [&](int thread, Random& random) {
        log.Write(CString(static_cast<wchar_t>(L'0' + thread), 1 + draw(random, 300)) + L'\n');
        ++written;
        use_texts(name, thread);
        make_and_delete(folder.wide(L"held"), thread);
        if (draw(random, 4) == 0) {
            const auto size = static_cast<unsigned long>(1 + draw(random, 20'000));
            const vex_util::CMemoryMap map(size);
            auto* const bytes = static_cast<char*>(static_cast<void*>(map));
            require(bytes != nullptr && bytes[size - 1]++ == 0, "a fresh block reads as zero");
            vex_lib::vlVmAllocator allocator(4096, 512);
            require(allocator.Alloc(512) != nullptr, "a block on a file");
        }
        if (thread == 0) {
            vex_util::CMemoryMap::CleanUp();
            require(vex_util::HiResTimer().GetElapsedS() >= 0 && _currentjavatime() > 0, "time passes");
        }
    });
    log.Close();
    require(lines_of(path) == written, "every text is in the log");
    require(folder.names().size() == 1, "no temporary file stays");
    return rounds;
}

}  // namespace basalt::stress
