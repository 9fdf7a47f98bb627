#include "basalt/util/hardware_addresses.h"

#include <gtest/gtest.h>
#include <ifaddrs.h>
#include <net/if_arp.h>
#include <netpacket/packet.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <span>
#include <string>

#include "src/platform/system_info.h"

namespace {

struct Interface {
    int index;
    unsigned short type;
    std::string address, name = "interface" + std::to_string(index);
    sockaddr_ll link{};
    ifaddrs entry{};
};
std::vector<Interface> s_interfaces;        // of the machine
std::size_t s_shown = 0, s_shown_more = 0;  // how many getifaddrs() reports, and how many more each time
int s_refusal = 0;                          // its errno

}  // namespace

// Linked in place of the system's calls (--wrap).
extern "C" int __wrap_getifaddrs(ifaddrs** list) {
    errno = s_refusal;
    static ifaddrs without_address;
    *list = &without_address;
    ifaddrs** next = &without_address.ifa_next;
    for (Interface& shown : std::span(s_interfaces).first(std::min(s_shown, s_interfaces.size()))) {
        const auto length = static_cast<unsigned char>(shown.address.size());
        shown.link = {AF_PACKET, 0, shown.index, shown.type, 0, length, {}};
        shown.address.copy(reinterpret_cast<char*>(shown.link.sll_addr), 8);
        shown.entry.ifa_name = shown.name.data();
        shown.entry.ifa_addr = reinterpret_cast<sockaddr*>(&shown.link);
        *next = &shown.entry;
        next = &shown.entry.ifa_next;
    }
    *next = nullptr;
    s_shown += s_shown_more;
    return s_refusal == 0 ? 0 : -1;
}
extern "C" void __wrap_freeifaddrs(ifaddrs*) {}
extern "C" int __wrap_access(const char* path, int) {
    const std::string file = path, devices = "/sys/class/net/interface";
    return file == devices + "5/phy80211" || file == devices + "6/wireless" ? 0 : -1;
}

namespace {

using basalt::MACAddressFromMIBTable;
using Texts = std::vector<std::string>;

TEST(HardwareAddresses, are_those_of_ethernet_interfaces_by_ascending_index) {
    s_interfaces = {{7, ARPHRD_ETHER, {"\0\x1A\x2B\x3C\x4D\x5E", 6}},
                    {1, ARPHRD_LOOPBACK, "loop"},
                    {5, ARPHRD_ETHER, "phy"},
                    {6, ARPHRD_ETHER, "air"},
                    {12, ARPHRD_ETHER, ""},
                    {9, ARPHRD_TUNNEL, "t"},
                    {3, ARPHRD_ETHER, "more than a row has"}};
    const std::pair<std::size_t, Texts> rows[] = {
        {0, {}}, {7, {"6d6f726520746861", "001a2b3c4d5e", ""}}, {1, {"001a2b3c4d5e"}}, {0, {}}};
    MACAddressFromMIBTable list;
    Texts all;
    for (const auto& [shown, added] : rows) {
        s_shown = shown;
        all.insert(all.end(), added.begin(), added.end());
        EXPECT_EQ(list.Create(), !all.empty()) << "the list keeps its addresses";
        EXPECT_EQ(list.GetMACAddressesAsHexString(), all);
    }
    s_shown = 7;
    MIB_IFROW space[8];
    auto* const table = reinterpret_cast<MIB_IFTABLE*>(space);
    DWORD size = 4 + sizeof(MIB_IFROW[7]) - 1;
    EXPECT_TRUE(GetIfTable(table, &size, 1) == 122 && size == 4 + sizeof(MIB_IFROW[7]));
    EXPECT_EQ(GetIfTable(table, &size, 0), 0U);
    std::string found;
    for (const MIB_IFROW& row : std::span(table->table, table->dwNumEntries)) {
        found += std::to_string(row.dwIndex) + '=' + std::to_string(row.dwType) + ' ';
    }
    EXPECT_EQ(found, "7=6 1=24 5=71 6=71 12=6 9=1 3=6 ");
}

TEST(HardwareAddresses, end_when_interfaces_come_and_go_or_the_system_refuses) {
    s_interfaces.clear();
    for (int i = 1; i <= 20; ++i) {
        s_interfaces.push_back({i, ARPHRD_ETHER, std::string(1, static_cast<char>(i))});
    }
    // Shown at first and more each time, addresses found: the table grows each time; it stops growing (and
    // two are wireless); all but one are gone before their rows are read.
    constexpr std::size_t ROWS[][3] = {{1, 1, 0}, {17, 1, 18}, {4, SIZE_MAX, 1}};
    for (const auto& [shown, more, addresses] : ROWS) {
        MACAddressFromMIBTable list;
        s_shown = shown, s_shown_more = more;
        EXPECT_EQ(list.Create(), addresses > 0);
        EXPECT_EQ(list.GetMACAddressesAsHexString().size(), addresses);
    }
    s_shown_more = 0;
    const std::array<DWORD, 4> rows[] = {{EMFILE, 4, 4, 0}, {ENOMEM, 8, 8, 0}, {0, 2, 122, 1}};
    for (const auto& [refusal, entry_error, table_error, is_created] : rows) {
        s_refusal = static_cast<int>(refusal);
        DWORD size = 0;
        MIB_IFROW row{};
        EXPECT_TRUE(GetIfEntry(&row) == entry_error && GetIfTable(nullptr, &size, 0) == table_error)
            << refusal;
        EXPECT_EQ(MACAddressFromMIBTable().Create(), is_created == 1);
    }
}

}  // namespace
