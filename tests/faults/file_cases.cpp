// Paths, files and their queries.
#include "basalt/files.h"
#include "basalt/platform/error.h"
#include "src/platform/file_search.h"
#include "tests/faults/trial.h"

namespace basalt::faults {

using vex_util::CFilePath;
using vex_util::Path;

void check_files() {
    check("CFilePath", [](Trial& t) {
        t.folder().write("a name that is long enough for the heap.txt");
        const CString full = t.path("a name that is long enough for the heap.txt");
        CFilePath path;
        const bool threw = t.throws([&] {
            path = CFilePath(full);
            path.SetExtension(L"a longer extension than before");
            path.Combine(path.Directory(), path.FileName());
            path = t.path("");
        });
        t.expect(!threw || t.struck(), "leaves only for a failure");
        path = full;
        t.expect(path.Extension() == L"txt" && path.FileExists(), "set afterwards");
    });
    check("CFilePath's queries", [](Trial& t) {
        t.folder().write("1.txt"), t.folder().write("2.txt"), t.folder().write("3.doc");
        CFilePath path(t.path("1.txt"));
        std::vector<CString> found;
        FILETIME time = {};
        const bool all_found = t.succeeds([&] {
            CFilePath::GetFileCreationTime(t.path("*.txt"), time);
            path.GetLastAccessTime();
            found = path.GetFilesInDirectory(L"*.txt");
            return path.FileExists() && !path.IsDirectory() && CFilePath::FileExists(t.path("*.txt"));
        });
        t.expect((all_found && found.size() == 2) || t.struck(), "no only for a failure");
        t.expect(path.FileExists() && path.GetFilesInDirectory(L"*.txt").size() == 2, "yes afterwards");
    });
    check("Path", [](Trial& t) {
        const CString full(L"C:\\a folder of some length\\a name of some length.extension");
        t.throws([&] {
            Path path(full);
            path = Path(path);
            t.expect(path.GetPath(15) == full, "the whole path");
            t.expect(Path::GetPath(full, 12) == L"a name of some length.extension", "the name");
        });
    });
    check("FindFirstFileW", [](Trial& t) {
        const CString name = t.path("a folder");
        std::filesystem::create_directory(t.folder() / "a folder");
        for (const CString& pattern : {name, name + L"*"}) {
            WIN32_FIND_DATAW entry;
            const BOOL found = t.attempt([&] { return FindClose(FindFirstFileW(pattern, &entry)); });
            t.expect(found != 0 ? entry.dwFileAttributes == FILE_ATTRIBUTE_DIRECTORY : t.struck(),
                     "its kind");
        }
    });
    check("files held alone", [](Trial& t) {
        const CString name = t.path("held"), folder(t.folder().path().c_str());
        const HANDLE file = t.attempt([&] {
            return CreateFileW(name, GENERIC_READ | GENERIC_WRITE, 0, nullptr, CREATE_NEW,
                               FILE_FLAG_DELETE_ON_CLOSE, nullptr);
        });
        t.expect(file != INVALID_HANDLE_VALUE || (t.struck() && GetLastError() != 0),
                 "refused for a failure");
        t.attempt([=] { CloseHandle(file); });
        wchar_t made[MAX_PATH + 1];
        const UINT number = t.attempt([&] { return GetTempFileNameW(folder, L"vma", 0, made); });
        t.expect(number != 0 || t.struck(), "0 only for a failure");
        const BOOL deleted = number == 0 ? 1 : t.attempt([&] { return DeleteFileW(made); });
        t.expect(deleted != 0 || (t.struck() && DeleteFileW(made) != 0), "deleted, or afterwards");
    });
}

}  // namespace basalt::faults
