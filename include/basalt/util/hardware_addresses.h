/// @file
/// Hardware addresses of the machine's Ethernet interfaces.
#ifndef BASALT_UTIL_HARDWARE_ADDRESSES_H
#define BASALT_UTIL_HARDWARE_ADDRESSES_H

#include <memory>
#include <string>
#include <vector>

#include "basalt/export.h"
#include "basalt/platform/types.h"

namespace basalt {

/// List of the hardware (MAC) addresses of the machine's Ethernet interfaces, empty at first.
/// Threads: one object is used by one thread at a time.
class BASALT_API MACAddressFromMIBTable {
public:
    /// Appends the addresses of the current Ethernet interfaces in ascending order of their indexes:
    /// connected or not, enabled or not, virtual ones (bridges, veth, tap) too; not wireless ones, loopback
    /// or any other type. A second call appends them again.
    /// @return whether the list is not empty afterwards. What the system refuses to report is missing.
    /// Out of memory: std::bad_alloc; some of the addresses may have been appended.
    bool Create();

    /// The addresses in the order of the list, each as VectorToHexString() gives it: "001a2b3c4d5e". An empty
    /// text for an interface without an address.
    std::vector<std::string> GetMACAddressesAsHexString();

private:
    std::shared_ptr<BYTE[]> m_table;
    std::vector<std::vector<unsigned char>> m_addresses;
};

}  // namespace basalt

#endif
