// How the settings that a partition runs with are built.

#include <cctype>
#include <cstddef>
#include <memory>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include "Exception.h"
#include "NumberText.h"
#include "VirtualSystemVisitorAttributes.h"
#include "VirtualSystemVisitorRules.h"
#include "VirtualSystemVisitorVSSD.h"

namespace {

using Partition = zemPartitionAttribute;

constexpr char kClass[] = "zemVSSDVisitor";
constexpr char kMethod[] = "getStateVSSD";

/// The RASDs of a VSSD by key, in any case of letters; of two with one key the first counts. Most
/// classes look up none, for which no table is made.
class RasdsByKey {
public:
    explicit RasdsByKey(zemVSSD& vssd) : m_vssd(vssd) {}

    /// Null: there is none, or it is of another kind.
    template <class Rasd>
    const Rasd* find(const Rasd& like) {
        const zemDynamicArray<zemRASD>& rasds = m_vssd.getRASDs();
        for (; m_known < rasds.size(); ++m_known) {
            m_rasds.emplace(lower(rasds[m_known]->getKey()), rasds[m_known]);
        }
        const auto found = m_rasds.find(lower(like.m_Data.getKey()));
        return found == m_rasds.end() ? nullptr : dynamic_cast<const Rasd*>(found->second);
    }

private:
    static std::string lower(const zemString& key) {
        std::string text(static_cast<const char*>(key));
        for (char& c : text) {
            c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
        }
        return text;
    }

    zemVSSD& m_vssd;
    int m_known = 0;
    std::unordered_map<std::string, const zemRASD*> m_rasds;
};

/// What is known of a partition that runs.
struct Running {
    zemAttributes lpar;
    bool isModel;  ///< told by the model, not by records
    std::vector<zemAttributes> processors;
    std::vector<zemAttributes> memory;
    std::vector<zemAttributes> slots;
    std::vector<zemAttributes> serial;
    std::vector<zemAttributes> scsi;
    std::vector<zemAttributes> ethernet;
};

template <class Object>
std::vector<zemAttributes> attributesOf(const zemDynamicArray<Object>& objects) {
    std::vector<zemAttributes> all;
    all.reserve(static_cast<std::size_t>(objects.size()));
    for (int i = 0; i < objects.size(); ++i) {
        all.emplace_back(*objects.getElementAt(i));
    }
    return all;
}

bool isActivated(const zemAttributes& lpar) {
    return lpar[Partition::ATTR_STATE].find("Not Activated") < 0;
}

/// The one record of processors or memory that a partition may have; one that is not activated has
/// none, whatever is told of it.
/// @throws zemInvalidParameterException there are several
std::vector<zemAttributes> onlyOne(const zemRecordSetsType& records, const char* resource,
                                   const zemAttributes& lpar, const zemString& mtms) {
    if (!isActivated(lpar)) {
        return {};
    }
    zemExpectNoMore(
        records, kClass, kMethod,
        zemString(resource) + " for lpar(" + lpar[Partition::ATTR_LPAR_ID] + ") -m " + mtms);
    return attributesOf(records);
}

class StateBuilder {
public:
    /// @param profile  the VSSD of the profile that runs
    StateBuilder(zemCEC& host, const Running& running, zemVSSD& profile)
        : m_host(host), m_running(running), m_profile(profile), m_stored(profile) {}

    std::unique_ptr<zemVSSD> build() {
        makeVSSD();
        if (isActivated(m_running.lpar)) {
            addProcessor();
            addMemory();
            addSlots();
        }
        addSerial();
        addScsi();
        addEthernet();
        zemNameRASDs(*m_vssd);
        return std::move(m_vssd);
    }

private:
    void makeVSSD() {
        const zemAttributes& lpar = m_running.lpar;
        const zemString& current = lpar[Partition::ATTR_CURR_PROFILE];
        const zemString& defaultName = lpar[Partition::ATTR_DEFAULT_PROFILE];
        m_vssd = std::make_unique<zemVSSD>(
            lpar[Partition::ATTR_LPAR_ID], m_host.getMTMS(), lpar[Partition::ATTR_LPAR_ENV],
            zemNumberOf(lpar[Partition::ATTR_AUTO_START]), lpar[Partition::ATTR_NAME], current,
            lpar[Partition::ATTR_BOOT_MODE], m_profile.getEnableConnectionMonitoring() ? 1 : 0,
            zemString::equalsIgnoreCase(current, defaultName) ? 1 : 0,
            m_profile.getMaxVirtualSlots(),
            zemNumberOf(lpar[Partition::ATTR_REDUNDANT_ERR_PATH_REPORTING]),
            lpar[Partition::ATTR_LPAR_KEYLOCK], defaultName);
        m_vssd->GenerateInstanceID(true);
    }

    /// The mode with which processors are compatible: what is asked of the partition, or, as
    /// records do not tell that in the words of profiles, what the profile has.
    zemString compatMode(const zemProcessorRASD& running) {
        const zemProcessorRASD* const stored = m_stored.find(running);
        if (m_running.isModel) {
            if (stored == nullptr) {
                throw zemInvalidParameterException(
                    kClass, kMethod,
                    "Error occured when retrieving processor configuration information from "
                    "profile " +
                        m_profile.getProfileName() + " for lpar " + m_vssd->getLparID() +
                        " on host " + m_host.getMTMS());
            }
            return m_running.lpar[Partition::ATTR_DESIRED_LPAR_PROC_COMPAT_MODE];
        }
        return stored == nullptr || stored->m_Data.m_ProcCompatMode.isEmpty()
                   ? zemString("default")
                   : stored->m_Data.m_ProcCompatMode;
    }

    void addProcessor() {
        for (const zemAttributes& processor : m_running.processors) {
            auto rasd = std::make_unique<zemProcessorRASD>();
            zemDecideProcessor(zemRunningProcessor(processor), rasd->m_Data);
            rasd->m_Data.m_ProcCompatMode = compatMode(*rasd);
            m_vssd->addRASD(rasd.release());
        }
    }

    void addMemory() {
        const int pools = zemNumberOf(m_host.getMemoy().getMaxMemPools());
        for (const zemAttributes& memory : m_running.memory) {
            auto rasd = std::make_unique<zemMemoryRASD>();
            zemDecideMemory(zemRunningMemory(memory, pools), rasd->m_Data);
            m_vssd->addRASD(rasd.release());
        }
    }

    void addSlots() {
        for (const zemAttributes& slot : m_running.slots) {
            auto rasd = std::make_unique<zemIOSlotRASD>();
            rasd->m_Data.m_DRCIndex = slot[zemSlotAttribute::ATTR_DRC_INDEX];
            const zemIOSlotRASD* const stored = m_stored.find(*rasd);
            zemDecideAdapter(stored == nullptr ? 0 : stored->m_Data.m_IsRequired, rasd->m_Data);
            if (stored != nullptr) {
                rasd->m_Data.m_TaggedIOType = stored->m_Data.m_TaggedIOType;
            }
            m_vssd->addRASD(rasd.release());
        }
    }

    void addSerial() {
        for (const zemAttributes& adapter : m_running.serial) {
            auto rasd = std::make_unique<zemVSERIALRASD>();
            zemDecideRemote(zemRunningSerial(adapter), rasd->m_Data);
            zemDecideAdapter(zemNumberOf(adapter[zemSerialAttribute::ATTR_IS_REQUIRED]),
                             rasd->m_Data);
            m_vssd->addRASD(rasd.release());
        }
    }

    /// Of records, the profile says whether an adapter is required.
    void addScsi() {
        for (const zemAttributes& adapter : m_running.scsi) {
            auto rasd = std::make_unique<zemVSCSIRASD>();
            zemDecideRemote(zemRunningScsi(adapter), rasd->m_Data);
            int isRequired = zemNumberOf(adapter[zemScsiAttribute::ATTR_IS_REQUIRED]);
            if (!m_running.isModel) {
                const zemVSCSIRASD* const stored = m_stored.find(*rasd);
                isRequired = stored == nullptr ? 0 : stored->m_Data.m_IsRequired;
            }
            zemDecideAdapter(isRequired, rasd->m_Data);
            m_vssd->addRASD(rasd.release());
        }
    }

    /// Of records, only adapters of the profile count, which tells the virtual switch.
    void addEthernet() {
        for (const zemAttributes& adapter : m_running.ethernet) {
            auto rasd = std::make_unique<zemVETHRASD>();
            zemDecideEthernet(adapter, rasd->m_Data);
            if (!m_running.isModel) {
                const zemVETHRASD* const stored = m_stored.find(*rasd);
                if (stored == nullptr) {
                    continue;
                }
                rasd->m_Data.m_vswitch = stored->m_Data.m_vswitch;
            }
            m_vssd->addRASD(rasd.release());
        }
    }

    zemCEC& m_host;
    const Running& m_running;
    zemVSSD& m_profile;
    RasdsByKey m_stored;
    std::unique_ptr<zemVSSD> m_vssd;
};

template <class Source>
bool decideProcessor(const Source* source, zemProcessorRASD::zemProcessorRASDData* data) {
    if (source == nullptr || data == nullptr) {
        return false;
    }
    zemDecideProcessor(zemRunningProcessor(zemAttributes(*source)), *data);
    return true;
}

template <class Source>
bool decideMemory(zemCEC& host, const Source* source, zemMemoryRASD::zemMemoryRASDData* data) {
    if (source == nullptr || data == nullptr) {
        return false;
    }
    const int pools = zemNumberOf(host.getMemoy().getMaxMemPools());
    zemDecideMemory(zemRunningMemory(zemAttributes(*source), pools), *data);
    return true;
}

}  // namespace

bool zemVSSDVisitor::getProcessorRASDData(const zemPartitionProcessorResource* source,
                                          zemProcessorRASD::zemProcessorRASDData* data) {
    return decideProcessor(source, data);
}

bool zemVSSDVisitor::getProcessorRASDData(const zemRecordType* source,
                                          zemProcessorRASD::zemProcessorRASDData* data) {
    return decideProcessor(source, data);
}

bool zemVSSDVisitor::getMemoryRASDData(const zemPartitionMemoryResource* source,
                                       zemMemoryRASD::zemMemoryRASDData* data) {
    return decideMemory(*m_CEC, source, data);
}

bool zemVSSDVisitor::getMemoryRASDData(const zemRecordType* source,
                                       zemMemoryRASD::zemMemoryRASDData* data) {
    return decideMemory(*m_CEC, source, data);
}

zemVSSD* zemVSSDVisitor::getStateVSSD(zemLPAR* lpar, zemPartitionProfileConfiguration* profile,
                                      int type) {
    if (lpar == nullptr) {
        const zemString lparID = profile == nullptr ? zemString() : profile->getLparID();
        throw zemInvalidParameterException(
            kClass, kMethod, "The lpar which lpar_id is " + lparID + " does not existed");
    }
    const std::unique_ptr<zemVSSD> stored(getProfileVSSD(lpar, profile, type));
    if (stored == nullptr) {
        throw zemInvalidParameterException(kClass, kMethod,
                                           "Error occurred when get the profile data of lpar(" +
                                               lpar->getLparID() + ") on host(" + m_CEC->getMTMS() +
                                               ").");
    }
    return getStateVSSD(lpar, *stored);
}

zemVSSD* zemVSSDVisitor::getStateVSSD(zemLPAR* lpar, zemVSSD& stored) {
    Running running = {zemAttributes(*lpar), true, {}, {}, {}, {}, {}, {}};
    if (lpar->isLparProcessorAvailable()) {
        running.processors.emplace_back(lpar->getLparProcessor());
    }
    if (lpar->isLparMemoryAvailable()) {
        running.memory.emplace_back(lpar->getLparMemory());
    }
    running.slots = attributesOf(lpar->getLparIOSlots());
    running.serial = attributesOf(lpar->getLparSerialAdapters());
    running.scsi = attributesOf(lpar->getLparSCSIAdapters());
    running.ethernet = attributesOf(lpar->getLparEthernetAdapters());
    return StateBuilder(*m_CEC, running, stored).build().release();
}

zemVSSD* zemVSSDVisitor::getStateVSSD(
    const zemRecordType& lparRecord, const zemRecordType& profileRecord,
    const zemRecordSetsType& procRecords, const zemRecordSetsType& memRecords,
    const zemRecordSetsType& ioSlotRecords, const zemRecordSetsType& serialRecords,
    const zemRecordSetsType& scsiRecords, const zemRecordSetsType& ethRecords, int type) {
    const std::unique_ptr<zemVSSD> stored(getProfileVSSD(lparRecord, profileRecord, type));
    const zemAttributes lpar(lparRecord);
    const zemString mtms = m_CEC->getMTMS();
    const Running running = {lpar,
                             false,
                             onlyOne(procRecords, "qyalloc -r proc", lpar, mtms),
                             onlyOne(memRecords, "qyalloc -r mem", lpar, mtms),
                             attributesOf(ioSlotRecords),
                             attributesOf(serialRecords),
                             attributesOf(scsiRecords),
                             attributesOf(ethRecords)};
    return StateBuilder(*m_CEC, running, *stored).build().release();
}
