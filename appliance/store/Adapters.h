/// Adapter lists: how a profile writes its virtual adapters and I/O slots in one text.
///
/// A list has elements with commas between them, an element has fields with slashes between them;
/// an element that holds a comma or a quote is quoted as a whole; an empty list is "none". Stored
/// lists leave the name of a remote partition empty, because partitions are renamed: the name is
/// filled in when a list is read. Lists that come from outside may quote single fields instead,
/// name the remote partition, and leave fields empty for their usual value; read here and written
/// back, they have the stored form.
#ifndef APPLIANCE_ADAPTERS_H
#define APPLIANCE_ADAPTERS_H

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "View.h"

namespace appliance {

/// One kind of adapter in lists.
struct AdapterForm {
    Kind kind;
    const char* list;    ///< attribute of a profile that holds the list
    const char* fields;  ///< attributes of the adapter; the one without name is the remote
                         ///< partition's name, behind its ID
};

constexpr AdapterForm kAdapterForms[] = {
    {Kind::Serial, "virtual_serial_adapters",
     "slot_num,adapter_type,supports_dnx,remote_lpar_id,,remote_slot_num,is_required"},
    {Kind::VirtualScsi, "virtual_scsi_adapters",
     "slot_num,adapter_type,remote_lpar_id,,remote_slot_num,is_required"},
    {Kind::Ethernet, "virtual_eth_adapters",
     "slot_num,ieee_virtual_eth,port_vlan_id,addl_vlan_ids,trunk_priority,is_required,vswitch"},
};

/// Null when adapters of @p kind stand in no list.
const AdapterForm* adapterForm(Kind kind);

/// The element for an adapter, unquoted and without the remote name.
std::string adapterElement(const AdapterForm& form, const Object& adapter);

/// The list of these elements, "none" for no element.
std::string adapterList(const std::vector<std::string>& elements);

/// The elements of a list, without their quotes; none for "none" and for an empty list.
/// @throws Failure BadValue with the attribute @p key: a quote is open at the end
std::vector<std::string> elementsOf(const std::string& key, const std::string& list);

/// The adapter that an element describes, in @p lpar, where its slot is its number; Ethernet
/// without a MAC address.
/// @throws Failure BadValue with the form's list and the element
Object adapterFromElement(const AdapterForm& form, const Place& lpar, const std::string& element);

/// All virtual adapters of a profile, by slot, as objects of its partition; Ethernet without MAC
/// addresses.
/// @throws Failure BadValue with list and element: it is malformed, or its slot is taken by another
///         or not below the profile's max_virtual_slots
std::map<std::int64_t, Object> adaptersOf(const Object& profile);

/// How @p value is stored as the attribute @p name of an adapter; nothing when it cannot be its
/// value. Empty stands for the usual value.
std::optional<std::string> adapterValue(const std::string& name, const std::string& value);

/// Whether the values of an Ethernet adapter go together: only IEEE ones have additional VLANs.
bool isWhole(const Object& ethernet);

/// A virtual slot of a host: the ID of its partition, and its number there.
using VirtualSlot = std::pair<std::int64_t, std::int64_t>;

VirtualSlot slotOf(const Object& adapter);

/// Where the server of a client adapter would be; nothing for other adapters.
std::optional<VirtualSlot> serverOf(const Object& adapter);

/// Whether the other end of @p adapter may be in @p slot. Either end may leave open which it is.
bool admits(const Object& adapter, const VirtualSlot& slot);

/// Whether @p other, which is where @p client has its server, is one, and lets the client in. A
/// server may name a client that is not there yet, or leave open who comes.
bool serves(const Object& other, const Object& client);

/// A MAC address that no adapter of the host has, for an Ethernet adapter in @p place.
std::string newMac(const HostView& view, const Place& place);

/// One physical slot of a profile.
struct IoSlot {
    std::string drcIndex;  ///< upper-case hexadecimal digits
    std::string pool;      ///< ID of its I/O pool, or "none"
    bool isRequired;
};

/// @throws Failure BadValue of io_slots with the element that is malformed or there twice
std::vector<IoSlot> ioSlotsFromList(const std::string& list);
std::string ioSlotElement(const IoSlot& slot);

/// A profile's list under the attribute @p key, with the remote names.
std::string namedAdapters(const Row& row, const char* key);

}  // namespace appliance

#endif
