#include "src/platform/multi_byte.h"

#include <climits>
#include <cstddef>
#include <cstring>
#include <string_view>

#include "basalt/platform/error.h"
#include "src/platform/code_page.h"

using basalt::platform::active_code_page;

namespace {

int fail(DWORD code) {
    SetLastError(code);
    return 0;
}

template <class Source, class Destination>
bool are_valid(const Source* source, int length, const Destination* destination, int room) {
    const bool has_destination = room == 0 || (room > 0 && destination != nullptr);
    return source != nullptr && (length > 0 || length == -1) && has_destination;
}

template <class Character>
std::basic_string_view<Character> view_of(const Character* source, int length) {
    return length > 0
               ? std::basic_string_view<Character>(source, static_cast<std::size_t>(length))
               : std::basic_string_view<Character>(source, std::char_traits<Character>::length(source) + 1);
}

int answer(std::size_t needed, int room) {
    if (needed > INT_MAX || (room != 0 && needed > static_cast<std::size_t>(room))) {
        return fail(ERROR_INSUFFICIENT_BUFFER);
    }
    return static_cast<int>(needed);
}

// Writes a text's bytes as far as they fit, by whole pieces, and answers how many there are.
std::size_t narrow_to(std::wstring_view text, char* destination, std::size_t room) {
    constexpr std::size_t PIECE = 64;
    char bytes[(PIECE + 1) * MB_LEN_MAX];
    std::size_t count = 0;
    std::mbstate_t state{};
    while (!text.empty()) {
        const char* const end = active_code_page().narrow_piece(text, PIECE, bytes, state);
        const auto length = static_cast<std::size_t>(end - bytes);
        if (count + length <= room) {
            std::memcpy(destination + count, bytes, length);
        }
        count += length;
    }
    return count;
}

}  // namespace

int MultiByteToWideChar(UINT code_page, DWORD flags, const char* source, int length, wchar_t* destination,
                        int room) {
    if (code_page != CP_ACP || (flags & ~MB_PRECOMPOSED) != 0 ||
        !are_valid(source, length, destination, room)) {
        return fail(ERROR_INVALID_PARAMETER);
    }
    const std::size_t needed =
        active_code_page().widen_to(view_of(source, length), destination, static_cast<std::size_t>(room));
    return answer(needed, room);
}

// NOLINTBEGIN(readability-non-const-parameter): the published signature
int WideCharToMultiByte(UINT code_page, DWORD flags, const wchar_t* source, int length, char* destination,
                        int room, const char* default_character, BOOL* used_default) {
    // NOLINTEND(readability-non-const-parameter)
    if (code_page != CP_ACP || flags != 0 || default_character != nullptr || used_default != nullptr ||
        !are_valid(source, length, destination, room)) {
        return fail(ERROR_INVALID_PARAMETER);
    }
    return answer(narrow_to(view_of(source, length), destination, static_cast<std::size_t>(room)), room);
}
