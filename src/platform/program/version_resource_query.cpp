#include <algorithm>
#include <cstddef>
#include <optional>
#include <string_view>

#include "src/platform/system/failure.h"
#include "src/platform/system_info.h"
#include "src/platform/text/utf8.h"

namespace {

constexpr DWORD FIXED_INFORMATION_SIGNATURE = 0xFEEF04BD;
constexpr std::size_t HEADER = 6;  // bytes: three words

constexpr std::size_t align_4(std::size_t offset) {
    return (offset + 3) & ~std::size_t{3};
}

constexpr std::wstring_view STRINGS = L"\\StringFileInfo\\";

constexpr wchar_t lower(wchar_t ch) {
    return ch >= L'A' && ch <= L'Z' ? ch - L'A' + L'a' : ch;
}

// A node by its offsets from the block's start.
struct Node {
    std::size_t key;
    std::size_t key_length;  // units
    std::size_t value;
    std::size_t value_size;  // bytes
    std::size_t children;
    std::size_t end;
};

class Block {
public:
    explicit Block(const void* bytes) : m_bytes(static_cast<const unsigned char*>(bytes)) {}

    const unsigned char* at(std::size_t offset) const { return m_bytes + offset; }
    std::size_t word(std::size_t offset) const {
        return static_cast<std::size_t>(m_bytes[offset] | m_bytes[offset + 1] << 8);
    }

    // The node at an offset, if it ends by `limit` with its key and value.
    std::optional<Node> node(std::size_t offset, std::size_t limit) const {
        if (offset > limit || limit - offset < HEADER) {
            return std::nullopt;
        }
        Node node{};
        const std::size_t length = word(offset);
        if (length < HEADER || length > limit - offset) {
            return std::nullopt;
        }
        node.end = offset + length;
        node.key = offset + HEADER;
        std::size_t terminator = node.key;
        while (terminator + 2 <= node.end && word(terminator) != 0) {
            terminator += 2;
        }
        if (terminator + 2 > node.end) {
            return std::nullopt;
        }
        node.key_length = (terminator - node.key) / 2;
        node.value = std::min(align_4(terminator + 2), node.end);
        const bool is_text = word(offset + 4) == 1;
        node.value_size = word(offset + 2) * (is_text ? 2 : 1);
        const std::size_t space = node.end - node.value;
        if (node.value_size > space) {
            // Some tools count a text in bytes; it still ends at its terminator.
            if (!is_text) {
                return std::nullopt;
            }
            node.value_size = space & ~std::size_t{1};
        }
        node.children = std::min(align_4(node.value + node.value_size), node.end);
        return node;
    }

    std::optional<Node> root() const { return node(0, word(0)); }

    std::optional<Node> child(const Node& parent, std::wstring_view key) const {
        std::size_t offset = parent.children;
        while (const std::optional<Node> candidate = node(offset, parent.end)) {
            if (has_key(*candidate, key)) {
                return candidate;
            }
            offset = align_4(candidate->end);
        }
        return std::nullopt;
    }

private:
    bool has_key(const Node& node, std::wstring_view key) const {
        std::size_t i = 0;
        while (i < node.key_length && i < key.size() &&
               lower(static_cast<wchar_t>(word(node.key + 2 * i))) == lower(key[i])) {
            ++i;
        }
        return i == node.key_length && i == key.size();
    }

    const unsigned char* m_bytes;
};

std::optional<Node> find(const Block& block, std::wstring_view path) {
    std::optional<Node> node = block.root();
    while (node && !path.empty()) {
        path.remove_prefix(1);
        const std::wstring_view key = path.substr(0, path.find(L'\\'));
        node = key.empty() ? node : block.child(*node, key);
        path.remove_prefix(key.size());
    }
    return node;
}

bool is_fixed_information(const Block& block, const Node& root) {
    return root.value_size >= sizeof(VS_FIXEDFILEINFO) &&
           (block.word(root.value) | block.word(root.value + 2) << 16) == FIXED_INFORMATION_SIGNATURE;
}

}  // namespace

BOOL VerQueryValueW(const void* block, const wchar_t* path, void** value, UINT* length) {
    const Block nodes(block);
    const std::wstring_view keys = path;
    const bool wants_root = keys == L"\\";
    const std::optional<Node> node = find(nodes, keys);
    if (!node || (wants_root && !is_fixed_information(nodes, *node))) {
        return basalt::platform::fail_with(ERROR_RESOURCE_TYPE_NOT_FOUND, 0);
    }
    *value = const_cast<unsigned char*>(nodes.at(node->value));
    // Its place decides whether it is a text: the caller would read too far if the node's own word did.
    const std::size_t unit = keys.starts_with(STRINGS) ? 2 : 1;
    *length = static_cast<UINT>(node->value_size / unit);
    return 1;
}

namespace basalt::platform {

std::wstring wide_from_utf16(const void* units, std::size_t length) {
    const Block block(units);
    std::wstring text;
    for (std::size_t i = 0; i < length && block.word(2 * i) != 0; ++i) {
        const std::size_t unit = block.word(2 * i);
        const std::size_t next = i + 1 < length ? block.word(2 * (i + 1)) : 0;
        if (unit >= 0xD800 && unit < 0xDC00 && next >= 0xDC00 && next < 0xE000) {
            text.push_back(static_cast<wchar_t>(0x10000 + ((unit - 0xD800) << 10) + (next - 0xDC00)));
            ++i;
        } else {
            const auto ch = static_cast<wchar_t>(unit);
            text.push_back(is_unicode_scalar(ch) ? ch : REPLACEMENT_CHARACTER);
        }
    }
    return text;
}

}  // namespace basalt::platform
