#include <algorithm>
#include <cwchar>
#include <iterator>

#include "basalt/frame.h"
#include "src/platform/file.h"

namespace {

constexpr std::size_t LONGEST_VALUE = MAX_PATH - 1;
constexpr wchar_t INBOX[] = L"\\Inbox";

// At most LONGEST_VALUE characters, filled with zeros, so that a buffer can be compared or written as a
// whole.
using FixedText = wchar_t[MAX_PATH];

constinit FixedText root_folder = {};
constinit FixedText product_folder = {};
constinit FixedText executable_folder = {};
constinit FixedText application_version = {};

// Longer than the others, so that no inbox is truncated.
constinit wchar_t inbox_folder[LONGEST_VALUE + std::size(INBOX)] = {};

// Copied first: the value may be the destination itself or another of these texts.
void store(FixedText& destination, const wchar_t* value) {
    FixedText copy = {};
    std::wcsncpy(copy, value, LONGEST_VALUE);
    std::copy(std::begin(copy), std::end(copy), destination);
}

void store_folder(FixedText& folder, const wchar_t* value) {
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
    FixedText folder = {};
    // Writes nothing if the folder does not fit.
    GetTempPathW(MAX_PATH, folder);
    return folder;
}
