// What may be taken from pools, held against what the tools let partitions take; and what
// partitions have, held against the RASDs of the visitors.
#include <gtest/gtest.h>

#include <memory>
#include <set>
#include <tuple>

#include "ProviderHarness.h"
#include "ResourcePoolManager.h"
#include "ToolFolder.h"
#include "VirtualSystemVisitor.h"

namespace {

constexpr char kHost[] = "1111-AAA*0000001";
constexpr int kFull = VISITOR_TYPE_RASD_INIT;
constexpr const char* kPools[] = {"ORXC_ProcessorPool",   "ORXC_MemoryPool",
                                  "ORXC_IOSlotPool",      "ORXC_EthernetAdapterPool",
                                  "ORXC_SCSIAdapterPool", "ORXC_SerialAdapterPool"};

class ResourcePoolSettingDataTest : public testing::Test {
protected:
    /// The properties that @p show sets, as "name=value".
    template <class Show>
    std::string shown(Show show) {
        CmpiInstance instance = FromServer<CmpiInstance>(m_harness.disk({}));
        show(instance);
        std::string all;
        for (unsigned i = 0; i < instance.getPropertyCount(); ++i) {
            CmpiString name;
            const CmpiData value = instance.getProperty(static_cast<int>(i), &name);
            all += (i == 0 ? "" : " ") + std::string(name.charPtr()) + '=' +
                   std::string(zemBaseProvider::cmpidata2String(value));
        }
        all.erase(std::remove(all.begin(), all.end(), '"'), all.end());
        return all;
    }
    std::string shown(zemResourceRASettingData& data) {
        return shown([&](CmpiInstance& to) { data.addSpecificProperties(to, nullptr, ""); });
    }

    ToolFolder m_tools;
    Harness m_harness{cimom::Character::Lean};
};

/// The hosts of the appliance, with all that hangs on them.
struct Hosts {
    Hosts() {
        visitor->initialize("", false, zemCECVisitor::Level_All);
        for (const char* pools : kPools) {
            zemRPVisitor::readHosts(*visitor, pools, kFull);
        }
        visitor->initializeLparProfile("", "", zemCECVisitor::Level_All);
    }
    zemVirtualizationManager manager;
    std::unique_ptr<zemCECVisitor> visitor{manager.createCECVisitor({"", ""})};
};

// Of host alpha.
TEST_F(ResourcePoolSettingDataTest, WhatMayBeTaken) {
    // clang-format off
    const struct { const char *id, *units, *leaves[4]; } rows[] = {
        {"D 3-Primordial", "Percent", {" VirtualQuantity=100 Reservation=100", " VirtualQuantity=2150 Reservation=2150", " VirtualQuantity=100 VirtualMinimum=100 VirtualMaximum=200 Minimum=100 Reservation=100 Limit=200", " VirtualQuantity=100 Reservation=100"}},
        {"S 3-0", "Percent", {" VirtualQuantity=100 Reservation=5", " VirtualQuantity=43000 Reservation=2150", " VirtualQuantity=100 VirtualMinimum=100 VirtualMaximum=100 Minimum=5 Reservation=5 Limit=5", " VirtualQuantity=1 Reservation=1"}},
        {"S 3-1", "Percent", {" VirtualQuantity=100 Reservation=5", " VirtualQuantity=8500 Reservation=425", " VirtualQuantity=100 VirtualMinimum=100 VirtualMaximum=100 Minimum=5 Reservation=5 Limit=5", " VirtualQuantity=1 Reservation=1"}},
        {"D 4-Primordial", "byte*2^10", {" Reservation=262144", " Reservation=85983232", " Minimum=262144 Reservation=262144 Limit=524288", " Reservation=262144"}},
        {"S 4-0", "byte*2^10", {" VirtualQuantity=262144", " VirtualQuantity=134217728", " VirtualQuantity=262144 VirtualMinimum=262144 VirtualMaximum=524288", " VirtualQuantity=262144"}},
        {"D 12-Primordial", "Slot", {" Reservation=1", " Reservation=7", " Minimum=1 Reservation=1 Limit=1", " Reservation=1"}},
        {"D 10-Primordial", "Adapter", {" VirtualQuantity=1", " VirtualQuantity=65534", " VirtualQuantity=1 VirtualMinimum=1 VirtualMaximum=1", " VirtualQuantity=1"}},
        {"D 6-Primordial", "Adapter", {" VirtualQuantity=1", "", " VirtualQuantity=1 VirtualMinimum=1 VirtualMaximum=1", " VirtualQuantity=1"}},
        {"D 21-Primordial", "Adapter", {" VirtualQuantity=1", "", " VirtualQuantity=1 VirtualMinimum=1 VirtualMaximum=1", " VirtualQuantity=1"}},
    };
    // clang-format on
    m_tools.makeAppliance(ZEM_PROGRAMS);
    Hosts hosts;
    zemCEC& host = *hosts.visitor->getData(0);
    for (const int mode : {kFull, 50}) {
        const auto* row = rows;
        for (const char* pools : kPools) {
            zemRPVisitor visitor(&host, pools);
            visitor.initialize("", mode);
            for (int i = 0; i < visitor.size(); ++i, ++row) {
                const std::string id = row->id + 2, type = id.substr(0, id.find('-'));
                for (std::size_t role = ROLE_MIN; role <= ROLE_INC; ++role) {
                    static constexpr const char* kRoles[] = {"MIN:", "MAX:", "DEF:", "INC:"};
                    std::string expected = std::string("InstanceID=ORX:") + *row->id +
                                           kRoles[role] + id + '*' + kHost +
                                           " ResourceType=" + type;
                    if (mode == kFull) {
                        expected += std::string(" AllocationUnits=") + row->units +
                                    " PoolID=" + id.substr(type.size() + 1) + row->leaves[role];
                    }
                    auto& leaf = *visitor.getData(i)->getCapability()->m_SettingData[role];
                    EXPECT_EQ(expected, shown(leaf));
                    EXPECT_EQ(-1, leaf.initialize(nullptr, &host, "", mode));
                }
            }
        }
    }
}

// One partition holds 2.50 units, on a host with the pools 0 and 1, of which the latter may hold 3.
TEST_F(ResourcePoolSettingDataTest, WhatPartitionsLeave) {
    // clang-format off
    const struct { const char *free, *least, *pools, *pool, *state, *ofPartition; std::string units; } rows[] = {
        {"2.50", "0.05", "64", "Primordial", "Running", "0", "250 5"},
        {"2.50", "0.05", "64", "Primordial", "Not Activated", "0", "500 5"},
        {"0.29", "0.29", "64", "0", "Not Activated", "255", "279 29"},
        {"0.29", "", "64", "1", "Not Activated", "255", "279 0"},
        {"2.50", "", "64", "1", "Not Activated", "255", "300 0"},
        {"2.50", "0.1", "64", "1", "Not Activated", "1", "300 10"},
        {"2.50", "0.1", "64", "1", "Running", "1", "50 10"},
        {"-1.00", "nan", "64", "1", "Running", "0", "0 0"},
        {"1e300", "1e300", "64", "0", "Running", "1", "1000000000000 1000000000"},
        {"1.00", "0.1", "64", "7", "Running", "0", "Pool ID : 7"},
        {"1.00", "0.1", "64", "Primordial", "Running", "7", "Pool ID : 7"},
        {"1.00", "0.1", "1", "Primordial", "Running", "7", "100 10"},
    };
    // clang-format on
    for (const auto& row : rows) {
        zemCEC host(kHost, "alpha");
        zemSystemProcessorResource processors;
        processors.setPendAvailSysProcUnits(row.free);
        processors.setMinProcUnitsPerVirtualProc(row.least);
        processors.setMaxSharedProcPools(row.pools);
        host.setProcessor(processors);
        for (const char* id : {"0", "1"}) {
            auto pool = std::make_unique<zemProcessorPoolResource>();
            pool->setSharedProcPoolId(id);
            pool->setMaxPoolCapacity(*id == '0' ? "null" : "3.00");
            host.addProcessorPool(pool.release());
        }
        zemPartitionProcessorResource held;
        held.setCurrProcUnits("100");
        held.setPendProcUnits("250");
        held.setPendSharedProcPoolId(row.ofPartition);
        auto lpar = std::make_unique<zemLPAR>(kHost, "3");
        lpar->setState(row.state);
        lpar->setLparProcessor(held);
        host.addLpar(lpar.release());
        zemProcessorPool pool;
        pool.getData()->m_PoolID = row.pool;
        zemProcessorRASettingDataSharedMAX most;
        zemProcessorRASettingDataSharedMIN least;
        std::string seen = failureText([&] { most.initialize(&pool, &host, "", kFull); }, "t");
        if (seen.empty()) {
            least.initialize(&pool, &host, "", kFull);
            seen = std::to_string(most.m_ProcRASettingData.m_Reservation) + ' ' +
                   std::to_string(least.m_ProcRASettingData.m_Reservation);
        }
        EXPECT_EQ(zemString("ORX:SMAX:3-") + row.pool + "*" + kHost, most.getData()->m_InstanceID);
        EXPECT_EQ(row.units, seen) << row.free << row.pool << row.state;
    }
}

// From what hangs on partitions, and from what is asked for where nothing does.
TEST_F(ResourcePoolSettingDataTest, WhatPartitionsHave) {
    constexpr int kKinds = VISITOR_TYPE_RASD_PROC | VISITOR_TYPE_RASD_MEM |
                           VISITOR_TYPE_RASD_IOSLOT | VISITOR_TYPE_RASD_VSCSI |
                           VISITOR_TYPE_RASD_VSERIAL | VISITOR_TYPE_RASD_VETH;
    m_tools.makeAppliance(ZEM_PROGRAMS);
    Hosts hosts;
    for (const auto& [i, j] : {std::pair(0, 1), {0, 2}, {0, 3}, {0, 4}, {0, 5}, {1, 0}, {1, 3}}) {
        zemCEC& host = *hosts.visitor->getData(i);
        zemLPAR& hung = *host.getLPARs().getElementAt(j);
        std::set<std::string> expected;
        const auto expect = [&](zemVSSD* made) {
            const std::unique_ptr<zemVSSD> vssd(made);
            for (int k = 0; k < vssd->getRASDs().size(); ++k) {
                // The lists do not tell what slots are tagged for.
                if (auto* slot = dynamic_cast<zemIOSlotRASD*>(vssd->getRASDs()[k])) {
                    slot->m_Data.m_TaggedIOType = zemArray<int>();
                }
                const zemRASDCommData& data = *vssd->getRASDs()[k]->getData();
                zemResourceRASettingDataCommData identity;
                identity.m_InstanceID = data.m_InstanceID;
                identity.m_ResourceType = static_cast<CMPIUint16>(data.m_ResourceType);
                identity.m_AllocationUnits = data.m_AllocationUnits;
                expected.insert(shown([&](CmpiInstance& to) {
                    zemAddIdentity(to, nullptr, identity);
                    zemAddRASDProperties(to, nullptr, data);
                }));
            }
        };
        zemVSSDVisitor systems(&host, "");
        for (int k = 0; k < hung.getLparProfile().size(); ++k) {
            expect(systems.getProfileVSSD(&hung, hung.getLparProfile()[k], kKinds));
        }
        expect(systems.getStateVSSD(&hung, hung.getLparProfile()[0], kKinds));
        for (const bool isHung : {false, true}) {
            std::set<std::string> seen;
            const auto see = [&](zemVSSD& vssd) {
                for (int k = 0; k < vssd.getRASDSet().size(); ++k) {
                    seen.insert(shown(*vssd.getRASDSet()[k]));
                }
            };
            for (const char* kind : {"Processor", "Memory", "IOSlotAdapter", "SCSIAdapter",
                                     "SerialAdapter", "EthernetAdapter"}) {
                zemLPAR asked(host.getMTMS(), hung.getLparID());
                zemLPAR& lpar = isHung ? hung : asked;
                lpar.initialize(&host, "", zemString("ORXC_") + kind + "RASettingData", kFull);
                see(lpar.getStateVSSD());
                for (int k = 0; k < lpar.getDefinedVSSDs().size(); ++k) {
                    see(*lpar.getDefinedVSSDs()[k]);
                }
            }
            EXPECT_EQ(expected, seen) << isHung;
        }
    }
}

/// Settings of a profile: "min_<name>=<value>", and so on.
std::string edges(const char* name, const std::string& value) {
    std::string settings;
    for (const char* edge : {"min_", "desired_", "max_"}) {
        settings += std::string(",") + edge + name + '=' + value;
    }
    return settings;
}

std::string settingsOf(const zemResourcePool& pool, CMPIUint64 quantity, CMPIUint64 reservation) {
    if (pool.getData()->m_ResourceType == zemRASDKinds::memory.resourceType) {
        return (pool.isPrimordial() ? ",mem_mode=ded" : ",proc_mode=shared,mem_mode=shared") +
               edges("mem", std::to_string((quantity + reservation) >> 10));
    }
    const std::string procs = edges("procs", std::to_string(quantity / 100));
    if (pool.isPrimordial()) {
        return ",mem_mode=ded,proc_mode=ded" + procs;
    }
    const std::string digits = std::to_string(1000000 + reservation);
    return ",proc_mode=shared,sharing_mode=cap,shared_proc_pool_id=" +
           std::string(pool.getData()->m_PoolID) + procs +
           edges("proc_units", digits.substr(1, 4) + '.' + digits.substr(5));
}

// With the largest and the least some partition starts, and with a step beyond none does.
TEST_F(ResourcePoolSettingDataTest, TheToolsGiveTheLargestAndNoMore) {
    int count = 0;
    for (const char* how : {"init", "generate --force --hosts 2 --lpars 8 --seed 7"}) {
        m_tools.makeAppliance(ZEM_PROGRAMS, how);
        const std::string restore =
            "cp " + m_tools.file("before") + " $APPLIANCE_HOME/appliance.db";
        m_tools.run(
            "nwplat -r lpar -m alpha -i 'name=new,profile_name=p,lpar_env=tmxlinux,"
            "proc_mode=shared,sharing_mode=cap" +
            edges("mem", "256") + edges("procs", "1") + edges("proc_units", "0.1") +
            "'; cp $APPLIANCE_HOME/appliance.db " + m_tools.file("before"));
        Hosts hosts;
        for (int i = 0; i < hosts.visitor->size(); ++i) {
            zemCEC& host = *hosts.visitor->getData(i);
            const std::string on = " -m '" + std::string(host.getMTMS()) + "' ";
            const auto starts = [&](const std::string& settings) {
                for (int j = 0; j < host.getLPARs().size(); ++j) {
                    const zemLPAR& lpar = *host.getLPARs().getElementAt(j);
                    const std::string id(lpar.getLparID()), name(lpar.getDefaultProfileName());
                    if (!lpar.isActivated() &&
                        m_tools.run("edplat -r prof" + on + "-i '\"name=" + name + "\",lpar_id=" +
                                    id + settings + "' && edpower -r lpar" + on + "--id " + id +
                                    " -o on -f '" + name + "'; s=$?; " + restore + "; exit $s")
                                .exit == 0) {
                        return true;
                    }
                }
                return false;
            };
            if (host.getState() != "Operating" && host.getState() != "Standby") {
                continue;
            }
            for (const char* pools : {kPools[0], kPools[1]}) {
                zemRPVisitor visitor(&host, pools);
                visitor.initialize("", kFull);
                for (int j = 0; j < visitor.size(); ++j) {
                    const zemResourcePool& pool = *visitor.getData(j);
                    const auto data = [&](zemPoolRole role) -> zemPoolRASettingDataCommData& {
                        const auto& leaves = visitor.getData(j)->getCapability()->m_SettingData;
                        return dynamic_cast<zemPoolRASettingDataCommData&>(
                            *leaves[role]->getData());
                    };
                    const auto &most = data(ROLE_MAX), &least = data(ROLE_MIN),
                               &step = data(ROLE_INC);
                    const CMPIUint64 virtuals = most.m_VirtualQuantity,
                                     whole = pools == kPools[0] ? 100 : 262144;
                    const std::tuple<CMPIUint64, CMPIUint64, bool> rows[] = {
                        {virtuals, most.m_Reservation, true},
                        {virtuals + step.m_VirtualQuantity, most.m_Reservation + step.m_Reservation,
                         false},
                        {virtuals + whole, most.m_Reservation, false},
                        {least.m_VirtualQuantity, least.m_Reservation, true},
                        {least.m_VirtualQuantity - step.m_VirtualQuantity,
                         least.m_Reservation - step.m_Reservation, false},
                    };
                    for (const auto& [quantity, reservation, isTaken] : rows) {
                        EXPECT_EQ(isTaken, starts(settingsOf(pool, quantity, reservation)))
                            << most.m_InstanceID << ' ' << quantity << ' ' << reservation;
                        ++count;
                    }
                }
            }
        }
    }
    EXPECT_LT(50, count);
}

}  // namespace
