// Matching a name against wildcards.
#ifndef BASALT_SRC_PLATFORM_DISK_WILDCARD_H
#define BASALT_SRC_PLATFORM_DISK_WILDCARD_H

#include <string_view>

namespace basalt::platform {

// Whether a name matches a pattern: `*` matches any characters, `?` one, any other character itself; "*.*"
// matches every name. Takes at most the product of the two lengths in steps.
constexpr bool matches_wildcards(std::wstring_view name, std::wstring_view pattern) noexcept {
    if (pattern == L"*.*") {
        return true;
    }
    // After a mismatch only the last star has to match one character more: the earlier ones matched the
    // shortest text that leads there.
    std::size_t n = 0;
    std::size_t p = 0;
    std::size_t star = std::wstring_view::npos;
    std::size_t after_star = 0;
    while (n < name.size()) {
        if (p < pattern.size() && pattern[p] == L'*') {
            star = p++;
            after_star = n;
        } else if (p < pattern.size() && (pattern[p] == L'?' || pattern[p] == name[n])) {
            ++p;
            ++n;
        } else if (star != std::wstring_view::npos) {
            p = star + 1;
            n = ++after_star;
        } else {
            return false;
        }
    }
    return pattern.find_first_not_of(L'*', p) == std::wstring_view::npos;
}

}  // namespace basalt::platform

#endif
