#include "SystemConfig.h"

#include <fstream>
#include <functional>
#include <memory>

#include "DNXApiCaller.h"
#include "Exception.h"
#include "QymoveCmdCaller.h"

namespace {

constexpr char kManagerSystem[] = "zemManagerSystem";

constexpr char kProductData[] = "/opt/wrt/data/dnxvpd.properties";

/// Hands key and value of each line with a "=" to @p take, until that returns true.
/// @return false when the file cannot be opened
bool readProductData(const char* fileName,
                     const std::function<bool(const zemString&, const std::string&)>& take) {
    std::ifstream file(fileName);
    if (!file) {
        return false;
    }
    for (std::string line; std::getline(file, line);) {
        const size_t equals = line.find('=');
        if (equals != std::string::npos &&
            take(line.substr(0, equals).c_str(), line.substr(equals + 1))) {
            break;
        }
    }
    return true;
}

zemString readUUID() {
    bool found = false;
    std::string uuid;
    const bool opened =
        readProductData(kProductData, [&](const zemString& key, const std::string& value) {
            found = zemString::equalsIgnoreCase(key, "UUID");
            if (found) {
                uuid = value;
            }
            return found;
        });
    // Clients know both as failures of access.
    if (!opened) {
        const zemString text =
            zemString("open the config file wrong, can not open file : ") + kProductData + ".";
        throw zemAccessDeniedException(kManagerSystem, "getDNXUUID", text);
    }
    if (!found) {
        const zemString text =
            zemString("there is no UUID infoamation in the config file : ") + kProductData + ".";
        throw zemAccessDeniedException(kManagerSystem, "getDNXUUID", text);
    }
    return uuid.c_str();
}

}  // namespace

zemConfigObject::zemConfigObject(const char* requestUserContext, const char* locale)
    : m_requestUserContext(requestUserContext), m_locale(locale) {}

zemConfigObject::~zemConfigObject() = default;

void zemConfigObject::need(OP_LEVEL level) {
    if (!(level == OP_LEVEL_1 ? m_gotLevel1 : m_gotLevel2)) {
        updateData(level);
    }
}

bool zemManagerSystem::isEnableRemoteRelocation(const char* requestUserContext) {
    using Manager = zemQymoveCmdCaller::ManagerSystemAttribute;
    int wanted[] = {Manager::ATTR_REMOTE_LPAR_MOBILITY_CAPABLE, Manager::ATTR_END};
    const zemRecordSetsType records =
        zemQymoveCmdCaller(requestUserContext, nullptr).getManagerSystemCapabilities(wanted);
    if (records.size() == 0) {
        throw zemOperationFailedException(kManagerSystem, "isEnableRemoteRelocation",
                                          zemString(records.size()));
    }
    return (*records.getElementAt(0))[wanted[0]] == "1";
}

zemDynamicArray<zemHostSystem> zemManagerSystem::getAllHostSystem(const char* requestUserContext,
                                                                  const char* locale) {
    const zemApiReader reader = {kManagerSystem, "getAllHostSystem", "getAllCecs", "UNKNOWN"};
    zemDynamicArray<zemHostSystem> hosts;
    for (apiProp& host : zemApiObjects(reader, zemApiCaller().getAllCecs(requestUserContext, 1))) {
        hosts.addElement(std::make_unique<zemHostSystem>(host, requestUserContext, locale));
    }
    return hosts;
}

zemHostSystem zemManagerSystem::getHostSystemByName(const zemString& name,
                                                    const char* requestUserContext,
                                                    const char* locale) {
    const zemApiReader reader = {kManagerSystem, "getHostSystemByName", "getCecObj"};
    const zemApiObjects hosts(reader, zemApiCaller().getCecObj(requestUserContext, name, 1));
    return zemHostSystem(hosts.only(name), requestUserContext, locale);
}

zemDynamicArray<zemVirtualSystem> zemManagerSystem::getAllVirtualSystemByHostName(
    const char* requestUserContext, const zemString& mtms) {
    const zemApiReader reader = {"zemHostSystem", "getAllVirtualSystem", "getAllLparsFromCec",
                                 "UNKNOWN"};
    zemDynamicArray<zemVirtualSystem> partitions;
    for (apiProp& partition :
         zemApiObjects(reader, zemApiCaller().getAllLparsFromCec(requestUserContext, mtms, 2))) {
        partitions.addElement(
            std::make_unique<zemVirtualSystem>(partition, requestUserContext, nullptr));
    }
    return partitions;
}

zemString zemManagerSystem::getMTMS(const char* /*requestUserContext*/) {
    static const zemString mtms = getMTMSByName(kProductData);
    return mtms;
}

zemString zemManagerSystem::getMTMSByName(const char* fileName) {
    std::string typeModel;
    std::string serialNum;
    int found = 0;
    readProductData(fileName, [&](const zemString& key, const std::string& value) {
        if (zemString::equalsIgnoreCase(key, "MODELTYPE")) {
            typeModel = value;
            ++found;
        } else if (zemString::equalsIgnoreCase(key, "SERIALNUMBER")) {
            serialNum = value;
            ++found;
        }
        return false;
    });
    return found == 2 ? (typeModel + '*' + serialNum).c_str() : "";
}

zemString zemManagerSystem::getDNXUUID() {
    static const zemString uuid = readUUID();  // a failure leaves it to the next call
    return uuid;
}
