#include <algorithm>
#include <iterator>
#include <memory>
#include <utility>

#include "QyplatCmdCaller.h"
#include "SystemConfig.h"
#include "SystemConfigSupport.h"
#include "SystemStateText.h"
#include "VirtualSystemRep.h"

namespace {

/// What initialize() does for a type.
struct Form {
    int type;
    bool isDescribed;    ///< the partition takes its name, type and keylock, too
    bool readsSettings;  ///< VSSDs take the settings of their profiles
};

constexpr Form kForms[] = {
    {VISITOR_TYPE_VSSD_INIT, true, true},
    {VISITOR_TYPE_VSSD_INIT_NI, false, false},
    {VISITOR_TYPE_RASD_INIT, false, true},
    {VISITOR_TYPE_RASD_INIT_NI, false, true},
};

bool isNull(const zemString& value) { return zemString::equalsIgnoreCase(value, "null"); }

/// Asks the tool for the profiles of a partition. The settings come from the profiles' objects;
/// this is done for its failures alone, by which a partition of which the tool knows no profile
/// is refused.
void expectProfiles(const zemString& userName, const zemString& mtms, const zemString& lparId) {
    using Profile = zemQyplatCmdCaller::PartitionProfileAttribute;
    // clang-format off
    int wanted[] = {
        Profile::ATTR_NAME, Profile::ATTR_LPAR_NAME, Profile::ATTR_LPAR_ID, Profile::ATTR_LPAR_ENV,
        Profile::ATTR_ALL_RESOURCES,
        Profile::ATTR_MIN_MEM, Profile::ATTR_DESIRED_MEM, Profile::ATTR_MAX_MEM,
        Profile::ATTR_PROC_MODE,
        Profile::ATTR_MIN_PROC_UNITS, Profile::ATTR_DESIRED_PROC_UNITS, Profile::ATTR_MAX_PROC_UNITS,
        Profile::ATTR_MIN_PROCS, Profile::ATTR_DESIRED_PROCS, Profile::ATTR_MAX_PROCS,
        Profile::ATTR_SHARING_MODE, Profile::ATTR_UNCAP_WEIGHT,
        Profile::ATTR_IO_SLOTS, Profile::ATTR_LPAR_IO_POOL_IDS, Profile::ATTR_MAX_VIRTUAL_SLOTS,
        Profile::ATTR_VIRTUAL_SERIAL_ADAPTERS, Profile::ATTR_VIRTUAL_SCSI_ADAPTERS,
        Profile::ATTR_VIRTUAL_ETH_ADAPTERS,
        Profile::ATTR_BOOT_MODE, Profile::ATTR_CONN_MONITORING, Profile::ATTR_AUTO_START,
        Profile::ATTR_REDUNDANT_ERR_PATH_REPORTING, Profile::ATTR_END};
    // clang-format on
    const zemString filter =
        zemCommandCaller::quoted(zemCommandCaller::filterItem("lpar_ids", lparId));
    zemQyplatCmdCaller(userName, "").getPartitionsProfileInformation(wanted, mtms, filter);
}

}  // namespace

zemLPAR::zemLPAR(const zemString& lparid) : m_lparID(lparid) {}

zemLPAR::zemLPAR(const zemString& mtms, const zemString& lparid) : m_MTMS(mtms), m_lparID(lparid) {}

zemLPAR::zemLPAR(const zemString& mtms, const zemString& lparid, const zemString& name,
                 const zemString& state, const zemString& defaultprofile, const zemString& current,
                 const zemString& osType, const zemString& keylock)
    : m_MTMS(mtms),
      m_lparID(lparid),
      m_lparName(name),
      m_state(state),
      m_defaultProfileName(defaultprofile),
      m_currentProfileName(current),
      m_virtualSystemType(osType),
      m_keylock(keylock) {}

zemLPAR::~zemLPAR() = default;

bool zemLPAR::isActivated() const { return m_state.find("Not Activated") == -1; }

zemString zemLPAR::getLparIDAndMTMS() const { return m_lparID + "*" + m_MTMS; }

int zemLPAR::initialize(zemCEC* cec, const zemString& userName, const zemString& className,
                        int type) {
    const Form* const form =
        std::find_if(std::begin(kForms), std::end(kForms),
                     [type](const Form& candidate) { return candidate.type == type; });
    if (form == std::end(kForms)) {
        return 0;
    }
    zemVirtualSystem partition =
        zemManagerSystem::getHostSystemByName(m_MTMS, userName).getVirtualSystemById(m_lparID);
    m_state = zemVirtualSystem::getStateByID(partition.getState());
    m_defaultProfileName = partition.getDefaultProfileName();
    m_currentProfileName = partition.getCurrentProfileName();
    if (m_currentProfileName.isEmpty()) {
        m_currentProfileName = m_defaultProfileName;
    }
    if (form->isDescribed) {
        m_lparName = partition.getName();
        m_virtualSystemType = partition.getEnv();
        m_keylock = zemVirtualSystem::getKeyLockByID(partition.getKeyLock());
        expectProfiles(userName, m_MTMS, m_lparID);
    }
    zemDynamicArray<zemVirtualSystemProfile> profiles = partition.getAllVirtualSystemProfiles();
    for (int i = 0; i < profiles.size(); ++i) {
        zemVirtualSystemProfile& profile = *profiles.getElementAt(i);
        const zemString name = profile.getName();
        auto defined = form->readsSettings ? std::make_unique<zemVSSD>(this, profile)
                                           : std::make_unique<zemVSSD>();
        if (zemString::equalsIgnoreCase(name, m_currentProfileName)) {
            if (form->readsSettings) {
                m_stateVSSD.initialize(this, profile);
            }
            m_stateVSSD.initializeState(userName, m_currentProfileName, cec, this, className, type);
        }
        defined->initializeDefined(userName, name, cec, this, className, type);
        m_definedVSSD.addElement(std::move(defined));
    }
    return 0;
}

void zemLPAR::setStatePlus(const zemString& code) {
    m_state = zemPartitionStateText(zemWholeNumberOf(code));
}

void zemLPAR::setDefaultProfileName(const zemString& value) {
    m_defaultProfileName = zemProfileNameOf(value);
}

void zemLPAR::setCurrentProfileName(const zemString& value) {
    m_currentProfileName = zemProfileNameOf(value);
}

void zemLPAR::setVirtualSystemType(const zemString& value) {
    const zemString type = zemEnvironmentText(zemWholeNumberOf(value));
    if (!type.isEmpty()) {
        m_virtualSystemType = type;
    }
}

void zemLPAR::setKeyLock(const zemString& value) {
    m_keylock = zemKeylockWord(zemWholeNumberOf(value), value);
}

void zemLPAR::setBootMode(const zemString& value) {
    m_bootMode = zemBootModeText(zemWholeNumberOf(value), "unknow");  // clients know it so
}

void zemLPAR::setCurrLparProcCompatMode(const zemString& value) {
    m_CurrLparProcCompatMode = zemCompatModeText(zemWholeNumberOf(value));
}

void zemLPAR::setDesiredLparProcCompatMode(const zemString& value) {
    m_DesiredLparProcCompatMode = zemCompatModeText(zemWholeNumberOf(value));
}

void zemLPAR::setRedundantErrPathReporting(const zemString& value) {
    m_REDUNDANT_ERR_PATH_REPORTING = isNull(value) ? "unavailable" : value;
}

void zemLPAR::setAutoStart(const zemString& value) { m_AutoStart = isNull(value) ? "0" : value; }

void zemLPAR::setMigrationState(int state, bool isApiNumber) {
    m_migrationState = isApiNumber ? zemMigrationStateOf(state) : state;
}

void zemLPAR::setMigrationState(const char* text) {
    m_migrationState = text == nullptr ? MIGRATION_UNKNOWN : zemMigrationStateOf(text);
}

void zemLPAR::setStateVSSD(zemVSSD& vssd) { m_stateVSSD = vssd; }

void zemLPAR::setLparProcessor(zemPartitionProcessorResource record) {
    m_LparProcessor = std::move(record);
    m_isLparProcAvailable = true;
}

void zemLPAR::setLparMemory(zemPartitionMemoryResource record) {
    m_LparMemory = std::move(record);
    m_isLparMemAvailable = true;
}
