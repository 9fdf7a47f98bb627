#include "basalt/util/hardware_addresses.h"

#include <algorithm>
#include <iterator>

#include "basalt/platform/error.h"
#include "basalt/util/hex.h"
#include "src/platform/system_info.h"

namespace basalt {

namespace {

// Interfaces may be added between the call for the size and the one for the table.
constexpr int MAX_READINGS = 8;

}  // namespace

bool MACAddressFromMIBTable::Create() {
    DWORD size = sizeof(MIB_IFTABLE);
    const auto allocate = [&] {
        m_table = std::make_shared<BYTE[]>(size);
        return reinterpret_cast<MIB_IFTABLE*>(m_table.get());
    };
    MIB_IFTABLE* table = allocate();
    if (GetIfTable(table, &size, 0) == ERROR_INSUFFICIENT_BUFFER) {
        table = allocate();
    }
    DWORD error = GetIfTable(table, &size, 1);
    for (int reading = 1; error == ERROR_INSUFFICIENT_BUFFER && reading < MAX_READINGS; ++reading) {
        table = allocate();
        error = GetIfTable(table, &size, 1);
    }
    if (error == ERROR_SUCCESS) {
        for (DWORD i = 0; i < table->dwNumEntries; ++i) {
            MIB_IFROW row{};
            row.dwIndex = table->table[i].dwIndex;
            if (GetIfEntry(&row) == ERROR_SUCCESS && row.dwType == IF_TYPE_ETHERNET_CSMACD) {
                const auto length = std::min<std::size_t>(row.dwPhysAddrLen, sizeof row.bPhysAddr);
                m_addresses.emplace_back(row.bPhysAddr, row.bPhysAddr + length);
            }
        }
    }
    return !m_addresses.empty();
}

std::vector<std::string> MACAddressFromMIBTable::GetMACAddressesAsHexString() {
    std::vector<std::string> texts;
    texts.reserve(m_addresses.size());
    std::transform(m_addresses.begin(), m_addresses.end(), std::back_inserter(texts), VectorToHexString);
    return texts;
}

}  // namespace basalt
