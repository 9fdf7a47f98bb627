#include "basalt/util/version_info.h"

#include <cstring>
#include <new>
#include <utility>

#include "src/platform/module_file_name.h"
#include "src/platform/version_resource.h"

namespace {

constexpr int high_word(DWORD value) {
    return static_cast<int>(value >> 16);
}
constexpr int low_word(DWORD value) {
    return static_cast<int>(value & 0xFFFF);
}

}  // namespace

VersionInfo::VersionInfo() = default;

bool VersionInfo::InitVersionInfo(HINSTANCE) {
    try {
        // On a copy, so that a failure half-way leaves everything as it was.
        VersionInfo found = *this;
        if (!found.read_resource()) {
            return false;
        }
        found.take_numbers();
        if (found.take_translation()) {
            found.take_texts();
        }
        *this = std::move(found);
        return true;
    } catch (const std::bad_alloc&) {
        return false;
    }
}

bool VersionInfo::read_resource() {
    wchar_t file[256];
    const DWORD length = GetModuleFileNameW(nullptr, file, std::size(file));
    // A name that was cut could be that of another file.
    if (length == 0 || length == std::size(file)) {
        return false;
    }
    DWORD handle = 0;
    const DWORD size = GetFileVersionInfoSizeW(file, &handle);
    if (size == 0) {
        return false;
    }
    m_version_data.assign(size, 0);
    return GetFileVersionInfoW(file, handle, size, m_version_data.data()) != 0;
}

void VersionInfo::take_numbers() {
    void* value = nullptr;
    UINT length = 0;
    VS_FIXEDFILEINFO fixed{};
    if (VerQueryValueW(m_version_data.data(), L"\\", &value, &length) == 0 || length < sizeof fixed) {
        return;
    }
    std::memcpy(&fixed, value, sizeof fixed);
    m_major = high_word(fixed.dwProductVersionMS);
    m_minor = low_word(fixed.dwProductVersionMS);
    m_schema = high_word(fixed.dwProductVersionLS);
    m_build = low_word(fixed.dwProductVersionLS);
}

bool VersionInfo::take_translation() {
    void* value = nullptr;
    UINT length = 0;
    WORD first[2] = {};
    if (VerQueryValueW(m_version_data.data(), L"\\VarFileInfo\\Translation", &value, &length) == 0 ||
        length < sizeof first) {
        return false;
    }
    std::memcpy(first, value, sizeof first);
    m_translation.Format(L"%04x%04x", first[0], first[1]);
    return true;
}

void VersionInfo::take_texts() {
    const std::pair<const wchar_t*, CString VersionInfo::*> texts[] = {
        {L"ProductName", &VersionInfo::m_product_name},
        {L"InternalName", &VersionInfo::m_internal_name},
        {L"LegalCopyright", &VersionInfo::m_copyright},
        {L"ProductVersion", &VersionInfo::m_product_version},
        {L"FileDescription", &VersionInfo::m_file_description},
        {L"Comment", &VersionInfo::m_comment},
    };
    for (const auto& [key, text] : texts) {
        CString path;
        path.Format(L"\\StringFileInfo\\%s\\%s", m_translation, key);
        void* value = nullptr;
        UINT length = 0;
        const bool is_there = VerQueryValueW(m_version_data.data(), path, &value, &length) != 0;
        this->*text = is_there ? basalt::platform::wide_from_utf16(value, length).c_str() : L"";
    }
}

// The published signatures are not const.
// NOLINTBEGIN(readability-make-member-function-const)

int VersionInfo::GetMajorVersion() {
    return m_major;
}

int VersionInfo::GetMinorVersion() {
    return m_minor;
}

int VersionInfo::GetSchemaVersion() {
    return m_schema;
}

int VersionInfo::GetBuild() {
    return m_build;
}

CString VersionInfo::GetProductName() {
    return m_product_name;
}

CString VersionInfo::GetInternalName() {
    return m_internal_name;
}

CString VersionInfo::GetCopyright() {
    return m_copyright;
}

CString VersionInfo::GetProductVersion() {
    return m_product_version;
}

CString VersionInfo::GetFileDescription() {
    return m_file_description;
}

CString VersionInfo::GetComment() {
    return m_comment;
}

CString VersionInfo::GetVersionString() {
    CString text;
    text.Format(L"%s %02d.%02d.%02d.%02d", m_product_name, m_major, m_minor, m_schema, m_build);
    return text;
}

// NOLINTEND(readability-make-member-function-const)
