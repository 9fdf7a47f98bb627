// Version resources: any bytes as a block, and as a program's file.
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

void query_all(const Bytes& block) {
    for (const wchar_t* const path :
         {L"\\", L"\\VarFileInfo\\Translation", L"\\StringFileInfo\\040904b0\\ProductName",
          L"\\StringFileInfo\\040904b0\\Comment"}) {
        void* value = nullptr;
        UINT length = 0;
        if (VerQueryValueW(block.data(), path, &value, &length) != 0) {
            const std::size_t size = length * std::size_t{path[1] == L'S' ? 2U : 1U};
            const auto* const first = static_cast<const unsigned char*>(value);
            require(first >= block.data() && first + size <= block.data() + block.size());
            require(basalt::platform::wide_from_utf16(value, size / 2).size() <= length);
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size >= 2) {  // a block, whose first word is its size
        Bytes block(data, data + std::clamp<std::size_t>(data[0] | std::size_t{data[1]} << 8, 2, size));
        block[0] = static_cast<unsigned char>(block.size() & 0xFF);
        block[1] = static_cast<unsigned char>(block.size() >> 8);
        query_all(block);
    }
    static const int file = memfd_create("program", MFD_CLOEXEC);
    static const std::wstring name = L"/proc/self/fd/" + std::to_wstring(file);
    require(ftruncate(file, 0) == 0 && pwrite(file, data, size, 0) == static_cast<ssize_t>(size));
    DWORD handle = 0;
    const DWORD needed = GetFileVersionInfoSizeW(name.c_str(), &handle);
    require(needed <= size);
    if (needed > 0) {
        Bytes block(needed);
        require(GetFileVersionInfoW(name.c_str(), 0, needed, block.data()) != 0);
        query_all(block);
    }
    return 0;
}
