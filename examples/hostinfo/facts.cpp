#include "facts.h"

#include <basalt/files.h>
#include <basalt/frame.h>
#include <basalt/util.h>
#include <basalt/version.h>

#include <filesystem>

namespace {

using vex_util::CFilePath;
using vex_util::Path;

enum Part : unsigned char { DRIVE = 1, DIRECTORY = 2, NAME = 4, EXTENSION = 8 };

std::string own_file() {
    std::error_code unknown;
    return std::filesystem::read_symlink("/proc/self/exe", unknown).string();
}

/// The setters take text that could be written to.
void set(void (*setter)(wchar_t*), CString value) {
    setter(value.GetBuffer());
}

void set_up(const Options& options, const CString& version) {
    set(_setKestraApplicationVersion, version);
    set(_setKestraExePath, CFilePath(own_file().c_str()).Directory());
    if (options.root) {
        set(_setKestraRootPath, options.root->c_str());
    }
    if (options.product) {
        set(_setKestraGRDXPath, options.product->c_str());
    }
}

Section program_facts(VersionInfo& info) {
    return {"program",
            {{"version", info.GetVersionString()},
             {"description", info.GetFileDescription()},
             {"copyright", info.GetCopyright()},
             {"comment", info.GetComment()},
             {"library", CString("basalt " BASALT_VERSION)}}};
}

Section system_facts() {
    return {"system",
            {{"operating system", static_cast<long>(_operatingsystem())},
             {"handheld", static_cast<long>(_handheldVersion())},
             {"language", static_cast<long>(_languageVersion())},
             {"default font size", _isDefaultFontSize()},
             {"task bar height", static_cast<long>(_taskbarheight())}}};
}

Section folder_facts() {
    return {"folders",
            {{"root", CString(_kestraRootPath())},
             {"product", CString(_kestraGRDXPath())},
             {"inbox", CString(_kestraPortulaInboxPath())},
             {"executable", CString(_kestraExePath())},
             {"temporary", _tempFilePath()}}};
}

Section network_facts() {
    basalt::MACAddressFromMIBTable table;
    table.Create();
    std::vector<CString> addresses;
    for (const std::string& address : table.GetMACAddressesAsHexString()) {
        addresses.emplace_back(address.c_str());
    }
    return {"network", {{"hardware addresses", addresses}}};
}

/// Year to second; empty for the time of nothing.
CString time_text(const FILETIME& time) {
    SYSTEMTIME t{};
    CString text;
    if ((time.dwLowDateTime != 0 || time.dwHighDateTime != 0) && FileTimeToSystemTime(&time, &t) != 0) {
        text.Format(L"%04d-%02d-%02d %02d:%02d:%02d", t.wYear, t.wMonth, t.wDay, t.wHour, t.wMinute,
                    t.wSecond);
    }
    return text;
}

Section path_facts(const CString& text) {
    const CFilePath file(text);
    return {"path",
            {{"path", text},
             {"drive", Path::GetPath(text, DRIVE)},
             {"directory", Path::GetPath(text, DIRECTORY)},
             {"name", Path::GetPath(text, NAME)},
             {"extension", Path::GetPath(text, EXTENSION)},
             {"composed directory", file.Directory()},
             {"composed name", file.FileName()},
             {"is file", file.IsFile()},
             {"is directory", file.IsDirectory()},
             {"created", time_text(file.GetCreationTime())},
             {"last read", time_text(file.GetLastAccessTime())}}};
}

}  // namespace

std::vector<Section> gather_facts(const Options& options) {
    VersionInfo info;
    info.InitVersionInfo(nullptr);
    set_up(options, info.GetVersionString());
    return {program_facts(info), system_facts(), folder_facts(), network_facts(),
            path_facts(options.path.value_or(own_file()).c_str())};
}
