#include "src/platform/system_info.h"

#include <ifaddrs.h>
#include <net/if.h>
#include <net/if_arp.h>
#include <netpacket/packet.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstdio>
#include <cstring>
#include <memory>

#include "basalt/platform/error.h"
#include "src/platform/errors/error_from_errno.h"

using namespace basalt::platform;

namespace {

// Used for nothing else: /sys shows the network namespace it was mounted in.
bool has_file(const char* name, const char* file) {
    char path[sizeof "/sys/class/net//phy80211" + IF_NAMESIZE];
    const int length = std::snprintf(path, sizeof path, "/sys/class/net/%s/%s", name, file);
    return length >= 0 && static_cast<std::size_t>(length) < sizeof path && ::access(path, F_OK) == 0;
}

// Wireless interfaces report themselves as Ethernet; this is the only difference.
bool is_wireless(const char* name) {
    return has_file(name, "wireless") || has_file(name, "phy80211");
}

DWORD type_of(const sockaddr_ll& link, const char* name) {
    switch (link.sll_hatype) {
        case ARPHRD_ETHER:
            return is_wireless(name) ? IF_TYPE_IEEE80211 : IF_TYPE_ETHERNET_CSMACD;
        case ARPHRD_LOOPBACK:
            return IF_TYPE_SOFTWARE_LOOPBACK;
        default:
            return IF_TYPE_OTHER;
    }
}

MIB_IFROW row_of(const sockaddr_ll& link, const char* name) {
    MIB_IFROW row{};
    row.dwIndex = static_cast<DWORD>(link.sll_ifindex);
    row.dwType = type_of(link, name);
    row.dwPhysAddrLen = std::min<DWORD>(link.sll_halen, sizeof row.bPhysAddr);
    std::copy_n(link.sll_addr, row.dwPhysAddrLen, row.bPhysAddr);
    return row;
}

// Calls `visit` with the row of each interface whose index is wanted, in the system's order. 0 or the
// system's error.
template <class Wanted, class Visit>
DWORD visit_interfaces(const Wanted& wanted, const Visit& visit) {
    ifaddrs* first = nullptr;
    if (::getifaddrs(&first) != 0) {
        return error_from_errno(errno);
    }
    const std::unique_ptr<ifaddrs, decltype(&::freeifaddrs)> list(first, ::freeifaddrs);
    for (const ifaddrs* entry = first; entry != nullptr; entry = entry->ifa_next) {
        // One for each interface, whatever its state.
        if (entry->ifa_addr != nullptr && entry->ifa_addr->sa_family == AF_PACKET) {
            sockaddr_ll link;
            std::memcpy(&link, entry->ifa_addr, sizeof link);
            if (wanted(static_cast<DWORD>(link.sll_ifindex))) {
                visit(row_of(link, entry->ifa_name));
            }
        }
    }
    return ERROR_SUCCESS;
}

}  // namespace

DWORD GetIfTable(MIB_IFTABLE* table, DWORD* size, BOOL sorted) {
    std::size_t count = 0;
    std::size_t needed = offsetof(MIB_IFTABLE, table);
    const auto any = [](DWORD) { return true; };
    const DWORD error = visit_interfaces(any, [&](const MIB_IFROW& row) {
        needed += sizeof row;
        if (needed <= *size) {
            table->table[count] = row;
        }
        ++count;
    });
    if (error != ERROR_SUCCESS) {
        return error;
    }
    if (needed > *size) {
        *size = static_cast<DWORD>(needed);
        return ERROR_INSUFFICIENT_BUFFER;
    }
    table->dwNumEntries = static_cast<DWORD>(count);
    if (sorted != 0) {
        std::sort(table->table, table->table + count,
                  [](const MIB_IFROW& a, const MIB_IFROW& b) { return a.dwIndex < b.dwIndex; });
    }
    return ERROR_SUCCESS;
}

DWORD GetIfEntry(MIB_IFROW* row) {
    bool found = false;
    const auto is_this = [index = row->dwIndex](DWORD candidate) { return candidate == index; };
    const DWORD error = visit_interfaces(is_this, [&](const MIB_IFROW& candidate) {
        *row = candidate;
        found = true;
    });
    return error != ERROR_SUCCESS || found ? error : ERROR_FILE_NOT_FOUND;
}
