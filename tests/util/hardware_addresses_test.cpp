#include "basalt/util/hardware_addresses.h"

#include <gtest/gtest.h>
#include <ifaddrs.h>
#include <net/if.h>
#include <net/if_arp.h>
#include <netpacket/packet.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <fstream>
#include <map>
#include <optional>

#include "src/platform/interface_table.h"
#include "tests/support/with_failing_allocations.h"

namespace {

using basalt::MACAddressFromMIBTable;
using Texts = std::vector<std::string>;

// What happens between the calls that the list is made by.
std::optional<DWORD> vanished_index;
std::size_t grows_by = 0;  // rows that appear, one after each call for the table
DWORD table_error = 0;
std::span<const MIB_IFROW> rows;
int list_refusal = 0;            // errno
ifaddrs* system_list = nullptr;  // null: the real one

}  // namespace

// The names the linker's --wrap makes of the platform's calls.
extern "C" {
int __real_getifaddrs(ifaddrs** list);
int __wrap_getifaddrs(ifaddrs** list) {
    if (list_refusal != 0) {
        errno = list_refusal;
        return -1;
    }
    *list = system_list;
    return system_list != nullptr ? 0 : __real_getifaddrs(list);
}
void __real_freeifaddrs(ifaddrs* list);
void __wrap_freeifaddrs(ifaddrs* list) {
    if (list != system_list) {
        __real_freeifaddrs(list);
    }
}
DWORD __real__Z10GetIfEntryP9MIB_IFROW(MIB_IFROW* row);
DWORD __wrap__Z10GetIfEntryP9MIB_IFROW(MIB_IFROW* row) {
    return row->dwIndex == vanished_index ? 2 : __real__Z10GetIfEntryP9MIB_IFROW(row);
}
DWORD __real__Z10GetIfTableP11MIB_IFTABLEPji(MIB_IFTABLE* table, DWORD* size, BOOL sorted);
DWORD __wrap__Z10GetIfTableP11MIB_IFTABLEPji(MIB_IFTABLE* table, DWORD* size, BOOL sorted) {
    if (table_error != 0) {
        return table_error;
    }
    const DWORD result = __real__Z10GetIfTableP11MIB_IFTABLEPji(table, size, sorted);
    if (grows_by > 0) {
        --grows_by;
        rows = {rows.data(), rows.size() + 1};
    }
    return result;
}
}

namespace {

MIB_IFROW row(DWORD index, DWORD type, const std::vector<unsigned char>& address) {
    MIB_IFROW row{};
    row.dwIndex = index;
    row.dwType = type;
    row.dwPhysAddrLen = static_cast<DWORD>(address.size());
    std::copy_n(address.begin(), std::min<std::size_t>(address.size(), 8), row.bPhysAddr);
    return row;
}

class HardwareAddresses : public testing::Test {
protected:
    HardwareAddresses() {
        basalt::platform::set_interface_table(&rows);
        rows = {};
    }
    ~HardwareAddresses() override {
        basalt::platform::set_interface_table(nullptr);
        vanished_index.reset();
        grows_by = 0;
        list_refusal = 0;
        system_list = nullptr;
    }

    MACAddressFromMIBTable m_list;
};

TEST_F(HardwareAddresses, ethernet_interfaces_by_ascending_index) {
    MIB_IFROW all[] = {row(7, 6, {0x00, 0x1A, 0x2B, 0x3C, 0x4D, 0x5E}),
                       row(1, 24, {0, 0, 0, 0, 0, 0}),
                       row(12, 6, {}),
                       row(5, 71, {1, 2, 3, 4, 5, 6}),
                       row(9, 1, {1}),
                       row(3, 6, {0xFF, 0xFE, 0xFD, 0, 1, 2, 3, 4})};
    all[5].dwPhysAddrLen = 0xFFFFFFFF;  // beyond the record, so not believed
    rows = all;
    EXPECT_TRUE(m_list.GetMACAddressesAsHexString().empty());
    EXPECT_TRUE(m_list.Create());
    EXPECT_EQ(m_list.GetMACAddressesAsHexString(), (Texts{"fffefd0001020304", "001a2b3c4d5e", ""}));
    rows = {all, 1};
    EXPECT_TRUE(m_list.Create());
    const Texts more = {"fffefd0001020304", "001a2b3c4d5e", "", "001a2b3c4d5e"};
    EXPECT_EQ(m_list.GetMACAddressesAsHexString(), more);
    const MACAddressFromMIBTable copy = m_list;
    rows = {};
    EXPECT_TRUE(m_list.Create()) << "what was gathered stays";
    EXPECT_EQ(MACAddressFromMIBTable(copy).GetMACAddressesAsHexString(), more);
}

TEST_F(HardwareAddresses, none_is_there_or_the_system_refuses_to_tell) {
    EXPECT_FALSE(m_list.Create());
    MIB_IFROW only = row(2, 71, {1, 2, 3, 4, 5, 6});
    rows = {&only, 1};
    EXPECT_FALSE(m_list.Create()) << "a wireless one";
    only.dwType = 6;
    table_error = 50;
    EXPECT_FALSE(m_list.Create());
    EXPECT_TRUE(m_list.GetMACAddressesAsHexString().empty());

    table_error = 0;
    basalt::platform::set_interface_table(nullptr);
    list_refusal = EMFILE;
    DWORD size = 0;
    EXPECT_EQ(GetIfTable(nullptr, &size, 0), 4U);
    EXPECT_EQ(GetIfEntry(&only), 4U);
    EXPECT_FALSE(m_list.Create());
    list_refusal = ENOMEM;
    EXPECT_EQ(GetIfTable(nullptr, &size, 0), 8U);
    EXPECT_EQ(GetIfEntry(&only), 8U);
    EXPECT_FALSE(m_list.Create());
}

TEST_F(HardwareAddresses, table_and_row_take_no_memory) {
    basalt::platform::set_interface_table(nullptr);
    char name[IF_NAMESIZE] = "fifteen-letters";
    sockaddr_ll link{};
    link.sll_family = AF_PACKET;
    link.sll_ifindex = 7;
    link.sll_hatype = ARPHRD_ETHER;
    link.sll_halen = 6;
    ifaddrs entry{};
    entry.ifa_name = name;
    entry.ifa_addr = reinterpret_cast<sockaddr*>(&link);
    system_list = &entry;
    MIB_IFTABLE table{};
    DWORD size = sizeof table;
    MIB_IFROW row{};
    row.dwIndex = 7;
    DWORD errors[2] = {1, 1};
    const auto ask = [&] {
        errors[0] = GetIfTable(&table, &size, 1);
        errors[1] = GetIfEntry(&row);
    };
    const auto check = [&](bool) {
        EXPECT_EQ(errors[0], 0U);
        EXPECT_EQ(errors[1], 0U);
    };
    EXPECT_EQ(with_failing_allocations(ask, check), 0);
    EXPECT_EQ(table.dwNumEntries, 1U);
    EXPECT_EQ(row.dwType, 6U);
    EXPECT_EQ(std::string(row.bDescr, row.bDescr + row.dwDescrLen), name);
}

TEST_F(HardwareAddresses, interfaces_that_come_and_go_meanwhile) {
    std::vector<MIB_IFROW> all;
    for (DWORD index = 1; index <= 20; ++index) {
        all.push_back(row(index, 6, {static_cast<unsigned char>(index)}));
    }
    rows = {all.data(), 1};
    grows_by = 4;
    vanished_index = 2;
    EXPECT_TRUE(m_list.Create());
    EXPECT_EQ(m_list.GetMACAddressesAsHexString(), (Texts{"01", "03", "04", "05"}));
    MACAddressFromMIBTable never_ready;
    grows_by = 15;
    EXPECT_FALSE(never_ready.Create()) << "ends although the table grows at every reading";
}

std::string first_line(const std::filesystem::path& file) {
    std::ifstream stream(file);
    std::string line;
    std::getline(stream, line);
    return line;
}

// The machine's own interfaces, as its files tell them.
TEST_F(HardwareAddresses, real_interfaces) {
    namespace fs = std::filesystem;
    basalt::platform::set_interface_table(nullptr);
    std::map<int, std::string> by_index;
    std::size_t seen = 0;
    std::error_code error;
    for (const fs::directory_entry& entry : fs::directory_iterator("/sys/class/net", error)) {
        const fs::path& folder = entry.path();
        if (!fs::exists(folder / "ifindex")) {
            continue;
        }
        const int index = std::stoi(first_line(folder / "ifindex"));
        if (if_nametoindex(folder.filename().c_str()) != static_cast<unsigned>(index)) {
            GTEST_SKIP() << "/sys shows another network's interfaces";
        }
        ++seen;
        if (first_line(folder / "type") == "1" && !fs::exists(folder / "phy80211") &&
            !fs::exists(folder / "wireless")) {
            by_index[index] = first_line(folder / "address");
            std::erase(by_index[index], ':');
        }
    }
    if (seen == 0) {
        GTEST_SKIP() << "/sys is not mounted";
    }
    Texts expected;
    for (const auto& [index, address] : by_index) {
        expected.push_back(address);
    }
    EXPECT_EQ(m_list.Create(), !expected.empty());
    EXPECT_EQ(m_list.GetMACAddressesAsHexString(), expected);

    std::vector<unsigned char> bytes(4 + 860 * seen);
    auto size = static_cast<DWORD>(bytes.size() - 1);
    auto* const table = reinterpret_cast<MIB_IFTABLE*>(bytes.data());
    EXPECT_EQ(GetIfTable(table, &size, 1), 122U);
    EXPECT_EQ(size, bytes.size());
    EXPECT_EQ(GetIfTable(table, &size, 1), 0U);
    EXPECT_EQ(table->dwNumEntries, seen);
    MIB_IFROW none{};
    none.dwIndex = 0x7FFFFFFF;
    EXPECT_EQ(GetIfEntry(&none), 2U);
}

}  // namespace
