/// What the six kinds of pools and of what is around them differ in: their classes and their words.
/// Private to the library.
///
/// Functions without state; any thread may call them.
#ifndef RESOURCE_POOL_MANAGER_ROWS_H
#define RESOURCE_POOL_MANAGER_ROWS_H

#include "StringUtils.h"
#include "VirtualSystemRepRASD.h"

/// The pool ID of what is not a shared pool.
constexpr char zemPrimordialPoolID[] = "Primordial";

/// Columns of zemPoolRow::classes.
enum zemPoolClass {
    POOL_CLASS_DEVICE,
    POOL_CLASS_POOL,
    POOL_CLASS_ALLOCATION,
    POOL_CLASS_CONFIGURATION,
    POOL_CLASS_SERVICE,
    POOL_CLASS_SETTING,
    POOL_CLASS_COUNT
};

struct zemPoolRow {
    const zemRASDKind& kind;
    const char* noun;           ///< in texts for humans
    const char* servicePrefix;  ///< of a service's name; clients know the odd one
    const char* classes[POOL_CLASS_COUNT];
};

/// How many rows there are, in the order of zemResourcePool::getIndexFromClassName(); that of a
/// kind.
constexpr int zemPoolRowCount = 6;
const zemPoolRow& zemPoolRowOf(int resourceType);

/// The first row of which a column from @p first to @p last names @p className, ignoring case; -1:
/// none.
int zemFindPoolRow(const zemString& className, zemPoolClass first, zemPoolClass last);

/// Sets the two texts of a pool, or of what is around it, that read alike.
template <class Data>
void zemSetTexts(Data& data, const zemString& text) {
    data.m_Caption = text;
    data.m_Description = text;
}

#endif
