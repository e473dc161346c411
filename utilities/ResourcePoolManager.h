/// Resource pools of a host: what there is of each kind of resource, how it is shared out, and what
/// CIM shows around a pool.
///
/// A host (zemCEC) has one primordial pool of each of six kinds; below those of processors and of
/// memory stand the host's shared pools. zemRPVisitor makes the pools of one host
/// (ResourcePoolManagerVisitor.h). By the mode in which it is made, a pool carries its quantities
/// (ResourcePoolManagerPool.h), or what is around it (ResourcePoolManagerCapabilities.h): its
/// allocation capabilities, the group of setting data that says what may be taken from it
/// (ResourcePoolManagerSettingData.h), the capabilities of its configuration service, the service.
///
/// A host owns its pools, a pool its sub-pools and all that it carries.
///
/// Thread-safety: none; objects belong to the operation that made them.
#ifndef RESOURCE_POOL_MANAGER_H
#define RESOURCE_POOL_MANAGER_H

#include "ResourcePoolManagerCapabilities.h"
#include "ResourcePoolManagerPool.h"
#include "ResourcePoolManagerSettingData.h"
#include "ResourcePoolManagerVisitor.h"

#endif
