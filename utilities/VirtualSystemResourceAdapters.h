/// Slots and virtual adapters in the strings in which the tools take and tell them.
///
/// A list is elements with commas between them, or the word "none". An element is fields with "/"
/// between them; a field with a comma stands in double quotes:
///
///     slot      drc_index/slot_io_pool_id or "none"/is_required
///     serial    slot_num/"client" or "server"/supports_dnx/remote_lpar_id/remote_lpar_name/
///               remote_slot_num/is_required
///     SCSI      slot_num/"client" or "server"/remote_lpar_id/remote_lpar_name/remote_slot_num/
///               is_required
///     Ethernet  slot_num/ieee_virtual_eth/port_vlan_id/addl_vlan_ids/trunk_priority/is_required
///               [/vswitch[/mac_addr]]
///
/// A class reads one element of its kind and writes one:
///
///     zemVirtualSerialAdapter adapter("4/server/1/any//any/0");
///     adapter.getRemoteLparId();  // -1: any
///     puts(adapter.getValue());   // "4/server/1/any//any/0"
///
/// Reading throws only for quotes that are not closed. Numbers are read as strtol() does and held
/// to the range of an int; a field of pools, remote partitions and remote slots that has anything
/// but digits is passed by. What an element does not tell stays -1 or empty.
///
/// Thread-safety: none; plain values.
#ifndef VIRTUAL_SYSTEM_RESOURCE_ADAPTERS_H
#define VIRTUAL_SYSTEM_RESOURCE_ADAPTERS_H

#include "Array.h"
#include "StringUtils.h"
#include "VirtualSystemFields.h"
#include "VirtualSystemResourceSettings.h"
#include "ZemExport.h"

/// The root of slots and adapters. The string form is made once and kept.
class ZEM_EXPORT zemVirtualSystemIOResource : public zemVirtualSystemResource {
public:
    /// The string form; made by refreshResourceString() if there is none yet. Fields that changed
    /// since do not show in it.
    zemString getValue() override;

    /// Appends the string form to the one that is kept, and returns all of it. So a second call
    /// doubles it; a caller that wants it anew makes a new object.
    virtual zemString refreshResourceString() = 0;

    /// Reads one field of an element, or one element of a list.
    /// @param index  where it begins; afterwards where the next @p delimiter stands, or -1 if there
    ///        is none. The caller steps over it. With -1 the field is empty.
    /// @return the field, without the quotes around it
    /// @throws zemInvalidParameterException quotes are not closed; the words are @p text
    static zemString getNextResourceProperty(const zemString& text, int& index, char delimiter);

protected:
    zemString m_strResource;  ///< the string form, empty until it has been asked for
};

/// A slot for a physical adapter. Without a pool, the string form loses the DRC index: it is
/// "none/" and the flag.
class ZEM_EXPORT zemIOSlotAdapter : public zemVirtualSystemIOResource {
public:
    zemIOSlotAdapter() = default;

    /// @throws zemInvalidParameterException quotes are not closed
    explicit zemIOSlotAdapter(const zemString& element);
    zemIOSlotAdapter(const zemString& drcIndex, int poolId, int isRequired);

    zemString refreshResourceString() override;
    zemSystemSetting* clone() const override;

    /// Takes from @p other what this one lacks, then appends the string form to the one kept.
    void mergeWith(const zemIOSlotAdapter& other);

    ZEM_READ_FIELD_OF(zemString, m_stringDrcIndex, DrcIndex);  ///< key of the slot on its host
    ZEM_READ_FIELD_OF(int, m_iPoolId, PoolId);                 ///< pool of slots
    ZEM_READ_FIELD_OF(int, m_iIsRequired, IsRequired);         ///< 1: no start without it

private:
    struct Form;
};

/// One end of a virtual serial line. The name of the partition at the other end is written, but
/// never read from an element: partitions are known by their numbers.
class ZEM_EXPORT zemVirtualSerialAdapter : public zemVirtualSystemIOResource {
public:
    zemVirtualSerialAdapter() = default;

    /// @throws zemInvalidParameterException quotes are not closed
    explicit zemVirtualSerialAdapter(const zemString& element);
    zemVirtualSerialAdapter(int slotId, int isServer, int supportsDNX, int remoteLparId,
                            const zemString& remoteLparName, int remoteSlotNumber, int isRequired);

    zemString refreshResourceString() override;
    zemSystemSetting* clone() const override;

    /// Takes from @p other what this one lacks, then appends the string form to the one kept.
    void mergeWith(const zemVirtualSerialAdapter& other);

    ZEM_READ_FIELD_OF(int, m_iSlotId, SlotId);              ///< virtual slot
    ZEM_READ_FIELD_OF(int, m_iIsServer, IsServer);          ///< 1 server, 0 client
    ZEM_READ_FIELD_OF(int, m_iSupportsDNX, SupportsDNX);    ///< 1: the appliance's console reaches
                                                            ///< it; of servers only
    ZEM_READ_FIELD_OF(int, m_iRemoteLparId, RemoteLparId);  ///< partition at the other end; -1 and
                                                            ///< -2 are any
    ZEM_READ_FIELD_OF(zemString, m_strRemoteLparName, RemoteLparName);  ///< its name
    ZEM_READ_FIELD_OF(int, m_iRemoteSlotNumber, RemoteSlotNumber);      ///< slot there, as above
    ZEM_READ_FIELD_OF(int, m_iIsRequired, IsRequired);                  ///< 1: no start without it

private:
    struct Form;
};

/// One end of a virtual SCSI bus; as a serial one, with nothing of consoles.
class ZEM_EXPORT zemVirtualSCSIAdapter : public zemVirtualSystemIOResource {
public:
    zemVirtualSCSIAdapter() = default;

    /// @throws zemInvalidParameterException quotes are not closed
    explicit zemVirtualSCSIAdapter(const zemString& element);
    zemVirtualSCSIAdapter(int slotId, int isServer, int remoteLparId,
                          const zemString& remoteLparName, int remoteSlotNumber, int isRequired);

    zemString refreshResourceString() override;
    zemSystemSetting* clone() const override;

    /// Takes from @p other what this one lacks, then appends the string form to the one kept.
    void mergeWith(const zemVirtualSCSIAdapter& other);

    ZEM_READ_FIELD_OF(int, m_iSlotId, SlotId);              ///< virtual slot
    ZEM_READ_FIELD_OF(int, m_iIsServer, IsServer);          ///< 1 server, 0 client
    ZEM_READ_FIELD_OF(int, m_iRemoteLparId, RemoteLparId);  ///< partition at the other end; -1 and
                                                            ///< -2 are any
    ZEM_READ_FIELD_OF(zemString, m_strRemoteLparName, RemoteLparName);  ///< its name
    ZEM_READ_FIELD_OF(int, m_iRemoteSlotNumber, RemoteSlotNumber);      ///< slot there, as above
    ZEM_READ_FIELD_OF(int, m_iIsRequired, IsRequired);                  ///< 1: no start without it

private:
    struct Form;
};

/// A virtual Ethernet adapter. Further VLANs are written one behind the other, with nothing
/// between them.
class ZEM_EXPORT zemVirtualEthernetAdapter : public zemVirtualSystemIOResource {
public:
    zemVirtualEthernetAdapter() = default;

    /// @throws zemInvalidParameterException quotes are not closed
    explicit zemVirtualEthernetAdapter(const zemString& element);
    zemVirtualEthernetAdapter(int slotId, int isIEEE, int portVlanId,
                              const zemArray<int>& additionalVlanIds, int trunkPriority,
                              int isRequired, const zemString& vswitch);

    zemString refreshResourceString() override;
    zemSystemSetting* clone() const override;

    /// Takes from @p other what this one lacks. The string form stays as it is.
    void mergeWith(const zemVirtualEthernetAdapter& other);

    ZEM_READ_FIELD_OF(int, m_iSlotId, SlotId);          ///< virtual slot
    ZEM_READ_FIELD_OF(int, m_iIsIEEE, IsIEEE);          ///< 1: tells VLANs apart
    ZEM_READ_FIELD_OF(int, m_iPortVlanId, PortVlanId);  ///< its VLAN
    ZEM_READ_FIELD_OF(zemArray<int>, m_aAdditionalVlanIds, AdditionalVlanIds);  ///< further VLANs
    ZEM_READ_FIELD_OF(int, m_iTrunkPriority,
                      TrunkPriority);                   ///< rank among those that lead outside
    ZEM_READ_FIELD_OF(int, m_iIsRequired, IsRequired);  ///< 1: no start without it
    ZEM_READ_FIELD_OF(zemString, m_vswitch, VSwitch);   ///< name of the virtual switch

private:
    struct Form;
};

#endif
