#include "LparState.h"

#include <initializer_list>

namespace appliance {

namespace {

constexpr const char* kQuantities[] = {"mem",        "min_mem",      "mem_weight",     "procs",
                                       "proc_units", "uncap_weight", "io_entitled_mem"};

bool isOneOf(const std::string& word, std::initializer_list<const char*> words) {
    for (const char* other : words) {
        if (word == other) return true;
    }
    return false;
}

}  // namespace

bool isActive(const Object& lpar) {
    return !isOneOf(lpar.get("state"), {"Not Activated", "Suspended", "Not Available"});
}

bool isMoving(const Object& lpar) {
    return !isOneOf(lpar.get("migration_state"), {"Not Migrating", "Migration Complete"});
}

const char* osVersion(const std::string& env) {
    return env == "osq00" ? "OSQ00 3.2" : env == "xbrgserver" ? "XBRG 2.1" : "Linux 5.14";
}

void setActive(Object& lpar, const char* state) {
    lpar.set("state", state);
    for (const std::string quantity : kQuantities) {
        lpar.set("run_" + quantity, lpar.get("curr_" + quantity));
    }
    lpar.set("os_version", osVersion(lpar.get("lpar_env")));
}

void setInactive(Object& lpar, const char* state) {
    lpar.set("state", state);
    for (const std::string quantity : kQuantities) {
        lpar.set("run_" + quantity, quantity == "proc_units" ? "0.0" : "0");
    }
}

}  // namespace appliance
