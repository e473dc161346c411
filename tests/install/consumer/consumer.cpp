// Uses each of the installed libraries: the library, the CMPI binding, the management library.

#include <CmpiStatus.h>
#include <libapi.h>

#include "BaseProvider.h"
#include "StringUtils.h"

int main() {
    const zemString name("name");
    const CmpiStatus status(CMPI_RC_ERR_FAILED);
    return name.length() == 4 && status.rc() == CMPI_RC_ERR_FAILED &&
                   getReturnCode(nullptr) == API_FAILED
               ? 0
               : 1;
}
