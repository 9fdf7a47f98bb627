#include <algorithm>
#include <cwchar>
#include <iterator>

#include "basalt/frame.h"
#include "src/platform/file.h"

namespace {

constexpr std::size_t LONGEST_VALUE = MAX_PATH - 1;
constexpr wchar_t INBOX[] = L"\\Inbox";

// A setting of at most LONGEST_VALUE characters. Nothing of an old value stays behind the terminator, so that
// a buffer can be compared or written out whole.
using Setting = wchar_t[MAX_PATH];

constinit Setting root_folder = {};
constinit Setting product_folder = {};
constinit Setting executable_folder = {};
constinit Setting application_version = {};

// Longer than the others, so that no inbox is ever cut.
constinit wchar_t inbox_folder[LONGEST_VALUE + std::size(INBOX)] = {};

// By way of a copy: the value may stand in the very setting, or be another setting of the library's.
void store(Setting& setting, const wchar_t* value) {
    Setting copy = {};
    std::wcsncpy(copy, value, LONGEST_VALUE);
    std::copy(std::begin(copy), std::end(copy), setting);
}

void store_folder(Setting& folder, const wchar_t* value) {
    _operatingsystem();
    store(folder, value);
}

}  // namespace

void _setKestraRootPath(wchar_t* value) {
    store_folder(root_folder, value);
}

wchar_t* _kestraRootPath() {
    return root_folder;
}

void _setKestraGRDXPath(wchar_t* value) {
    store_folder(product_folder, value);
    std::fill(std::begin(inbox_folder), std::end(inbox_folder), L'\0');
    std::wcscpy(inbox_folder, product_folder);
    std::wcscat(inbox_folder, INBOX);
}

wchar_t* _kestraGRDXPath() {
    return product_folder;
}

wchar_t* _kestraPortulaInboxPath() {
    return inbox_folder;
}

void _setKestraExePath(wchar_t* value) {
    store(executable_folder, value);
}

wchar_t* _kestraExePath() {
    return executable_folder;
}

void _setKestraApplicationVersion(wchar_t* value) {
    store(application_version, value);
}

wchar_t* _kestraApplicationVersion() {
    return application_version;
}

CString _tempFilePath() {
    Setting folder = {};
    // A length beyond the buffer is the room the folder would have needed: then, as on failure, nothing was
    // written.
    GetTempPathW(MAX_PATH, folder);
    return folder;
}
