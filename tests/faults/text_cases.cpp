// Environment, texts, timers, log, hexadecimal text, hardware addresses, version information, paths and
// files.
#include <filesystem>
#include <new>
#include <string>
#include <tuple>

#include "basalt/files.h"
#include "basalt/frame.h"
#include "basalt/platform.h"
#include "basalt/util.h"
#include "src/platform/file.h"
#include "src/platform/file_search.h"
#include "tests/faults/trial.h"

namespace basalt::faults {

namespace {

using vex_util::CFilePath;
using vex_util::Path;

std::string utf8(const CString& text) {
    return std::filesystem::path(text.GetString()).string();
}

std::string text_calls() {
    wchar_t wide[40];
    char narrow[40];
    COleDateTime date;
    CString text(L"a text that does not fit into the string itself");
    text.Format(L"%s and %i of 'em, %.*f", text, 17, 5000, 2.5);
    (text += L" behind").Replace(L"t", L"tt");
    const vex_util::HiResTimer timer(text, true);
    _char2tchar("M\xC3\xBCller", wide, 39);
    _tchar2char(wide, narrow, 39);
    _int2tchar(_operatingsystem() == 11 && _random_uint16() < 65535 ? -42 : 0, wide, 19, 10);
    _setKestraGRDXPath(wide);
    ParseDateFromHexString("3031303232303231", date);
    return narrow + utf8(text.Mid(3).MakeUpper().MakeReverse() + text.Left(20) + CString("narrow")) +
           utf8(_kestraPortulaInboxPath()) +
           std::to_string(date.m_dt + vex_util::PeriodicTimer(1, true).Update(false)) +
           HexStringToString(StringToHexString("longer than fits a short string")) +
           VectorToHexString(HexStringToVector(std::string(100, 'a')));
}

std::string replacement_calls() {
    _REPLACE_CLEANUP();
    _REPLACE_FLAG(true);
    try {
        _REPLACE_LOAD(1, 2);
    } catch (const std::bad_alloc&) {
        return _REPLACE(1) == 1 ? throw : "stored";
    }
    return std::to_string(_REPLACE(1));
}

std::string address_calls() {
    MACAddressFromMIBTable table;
    const auto texts = (table.Create(), table.GetMACAddressesAsHexString());
    return std::to_string(texts.size()) + (texts.empty() ? "" : texts.front());
}

std::string version_calls() {
    VersionInfo info;
    const bool found = info.InitVersionInfo(nullptr);
    const bool is_right = info.GetVersionString() == (found ? L"Faults 04.01.02.305" : L" 01.00.00.01");
    return is_right ? std::to_string(found) : "?";
}

// Each of six texts of which the third fills the buffer is whole or lost, and an open log writes later ones.
void check_log(Trial& t) {
    const std::string name = t.folder() / "a.log";
    const CString text(L'x', 3000);
    vex_util::FileLogger log;
    t.attempt([&] { log.Open(name.c_str()); });
    for (int i = 0; i < 6; ++i) {
        t.attempt([&] { log.Write(text); });
    }
    t.attempt([&] { log.Close(); });
    const std::uintmax_t size = std::filesystem::exists(name) ? std::filesystem::file_size(name) : 0;
    t.expect(size == 18'000 || (t.was_ever_struck() && size % 3000 == 0), "each text whole or lost");
    log.Open(name.c_str());
    log.Write(text);
    log.Close();
    t.expect(std::filesystem::file_size(name) == 3000, "written afterwards");
}

enum Failures { EXCEPTION, LOSS };  // what a failed call may lead to; a loss may be an exception too

}  // namespace

void check_texts() {
    using Row = std::tuple<const char*, std::string (*)(), Failures>;
    for (const auto& [operation, work, failures] :
         {Row("CString, conversions, hexadecimal text", text_calls, EXCEPTION),
          Row(
              "_tempFilePath", [] { return utf8(_tempFilePath()); }, LOSS),
          Row("VersionInfo", version_calls, LOSS), Row("_REPLACE_LOAD", replacement_calls, EXCEPTION),
          Row("MACAddressFromMIBTable::Create", address_calls, LOSS)}) {
        check(operation, [work = work, failures = failures](Trial& t) {
            const std::string expected = work();
            std::string result = expected;
            const bool threw = t.throws([&] { result = work(); });
            t.expect(!threw || t.struck(), "throws only for a failure");
            t.expect(result == expected || (failures == LOSS && t.struck()), "the right result");
            t.expect(work() == expected, "the same afterwards");
        });
    }
    check("FileLogger", check_log);
}

void check_files() {
    check("CFilePath and Path", [](Trial& t) {
        t.folder().write("1.txt"), t.folder().write("2.txt"), t.folder().write("a name of some length.doc");
        const CString full = t.path("a name of some length.doc");
        CFilePath path;
        std::vector<CString> found;
        FILETIME time = {};
        const bool all_found = t.succeeds([&] {
            path = CFilePath(full);
            path.SetExtension(L"a longer extension than before");
            path.Combine(path.Directory(), Path::GetPath(full, 12));
            CFilePath::GetFileCreationTime(t.path("*.txt"), time);
            path.GetLastAccessTime();
            found = path.GetFilesInDirectory(L"*.txt");
            return path.FileExists() && !path.IsDirectory() && CFilePath::FileExists(t.path("*.txt"));
        });
        t.expect((all_found && found.size() == 2) || t.struck(), "throws and denies only for a failure");
        path = CFilePath(full);
        t.expect(path.Extension() == L"doc" && path.FileExists(), "set afterwards");
        t.expect(path.GetFilesInDirectory(L"*.txt").size() == 2, "found afterwards");
    });
    // Out of memory at a link or its target must not pass for a file or for no entry.
    check("FindFirstFileW", [](Trial& t) {
        const CString name = t.path("a link");
        std::filesystem::create_directory_symlink("/", t.folder() / "a link");
        for (const CString& pattern : {name, name + L"*"}) {
            WIN32_FIND_DATAW entry;
            const HANDLE found = t.attempt([&] { return FindFirstFileW(pattern, &entry); });
            FindClose(found);
            t.expect(found != INVALID_HANDLE_VALUE ? entry.dwFileAttributes == FILE_ATTRIBUTE_DIRECTORY
                                                   : t.struck(),
                     "its kind");
        }
    });
}

}  // namespace basalt::faults
