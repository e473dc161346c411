/// Adapter lists: how a profile writes its virtual adapters and I/O slots in one text.
///
/// A list has elements with commas between them, an element has fields with slashes between them;
/// an element that holds a comma or a quote is quoted as a whole; an empty list is "none". Stored
/// lists leave the name of a remote partition empty, because partitions are renamed: the name is
/// filled in when a list is read.
#ifndef APPLIANCE_ADAPTERS_H
#define APPLIANCE_ADAPTERS_H

#include <string>
#include <vector>

#include "View.h"

namespace appliance {

/// One kind of adapter in lists.
struct AdapterForm {
    Kind kind;
    const char* list;        ///< attribute of a profile that holds the list
    const char* fields[8];   ///< attributes of the adapter, then null; "" is the remote name
    std::size_t remoteId;    ///< field with the remote partition's ID; 0 when there is none
    std::size_t remoteName;  ///< field with its name
};

constexpr AdapterForm kAdapterForms[] = {
    {Kind::Serial,
     "virtual_serial_adapters",
     {"slot_num", "adapter_type", "supports_dnx", "remote_lpar_id", "", "remote_slot_num",
      "is_required"},
     3,
     4},
    {Kind::VirtualScsi,
     "virtual_scsi_adapters",
     {"slot_num", "adapter_type", "remote_lpar_id", "", "remote_slot_num", "is_required"},
     2,
     3},
    {Kind::Ethernet,
     "virtual_eth_adapters",
     {"slot_num", "ieee_virtual_eth", "port_vlan_id", "addl_vlan_ids", "trunk_priority",
      "is_required", "vswitch"},
     0,
     0},
};

/// Null when adapters of @p kind stand in no list.
const AdapterForm* adapterForm(Kind kind);

/// The element for an adapter, unquoted and without the remote name.
std::string adapterElement(const AdapterForm& form, const Object& adapter);

/// The list of these elements, "none" for no element.
std::string adapterList(const std::vector<std::string>& elements);

/// A profile's list under the attribute @p key, with the remote names.
std::string namedAdapters(const Row& row, const char* key);

}  // namespace appliance

#endif
