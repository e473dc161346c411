/// The model's picture of the managed hosts: hosts, their partitions, and what is set of these.
///
/// VirtualSystemRepSystem.h    zemCEC, one host, and zemLPAR, one partition
/// VirtualSystemRepVSSD.h      zemVSSD, the settings of a running partition or of a profile
/// VirtualSystemRepRASD.h      zemRASD and its kinds, the settings of one resource
///
/// A host owns its partitions, a partition its VSSDs, and a VSSD its RASDs.
#ifndef VIRTUAL_SYSTEM_REP_H
#define VIRTUAL_SYSTEM_REP_H

#include "VirtualSystemRepRASD.h"
#include "VirtualSystemRepSystem.h"
#include "VirtualSystemRepVSSD.h"

#endif
