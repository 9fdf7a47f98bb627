#include "basalt/util/version_info.h"

#include <cstring>
#include <iterator>
#include <new>
#include <optional>
#include <utility>

#include "src/platform/system_info.h"

namespace {

constexpr int high_word(DWORD value) {
    return static_cast<int>(value >> 16);
}
constexpr int low_word(DWORD value) {
    return static_cast<int>(value & 0xFFFF);
}

// Empty when there is no resource.
std::vector<BYTE> read_resource() {
    wchar_t file[256];
    const DWORD length = GetModuleFileNameW(nullptr, file, std::size(file));
    // A truncated name could be that of another file.
    if (length == 0 || length == std::size(file)) {
        return {};
    }
    DWORD handle = 0;
    std::vector<BYTE> resource(GetFileVersionInfoSizeW(file, &handle));
    const auto size = static_cast<DWORD>(resource.size());
    if (size == 0 || GetFileVersionInfoW(file, handle, size, resource.data()) == 0) {
        return {};
    }
    return resource;
}

// A value of at least the record's size, copied since it may be unaligned.
template <class Record>
std::optional<Record> record_at(const std::vector<BYTE>& resource, const wchar_t* path) {
    void* value = nullptr;
    UINT length = 0;
    Record record;
    if (VerQueryValueW(resource.data(), path, &value, &length) == 0 || length < sizeof record) {
        return std::nullopt;
    }
    std::memcpy(&record, value, sizeof record);
    return record;
}

// Empty when there is none.
CString text_at(const std::vector<BYTE>& resource, const CString& translation, const wchar_t* key) {
    CString path;
    path.Format(L"\\StringFileInfo\\%s\\%s", translation, key);
    void* value = nullptr;
    UINT length = 0;
    if (VerQueryValueW(resource.data(), path, &value, &length) == 0) {
        return {};
    }
    return basalt::platform::wide_from_utf16(value, length).c_str();
}

struct Translation {
    WORD language;
    WORD code_page;
};

}  // namespace

VersionInfo::VersionInfo() = default;

bool VersionInfo::InitVersionInfo(HINSTANCE) {
    try {
        // On a copy, so that a failure leaves everything as it was.
        VersionInfo found = *this;
        found.m_version_data = read_resource();
        if (found.m_version_data.empty()) {
            return false;
        }
        if (const auto fixed = record_at<VS_FIXEDFILEINFO>(found.m_version_data, L"\\")) {
            found.m_major = high_word(fixed->dwProductVersionMS);
            found.m_minor = low_word(fixed->dwProductVersionMS);
            found.m_schema = high_word(fixed->dwProductVersionLS);
            found.m_build = low_word(fixed->dwProductVersionLS);
        }
        if (const auto first = record_at<Translation>(found.m_version_data, L"\\VarFileInfo\\Translation")) {
            found.m_translation.Format(L"%04x%04x", first->language, first->code_page);
            const auto text = [&found](const wchar_t* key) {
                return text_at(found.m_version_data, found.m_translation, key);
            };
            found.m_product_name = text(L"ProductName");
            found.m_internal_name = text(L"InternalName");
            found.m_copyright = text(L"LegalCopyright");
            found.m_product_version = text(L"ProductVersion");
            found.m_file_description = text(L"FileDescription");
            found.m_comment = text(L"Comment");
        }
        *this = std::move(found);
        return true;
    } catch (const std::bad_alloc&) {
        return false;
    }
}

// The interface's signatures are not const.
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
