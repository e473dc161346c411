/// zemVSSD: virtual system setting data, the settings of one partition on one of two sides.
///
/// A partition has one VSSD for what is running (the state side) and one for each of its profiles
/// (the defined side). A VSSD holds the settings of the system itself, the setting data of its
/// resources in the form that CIM classes show (getRASDSet()), built by initializeState() and
/// initializeDefined(), and its resources as RASDs (getRASDs()). It owns both.
///
/// Copying and assigning hand the resources over: the copy has the same fields, and owns the RASDs
/// and setting data from there on; the source, although const, keeps readable pointers to them, for
/// as long as the copy lives. The target of an assignment first deletes what it owned.
///
/// Texts are those of the tools; numbers are -1 while they are not known, and 0 or 1 for flags.
///
/// Thread-safety: none; a VSSD belongs to the operation that made it.
///
///     zemVSSD vssd(mtms, "ORX:2*my-prof-3*1111-AAA*0000001");
///     puts(vssd.getProfileName());  // "my-prof"
///     vssd.addRASD(4, "4-Memory")->getInstanceID(true, &vssd);
#ifndef VIRTUAL_SYSTEM_REP_VSSD_H
#define VIRTUAL_SYSTEM_REP_VSSD_H

#include "AutoRelease.h"
#include "DynamicArray.h"
#include "RecordSets.h"
#include "ResourcePoolManagerSettingData.h"
#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"
#include "ZemExport.h"

class zemCEC;
class zemLPAR;
class zemVirtualSystemProfile;

class ZEM_EXPORT zemVSSD {
public:
    zemVSSD() = default;

    /// @param mtms  key of the host
    zemVSSD(const zemString& mtms, const zemString& lparID, const zemString& profileName);

    /// Takes partition and profile from @p id.
    /// @throws zemInvalidParameterException as AnalyzeInstanceID()
    zemVSSD(const zemString& mtms, const zemString& id);

    zemVSSD(const zemString& lparID, const zemString& mtms, const zemString& virtualSystemType,
            int autoActivate, const zemString& lparName, const zemString& profileName,
            const zemString& bootMode, int enableConnectionMonitoring, int isDefault,
            int maxVirtualSlots, int enableRedundantErrorPathReporting, const zemString& keylock,
            const zemString& defaultProfileName);

    /// The same as initialize() of an empty VSSD.
    zemVSSD(zemLPAR* lpar, const zemRecordType& record);
    zemVSSD(zemLPAR* lpar, zemVirtualSystemProfile& profile);

    zemVSSD(const zemVSSD&) = default;
    zemVSSD& operator=(const zemVSSD&) = default;

    /// Takes the settings of a profile of @p lpar: from a record of "qyplat -r prof" keyed by the
    /// attributes of zemQyplatCmdCaller::PartitionProfileAttribute, in which absent ones read as
    /// empty, or from the profile's object, which is read at level 2. Partition ID, host and
    /// instance ID stay. The object tells nothing of redundant error paths: the field becomes 1
    /// unless it was 0. Returns 0.
    int initialize(zemLPAR* lpar, const zemRecordType& record);
    int initialize(zemLPAR* lpar, zemVirtualSystemProfile& profile);

    /// Makes this the VSSD of one side of @p lpar under @p profileName, and builds the setting data
    /// of the resources of one class: on the defined side from the lists that initialize() took,
    /// on the state side slots from that list, and adapters from the lists below, asked once.
    /// @param userName  who asks
    /// @param className  class of the setting data, ignoring case; another one gives none
    /// @param type  a VMVisitorType; for the two of VSSDs no setting data are built
    /// @return 0, or -1 for processor, memory or slots of a partition that is not activated, which
    ///         have no state side
    int initializeState(const zemString& userName, const zemString& profileName, zemCEC* cec,
                        zemLPAR* lpar, const zemString& className, int type);
    int initializeDefined(const zemString& userName, const zemString& profileName, zemCEC* cec,
                          zemLPAR* lpar, const zemString& className, int type);

    const zemString& getInstanceID() const { return m_InstanceID; }
    const zemString& getMTMS() const { return m_MTMS; }
    const zemString& getVirtualSystemType() const { return m_virtualSystemType; }
    const zemString& getVirtualSystemID() const { return m_virtualSystemIdentifier; }
    const zemString& getLparID() const { return m_lparID; }
    const zemString& getLparName() const { return m_lparName; }
    const zemString& getProfileName() const { return m_profileName; }
    const zemString& getBootMode() const { return m_bootMode; }
    int getMaxVirtualSlots() const { return m_maxVirtualSlots; }
    const zemString& getKeylock() const { return m_keylock; }
    const zemString& getDefaultProfileName() const { return m_defaultProfileName; }
    int getMemoryPoolNum() const { return m_memoryPoolNum; }
    void setMemoryPoolNum(int count) { m_memoryPoolNum = count; }

    /// What clients set. Partition ID, host and instance ID stay.
    void setVirtualSystemType(const zemString& type) { m_virtualSystemType = type; }
    void setLparName(const zemString& name) { m_lparName = name; }
    void setProfileName(const zemString& name) { m_profileName = name; }
    void setDefaultProfileName(const zemString& name) { m_defaultProfileName = name; }
    void setBootMode(const zemString& mode) { m_bootMode = mode; }
    void setKeylock(const zemString& position) { m_keylock = position; }
    void setMaxVirtualSlots(int count) { m_maxVirtualSlots = count; }
    void setAutoActivate(int flag) { m_autoActivate = flag; }
    void setEnableConnectionMonitoring(int flag) { m_enableConnectionMonitoring = flag; }
    void setEnableRedundantErrorPathReporting(int flag) {
        m_enableRedundantErrorPathReporting = flag;
    }

    /// Flags; one that is not known reads true.
    bool getAutoActivate() const { return m_autoActivate != 0; }
    bool getEnableConnectionMonitoring() const { return m_enableConnectionMonitoring != 0; }
    bool getIsDefault() const { return m_isDefault != 0; }
    bool getEnableRedundantErrorPathReporting() const {
        return m_enableRedundantErrorPathReporting != 0;
    }

    /// Whether the instance ID is one of the state side.
    bool isState() const;

    /// Forms the instance ID of one side from partition ID, profile name and host, stores and
    /// returns it.
    const zemString& GenerateInstanceID(bool isState);

    /// Takes the partition ID, and on the defined side the profile name, from @p id. Both stay when
    /// @p id has neither form.
    /// @throws zemInvalidParameterException @p id does not end with the host @p mtms, or names it
    ///         before
    void AnalyzeInstanceID(const zemString& mtms, const zemString& id);

    /// The setting data and the RASDs, which belong to this object.
    zemDynamicArray<zemResourceRASettingData>& getRASDSet() { return m_RASDSet; }
    zemDynamicArray<zemRASD>& getRASDs() { return m_RASDs; }

    /// The first RASD with this key, ignoring case, or null; and all of a resource type in an array
    /// that does not own them.
    zemRASD* getRASD(const zemString& key) const;
    zemDynamicArray<zemRASD> getRASD(int resourceType) const;

    /// Deletes the first RASD with this key, ignoring case, and tells whether there was one.
    bool removeRASD(const zemString& key);

    /// Appends @p rasd, not null, which belongs to this object from here on. Returns 0.
    int addRASD(zemRASD* rasd);

    /// A new RASD of a kind, made from @p key; null for an unknown type. createRASD() gives it to
    /// the caller, addRASD() appends it.
    static zemRASD* createRASD(int resourceType, const zemString& key);
    zemRASD* addRASD(int resourceType, const zemString& key);

    /// The lists of slots and adapters as stored.
    const zemString& getIOSlotInfo() const { return m_IOSlotsInfo; }
    const zemString& getSerialAdapterInfo() const { return m_virtualSerialAdaptersInfo; }
    const zemString& getSCSIAdapterInfo() const { return m_virtualSCSIAdaptersInfo; }
    const zemString& getEthernetAdapterInfo() const { return m_virtualEthetnetAdaptersInfo; }

    /// The adapters that a partition has now, in the form of the stored lists but with a comma
    /// behind each; "none," when there are none and when asking fails in any way. Serial and SCSI
    /// adapters are asked of a tool, Ethernet adapters of the management library; their virtual
    /// switches, which that does not tell, are taken from the stored list, and behind them stands
    /// the MAC address.
    zemString getSerialAdapterInfo(const zemString& userName, const zemString& mtms,
                                   const zemString& lparId) const;
    zemString getSCSIAdapterInfo(const zemString& userName, const zemString& mtms,
                                 const zemString& lparId) const;
    zemString getEthernetAdapterInfo(const zemString& userName, const zemString& mtms,
                                     const zemString& lparId) const;

    /// Prints to standard output, a line a field; a VSSD with its RASDs. Not null.
    static void dumpVSSD(zemVSSD* vssd);
    static void dumpRASD(zemRASD* rasd);

    /// Whether @p vssd has the same settings; equals() compares the RASDs too, pairwise in their
    /// order. Setting data, which follow from the settings, are not compared. Never equal to null.
    bool equals(const zemVSSD* vssd) const;
    bool equalvssd(const zemVSSD* vssd) const;

    /// Whether @p vssd has the same in all that clients set: all fields but the mark of the default
    /// profile and the lists of slots and adapters, for which the RASDs stand, pairwise.
    bool hasSettingsOf(const zemVSSD& vssd) const;

private:
    struct Fields;

    int initializeSide(zemSettingSide side, const zemString& userName, const zemString& profileName,
                       zemCEC* cec, zemLPAR* lpar, const zemString& className, int type);
    void takeFromPartition(zemLPAR* lpar);
    int indexOf(const zemString& key) const;

    zemString m_InstanceID;
    zemString m_MTMS;                     ///< key of the host
    zemString m_virtualSystemType;        ///< what runs in the partition, as "tmxlinux"
    int m_autoActivate = -1;              ///< 1: starts with the host
    zemString m_virtualSystemIdentifier;  ///< "<partition ID>*<MTMS>"
    zemString m_lparID;
    zemString m_lparName;
    zemString m_profileName;
    zemString m_bootMode;  ///< as "norm"
    int m_enableConnectionMonitoring = -1;
    int m_isDefault = -1;  ///< 1: the profile is the partition's default
    int m_maxVirtualSlots = -1;
    int m_enableRedundantErrorPathReporting = -1;
    zemString m_keylock;  ///< "norm", "manual"
    zemString m_defaultProfileName;
    zemString m_IOSlotsInfo;  ///< this and the next three: the profile's lists, as the tools print
    zemString m_virtualSerialAdaptersInfo;
    zemString m_virtualSCSIAdaptersInfo;
    zemString m_virtualEthetnetAdaptersInfo;
    int m_memoryPoolNum = 0;  ///< memory pools of the host
    zemDynamicArray<zemResourceRASettingData> m_RASDSet;
    zemDynamicArray<zemRASD> m_RASDs;
};

/// Owns a VSSD to the end of its scope.
struct ZEM_EXPORT zemVSSDFree {
    void operator()(zemVSSD* vssd) const { delete vssd; }
};
using zemVSSDAutoRelease = zemAutoRelease<zemVSSD, zemVSSDFree>;

#endif
