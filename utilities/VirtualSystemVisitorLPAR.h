/// zemLPARVisitor: reads and changes the partitions of one host.
///
/// initialize() fills the host's array with all of them; getData() with keys reads a single one
/// anew, with what it can change while it runs. Records are keyed by
/// zemQyplatCmdCaller::PartitionAttribute, whether a tool or the management library told them, and
/// hold the tools' words.
///
///     zemLPARVisitor visitor(&host, "");
///     visitor.setOperEnv(userName, locale);
///     std::unique_ptr<zemLPAR> lpar(visitor.getData(&host, "3", ""));
///     puts(lpar->getState());
///
/// Whoever is handed a partition by one of the reading forms deletes it; those of the array are the
/// host's. Operations throw what tools (CommandCaller.h) and the management library raise; the
/// library's failures bear the class "zemVSSDVisitor", by which clients know them. That either
/// finds nothing gives no records.
///
/// Thread-safety: none; a visitor belongs to one operation.
#ifndef VIRTUAL_SYSTEM_VISITOR_LPAR_H
#define VIRTUAL_SYSTEM_VISITOR_LPAR_H

#include <sys/types.h>

#include <cstdio>

#include "CommandCaller.h"
#include "DNXApiCaller.h"
#include "RecordSets.h"
#include "StringUtils.h"
#include "VirtualSystemRep.h"
#include "VirtualSystemVisitorManager.h"
#include "ZemExport.h"

class ZEM_EXPORT zemLPARVisitor {
public:
    /// @param cec  the host, not null; outlives the visitor
    /// @param type  CIM class whose instances are wanted
    zemLPARVisitor(zemCEC* cec, const zemString& type) : m_CEC(cec), m_Type(type) {}

    void setOperEnv(const zemOperEnv& env) { m_Env = env; }
    void setOperEnv(const zemString& user, const zemString& locale) { m_Env = {user, locale}; }

    /// Locale of the objects that initialize() asks; tools run under that of setOperEnv().
    void setLocale(const zemString& locale) { m_locale = locale; }

    /// Fills the host with its partitions, of which those before are dropped: key and state, and by
    /// zemLPAR::initialize() what @p type asks for.
    /// @param type  a VMVisitorType; beyond key and state, only the partial forms read
    /// @return 0
    /// @throws what the objects of SystemConfig.h and zemLPAR::initialize() throw
    int initialize(const zemString& userName, int type);

    /// The host's partitions: how many, and one by its position, null outside of them.
    int size() const { return m_CEC->getLPARs().size(); }
    zemLPAR* getData(int index) const { return m_CEC->getLPARs().getElementAt(index); }

    /// One partition, read anew by its number, or without one by its name; null without either.
    /// @param mtms  key of the visitor's host
    /// @param capability  not 0: the tool "qydyn" is asked what can change while it runs; of a
    ///        partition that it does not list nothing is taken
    /// @throws zemInvalidParameterException there is no such partition, or more than one
    zemLPAR* getData(zemCEC* cec, const zemString& lparId, const zemString& lparName) {
        return getData(cec->getMTMS(), lparId, lparName, 1);
    }
    zemLPAR* getData(const zemString& mtms, const zemString& lparId, const zemString& lparName,
                     int capability);

    /// A new partition of a record; null for null.
    zemLPAR* getLPAR(const zemRecordType* record) const;

    /// The records of partitions by the tools "qyplat" and "qymove". A partition's migration is in
    /// the record at the same place of the second tool's answer, and counts as "not migrating" if
    /// another one's stands there.
    /// @param filter  the tool's filter, made of zemCommandCaller::filterItem() and not quoted;
    ///        empty: all partitions of the host
    /// @param type  has no effect
    zemRecordSetsType getLparRecords(const zemString& filter, int type);

    /// The same by the management library, whose answer @p prop owns from there on.
    /// @param lparId  number of a partition, of which there may be none; empty: all of the host
    /// @throws zemAccessDeniedException the user may not read
    /// @throws zemOperationFailedException any other failure, and no answer
    zemRecordSetsType getLparRecords(const zemString& lparId, int type,
                                     zemAutoReleaseApiProp& prop);

    /// Changes of the host's array alone, by the partition's key "<number>*<key of the host>". Each
    /// returns 0.
    ///
    /// What is added is the host's. What modifies takes the place of the partition with its key,
    /// which is deleted; if there is none nothing happens, and @p lpar stays the caller's.
    int addData(zemLPAR* lpar, const zemString& userName);
    int removeData(const zemString& idmtms);
    int modifyData(zemLPAR* lpar);

    // --- Changes of the appliance, each by one line of a tool; the model stays as it is
    //
    // throws: what the tools' failures raise (CommandCaller.h).

    /// Deletes a partition with its profiles. Returns 0.
    int deleteLpar(const zemString& mtms, const zemString& lparId);

    /// Gives the partition of @p vssd its default profile and its name, by one line, and the
    /// position of its keylock, by another; each that is invalid stays as it is. Returns 0.
    /// @throws zemObjectNotFoundException of "zemVirtualSystem" and "setDefaultProfile": there is
    ///         no such host or partition
    int ModifyLparProperties(zemVSSD* vssd);

    /// Turns the keylock of the partition of @p vssd to "norm" or "manual". Returns 0.
    int ChangeKeyLock(zemVSSD* vssd, const zemString& keylock);

    // The resources of a partition that runs. With both of pid and fpOutput the tool works in the
    // background, and child and stream are the caller's (EdallocCmdCaller.h); with nulls it has
    // ended.

    /// Adds (CH_OP_ADD) or removes (CH_OP_REMOVE) the slot or adapter of @p rasd.
    /// @return 0; -1, and no tool runs, for other changes and other RASDs
    int ChangeRunningIOResource(const zemString& mtms, const zemString& lparid, zemRASD* rasd,
                                pid_t* pid, FILE** fpOutput, zemCommandCaller::CH_OP_TYPE op);

    /// Changes processors or memory from what @p rasdold says to what @p rasd says: their size, or
    /// if that stays their weight and the way of sharing. Quantities that are not set do not
    /// change.
    /// @return 0; -1, and no tool runs, when nothing is to change, and for other RASDs
    /// @throws zemOperationFailedException @p rasdold is neither shared nor dedicated
    /// @throws zemInvalidParameterException as removing processors does (EdallocCmdCaller.h)
    int ChangeRunningMemProcResource(const zemString& mtms, const zemString& lparid,
                                     zemRASD* rasdold, zemRASD* rasd, pid_t* pid, FILE** fpOutput);

    /// The management library's numbers as words for a user; "unknown", or for types "", for a
    /// number without one.
    static zemString getOSTypeString(int definitionState);
    static zemString getStateString(int state);
    static zemString getCompatModeString(int mode);
    static zemString getKeyLockString(int keylock);
    static zemString getBootModeString(int bootMode);

private:
    int indexOf(const zemString& idmtms) const;
    void readCapability(zemLPAR& lpar, const zemString& mtms) const;

    zemCEC* m_CEC;
    zemString m_Type;
    zemOperEnv m_Env;
    zemString m_locale;
};

#endif
