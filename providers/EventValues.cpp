#include "EventValues.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdlib>
#include <functional>
#include <vector>

#include "BaseProvider.h"
#include "PropertyRows.h"
#include "SystemConfig.h"

namespace {

using Names = zemWrtConstants;

/// Where an indication shows a value.
enum class Shown {
    Partition,  ///< in SourceInstance or PreviousInstance, as the partition's provider does
    Values,     ///< in Values or PreviousValues
    Indication  ///< in the indication itself
};

struct EventRow {
    zemString (*name)();  ///< what the event calls it
    const char* property;
    ValueKind kind;
    EventAspect aspect;
    Shown shown;
};

constexpr EventAspect kState = EventAspect::State, kResources = EventAspect::Resources,
                      kMove = EventAspect::Move;

constexpr EventRow kRows[] = {
    {Names::getUSER_DEFINED_NAME, "ElementName", ValueKind::Text, kState, Shown::Partition},
    {Names::getPARTITION_STATE, "State", ValueKind::Text, kState, Shown::Partition},
    {Names::getPARTITION_STATE, "EnabledState", ValueKind::EnabledState, kState, Shown::Partition},
    {Names::getOS_TYPE, "LparEnvironment", ValueKind::Text, kState, Shown::Partition},
    {Names::getREMOTERESTART_STATE, "RemoteRestartStatus", ValueKind::Text, kState,
     Shown::Partition},
    {Names::getOP_PANEL_VALUE, "ReferenceCode", ValueKind::Text, kState, Shown::Values},
    {Names::getMIGRATION_STATE, "MigrationState", ValueKind::Uint16, kState, Shown::Values},
    {Names::getPendAllocMem, "PendingMemory", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getCurAllocMem, "CurrentMemory", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getRuntimeMem, "RuntimeMemory", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getPendEntMem, "PendingEntitledMemory", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getCurrEntMem, "CurrentEntitledMemory", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getRuntimeEntMem, "RuntimeEntitledMemory", ValueKind::Uint32, kResources,
     Shown::Values},
    {Names::getPendVRMWeight, "PendingMemoryWeight", ValueKind::Uint16, kResources, Shown::Values},
    {Names::getCurrVRMWeight, "CurrentMemoryWeight", ValueKind::Uint16, kResources, Shown::Values},
    {Names::getRuntimeVRMWeight, "RuntimeMemoryWeight", ValueKind::Uint16, kResources,
     Shown::Values},
    {Names::getPendAllocProcs, "PendingProcessors", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getCurAllocProcs, "CurrentProcessors", ValueKind::Uint32, kResources, Shown::Values},
    {Names::getPendAllocProcUnits, "PendingProcessingUnits", ValueKind::Hundredths, kResources,
     Shown::Values},
    {Names::getCurAllocProcUnits, "CurrentProcessingUnits", ValueKind::Hundredths, kResources,
     Shown::Values},
    {Names::getPendSharingMode, "PendingSharingMode", ValueKind::Text, kResources, Shown::Values},
    {Names::getCurSharingMode, "CurrentSharingMode", ValueKind::Text, kResources, Shown::Values},
    {Names::getPendUncappedWeight, "PendingUncappedWeight", ValueKind::Uint16, kResources,
     Shown::Values},
    {Names::getCurUncappedWeight, "CurrentUncappedWeight", ValueKind::Uint16, kResources,
     Shown::Values},
    {Names::getUSER_DEFINED_NAME, "PartitionName", ValueKind::Text, kMove, Shown::Indication},
    {Names::getComputerSystemName, "DestinationHostName", ValueKind::Text, kMove,
     Shown::Indication},
    {Names::getCURRENT_MIGRATION_STATE, "State", ValueKind::Text, kMove, Shown::Indication},
    {Names::getTOTAL_BYTES, "TotalBytes", ValueKind::Uint64, kMove, Shown::Indication},
    {Names::getBYTES_SENT, "SentBytes", ValueKind::Uint64, kMove, Shown::Indication},
    {Names::getBYTES_LEFT, "LeftBytes", ValueKind::Uint64, kMove, Shown::Indication},
};

std::vector<PropertyRow> rowsShown(Shown where) {
    std::vector<PropertyRow> rows;
    for (const EventRow& row : kRows) {
        if (row.shown == where) {
            rows.push_back({row.property, row.kind, static_cast<int>(&row - kRows)});
        }
    }
    return rows;
}

/// The console tells states by number.
zemString wordOf(const EventRow& row, const zemString& value) {
    return row.name == Names::getPARTITION_STATE && value.isDigit()
               ? zemVirtualSystem::getStateByID(std::atoi(value))
               : value;
}

using Reader = std::function<zemString(const char* name)>;

std::unique_ptr<zemRecordType> readRecord(bool isMove, const Reader& read) {
    auto record = std::make_unique<zemRecordType>();
    for (const EventRow& row : kRows) {
        if ((row.aspect == kMove) == isMove) {
            record->insert(static_cast<int>(&row - kRows), wordOf(row, read(row.name())));
        }
    }
    return record;
}

Reader readerOf(const zemWRTEvent& event, jobject object) {
    return
        [&event, object](const char* name) { return event.getRClientObjectProperty(object, name); };
}

/// Of a table of texts and numbers.
Reader readerOfTable(const zemWRTEvent& event, jobject table) {
    return [java = event.getJvmHelper(), table](const char* name) {
        const jobject value = java->getValueOfHashtable(java->getEnv(), table, name);
        return value == nullptr ? zemString()
                                : java->getStringObjValue(java->getEnv(), value, true);
    };
}

bool isDifferent(const zemRecordType& before, const zemRecordType& after, EventAspect aspect) {
    return std::any_of(std::begin(kRows), std::end(kRows), [&](const EventRow& row) {
        const int number = static_cast<int>(&row - kRows);
        return row.aspect == aspect && !(before[number] == after[number]);
    });
}

void readMove(const zemWRTEvent& event, PartitionEvent& read) {
    if (const jobject table = event.getHashObject("getNewObject")) {
        const Reader reader = readerOfTable(event, table);
        read.partition = static_cast<const char*>(reader(Names::getNAME()));
        read.after = readRecord(true, reader);
    }
}

void readChange(const zemWRTEvent& event, PartitionEvent& read) {
    const jobject before = event.getOldRClientObject(), after = event.getNewRClientObject();
    for (const auto& [object, record] : {std::pair(before, &read.before), {after, &read.after}}) {
        if (object != nullptr) {
            const Reader reader = readerOf(event, object);
            read.partition = static_cast<const char*>(reader(Names::getNAME()));
            *record = readRecord(false, reader);
        }
    }
}

/// What the event tells of an ORXC_LPAR_CS, and nothing else: no default of the class.
CmpiInstance partitionIn(const CmpiObjectPath& path, const zemRecordType& record) {
    static const std::vector<PropertyRow> rows = rowsShown(Shown::Partition);
    std::vector<const char*> told = {"CreationClassName", "Name"};
    for (const PropertyRow& row : rows) {
        if (!record[row.attribute].isEmpty()) {
            told.push_back(row.property);
        }
    }
    told.push_back(nullptr);
    CmpiInstance instance = newInstance(path, told.data());
    setProperties(instance, rows, told.data(), record);
    return instance;
}

CmpiInstance valuesIn(const CmpiObjectPath& nearby, const zemRecordType& record) {
    static const std::vector<PropertyRow> rows = rowsShown(Shown::Values);
    CmpiInstance values(zemBaseProvider::createObjectPath(nearby, "ORXC_PartitionValues"));
    setProperties(values, rows, nullptr, record);
    return values;
}

void setPath(CmpiInstance& indication, const char* property, const CmpiObjectPath& path) {
    const zemString text = zemBaseProvider::objectPathToString(path);
    indication.setProperty(property, CmpiData(static_cast<const char*>(text)));
}

void showChange(CmpiInstance& indication, const CmpiObjectPath& path, const PartitionEvent& event) {
    const zemRecordType& source = event.after ? *event.after : *event.before;
    setPath(indication, "SourceInstanceModelPath", path);
    indication.setProperty("SourceInstance", CmpiData(partitionIn(path, source)));
    indication.setProperty("Values", CmpiData(valuesIn(path, source)));
    if (event.before && event.after) {
        indication.setProperty("PreviousInstance", CmpiData(partitionIn(path, *event.before)));
        indication.setProperty("PreviousValues", CmpiData(valuesIn(path, *event.before)));
    }
}

CMPIUint64 numberOf(const CmpiInstance& instance, const char* property) {
    const CmpiData value = instance.getProperty(property);
    return value.isNullValue() ? 0 : value.getUint64();
}

void showMove(CmpiInstance& indication, const CmpiObjectPath& path, const PartitionEvent& event) {
    static const std::vector<PropertyRow> rows = rowsShown(Shown::Indication);
    setPath(indication, "PartitionPath", path);
    setProperties(indication, rows, nullptr, *event.after);
    const auto sent = static_cast<double>(numberOf(indication, "SentBytes"));
    const auto total = static_cast<double>(numberOf(indication, "TotalBytes"));
    CmpiData percent;
    percent.setUint16(
        static_cast<CMPIUint16>(total > 0 ? std::lround(100 * std::min(sent / total, 1.0)) : 0));
    indication.setProperty("PercentComplete", percent);
}

}  // namespace

std::unique_ptr<PartitionEvent> readEvent(const zemWRTEvent& event, EventAspect aspect) {
    using std::chrono::microseconds;
    auto read = std::make_unique<PartitionEvent>();
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    read->time = static_cast<CMPIUint64>(std::chrono::duration_cast<microseconds>(now).count());
    aspect == kMove ? readMove(event, *read) : readChange(event, *read);
    const bool isModification = read->before && read->after;
    if (read->partition.empty() ||
        (isModification && !isDifferent(*read->before, *read->after, aspect))) {
        return nullptr;
    }
    return read;
}

CmpiInstance makeIndication(const CmpiObjectPath& nearby, const char* className, EventAspect aspect,
                            const PartitionEvent& event) {
    CmpiInstance indication(zemBaseProvider::createObjectPath(nearby, className));
    indication.setProperty("IndicationTime", CmpiData(CmpiDateTime(event.time, false)));
    const CmpiObjectPath path = systemPath(nearby, "ORXC_LPAR_CS", event.partition);
    aspect == kMove ? showMove(indication, path, event) : showChange(indication, path, event);
    return indication;
}
