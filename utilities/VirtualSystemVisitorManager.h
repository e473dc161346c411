/// The entry to the model: zemVirtualizationManager, which owns the hosts that one provider
/// operation reads, and hands out the visitors that read them.
///
/// A provider makes a manager, asks it for a visitor, lets that read, and walks what it read:
///
///     zemVirtualizationManager manager;
///     std::unique_ptr<zemCECVisitor> hosts(manager.createCECVisitor({userName, locale}));
///     hosts->initialize(userName, false, zemCECVisitor::Level_All);
///     hosts->initializeLparResource(userName, "", zemCECVisitor::Level_All, VISITOR_TYPE_LPAR);
///     for (int i = 0; i < hosts->size(); ++i) puts(hosts->getData(i)->getSystemName());
///
/// Nothing is kept from one operation to the next: a manager lives for one of them, and so do all
/// pointers that visitors give, which are the manager's.
///
/// Thread-safety: none; a manager and its visitors belong to one operation.
#ifndef VIRTUAL_SYSTEM_VISITOR_MANAGER_H
#define VIRTUAL_SYSTEM_VISITOR_MANAGER_H

#include <memory>
#include <type_traits>

#include "DynamicArray.h"
#include "StringUtils.h"
#include "VirtualSystemRep.h"
#include "ZemExport.h"

class zemCECVisitor;
class zemLPARVisitor;
class zemRPVisitor;
class zemVSSDVisitor;

/// Who acts, and in which language: what tools run under.
struct ZEM_EXPORT zemOperEnv {
    zemOperEnv() = default;
    zemOperEnv(const zemString& userName, const zemString& locale)
        : m_userName(userName), m_locale(locale) {}

    zemString m_userName;  ///< empty: the process's own user
    zemString m_locale;    ///< LC_ALL of the tools; empty leaves it alone
};

template <class Item, class Visitor>
class zemVMVisitor;

/// Partitions, settings and pools through the visitors of single hosts.
typedef zemVMVisitor<zemLPAR, zemLPARVisitor> zemLPARonCECVisitor;
typedef zemVMVisitor<zemVSSD, zemVSSDVisitor> zemVSSDonCECVisitor;
typedef zemVMVisitor<zemResourcePool, zemRPVisitor> zemRPonCECVisitor;

class ZEM_EXPORT zemVirtualizationManager {
public:
    zemVirtualizationManager() = default;
    zemVirtualizationManager(const zemVirtualizationManager&) = delete;
    zemVirtualizationManager& operator=(const zemVirtualizationManager&) = delete;

    /// New visitors, which the caller deletes before the manager. Without @p env they act as the
    /// process's own user.
    /// @param type  CIM class whose instances are wanted, as "ORXC_MemoryRASettingData"
    zemCECVisitor* createCECVisitor();
    zemCECVisitor* createCECVisitor(const zemOperEnv& env);
    zemLPARonCECVisitor* createLPARVisitor(const zemString& type);
    zemLPARonCECVisitor* createLPARVisitor(const zemString& type, const zemOperEnv& env);
    zemVSSDonCECVisitor* createVSSDVisitor(const zemString& type);
    zemVSSDonCECVisitor* createVSSDVisitor(const zemString& type, const zemOperEnv& env);
    zemRPonCECVisitor* createRPonCECVisitor(const zemString& type);
    zemRPonCECVisitor* createRPonCECVisitor(const zemString& type, const zemOperEnv& env);

    /// The host with this key; as zemCECVisitor::getData().
    zemCEC* getCEC(const zemString& mtms, const zemOperEnv& env);

    zemDynamicArray<zemCEC> m_CECs;  ///< the hosts, owned
};

/// What items are found by: partitions by "<number>*<key of the host>", settings by instance ID, as
/// are pools (ResourcePoolManagerVisitor.h).
inline zemString zemItemKey(const zemLPAR& lpar) { return lpar.getLparIDAndMTMS(); }
inline zemString zemItemKey(const zemVSSD& vssd) { return vssd.getInstanceID(); }

/// All items of one kind of a manager's hosts. Each operation is done by a Visitor of the host: a
/// class with a constructor (zemCEC*, class name), setOperEnv(), initialize(user, type), size() and
/// getData(index), which is included where this template's operations are used. That of pools takes
/// the class name in place of the user, and a mode in place of the type.
template <class Item, class Visitor>
class ZEM_EXPORT zemVMVisitor {
public:
    zemVMVisitor(zemVirtualizationManager* vm, const zemString& type) : m_VM(vm), m_Type(type) {}
    zemVMVisitor(zemVirtualizationManager* vm, const zemString& type, const zemOperEnv& env)
        : m_VM(vm), m_Env(env), m_Type(type) {}

    /// Lets the items of one host be read; a host that the manager lacks is asked for first.
    /// @param mtms  key of the host
    /// @param className  in place of the class for which the visitor was made
    /// @param level  a VMVisitorType
    /// @return what the host's visitor returns, which is 0; -1: there is no such host
    /// @throws what the host's visitor throws
    int initialize(const zemString& mtms, const zemString& className, int level) {
        start();
        zemCEC* const cec = m_VM->getCEC(mtms, m_Env);
        if (cec == nullptr) {
            return -1;
        }
        constexpr bool isOfPools = std::is_same_v<Visitor, zemRPVisitor>;
        return on(cec, className).initialize(isOfPools ? className : m_Env.m_userName, level);
    }
    int initialize(const zemString& mtms, int level) { return initialize(mtms, m_Type, level); }

    /// The same for who wants one item: -1, too, when it is not among those read.
    /// @param type  as className above
    int initializePlus(const zemString& mtms, int level, const zemString& key,
                       const zemString& type) {
        const int result = initialize(mtms, type, level);
        return result == 0 && getData(key) == nullptr ? -1 : result;
    }

    /// The items read of all hosts, in the hosts' order: how many, and one by its position, null
    /// outside of them. Walking upwards does not start anew at each: who changes the manager's
    /// hosts himself starts at 0 again.
    int size() const {
        int count = 0;
        for (int i = 0; i < m_VM->m_CECs.size(); ++i) {
            count += on(m_VM->m_CECs.getElementAt(i), m_Type).size();
        }
        return count;
    }
    Item* getData(int index) {
        if (index < m_first || index == 0) {
            start();
        }
        for (; index >= 0 && m_host < m_VM->m_CECs.size(); ++m_host, m_visitor.reset()) {
            if (m_visitor == nullptr) {
                m_visitor = std::make_shared<Visitor>(on(m_VM->m_CECs[m_host], m_Type));
            }
            if (Item* const item = m_visitor->getData(index - m_first)) {
                return item;
            }
            m_first += m_visitor->size();
        }
        start();
        return nullptr;
    }

    /// The item with this key, for which all are gone through, or null.
    Item* getData(const zemString& key) const {
        for (int i = 0; i < m_VM->m_CECs.size(); ++i) {
            Visitor visitor = on(m_VM->m_CECs.getElementAt(i), m_Type);
            const int count = visitor.size();
            for (int j = 0; j < count; ++j) {
                Item* const item = visitor.getData(j);
                if (item != nullptr && zemItemKey(*item) == key) {
                    return item;
                }
            }
        }
        return nullptr;
    }

    void setOperEnv(const zemOperEnv& env) {
        start();
        m_Env = env;
    }
    void setOperEnv(const zemString& user, const zemString& locale) {
        setOperEnv(zemOperEnv(user, locale));
    }
    const zemOperEnv& getOperEnv() const { return m_Env; }

private:
    Visitor on(zemCEC* cec, const zemString& className) const {
        Visitor visitor(cec, className);
        visitor.setOperEnv(m_Env);
        return visitor;
    }

    void start() {
        m_host = m_first = 0;
        m_visitor.reset();
    }

    zemVirtualizationManager* m_VM;
    zemOperEnv m_Env;
    zemString m_Type;

    /// Where getData(index) was last: a host, the position of its first item, and its visitor.
    int m_host = 0;
    int m_first = 0;
    std::shared_ptr<Visitor> m_visitor;
};

#endif
