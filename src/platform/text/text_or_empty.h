// A text that may be null.
#ifndef BASALT_SRC_PLATFORM_TEXT_TEXT_OR_EMPTY_H
#define BASALT_SRC_PLATFORM_TEXT_TEXT_OR_EMPTY_H

#include <string_view>

namespace basalt::platform {

/// The text, or none where the pointer is null, as every call of `CString` takes it.
inline std::wstring_view text_or_empty(const wchar_t* text) {
    return text != nullptr ? std::wstring_view(text) : std::wstring_view();
}

}  // namespace basalt::platform

#endif
