// FindFreeFunctionId - the id that the function dialogs give a new function.
//
// The manager hands out its next ids without looking at the ids in use or at
// the end of their range. A host that set a next id too low would let a new
// function replace one that exists, and an id past the range would make the
// new function one of another kind. The dialogs therefore take the first id
// from the next one on that lies inside the range and that no function holds.
#pragma once

#include "CFunctionManager.h"

// The first id of [minId, maxId], from `next` on (from minId if `next` lies
// below), that no function of `manager` holds; false when there is none.
inline bool FindFreeFunctionId(const CFunctionManager& manager, long next, long minId, long maxId, long& id)
{
    long candidate = next < minId ? minId : next;
    if (candidate > maxId)
        return false;
    CFunctionManager::CFunction holder(0, CString());
    while (manager.GetFunction(candidate, holder)) {
        if (candidate >= maxId)
            return false;
        ++candidate;
    }
    id = candidate;
    return true;
}
