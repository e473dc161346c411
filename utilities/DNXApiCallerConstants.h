/// Names by which the management library and the console's events know things, as texts that
/// providers ask for by getters. Everything is static and safe from any thread.
#ifndef DNX_API_CALLER_CONSTANTS_H
#define DNX_API_CALLER_CONSTANTS_H

#include "StringUtils.h"
#include "ZemExport.h"

/// Base of the families of constants. The two lookups would read a field of a Java class; no
/// constant needs that, and they answer 0 and an empty text.
class ZEM_EXPORT zemConstants {
public:
    static int getIntProperty(const char*, const char*) { return 0; }
    static zemString getStringProperty(const char*, const char*) { return {}; }
};

/// Keys of reference codes.
class ZEM_EXPORT zemDnxApiConstants : public zemConstants {
public:
    static zemString getCMD_RC() { return "rc"; }
    static zemString getWORD1() { return "word1"; }
    static zemString getWORD2() { return "word2"; }
    static zemString getWORD3() { return "word3"; }
    static zemString getWORD4() { return "word4"; }
    static zemString getWORD5() { return "word5"; }
    static zemString getWORD6() { return "word6"; }
    static zemString getWORD7() { return "word7"; }
    static zemString getWORD8() { return "word8"; }
    static zemString getWORD9() { return "word9"; }
    static zemString getFRU_CALL_OUT_LOC_CODES() { return "fru_call_out_loc_codes"; }
};

#endif
