// Environment, texts, timers, log, hexadecimal text, hardware addresses, version information.
#include <fstream>
#include <iterator>
#include <memory>
#include <string>
#include <vector>

#include "basalt/frame.h"
#include "basalt/platform.h"
#include "basalt/util.h"
#include "src/platform/error_message.h"
#include "tests/faults/trial.h"

namespace basalt::faults {

namespace {

using vex_util::FileLogger;

std::string contents(const Trial& t, const char* name) {
    std::ifstream file(t.folder() / name, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

// Work that may throw for want of memory alone, and gives the same afterwards.
template <class Work>
void check_result(const char* operation, Work work) {
    check(operation, [work](Trial& t) {
        const auto expected = work();
        auto result = expected;
        if (!t.throws([&] { result = work(); })) {
            t.expect(result == expected, "the right result or none");
        } else {
            t.expect(t.struck(), "leaves only for a failure");
        }
        t.expect(work() == expected, "the same afterwards");
    });
}

void check_frame() {
    check("_tempFilePath", [](Trial& t) {
        const CString expected = _tempFilePath();
        CString folder;
        t.throws([&] { folder = _tempFilePath(); });
        t.expect(folder == expected || (folder.IsEmpty() && t.struck()), "the folder, or none for a failure");
        t.expect(_tempFilePath() == expected, "the same afterwards");
    });
    check("_REPLACE_LOAD, _REPLACE_CLEANUP", [](Trial& t) {
        _REPLACE_FLAG(true);
        const bool threw = t.throws([] { _REPLACE_LOAD(1, 2); });
        t.expect(_REPLACE(1) == (threw ? 1U : 2U), "stored, or nothing stored");
        _REPLACE_LOAD(1, 2);
        t.expect(_REPLACE(1) == 2, "stored afterwards");
        t.attempt([] { _REPLACE_CLEANUP(); });
        t.expect(_REPLACE(1) == 1, "released");
    });
    check("_char2tchar, _tchar2char, _int2tchar", [](Trial& t) {
        wchar_t wide[40];
        char narrow[40];
        wchar_t number[20];
        t.attempt([&] {
            _char2tchar("M\xC3\xBCller", wide, 39);
            _tchar2char(wide, narrow, 39);
            _int2tchar(-42, number, 19, 10);
        });
        t.expect(std::string(narrow) == "M\xC3\xBCller" && std::wstring(number) == L"-42", "nothing fails");
    });
    check("_setKestraGRDXPath and the other settings", [](Trial& t) {
        wchar_t folder[] = L"C:\\data";
        t.attempt([&] {
            _setKestraRootPath(folder);
            _setKestraGRDXPath(folder);
            _setKestraExePath(folder);
            _setKestraApplicationVersion(folder);
        });
        t.expect(std::wstring(_kestraPortulaInboxPath()) == L"C:\\data\\Inbox", "nothing fails");
    });
    check("_operatingsystem and the other queries", [](Trial& t) {
        t.expect(t.attempt([] {
            return _operatingsystem() == 11 && _handheldVersion() == 1 && _checkForHighResolution() == 1.0 &&
                   _random_uint16() < 65535 && _taskbarheight() == 26;
        }),
                 "nothing fails");
    });
}

void check_log() {
    check("FileLogger::Open", [](Trial& t) {
        FileLogger log;
        const std::string name = t.folder() / "a.log";
        t.attempt([&] { log.Open(name.c_str()); });
        log.Write(L"a");
        log.Close();
        t.expect(contents(t, "a.log") == "a" || t.struck(), "closed only for a failure");
        log.Open((t.folder() / "b.log").c_str());
        log.Write(L"b");
        log.Close();
        t.expect(contents(t, "b.log") == "b", "opened afterwards");
    });
    check("FileLogger::Write, Close", [](Trial& t) {
        const CString text(L'x', 3000);  // the third fills the buffer
        FileLogger log((t.folder() / "c.log").c_str());
        for (int i = 0; i < 6; ++i) {
            t.attempt([&] { log.Write(text); });
        }
        t.attempt([&] { log.Close(); });
        const std::size_t size = contents(t, "c.log").size();
        t.expect(size == 18'000 || (t.was_ever_struck() && size % 3000 == 0), "each text whole or lost");
        log.Open((t.folder() / "c.log").c_str());
        log.Write(L"y");
        log.Close();
        t.expect(contents(t, "c.log") == "y", "written afterwards");
    });
}

void check_programs() {
    check("FormatMessageW", [](Trial& t) {
        constexpr DWORD SYSTEM_TEXT = 0x1300;
        wchar_t* text = nullptr;
        const auto ask = [&] { return FormatMessageW(SYSTEM_TEXT, nullptr, 5, 0, &text, 0, nullptr) != 0; };
        const bool told = t.attempt(ask);
        t.expect(told ? text != nullptr : t.struck() && GetLastError() == ERROR_NOT_ENOUGH_MEMORY,
                 "the text, or why there is none");
        LocalFree(text);
        t.expect(ask(), "the text afterwards");
        LocalFree(text);
    });
    check("MACAddressFromMIBTable::Create", [](Trial& t) {
        MACAddressFromMIBTable expected;
        expected.Create();
        MACAddressFromMIBTable found;
        bool any = false;
        const bool threw = t.throws([&] { any = found.Create(); });
        const auto texts = found.GetMACAddressesAsHexString();
        t.expect(threw || any == !texts.empty(), "whether it holds one");
        t.expect(texts == expected.GetMACAddressesAsHexString() || t.struck(), "missing only for a failure");
        MACAddressFromMIBTable after;
        after.Create();
        t.expect(after.GetMACAddressesAsHexString() == expected.GetMACAddressesAsHexString(), "afterwards");
    });
    check("VersionInfo::InitVersionInfo", [](Trial& t) {
        VersionInfo info;
        const bool found = t.attempt([&] { return info.InitVersionInfo(nullptr); });
        t.expect(info.GetVersionString() == (found ? L"Faults 04.01.02.305" : L" 01.00.00.01"),
                 "all or nothing");
        t.expect(found || t.struck(), "false only for a failure");
        t.expect(info.InitVersionInfo(nullptr) && info.GetBuild() == 305, "found afterwards");
    });
    check_result("VersionInfo's getters", [] {
        VersionInfo info;
        return info.GetVersionString() + info.GetProductName() + info.GetComment();
    });
}

}  // namespace

void check_texts() {
    check_frame();
    check_result("CString", [] {
        CString text(L"a text that does not fit into the string itself");
        text.Format(L"%s and %i of 'em, %08.3f", static_cast<const wchar_t*>(text), 17, 2.5);
        text += L" behind";
        text.Replace(L"t", L"tt");
        return text.Mid(3).MakeUpper() + text.Left(20) + CString("narrow \xC3\xBC");
    });
    check_result("StringToHexString, HexStringToString",
                 [] { return HexStringToString(StringToHexString("longer than fits a short string")); });
    check_result("VectorToHexString, HexStringToVector",
                 [] { return HexStringToVector(VectorToHexString(std::vector<unsigned char>(100, 0xA5))); });
    check_result("ParseDateFromHexString", [] {
        COleDateTime date;
        return ParseDateFromHexString("3031303232303231", date) && date.GetStatus() == COleDateTime::valid;
    });
    check("HiResTimer, PeriodicTimer", [](Trial& t) {
        const CString name(L"a name that does not fit into the string itself");
        t.throws([&] {
            vex_util::HiResTimer timer(name, true);
            const vex_util::HiResTimer copy(timer);
            timer.Reset();
            t.expect(timer.GetElapsedS() >= 0, "time passes");
        });
        vex_util::PeriodicTimer periodic(1.0F, true);
        t.expect(t.attempt([&] { return periodic.Update(false); }), "nothing fails");
    });
    check_log();
    check_programs();
}

}  // namespace basalt::faults
