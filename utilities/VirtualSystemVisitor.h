/// The readers of the model: from one provider operation to hosts, partitions and settings.
///
/// VirtualSystemVisitorManager.h  the manager, which owns the hosts and makes the visitors
/// VirtualSystemVisitorCEC.h      zemCECVisitor: hosts, and what hangs on them, by few calls
/// VirtualSystemVisitorLPAR.h     zemLPARVisitor: the partitions of one host
/// VirtualSystemVisitorVSSD.h     zemVSSDVisitor: settings of a partition and of its profiles
///
/// Visitors own nothing but what they say: what they read belongs to the manager.
#ifndef VIRTUAL_SYSTEM_VISITOR_H
#define VIRTUAL_SYSTEM_VISITOR_H

#include "VirtualSystemVisitorCEC.h"
#include "VirtualSystemVisitorLPAR.h"
#include "VirtualSystemVisitorManager.h"
#include "VirtualSystemVisitorType.h"
#include "VirtualSystemVisitorVSSD.h"

#endif
