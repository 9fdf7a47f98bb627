#include "basalt/util/hardware_addresses.h"

#include <gtest/gtest.h>
#include <ifaddrs.h>
#include <net/if_arp.h>
#include <netpacket/packet.h>

#include <algorithm>
#include <cerrno>
#include <span>
#include <string>

#include "src/platform/system_info.h"

namespace {

struct Interface {
    int index;
    unsigned short type;
    std::string address;
};
std::vector<Interface> s_interfaces;        // of the machine, named by their indexes
std::size_t s_shown = 0, s_shown_more = 0;  // how many getifaddrs() reports, and how many more each time
int s_refusal = 0;                          // its errno

}  // namespace

// Linked in place of the system's calls (--wrap).
extern "C" int __wrap_getifaddrs(ifaddrs** list) {
    errno = s_refusal;
    static std::vector<ifaddrs> entries;
    static std::vector<sockaddr_ll> links;
    static std::vector<std::string> names;
    const std::size_t count = std::min(s_shown, s_interfaces.size());
    entries.assign(count + 1, {});  // the first without an address
    links.assign(count, {});
    names.assign(count, {});
    for (std::size_t i = 0; i < count; ++i) {
        const auto& [index, type, address] = s_interfaces[i];
        const auto length = static_cast<unsigned char>(address.size());
        links[i] = {AF_PACKET, 0, index, type, 0, length, {}};
        std::copy_n(address.begin(), std::min<std::size_t>(length, 8), links[i].sll_addr);
        names[i] = "interface" + std::to_string(index);
        entries[i].ifa_next = &entries[i + 1];
        entries[i + 1].ifa_name = names[i].data();
        entries[i + 1].ifa_addr = reinterpret_cast<sockaddr*>(&links[i]);
    }
    s_shown += s_shown_more;
    *list = entries.data();
    return s_refusal == 0 ? 0 : -1;
}
extern "C" void __wrap_freeifaddrs(ifaddrs*) {}
extern "C" int __wrap_access(const char* path, int) {
    const std::string file = path;
    const char* const wireless[] = {"/sys/class/net/interface5/phy80211",
                                    "/sys/class/net/interface6/wireless"};
    return file == wireless[0] || file == wireless[1] ? 0 : -1;
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
    DWORD size = 4 + 7 * 860 - 1;
    EXPECT_EQ(GetIfTable(table, &size, 1), 122U);
    EXPECT_EQ(size, 4U + 7 * 860);
    EXPECT_EQ(GetIfTable(table, &size, 0), 0U);
    std::string found;
    for (const MIB_IFROW& row : std::span(table->table, table->dwNumEntries)) {
        found +=
            std::string(row.bDescr, row.bDescr + row.dwDescrLen) + "=" + std::to_string(row.dwType) + " ";
    }
    EXPECT_EQ(
        found,
        "interface7=6 interface1=24 interface5=71 interface6=71 interface12=6 interface9=1 interface3=6 ");
}

TEST(HardwareAddresses, end_when_interfaces_come_and_go_or_the_system_refuses) {
    s_interfaces.clear();
    for (int i = 1; i <= 20; ++i) {
        s_interfaces.push_back({i, ARPHRD_ETHER, std::string(1, static_cast<char>(i))});
    }
    MACAddressFromMIBTable list;
    s_shown = s_shown_more = 1;
    EXPECT_FALSE(list.Create()) << "the table grows each time";
    s_shown = 17;
    EXPECT_TRUE(list.Create()) << "it stops growing";
    EXPECT_EQ(list.GetMACAddressesAsHexString().size(), 18U) << "all but the wireless ones";
    list = {};
    s_shown = 4;
    s_shown_more = std::size_t{0} - 1;
    EXPECT_TRUE(list.Create());
    EXPECT_EQ(list.GetMACAddressesAsHexString(), Texts{"01"}) << "gone before their rows were read";
    s_shown_more = 0;
    const std::pair<int, DWORD> errors[] = {{EMFILE, 4}, {ENOMEM, 8}, {0, 2}};
    for (const auto& [refusal, error] : errors) {
        s_refusal = refusal;
        DWORD size = 0;
        MIB_IFROW row{};
        EXPECT_EQ(GetIfEntry(&row), error);
        EXPECT_EQ(GetIfTable(nullptr, &size, 0), refusal != 0 ? error : 122U);
        EXPECT_EQ(MACAddressFromMIBTable().Create(), refusal == 0);
    }
}

}  // namespace
