/// Instance IDs of VSSDs, RASDs and their setting data: formed and taken apart here, and nowhere
/// else. Private to the library.
///
///     side     system, processor, memory       slot, adapter
///     state    ORX:4*<lpar>*<MTMS>             ORX:4*<what>*<lpar>*<MTMS>
///     defined  ORX:2*<profile>-<lpar>*<MTMS>   ORX:2*<profile>-<what>*<lpar>*<MTMS>
///
/// <what> is a DRC index or a slot number. An MTMS holds a "*", and a profile's name may hold both
/// "-" and "*", so IDs are taken apart from the right, with the MTMS known. They come from clients
/// and may be any text.
///
/// Functions without state; any thread may call them.
#ifndef VIRTUAL_SYSTEM_INSTANCE_ID_H
#define VIRTUAL_SYSTEM_INSTANCE_ID_H

#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"

/// Whose ID it is, for the length of a call. The state side does not look at the profile.
struct zemInstanceIdOwner {
    zemSettingSide side;
    const zemString& profileName;
    const zemString& lparID;
    const zemString& mtms;
};

/// The ID of a system, its processor or memory; of a slot; of an adapter.
zemString zemFormInstanceId(const zemInstanceIdOwner& owner);
zemString zemFormInstanceId(const zemInstanceIdOwner& owner, const zemString& drcIndex);
zemString zemFormInstanceId(const zemInstanceIdOwner& owner, int slot);

/// Whether @p id is one of @p side, by its beginning.
bool zemIsInstanceIdOf(zemSettingSide side, const zemString& id);

/// Whether @p id ends with "*" and @p mtms, and has this nowhere before.
bool zemInstanceIdEndsWith(const zemString& id, const zemString& mtms);

/// Takes the ID of a system apart that ends with @p mtms. The state side leaves @p profileName
/// alone, and an ID of neither form both.
void zemSplitInstanceId(const zemString& id, const zemString& mtms, zemString& profileName,
                        zemString& lparID);

/// What stands for <what> in the ID of a slot or an adapter, with "*" and the partition ID behind
/// it; empty when @p id is too short. That it ends with @p mtms is the caller's word.
zemString zemResourceOfInstanceId(const zemString& id, const zemString& mtms);

/// The ID of the system whose resource @p id is: @p id itself unless it names a resource; empty
/// when it does not end with @p mtms, or is of another form.
zemString zemSystemInstanceIdOf(const zemString& id, const zemString& mtms, bool namesResource);

#endif
