// How settings are read: the VSSDs that the model holds, the readers of records, and the entries by
// keys, which read all that one VSSD needs.

#include <memory>
#include <vector>

#include "VirtualSystemVisitorAttributes.h"
#include "VirtualSystemVisitorCEC.h"
#include "VirtualSystemVisitorLPAR.h"
#include "VirtualSystemVisitorReaders.h"
#include "VirtualSystemVisitorRules.h"
#include "VirtualSystemVisitorVSSD.h"

namespace {

constexpr char kClass[] = "zemVSSDVisitor";

/// A partition's VSSD of the state side is there once it has an ID.
int stateCount(zemLPAR& lpar) { return lpar.getStateVSSD().getInstanceID().isEmpty() ? 0 : 1; }
int count(zemLPAR& lpar) { return stateCount(lpar) + lpar.getDefinedVSSDs().size(); }

/// What the tool that lists resources says of those that partitions have; nothing if it finds none.
template <class Resource>
zemRecordSetsType allocated(const zemOperEnv& env, const zemCEC& host, const zemString& filter,
                            zemRecordSetsType (zemQyallocCmdCaller::*query)(int*, const char*,
                                                                            const char*)) {
    std::vector<int> wanted = zemAttributesOf<Resource>();
    const zemString option = filter.isEmpty() ? filter : zemCommandCaller::quoted(filter);
    zemQyallocCmdCaller caller(env.m_userName, env.m_locale);
    return zemRecordsOf([&] { return (caller.*query)(wanted.data(), host.getMTMS(), option); });
}

zemLPARVisitor partitionsOf(zemCEC* host, const zemString& type, const zemOperEnv& env) {
    zemLPARVisitor visitor(host, type);
    visitor.setOperEnv(env);
    visitor.setLocale(env.m_locale);
    return visitor;
}

/// The partition of a result that names one; null if there is none.
apiProp* objectOf(const zemAutoReleaseApiProp& result) {
    return result.get() == nullptr ? nullptr : result.get() + 1;
}

/// What was asked for, in the words of failures.
zemString query(const char* resource, const zemString& filter, const zemString& mtms) {
    return zemString(resource) + " --filter " + filter + " -m " + mtms;
}

}  // namespace

int zemVSSDVisitor::initialize(const zemString& userName, int type) {
    m_lparIndex = m_firstIndex = 0;
    return partitionsOf(m_CEC, m_Type, m_Env).initialize(userName, type);
}

int zemVSSDVisitor::size() const {
    int total = 0;
    for (int i = 0; i < m_CEC->getLPARs().size(); ++i) {
        total += count(*m_CEC->getLPARs().getElementAt(i));
    }
    return total;
}

zemVSSD* zemVSSDVisitor::getData(int index) {
    if (index < m_firstIndex || index == 0) {
        m_lparIndex = m_firstIndex = 0;
    }
    for (; index >= 0 && m_lparIndex < m_CEC->getLPARs().size(); ++m_lparIndex) {
        zemLPAR& lpar = *m_CEC->getLPARs().getElementAt(m_lparIndex);
        const int inside = index - m_firstIndex;
        if (inside < count(lpar)) {
            const int defined = inside - stateCount(lpar);
            return defined < 0 ? &lpar.getStateVSSD()
                               : lpar.getDefinedVSSDs().getElementAt(defined);
        }
        m_firstIndex += count(lpar);
    }
    return nullptr;
}

zemVSSD* zemVSSDVisitor::getData(const zemString& id, zemCEC* cec) {
    zemVSSDVisitor all(cec, m_Type);
    for (int i = 0;; ++i) {
        zemVSSD* const vssd = all.getData(i);
        if (vssd == nullptr || vssd->getInstanceID() == id) {
            return vssd;
        }
    }
}

zemVSSD* zemVSSDVisitor::getData(const zemString& id, int type) {
    const zemVSSD named(m_CEC->getMTMS(), id);
    if (named.getLparID().isEmpty()) {
        return nullptr;
    }
    return named.isState() ? getStateVSSD(named.getLparID(), type)
                           : getProfileVSSD(named.getLparID(), named.getProfileName(), type);
}

zemVSSD* zemVSSDVisitor::getStateVSSD(const zemString& lparId, int type) {
    constexpr char kMethod[] = "getStateVSSD";
    const zemString mtms = m_CEC->getMTMS();
    const zemString filter = zemCommandCaller::filterItem("lpar_ids", lparId);
    zemAutoReleaseApiProp prop;
    const zemRecordSetsType lpars = getLparRecords(lparId, type, prop);
    zemExpectRecord(lpars, kClass, kMethod, query("qyplat -r lpar", filter, mtms));
    const std::unique_ptr<zemLPAR> lpar(
        partitionsOf(m_CEC, m_Type, m_Env).getLPAR(lpars.getElementAt(0)));
    const zemString profile = lpar->getCurrentProfileName();
    const zemRecordSetsType profiles = getProfileRecords(objectOf(prop), lparId, profile, type);
    zemExpectRecord(profiles, kClass, kMethod,
                    query("qyplat -r profile", filter + ",profile_names=" + profile, mtms));
    zemRecordSetsType processors;
    zemRecordSetsType memory;
    zemRecordSetsType slots;
    if (lpar->isActivated()) {
        processors = getProcRecords(filter);
        memory = getMemoryRecords(filter);
        slots = getIOSlotRecords(filter);
    }
    const zemRecordSetsType serial = getVSERIALRecords(filter);
    const zemRecordSetsType scsi = getVSCSIRecords(filter);
    zemRecordSetsType ethernet;
    getVETHRecords(objectOf(prop), lparId, ethernet);
    return getStateVSSD(*lpars.getElementAt(0), *profiles.getElementAt(0), processors, memory,
                        slots, serial, scsi, ethernet, type);
}

zemVSSD* zemVSSDVisitor::getProfileVSSD(const zemString& lparId, const zemString& profileName,
                                        int type) {
    constexpr char kMethod[] = "getProfileVSSD";
    const zemString mtms = m_CEC->getMTMS();
    zemAutoReleaseApiProp prop;
    const zemRecordSetsType lpars = getLparRecords(lparId, type, prop);
    zemExpectNoMore(lpars, kClass, kMethod, "getLparObj with lpar id " + lparId + " on " + mtms);
    zemRecordSetsType profiles;
    if (lpars.size() != 0) {
        profiles = getProfileRecords(objectOf(prop), lparId, profileName, type);
    }
    zemExpectRecord(
        profiles, kClass, kMethod,
        "getLparProfile for profile name " + profileName + " of lpar " + lparId + " on " + mtms);
    return getProfileVSSD(*lpars.getElementAt(0), *profiles.getElementAt(0), type);
}

zemRecordSetsType zemVSSDVisitor::getLparRecords(const zemString& lparId, int type,
                                                 zemAutoReleaseApiProp& prop) {
    return partitionsOf(m_CEC, m_Type, m_Env).getLparRecords(lparId, type, prop);
}

zemRecordSetsType zemVSSDVisitor::getProfileRecords(apiProp* /*prop*/, const zemString& lparId,
                                                    const zemString& profileName, int /*type*/) {
    constexpr int kEverything = 2;
    static constexpr zemApiReader kReader = {kClass, "getProfileRecords", "getLparProfile", nullptr,
                                             true};
    const zemString mtms = m_CEC->getMTMS();
    const zemApiObjects objects(
        kReader, zemApiCaller().getLparProfile(m_Env.m_userName, lparId + "*" + mtms, profileName,
                                               kEverything));
    zemRecordSetsType records;
    for (apiProp& object : objects) {
        zemPartitionProfileConfiguration profile(mtms, lparId);
        zemReadProfile(object, profile);
        records.addElement(std::make_unique<zemRecordType>(zemRecordOf(profile)));
    }
    return records;
}

zemRecordSetsType zemVSSDVisitor::getProcRecords(const zemString& filter) {
    return allocated<zemPartitionProcessorResource>(
        m_Env, *m_CEC, filter, &zemQyallocCmdCaller::getPartitionProcessorResources);
}

zemRecordSetsType zemVSSDVisitor::getMemoryRecords(const zemString& filter) {
    return allocated<zemPartitionMemoryResource>(m_Env, *m_CEC, filter,
                                                 &zemQyallocCmdCaller::getPartitionMemoryResources);
}

zemRecordSetsType zemVSSDVisitor::getIOSlotRecords(const zemString& filter) {
    return allocated<zemPartitionIOSlotResource>(m_Env, *m_CEC, filter,
                                                 &zemQyallocCmdCaller::getPhysicalIOSlotResources);
}

zemRecordSetsType zemVSSDVisitor::getVSCSIRecords(const zemString& filter) {
    return allocated<zemPartitionSCSIAdapterResource>(
        m_Env, *m_CEC, filter, &zemQyallocCmdCaller::getPartitionVirtualSCSIResources);
}

zemRecordSetsType zemVSSDVisitor::getVSERIALRecords(const zemString& filter) {
    return allocated<zemPartitionSerialAdapterResource>(
        m_Env, *m_CEC, filter, &zemQyallocCmdCaller::getPartitionVirtualSerialResources);
}

int zemVSSDVisitor::getVETHRecords(apiProp* /*prop*/, const zemString& lparId,
                                   zemRecordSetsType& out) {
    const zemCECVisitor reader(nullptr, m_Type);
    const auto adapters = reader.getAllEthernetAdapterLevelLparByKeys(
        m_Env.m_userName, zemCECVisitor::Level_All, m_CEC->getMTMS(), lparId);
    out.clear();
    for (int i = 0; i < adapters.size(); ++i) {
        out.addElement(std::make_unique<zemRecordType>(zemRecordOf(*adapters.getElementAt(i))));
    }
    return 0;
}

zemRecordSetsType zemVSSDVisitor::getResultForLPAR(const zemRecordSetsType& records,
                                                   const zemString& lparId) {
    constexpr int kLparId = 0;  // in all tables that have it, but that of migrations
    constexpr int kGrow = 25;
    zemRecordSetsType found(0, kGrow, 0);
    for (int i = 0; i < records.size(); ++i) {
        if (zemAttributes(*records.getElementAt(i))[kLparId] == lparId) {
            found.addElement(records.getElementAt(i));
        }
    }
    return found;
}
