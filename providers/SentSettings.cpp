#include "SentSettings.h"

#include <algorithm>
#include <cstdlib>

#include "PropertyRows.h"

namespace {

std::string idOf(const CmpiInstance& instance) {
    CmpiData id;
    try {
        id = instance.getProperty("InstanceID");
    } catch (const CmpiStatus&) {
        return "";  // it was not given, in the way of some servers
    }
    const bool isText = !id.isNotFound() && !id.isNullValue() && id.getType() == CMPI_string;
    return isText ? id.getString().charPtr() : "";
}

bool isAmount(const zemRASD& resource) {
    return dynamic_cast<const zemProcessorRASD*>(&resource) != nullptr ||
           dynamic_cast<const zemMemoryRASD*>(&resource) != nullptr;
}

constexpr int kDedicated = 2;  ///< ConsumerVisibility of processors and memory that are one's own

[[noreturn]] void refuse(const char* why) {
    throw zemInvalidParameterException("SentSettings", "settleAmounts", why);
}

/// Of a dedicated resource a partition sees all that it has: what is said of one is meant of both.
/// Shared memory has its limits as it is seen, and none of what is held.
/// @param before  what the client did not say
void settleAmounts(const zemRASDCommData& before, zemRASD& resource) {
    using Data = zemRASDCommData;
    static constexpr std::int64_t Data::*kPairs[][2] = {
        {&Data::m_VirtualMinimum, &Data::m_Minimum},
        {&Data::m_VirtualQuantity, &Data::m_Reservation},
        {&Data::m_VirtualMaximum, &Data::m_Limit}};
    Data& now = *resource.getData();
    if (isAmount(resource) && now.m_ConsumerVisibility == kDedicated) {
        for (const auto& [seen, held] : kPairs) {
            if (now.*held == before.*held) {
                now.*held = now.*seen;
            } else if (now.*seen == before.*seen) {
                now.*seen = now.*held;
            }
            if (now.*seen != now.*held) {
                refuse("A dedicated resource is as much as it is seen.");
            }
        }
    } else if (dynamic_cast<const zemMemoryRASD*>(&resource) != nullptr &&
               (now.m_Minimum != before.m_Minimum || now.m_Limit != before.m_Limit)) {
        refuse("Shared memory has no Minimum and no Limit but VirtualMinimum and VirtualMaximum.");
    }
}

}  // namespace

std::vector<CmpiData> elementsOf(const CmpiArgs& in, const char* name) {
    const CmpiData value = argumentOf(in, name);
    if (value.isNullValue()) {
        return {};
    }
    if ((static_cast<unsigned>(value.getType()) & CMPI_ARRAY) == 0) {
        return {value};
    }
    std::vector<CmpiData> elements;
    const CmpiArray list = value.getArray();
    for (CMPICount i = 0; i < list.size(); ++i) {
        elements.push_back(list[i].getData());
    }
    return elements;
}

std::vector<Sent> sentIn(const CmpiArgs& in, const char* name, bool isResource) {
    std::vector<Sent> all;
    for (const CmpiData& element : elementsOf(in, name)) {
        if (element.isNullValue() || element.getType() != CMPI_instance) {
            return {};
        }
        const CmpiInstance instance = element.getInstance();
        const SettingClass* const row =
            settingClassNamed(instance.getObjectPath().getClassName().charPtr());
        if (row == nullptr || (row->resourceType != 0) != isResource) {
            return {};
        }
        all.push_back({instance, *row, idOf(instance)});
    }
    return all;
}

bool MeantResources::add(const One& one, const std::string& host) {
    const std::optional<SettingId> of = settingIdOf(one.row, one.id);
    if (!of || of->owner.host != host || (!all.empty() && of->system != system.system)) {
        return false;
    }
    system = *of;
    all.push_back(one);
    return true;
}

std::vector<const SettingClass*> MeantResources::classes() const {
    std::vector<const SettingClass*> rows;
    for (const One& each : all) {
        if (std::find(rows.begin(), rows.end(), &each.row) == rows.end()) {
            rows.push_back(&each.row);
        }
    }
    return rows;
}

PresentSettings readPresent(const CmpiContext& context, const SettingId& id,
                            const std::vector<const SettingClass*>& classes) {
    PresentSettings present;
    int type = 0;
    for (const SettingClass* row : classes) {
        type |= row->type;
    }
    const auto take = [&](zemCEC& host, std::unique_ptr<zemVSSD> system) {
        if (system->getInstanceID() != id.system.c_str()) {
            return;
        }
        if (!id.isState) {
            zemVSSDVisitor visitor(&host, "");
            visitor.setOperEnv(zemBaseProvider::getUserContext(context),
                               zemBaseProvider::getExternalLanguageName(context));
            present.stored.reset(
                visitor.getProfileVSSD(system->getLparID(), id.profile.c_str(), type));
            const zemString pools = host.getMemoy().getMaxMemPools();
            present.stored->setMemoryPoolNum(static_cast<int>(std::strtol(pools, nullptr, 10)));
        }
        present.shown = std::move(system);
    };
    try {
        readSettings(context, id.owner, classes, take);
    } catch (const zemException& e) {
        if (!isUnknownObject(e)) {
            throw;
        }
    }
    return present;
}

zemRASD* resourceOf(zemVSSD& system, const SettingClass& row, const std::string& id) {
    const zemDynamicArray<zemRASD> resources = system.getRASD(row.resourceType);
    for (int i = 0; i < resources.size(); ++i) {
        if (resources[i]->getInstanceID(true, &system) == id.c_str()) {
            return resources[i];
        }
    }
    return nullptr;
}

void addResource(const Sent& sent, SettingUse use, const CmpiObjectPath& near, zemVSSD& system) {
    const std::unique_ptr<zemRASD> blank(newResource(sent.row));
    std::unique_ptr<zemRASD> resource(newResource(sent.row));
    const zemString none;
    const Setting shown = {none, system, blank->getData()};
    takeSetting({use, sent.instance, sent.row, near, shown}, system, resource->getData());
    settleAmounts(*blank->getData(), *resource);
    system.addRASD(resource.release());
}

bool changeResource(const SentSetting& sent, zemVSSD& system, zemRASD& resource) {
    const std::unique_ptr<zemRASD> before(resource.clone());
    const bool isAsked = takeSetting(sent, system, resource.getData());
    if (!isAmount(resource) ||
        resource.getData()->m_ConsumerVisibility == before->getData()->m_ConsumerVisibility) {
        settleAmounts(*before->getData(), resource);
        return isAsked;
    }
    const std::unique_ptr<zemRASD> blank(newResource(sent.row));
    std::unique_ptr<zemRASD> fresh(newResource(sent.row));
    takeSetting(sent, system, fresh->getData());
    settleAmounts(*blank->getData(), *fresh);
    system.removeRASD(resource.getKey());
    system.addRASD(fresh.release());
    return true;
}
