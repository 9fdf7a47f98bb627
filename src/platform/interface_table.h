// The network interfaces of the machine.
#ifndef BASALT_SRC_PLATFORM_INTERFACE_TABLE_H
#define BASALT_SRC_PLATFORM_INTERFACE_TABLE_H

#include <span>

#include "basalt/platform/types.h"

inline constexpr DWORD IF_TYPE_OTHER = 1;
inline constexpr DWORD IF_TYPE_ETHERNET_CSMACD = 6;
inline constexpr DWORD IF_TYPE_SOFTWARE_LOOPBACK = 24;
inline constexpr DWORD IF_TYPE_IEEE80211 = 71;

// The published record: its name has 16-bit characters on every system.
struct MIB_IFROW {
    char16_t wszName[256];
    DWORD dwIndex;
    DWORD dwType;
    DWORD dwMtu;
    DWORD dwSpeed;
    DWORD dwPhysAddrLen;
    BYTE bPhysAddr[8];
    DWORD dwAdminStatus;
    DWORD dwOperStatus;
    DWORD dwLastChange;
    DWORD dwInOctets;
    DWORD dwInUcastPkts;
    DWORD dwInNUcastPkts;
    DWORD dwInDiscards;
    DWORD dwInErrors;
    DWORD dwInUnknownProtos;
    DWORD dwOutOctets;
    DWORD dwOutUcastPkts;
    DWORD dwOutNUcastPkts;
    DWORD dwOutDiscards;
    DWORD dwOutErrors;
    DWORD dwOutQLen;
    DWORD dwDescrLen;
    BYTE bDescr[256];
};
static_assert(sizeof(MIB_IFROW) == 860);

// The published record; there are as many rows as the number says.
struct MIB_IFTABLE {
    DWORD dwNumEntries;
    MIB_IFROW table[1];
};
static_assert(sizeof(MIB_IFTABLE) == 864);

// Every interface, up or down, with an address or without: index, type, hardware address (its first 8 bytes)
// and, as description, its name; the other fields are 0. An interface is of Ethernet type when the system
// says so and it is not wireless; virtual ones count. `size` is the table's room in bytes, `sorted` asks for
// ascending indexes instead of the system's order. Result: 0, or ERROR_INSUFFICIENT_BUFFER with the size
// needed in `size` and a table without meaning, or the code of what the system refused. Interfaces may come
// and go between two calls. Threads: thread-safe.
DWORD GetIfTable(MIB_IFTABLE* table, DWORD* size, BOOL sorted);

// The row of the interface whose index the caller has set in it.
// Result: 0, or ERROR_FILE_NOT_FOUND for an index that is none, or the code of what the system refused; the
// row is then as it was. Threads: thread-safe.
DWORD GetIfEntry(MIB_IFROW* row);

namespace basalt::platform {

// Lets the rows stand for the machine's interfaces; null brings those back. They stay the caller's.
// Threads: none of the calls above may be under way.
void set_interface_table(const std::span<const MIB_IFROW>* rows);

}  // namespace basalt::platform

#endif
