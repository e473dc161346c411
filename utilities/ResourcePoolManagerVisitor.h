/// zemRPVisitor: makes the pools of one host, and walks them.
///
/// Pools are made from a host that has been read already. readHosts() lets all hosts of a manager
/// be read for the pools of one class, with at most four calls of the management library however
/// many hosts, pools and partitions there are:
///
///     zemVirtualizationManager manager;
///     std::unique_ptr<zemCECVisitor> hosts(manager.createCECVisitor(env));
///     hosts->initialize(env.m_userName, false, zemCECVisitor::Level_All);
///     zemRPVisitor::readHosts(*hosts, className, mode);
///     std::unique_ptr<zemRPonCECVisitor> pools(manager.createRPonCECVisitor(className, env));
///     for (int i = 0; i < hosts->size(); ++i) {
///         pools->initialize(hosts->getData(i)->getMTMS(), mode);
///     }
///     for (int i = 0; zemResourcePool* pool = pools->getData(i); ++i) {
///         puts(pool->getData()->m_InstanceID);
///     }
///
/// One host is read alike, by zemCECVisitor::initialize() with its key.
///
/// Thread-safety: none; a visitor belongs to one operation.
#ifndef RESOURCE_POOL_MANAGER_VISITOR_H
#define RESOURCE_POOL_MANAGER_VISITOR_H

#include <memory>

#include "ResourcePoolManagerPool.h"
#include "StringUtils.h"
#include "VirtualSystemVisitorCEC.h"
#include "VirtualSystemVisitorManager.h"
#include "ZemExport.h"

/// All pools of a host in one row: each primordial pool with its sub-pools behind it. It holds
/// nothing itself.
class ZEM_EXPORT zemHierarchyPoolVistor {
public:
    /// @param cec  not null; outlives the visitor
    explicit zemHierarchyPoolVistor(zemCEC* cec) : m_CEC(cec) {}

    /// How many there are, and one by its position, null outside of them.
    int size() const;
    zemResourcePool* getData(int index) const;

private:
    zemCEC* m_CEC;
};

class ZEM_EXPORT zemRPVisitor {
public:
    /// @param cec  the host, not null; outlives the visitor
    /// @param type  CIM class whose instances are wanted
    zemRPVisitor(zemCEC* cec, const zemString& type) : m_CEC(cec), m_Type(type) {}

    void setOperEnv(const zemOperEnv& env) { m_Env = env; }
    void setOperEnv(const zemString& user, const zemString& locale) { m_Env = {user, locale}; }

    /// Hangs on the hosts of @p hosts what their pools are made of. Once for a class after the
    /// hosts have been read: slots and adapters add up. Partitions and what shared pools of
    /// processors are made of, where that hangs there already, are not read again.
    ///
    ///     kind       calls for keys   where pools tell everything
    ///     processor  2                4
    ///     memory     2                4
    ///     slot       0                2
    ///     adapter    0                2
    ///
    /// @param className  as for initialize(); for another class nothing is read
    /// @param mode  as for zemResourcePool::initialize()
    /// @param haveSettings  partitions hang there, and what hosts and all partitions have of this
    ///        kind, as the settings of partitions need it: none of that is read again
    /// @throws what the operations of zemCECVisitor throw
    static void readHosts(zemCECVisitor& hosts, const zemString& className, int mode,
                          bool haveSettings = false);

    /// Makes the pools of the host, of which those before are dropped, whatever their kind.
    /// @param className  class of pools or of what is around them, in any case of letters; empty:
    ///        that of the constructor
    /// @param level  the mode of zemResourcePool::initialize()
    /// @return 0; -1 for another class and for a host that has not been read: it has no pools then
    /// @throws what zemResourcePool::initialize() throws; the host has no pools then
    int initialize(const zemString& className, int level);

    /// The host's pools, primordial pools and sub-pools alike: how many, and one by its position,
    /// null outside of them.
    int size() const { return zemHierarchyPoolVistor(m_CEC).size(); }
    zemResourcePool* getData(int index) const {
        return zemHierarchyPoolVistor(m_CEC).getData(index);
    }

private:
    /// A new pool of the kind to which m_Type belongs; null for another class.
    std::unique_ptr<zemResourcePool> getResourcePool() const;

    zemCEC* m_CEC;
    zemString m_Type;
    zemOperEnv m_Env;
};

/// What pools are found by: instance ID.
inline zemString zemItemKey(const zemResourcePool& pool) { return pool.getData()->m_InstanceID; }

#endif
