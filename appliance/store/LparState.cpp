#include "LparState.h"

#include "Text.h"

namespace appliance {

namespace {

constexpr const char* kQuantities =
    "mem,min_mem,mem_weight,procs,proc_units,uncap_weight,io_entitled_mem";

}  // namespace

bool isActive(const Object& lpar) {
    return !isListed("Not Activated,Suspended,Not Available", lpar.get("state"));
}

bool isMoving(const Object& lpar) {
    return !isListed("Not Migrating,Migration Complete", lpar.get("migration_state"));
}

const char* osVersion(const std::string& env) {
    return env == "osq00" ? "OSQ00 3.2" : env == "xbrgserver" ? "XBRG 2.1" : "Linux 5.14";
}

void setActive(Object& lpar, const char* state) {
    lpar.set("state", state);
    for (const std::string& quantity : split(kQuantities)) {
        lpar.set("run_" + quantity, lpar.get("curr_" + quantity));
    }
    lpar.set("os_version", osVersion(lpar.get("lpar_env")));
}

void setInactive(Object& lpar, const char* state) {
    lpar.set("state", state);
    for (const std::string& quantity : split(kQuantities)) {
        lpar.set("run_" + quantity, quantity == "proc_units" ? "0.0" : "0");
    }
}

}  // namespace appliance
