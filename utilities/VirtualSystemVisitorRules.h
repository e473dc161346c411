/// The rules that decide a RASD: which values of a partition, or of one of its profiles, become
/// which of the RASD's. Private to the library.
///
/// Each kind has values that are the same whoever told them; functions take them from attributes of
/// what runs or of a profile, and one function makes the RASD's data of them:
///
///     zemDecideMemory(zemProfileMemory(zemAttributes(record), pools), rasd.m_Data);
///
/// Attributes come from tools and from the management library and may be any text: what is no
/// number counts as 0, and what is too large as the largest.
///
/// Functions of their arguments; any thread may call them.
#ifndef VIRTUAL_SYSTEM_VISITOR_RULES_H
#define VIRTUAL_SYSTEM_VISITOR_RULES_H

#include <cstdint>
#include <optional>

#include "RecordSets.h"
#include "StringUtils.h"
#include "VirtualSystemRepVSSD.h"
#include "VirtualSystemVisitorAttributes.h"

/// The least of something, how much there is, and the most.
struct zemQuantities {
    std::int64_t minimum = 0;
    std::int64_t quantity = 0;
    std::int64_t maximum = 0;
};

/// Processing units, a number with a point whatever the locale, as hundredths; halves go up.
std::int64_t zemHundredths(const zemString& units);

/// Hundredths of processors.
struct zemProcessorValues {
    bool isShared = false;
    zemString sharingMode;
    int weight = 0;          ///< counts for uncapped shared processors
    zemString poolID;        ///< this too, and the units, of shared processors alone
    zemQuantities virtuals;  ///< virtual processors
    zemQuantities units;     ///< what stands behind them
};

/// @param pools  how many shared pools the host may have; without any there is but one
zemProcessorValues zemRunningProcessor(const zemAttributes& processor);
zemProcessorValues zemProfileProcessor(const zemAttributes& profile, int pools);
void zemDecideProcessor(const zemProcessorValues& values,
                        zemProcessorRASD::zemProcessorRASDData& data);

/// Kilobytes.
struct zemMemoryValues {
    bool isShared = false;
    zemQuantities memory;
    std::int64_t entitled = -1;  ///< kept for I/O, and
    int weight = -1;             ///< share of the pool: of shared memory
};

/// @param pools  how many pools of memory the host may have; without any no memory is shared
zemMemoryValues zemRunningMemory(const zemAttributes& memory, int pools);
zemMemoryValues zemProfileMemory(const zemAttributes& profile, int pools);
void zemDecideMemory(const zemMemoryValues& values, zemMemoryRASD::zemMemoryRASDData& data);

/// What slots and adapters have in common.
void zemDecideAdapter(int isRequired, zemRASDCommData& data);

/// A serial or SCSI adapter and its partner.
struct zemRemoteValues {
    int slot = -1;
    int adapterType = -1;            ///< 0 server, 1 client
    zemString partition;             ///< the partner's number, unless the flag says that
    int anyPartition = 0;            ///< any may be the partner: 1, or 2 by the appliance's console
    std::optional<int> partnerSlot;  ///< none: any
};

zemRemoteValues zemRunningSerial(const zemAttributes& adapter);
zemRemoteValues zemRunningScsi(const zemAttributes& adapter);
void zemDecideRemote(const zemRemoteValues& values, zemRemoteAdapterRASDData& data);

/// An Ethernet adapter that runs.
void zemDecideEthernet(const zemAttributes& adapter, zemVETHRASD::zemVETHRASDData& data);

/// Gives the RASDs of @p vssd, which has its own, their instance IDs.
void zemNameRASDs(zemVSSD& vssd);

/// Expects one record.
/// @param cls,method  who reads
/// @param query  what was asked, in the words of the failures' texts
/// @throws zemObjectNotFoundException there is none
/// @throws zemInvalidParameterException there are several
void zemExpectRecord(const zemRecordSetsType& records, const char* cls, const char* method,
                     const zemString& query);
void zemExpectNoMore(const zemRecordSetsType& records, const char* cls, const char* method,
                     const zemString& query);

#endif
