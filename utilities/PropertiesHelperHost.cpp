#include <arpa/inet.h>
#include <netdb.h>
#include <unistd.h>

#include <cerrno>
#include <vector>

#include "PropertiesHelper.h"
#include "Synchronizer.h"

namespace {

constexpr unsigned int kNoAddress = 0xFFFFFFFF;
constexpr unsigned int kLoopback = 0x7F000001;

/// The entry of the host data base for one name, with the bytes that it points into.
class HostEntry {
public:
    explicit HostEntry(const char* name) {
        if (name == nullptr) {
            return;
        }
        int error = 0;
        while (gethostbyname_r(name, &m_entry, m_bytes.data(), m_bytes.size(), &m_found, &error) ==
               ERANGE) {
            m_bytes.resize(m_bytes.size() * 2);
        }
    }
    HostEntry(const HostEntry&) = delete;
    HostEntry& operator=(const HostEntry&) = delete;

    const char* canonicalName() const { return m_found != nullptr ? m_found->h_name : nullptr; }

    const in_addr* firstAddress() const {
        return m_found != nullptr && m_found->h_addrtype == AF_INET
                   ? reinterpret_cast<const in_addr*>(m_found->h_addr_list[0])
                   : nullptr;
    }

private:
    hostent m_entry = {};
    hostent* m_found = nullptr;
    std::vector<char> m_bytes = std::vector<char>(1024);
};

zemString findHostName() {
    char name[257] = {};
    return gethostname(name, sizeof name - 1) == 0 ? zemString(name) : zemString();
}

zemString findFullHostName() {
    const zemString& shortName = zemPropertiesHelper::getHostName();
    return shortName.isEmpty() ? zemString() : zemString(HostEntry(shortName).canonicalName());
}

/// A name that is looked up until it is found and then never changes, so that a reference to it can
/// be handed out. The lock is not held during the look-up, which may take a name server's time.
class CachedName {
public:
    zemString& get(zemString (*find)()) {
        {
            const zemSynchronizer guard(m_lock);
            if (!m_name.isEmpty()) {
                return m_name;
            }
        }
        const zemString found = find();
        const zemSynchronizer guard(m_lock);
        if (m_name.isEmpty()) {
            if (found.isEmpty()) {
                return m_none;
            }
            m_name = found;
        }
        return m_name;
    }

private:
    zemSynchronizerContext m_lock;
    zemString m_name;
    zemString m_none;  // what callers see while m_name may still be written by another thread
};

}  // namespace

zemString& zemPropertiesHelper::getHostName() {
    static CachedName strHostName;
    return strHostName.get(findHostName);
}

zemString& zemPropertiesHelper::getFullHostName() {
    static CachedName strFullHostName;
    return strFullHostName.get(findFullHostName);
}

unsigned int zemPropertiesHelper::getHostIPAddress(const char* name) {
    const HostEntry host(name);
    const in_addr* address = host.firstAddress();
    return address != nullptr ? ntohl(address->s_addr) : kNoAddress;
}

zemString zemPropertiesHelper::getHostIP(const char* name) {
    const HostEntry host(name);
    const in_addr* address = host.firstAddress();
    char text[INET_ADDRSTRLEN] = {};
    if (address != nullptr) {
        inet_ntop(AF_INET, address, text, sizeof text);
    }
    return zemString(text);
}

bool zemPropertiesHelper::isSameHost(const char* host) {
    const unsigned int ip = getHostIPAddress(host);
    if (ip == kLoopback) {
        return true;
    }
    if (ip == kNoAddress) {
        return false;
    }
    unsigned int local = getHostIPAddress(getFullHostName());
    if (local == kLoopback) {
        local = getHostIPAddress(getHostName());
    }
    return local != kNoAddress && local == ip;
}
