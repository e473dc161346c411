/// zemVSSDVisitor: builds the settings of one partition of one host, with their RASDs: those that
/// the partition runs with (the state side), and those of one of its profiles (the defined side).
/// Profiles are changed here too, by VSSDs and RASDs of the same form.
///
/// Here a record of the back end becomes quantities: processors in hundredths, memory in kilobytes.
/// Each side has three entries that give the same RASDs but where it is said: by keys, which reads
/// all that is needed for that one partition; from the model, of which zemCECVisitor has read the
/// records of many partitions at once; and from records keyed by the attributes of the tools.
///
///     zemVSSDVisitor visitor(&host, "");
///     visitor.setOperEnv(userName, locale);
///     constexpr int kType = VISITOR_TYPE_RASD_PROC | VISITOR_TYPE_RASD_MEM;
///     std::unique_ptr<zemVSSD> running(visitor.getStateVSSD("3", kType));
///     puts(running->getRASD("3-Processor")->getData()->m_InstanceID);
///
/// A type is a sum of VMVisitorType: the bits VISITOR_TYPE_RASD_... say which kinds of RASDs a
/// profile gets. Whether a host has pools is what its records of processors and memory say: a host
/// of which they were not read has none.
///
/// VSSDs and RASDs that are built are the caller's; those of the model are the model's.
///
/// Operations throw what tools (CommandCaller.h) and the management library raise, the latter as
/// zemAccessDeniedException for a user who may not read and zemOperationFailedException for any
/// other failure. That a tool or the library finds nothing gives no records.
///
/// Thread-safety: none; a visitor belongs to one operation.
#ifndef VIRTUAL_SYSTEM_VISITOR_VSSD_H
#define VIRTUAL_SYSTEM_VISITOR_VSSD_H

#include "CommandCaller.h"
#include "DNXApiCaller.h"
#include "RecordSets.h"
#include "StringUtils.h"
#include "VirtualSystemRep.h"
#include "VirtualSystemVisitorManager.h"
#include "ZemExport.h"

class ZEM_EXPORT zemVSSDVisitor {
public:
    /// @param cec  the host, not null; outlives the visitor
    /// @param type  CIM class whose instances are wanted
    zemVSSDVisitor(zemCEC* cec, const zemString& type) : m_CEC(cec), m_Type(type) {}

    void setOperEnv(const zemOperEnv& env) { m_Env = env; }
    void setOperEnv(const zemString& user, const zemString& locale) { m_Env = {user, locale}; }

    // --- The VSSDs of the model

    /// Fills the host with its partitions and their VSSDs; as zemLPARVisitor::initialize().
    int initialize(const zemString& userName, int type);

    /// The VSSDs that the host's partitions hold, in the order of the partitions, the one of the
    /// state side in front of a partition's others: how many, and one by its position, null
    /// outside of them. Walking upwards does not start anew at each: who changes the partitions
    /// starts at 0 again.
    int size() const;
    zemVSSD* getData(int index);

    /// The VSSD with this instance ID: among those of a host's partitions, null if there is none;
    /// or built anew, null for an ID of neither side.
    /// @throws zemInvalidParameterException @p id is not of the visitor's host
    /// @throws what the entries by keys throw
    zemVSSD* getData(const zemString& id, zemCEC* cec);
    zemVSSD* getData(const zemString& id, int type);

    // --- By keys

    /// @throws zemObjectNotFoundException there is no such partition, or no profile of that name;
    ///         for the state side, of the partition's current one
    /// @throws zemInvalidParameterException there is more than one
    zemVSSD* getStateVSSD(const zemString& lparId, int type);
    zemVSSD* getProfileVSSD(const zemString& lparId, const zemString& profileName, int type);

    // --- From the model

    /// Null for a null argument. A slot's tags are those of all tagged slots of the profile.
    /// @throws as createIORASDs()
    zemVSSD* getProfileVSSD(zemLPAR* lpar, zemPartitionProfileConfiguration* profile, int type);

    /// From the records that hang on @p lpar; of a partition that is not activated, only adapters.
    /// @param profile  the current one; it lends what the partition does not tell
    /// @throws zemInvalidParameterException an argument is null, or there is a record of processors
    ///         and @p type does not ask for them
    zemVSSD* getStateVSSD(zemLPAR* lpar, zemPartitionProfileConfiguration* profile, int type);

    /// The same for who has built the VSSD of the current profile anyhow, which stays as it is.
    /// @param lpar  not null
    /// @throws zemInvalidParameterException there is a record of processors and @p stored has none
    zemVSSD* getStateVSSD(zemLPAR* lpar, zemVSSD& stored);

    // --- From records

    /// @param lparRecord  as getLparRecords() gives it
    /// @param profileRecord  as getProfileRecords() gives it
    zemVSSD* getProfileVSSD(const zemRecordType& lparRecord, const zemRecordType& profileRecord,
                            int type);

    /// An Ethernet adapter that is not in the profile too is left out.
    /// @throws zemInvalidParameterException there are several records of processors or memory
    zemVSSD* getStateVSSD(const zemRecordType& lparRecord, const zemRecordType& profileRecord,
                          const zemRecordSetsType& procRecords, const zemRecordSetsType& memRecords,
                          const zemRecordSetsType& ioSlotRecords,
                          const zemRecordSetsType& serialRecords,
                          const zemRecordSetsType& scsiRecords, const zemRecordSetsType& ethRecords,
                          int type);

    // --- Readers

    /// As that of zemLPARVisitor.
    zemRecordSetsType getLparRecords(const zemString& lparId, int type,
                                     zemAutoReleaseApiProp& prop);

    /// One profile by the management library, keyed by
    /// zemQyplatCmdCaller::PartitionProfileAttribute.
    /// @param prop  the partition among those of getLparRecords(); the library of now does not need
    ///        it, and null will do
    /// @param type  has no effect
    zemRecordSetsType getProfileRecords(apiProp* prop, const zemString& lparId,
                                        const zemString& profileName, int type);

    /// What a partition has, by the tool "qyalloc", keyed by the attributes of
    /// zemQyallocCmdCaller for the resource and the level of partitions.
    /// @param filter  as for zemLPARVisitor::getLparRecords()
    zemRecordSetsType getProcRecords(const zemString& filter);
    zemRecordSetsType getMemoryRecords(const zemString& filter);
    zemRecordSetsType getIOSlotRecords(const zemString& filter);
    zemRecordSetsType getVSCSIRecords(const zemString& filter);
    zemRecordSetsType getVSERIALRecords(const zemString& filter);

    /// Its Ethernet adapters, by the management library, in the same form. Returns 0.
    /// @param prop  as for getProfileRecords()
    int getVETHRecords(apiProp* prop, const zemString& lparId, zemRecordSetsType& out);

    /// The records whose attribute "lpar_id" is @p lparId, in an array that does not own them.
    static zemRecordSetsType getResultForLPAR(const zemRecordSetsType& records,
                                              const zemString& lparId);

    // --- Rules

    /// What a record says of running processors and memory; false, and nothing is done, for null.
    bool getProcessorRASDData(const zemPartitionProcessorResource* source,
                              zemProcessorRASD::zemProcessorRASDData* data);
    bool getProcessorRASDData(const zemRecordType* source,
                              zemProcessorRASD::zemProcessorRASDData* data);
    bool getMemoryRASDData(const zemPartitionMemoryResource* source,
                           zemMemoryRASD::zemMemoryRASDData* data);
    bool getMemoryRASDData(const zemRecordType* source, zemMemoryRASD::zemMemoryRASDData* data);

    /// Adds a RASD to @p vssd for each element of a list of slots or adapters, in the form of
    /// VirtualSystemResourceAdapters.h. An element may stand in double quotes.
    /// @throws zemOperationFailedException id "INVALID_RECORD": quotes are not closed; the words
    ///         are what is left of the list, and what stood before it has been added
    static void createIORASDs(const zemString& setting, int resourcetype, zemVSSD* vssd);

    /// A RASD of one element; null for an empty one, and for a type that is neither slot nor
    /// adapter.
    /// @throws zemInvalidParameterException quotes around a field are not closed
    static zemRASD* createIORASD(const zemString& element, int resourcetype);

    /// How shared processors are shared: "cap", "uncap", or "unknown" for another number.
    static zemString getSharingModeString(int sharingMode);

    /// What createIORASDs() takes apart: the slots or the adapters of @p vssd as a list, escaped to
    /// be a value of a change tool's line. An element with additional VLANs stands in quotes, and
    /// so does one with a comma or a quote. A RASD's mark that it is required becomes 0 unless it
    /// is 1. Empty if there are none, and for a type that is neither slot nor adapter.
    static zemString getIOSettingString(zemVSSD* vssd, int resourcetype);

    /// The instance ID of the VSSD to which the RASD with the ID @p id belongs; empty unless it
    /// ends with the key of @p cec and has the form of its type.
    static zemString ConstructVSSDInstanceIDFromRASDInstanceID(zemCEC* cec, const zemString& id,
                                                               int resourceType);

    /// The resource type of a class of setting data, as 3 for "ORXC_ProcessorRASettingData",
    /// ignoring case.
    /// @throws zemInvalidParameterException there is no such class
    static int getResourceType(const zemString& className);

    // --- Changes of the model alone

    /// Appends @p vssd to the profiles' VSSDs of its partition, which owns it from there on; if the
    /// host has no such partition it stays the caller's. Returns 0.
    int addData(zemVSSD* vssd);

    /// Puts @p data in the place of the VSSD with its instance ID, if that has other settings
    /// (zemVSSD::hasSettingsOf()), and prints what it returns.
    /// @return 0: a profile's belongs to the partition now, and of the one that runs @p data has
    ///         handed its RASDs over; -1: there is none to change, and @p data is the caller's
    int modifyData(zemVSSD* data);

    /// Deletes the VSSD of a profile with this instance ID. Returns 0.
    int removeData(const zemString& id);

    // --- Changes of a profile, each by one line of a tool; the model stays as it is
    //
    // return: 0. throws: what the tool's failures raise (CommandCaller.h); it has changed nothing
    // then.

    /// Changes the resources of the profile that @p vssd names as its RASDs say: lists of slots and
    /// adapters get or lose elements or are set, and so are tagged slots; processors and memory are
    /// only set (CH_OP_MODIFY). What has no RASD, and what is empty or not set, stays.
    /// @throws zemInvalidParameterException there are several RASDs of processors or of memory
    int ModifyResourcesOfProfile(zemVSSD* vssd, zemCommandCaller::CH_OP_TYPE opType);
    int AddIOResources(zemVSSD* vssd);     ///< with CH_OP_ADD
    int RemoveIOResources(zemVSSD* vssd);  ///< with CH_OP_REMOVE

    /// Gives the profile @p name of the partition of @p vssd the settings and the name of @p vssd.
    int ModifySystemSetting(zemVSSD* vssd, const zemString& name);

    /// Deletes a profile, which is neither the partition's default nor its current one.
    int deleteLparProfile(const zemString& mtms, const zemString& lparId, const zemString& profile);

private:
    zemOperEnv m_Env;
    zemCEC* m_CEC;
    zemString m_Type;

    /// Where getData(index) was last: a partition, and the position of its first VSSD.
    int m_lparIndex = 0;
    int m_firstIndex = 0;
};

#endif
