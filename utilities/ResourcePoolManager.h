/// Resource pools of a host, and the setting data of what is taken from them.
///
/// Thread-safety: none; objects belong to the operation that made them.
#ifndef RESOURCE_POOL_MANAGER_H
#define RESOURCE_POOL_MANAGER_H

#include "ResourcePoolManagerSettingData.h"
#include "ZemExport.h"

/// How much of one resource a host has, and how it is shared out. A host owns its pools.
class ZEM_EXPORT zemResourcePool {
public:
    virtual ~zemResourcePool();
};

#endif
