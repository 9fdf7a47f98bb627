// Version resources: any bytes as a block, and any bytes as a program's file.
#include "src/platform/system_info.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "fuzz/input.h"

namespace {

using basalt::fuzz::require;
using Bytes = std::vector<unsigned char>;

void query(const Bytes& block, const wchar_t* path, std::size_t unit) {
    void* value = nullptr;
    UINT length = 0;
    if (VerQueryValueW(block.data(), path, &value, &length) == 0) {
        return;
    }
    const auto* const first = static_cast<const unsigned char*>(value);
    require(first >= block.data() && first <= block.data() + block.size());
    const auto room = static_cast<std::size_t>(block.data() + block.size() - first);
    require(length * unit <= room);
    require(basalt::platform::wide_from_utf16(value, length * unit / 2).size() <= length);
}

void query_all(const Bytes& block) {
    query(block, L"\\", 1);
    query(block, L"\\VarFileInfo\\Translation", 1);
    query(block, L"\\StringFileInfo\\040904b0\\ProductName", 2);
    query(block, L"\\StringFileInfo\\040904b0\\Comment", 2);
    query(block, L"\\StringFileInfo\\\\", 2);
}

// As a block whose first word keeps its promise: what VerQueryValueW asks of its caller.
void check_block(Bytes block) {
    if (block.size() < 2) {
        return;
    }
    const auto promised = static_cast<std::size_t>(block[0] | block[1] << 8);
    const std::size_t size = std::min({block.size(), promised, std::size_t{0xFFFF}});
    if (size < 2) {
        return;
    }
    block.resize(size);
    block.shrink_to_fit();
    block[0] = static_cast<unsigned char>(size & 0xFF);
    block[1] = static_cast<unsigned char>(size >> 8);
    query_all(block);
}

void check_file(const std::uint8_t* data, std::size_t size) {
    static const int file = memfd_create("program", MFD_CLOEXEC);
    static const std::wstring name = L"/proc/self/fd/" + std::to_wstring(file);
    require(ftruncate(file, 0) == 0 && pwrite(file, data, size, 0) == static_cast<ssize_t>(size));
    const DWORD needed = GetFileVersionInfoSizeW(name.c_str(), nullptr);
    require(needed <= size);
    if (needed > 0) {
        Bytes block(needed);
        require(GetFileVersionInfoW(name.c_str(), 0, needed, block.data()) != 0);
        query_all(block);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    check_block(Bytes(data, data + size));
    check_file(data, size);
    return 0;
}
