// What a deployment preloads whose providers must not answer.
#include "BaseProvider.h"

CMPIBoolean zemBaseProvider::isProviderEnabled(const CmpiContext&) { return false; }
