/// What the appliance manages as objects: the appliance itself, its hosts, their partitions, and
/// the stored profiles of partitions.
///
///     zemHostSystem host = zemManagerSystem::getHostSystemByName(mtms, userName, locale);
///     zemVirtualSystem partition = host.getVirtualSystemById("3");
///     partition.setName("web2");
///
/// An object reads what it lacks on the first question for it, identity and state (level 1) apart
/// from the rest (level 2), and never reads it again. Objects are values: a partition holds a copy
/// of its host and a profile one of its partition, so each stands alone. They ask under the user
/// and locale of the request that made them.
///
/// Reading throws what the management library's results raise (DNXApiCaller.h), changes and
/// queries what the tools' failures raise (CommandCaller.h); ids by which a tool says that there is
/// no such partition become zemObjectNotFoundException.
///
/// Thread-safety: none; objects belong to one operation. zemManagerSystem may be asked by any
/// thread.
#ifndef SYSTEM_CONFIG_H
#define SYSTEM_CONFIG_H

#include <sys/types.h>

#include <cstdio>
#include <string>

#include "CommandCaller.h"
#include "libapi.h"

class zemHostSystem;
class zemVirtualSystem;
class zemVirtualSystemProfile;

/// An object that reads what it lacks from the management library.
class ZEM_EXPORT zemConfigObject {
public:
    enum OP_LEVEL { OP_LEVEL_1 = 1, OP_LEVEL_2 = 2, OP_LEVEL_ALL = 3 };

    virtual ~zemConfigObject();

    void setLocale(const char* locale) { m_locale = locale; }

    /// The user under whom this object asks.
    zemString getAuthorizedUser() const { return m_requestUserContext; }

protected:
    zemConfigObject() = default;
    zemConfigObject(const char* requestUserContext, const char* locale);
    zemConfigObject(const zemConfigObject&) = default;
    zemConfigObject& operator=(const zemConfigObject&) = default;

    /// Reads @p level, 1 or 2, unless that has been read.
    void need(OP_LEVEL level);

    /// The detail that the library is asked for: level 2 comprises level 1, so it is all.
    static int detailOf(OP_LEVEL level) { return level == OP_LEVEL_ALL ? OP_LEVEL_2 : level; }

    bool m_gotLevel1 = false;
    bool m_gotLevel2 = false;
    zemString m_requestUserContext;
    zemString m_locale;

private:
    /// Reads this object.
    virtual void updateData(OP_LEVEL level) = 0;
};

/// What is known of the appliance itself.
class ZEM_EXPORT zemManagerSystem {
public:
    zemManagerSystem() = delete;

    /// Whether partitions can move to hosts of another appliance.
    /// @throws zemOperationFailedException the tool tells nothing
    static bool isEnableRemoteRelocation(const char* requestUserContext);

    /// All hosts, and the one whose key is @p name.
    static zemDynamicArray<zemHostSystem> getAllHostSystem(const char* requestUserContext,
                                                           const char* locale = nullptr);
    static zemHostSystem getHostSystemByName(const zemString& name, const char* requestUserContext,
                                             const char* locale = nullptr);

    /// The partitions of the host @p mtms.
    static zemDynamicArray<zemVirtualSystem> getAllVirtualSystemByHostName(
        const char* requestUserContext, const zemString& mtms);

    /// The appliance's own key, read once in the life of the process; empty when it is not known.
    static zemString getMTMS(const char* requestUserContext);

    /// The key in the product data file @p fileName, which holds a line KEY=value for each datum.
    /// @return empty when there is no file, or its lines of type and serial number are not two
    static zemString getMTMSByName(const char* fileName);

    /// The appliance's unique identifier, kept from the first success on.
    /// @throws zemAccessDeniedException the product data file cannot be opened or has none
    static zemString getDNXUUID();
};

/// One managed host.
class ZEM_EXPORT zemHostSystem : public zemConfigObject {
public:
    zemHostSystem() = default;

    /// @param prop  the host as the management library gives it
    zemHostSystem(apiProp& prop, const char* requestUserContext, const char* locale);

    /// A host of which only the key is known.
    zemHostSystem(const zemString& mtms, const char* requestUserContext, const char* locale);
    zemHostSystem(const zemHostSystem&) = default;
    zemHostSystem& operator=(const zemHostSystem&) = default;
    ~zemHostSystem() override;

    /// The partitions of the host, and those among them that serve I/O to others.
    zemDynamicArray<zemVirtualSystem> getAllVirtualSystem();
    zemDynamicArray<zemVirtualSystem> getAllXBRG();

    /// One partition.
    /// @throws zemObjectNotFoundException there is none
    zemVirtualSystem getVirtualSystemByName(const zemString& lparName);
    zemVirtualSystem getVirtualSystemById(const zemString& lparId);

    zemString getSystemName();
    zemString getTypeModel();
    zemString getSerialNumber();
    zemString getPrimaryFSPIP();
    zemString getBackupFSPIP();
    bool getOsq00Capable();

    /// The key "<type model>*<serial number>".
    zemString getMTMS();

    /// The state as the library's number, and the words for such a number.
    int getState();
    static zemString getStateByID(int state);

    /// Whether the appliance has a connection to the host.
    bool isConnected();

    /// What the host allows of migrations, active and inactive.
    /// @throws zemOperationFailedException the tool tells nothing
    bool isEnableInactiveMigration();
    int getMaxInactiveMigrationNum();
    int getCurrentInactiveMigrationNum();
    bool isEnableActiveMigration();
    int getMaxActiveMigrationNum();
    int getCurrentActiveMigrationNum();

    /// Deletes a partition. Returns 0.
    int destoryVirtualSystem(const char* lparId);

    /// Makes a partition of attributes of zemNwplatCmdCaller::PartitionAttribute. Returns 0.
    int createVirtualSystem(const zemDynamicArray<tagAttributePair>& attrPairs);

    /// Whether no partition has this number; false also when the library cannot tell. Throws
    /// nothing.
    bool IsUnusedLparId(const zemString& lparId);

private:
    void updateData(OP_LEVEL level) override;
    void parseApiProp(apiProp& prop);
    void setMTMS(const zemString& mtms);
    zemString migrationCapability(int row, const char* method);

    /// The partitions of one environment, or all for null.
    zemDynamicArray<zemVirtualSystem> readPartitions(const char* method, const char* environment);

    static int m_managedSystemInfoAttr[];

    zemString m_name;
    int m_state = 0;
    zemString m_primaryFspIP;
    zemString m_backupFspIP;
    zemString m_typeModel;
    zemString m_serialNum;
    bool m_osq00Capable = false;
    zemString m_lparProcCompatModes;
    zemString m_ipmiPassThroughCapable;
};

/// One partition.
class ZEM_EXPORT zemVirtualSystem : public zemConfigObject {
public:
    zemVirtualSystem() = default;

    /// @param prop  the partition as the management library gives it; without @p host, the host is
    ///        taken from its key
    zemVirtualSystem(apiProp& prop, const zemHostSystem& host, const char* requestUserContext,
                     const char* locale);
    zemVirtualSystem(apiProp& prop, const char* requestUserContext, const char* locale);

    /// A partition of which only the number is known.
    zemVirtualSystem(const zemString& lparId, const zemHostSystem& host,
                     const char* requestUserContext, const char* locale);
    zemVirtualSystem(const zemVirtualSystem&) = default;
    zemVirtualSystem& operator=(const zemVirtualSystem&) = default;
    ~zemVirtualSystem() override;

    zemString getName();
    zemString getLparID() const { return m_lparId; }

    /// The key "<number>*<key of the host>", and the key of the host.
    zemString getLparIDAndMTMS();
    zemString getMTMS() { return m_hostSystem.getMTMS(); }

    /// The word for what runs in the partition: "tmxlinux", "xbrgserver", "osq00".
    zemString getEnv();
    bool isXBRG();
    bool isOSQ00();

    zemHostSystem getHostSystem() const { return m_hostSystem; }

    /// State and boot mode as the library's numbers, and the words for such numbers.
    int getState();
    static zemString getStateByID(int state);
    int getBootMode();
    static zemString getBootModeByID(int bootMode);

    /// Whether the partition is activated.
    bool isLive();

    /// Names of profiles; empty when there is none.
    zemString getDefaultProfileName();
    zemString getCurrentProfileName();

    zemString getProcCompatMode();

    /// The position of the keylock, 0 "norm", 1 "manual" or -1 unknown, and the word for such a
    /// number, "" for unknown ones.
    int getKeyLock();
    static zemString getKeyLockByID(int position);

    /// Whether errors are reported on two paths.
    bool getRedundantPath();

    /// The state of a migration: 0 unknown, 1 not migrating, 2 starting, 3 stopped, 4 in progress,
    /// 5 lost connection, 6 complete. Of this partition, of the library's number, of a tool's text;
    /// and the words for this partition's.
    int getMigrationState();
    static int getMigrationState(int number);
    static int getMigrationStateFromString(const zemString& text);
    zemString getMigrationStateString();

    /// Tries a move to @p targetHost.
    /// @param isCrossManager  the host belongs to the appliance @p targetManager
    /// @param userName  user on that appliance; null: not told to the tool. Both stand in the line
    ///        as they are: the caller quotes what may hold a blank, a quote or a backslash
    ///        (zemCommandCaller::quoted()).
    /// @return true
    /// @throws zemOperationFailedException it cannot be done: the id is the first word of the
    ///         tool's text
    bool validateMigratebility(const zemString& targetHost, bool isCrossManager,
                               const zemString& targetManager, const char* userName);

    /// Starts the move and returns 0 at once; the child and its stream belong to the caller
    /// (zemPropertiesHelper::asynExecuteCommand()).
    int migrateTo(const zemString& targetHost, bool isCrossManager, const zemString& targetManager,
                  const char* userName, pid_t* pid, FILE** fpOutput);

    /// Stops a move. Only @p timeOut counts, as the waitTime of
    /// zemPropertiesHelper::executeCommand(). Returns 0.
    /// @throws zemOperationFailedException as validateMigratebility() does
    int stopMigration(const zemString& targetHost, bool isCrossManager,
                      const zemString& targetManager, const char* userName, int timeOut);

    /// How much of a move is done, 0 to 90: the last tenth is what follows the transmission. -1
    /// when it cannot be told. Throws nothing.
    int getMigrationPercentComplete(const char* userName);

    /// Changes of the partition; @p keylockPos is a word of the tool's, as "norm". Each returns 0.
    /// @throws zemObjectNotFoundException there is no such partition
    int setDefaultProfile(const zemString& profileName);
    int setName(const zemString& systemName);
    int setKeylock(const zemString& keylockPos);

    /// The profiles of the partition: the one it runs with, the one it starts with, all, and one
    /// by its name.
    zemVirtualSystemProfile getCurrentProfile();
    zemVirtualSystemProfile getDefaultProfile();
    zemDynamicArray<zemVirtualSystemProfile> getAllVirtualSystemProfiles();
    zemVirtualSystemProfile getVirtualSystemProfileByName(const zemString& profileName);

private:
    friend class zemHostSystem;

    /// One attribute of zemQyplatCmdCaller::PartitionAttribute, asked of the tool.
    /// @throws zemObjectNotFoundException there is no such partition
    /// @throws zemInvalidParameterException id "INVALID_INDEX": there is no such attribute
    zemString getAttributeValue(int attributeIndex);

    /// The filter of the tools for this partition.
    zemString ownFilter() const;

    void updateData(OP_LEVEL level) override;
    void parseApiProp(apiProp& prop);
    int change(int attributeIndex, const zemString& value, const char* method);
    std::string moveLine(char operation, const zemString& targetHost, bool isCrossManager,
                         const zemString& targetManager, const char* userName);

    static int m_virtualSystemInfoAttr[];

    zemString m_lparId;
    zemString m_lparName;
    zemString m_lparEnv;
    int m_lparState = 0;
    int m_bootMode = 0;
    zemString m_defaultProfile;
    zemString m_currProfile;
    zemString m_procCompatMode;
    bool m_redundantPath = false;
    int m_lparKeylock = 0;
    int m_migrationState = 0;
    zemHostSystem m_hostSystem;
};

/// One stored profile of a partition.
class ZEM_EXPORT zemVirtualSystemProfile : public zemConfigObject {
public:
    enum IOResourceType : int {
        IORSC_TYPE_SCSIADAPTER = 0,
        IORSC_TYPE_SERIALADAPTER = 1,
        IORSC_TYPE_ETHERNETADAPTER = 2,
        IORSC_TYPE_IOSLOTADAPTER = 3
    };

    zemVirtualSystemProfile() = default;

    /// @param prop  the profile as the management library gives it
    zemVirtualSystemProfile(apiProp& prop, const zemVirtualSystem& virtualSystem,
                            const char* requestUserContext, const char* locale);

    /// A profile of which only the name is known.
    zemVirtualSystemProfile(const zemString& profileName, const zemVirtualSystem& virtualSystem,
                            const char* requestUserContext, const char* locale);
    zemVirtualSystemProfile(const zemVirtualSystemProfile&) = default;
    zemVirtualSystemProfile& operator=(const zemVirtualSystemProfile&) = default;
    ~zemVirtualSystemProfile() override;

    zemString getName() const { return m_profileName; }
    zemVirtualSystem getVirtualSystem() const { return m_virtualSystem; }

    bool getConnMonitoring();
    bool getAutoStart();
    int getBootMode();
    zemString getProcMode();
    zemString getSharingMode();

    /// How many virtual slots there may be; -1 where the library tells none.
    int getMaxVirtualSlots();

    /// Quantities as the library gives them, units in hundredths of a processor and memory in
    /// megabytes; -1 where it tells none.
    int getMinProcUnits();
    int getDesiredProcUnits();
    int getMaxProcUnits();
    int getMinProcs();
    int getDesiredProcs();
    int getMaxProcs();
    int getMinMem();
    int getDesiredMem();
    int getMaxMem();
    int getUncapWeight();

    /// Adapters and slots as lists in the tools' form; empty when there are none.
    zemString getVirtualSerialAdapterString();
    zemString getVirtualSCSIAdapterString();
    zemString getVirtualEthernetAdapterString();
    zemString getIOSlotAdapterString();

    /// One such list in its elements.
    /// @throws zemOperationFailedException id "INVALID_RECORD": the list ends inside quotes
    zemDynamicArray<zemString> getVirtualIOResources(IOResourceType rscType);

    /// Attributes of zemQyplatCmdCaller::PartitionProfileAttribute, asked of the tool: a record for
    /// a list that ends in -1, and a single value.
    /// @throws zemObjectNotFoundException there is no such profile
    /// @throws zemInvalidParameterException id "INVALID_INDEX": there is no such attribute
    zemRecordSetsType getAttributeValues(int* attributeIndex);
    zemString getAttributeValue(int attributeIndex);

    /// Changes of the profile, with attributes of zemEdplatCmdCaller::PartitionProfileAttribute:
    /// setting values, and adding to and removing from the lists of adapters. Each returns 0.
    int setName(const zemString& newName);
    int setAttributeValues(const zemDynamicArray<tagAttributePair>& attrPairs);
    int modifyVirtualSystemResources(const zemDynamicArray<tagAttributePair>& attrPairs);
    int addVirtualIOResources(const zemDynamicArray<tagAttributePair>& attrPairs);
    int removeVirtualIOResources(const zemDynamicArray<tagAttributePair>& attrPairs);

private:
    void updateData(OP_LEVEL level) override;
    void parseApiProp(apiProp& prop);
    int change(const zemDynamicArray<tagAttributePair>& attrPairs,
               zemCommandCaller::CH_OP_TYPE operation);

    zemString m_profileName;
    bool m_connMonitoring = false;
    int m_bootMode = 0;
    /// stays unset: the library has no such datum of profiles
    [[maybe_unused]] bool m_redundantPath = false;
    zemString m_virtualSerialAdapters;
    zemString m_virtualScsiAdapters;
    zemString m_virtualEthAdapters;
    zemString m_ioSlots;
    zemString m_procMode;
    zemString m_sharingMode;
    int m_minProcUnits = -1;
    int m_desiredProcUnits = -1;
    int m_maxProcUnits = -1;
    int m_minProcs = -1;
    int m_desiredProcs = -1;
    int m_maxProcs = -1;
    int m_minMem = -1;
    int m_desiredMem = -1;
    int m_maxMem = -1;
    int m_uncapWeight = -1;
    bool m_autoStart = false;
    zemVirtualSystem m_virtualSystem;
    int m_maxVirtualSlots = -1;
};

#endif
