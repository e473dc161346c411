/// How much of the model an operation reads: the type that the visitors hand down to each
/// partition's initialize().
///
/// The values from 33 to 56 are the mark of the partial forms, one bit for the kind, and 16 for
/// names only. The values from 256 on are single bits, which a caller combines.
#ifndef VIRTUAL_SYSTEM_VISITOR_TYPE_H
#define VIRTUAL_SYSTEM_VISITOR_TYPE_H

enum VMVisitorType {
    VISITOR_TYPE_ALL_INIT = 0,
    VISITOR_TYPE_ALL_INIT_NI = 1,  ///< NI here and below: names only

    VISITOR_TYPE_PART_INIT = 32,  ///< marks the partial forms
    VISITOR_TYPE_VSSD_INIT = 33,
    VISITOR_TYPE_VSSD_INIT_NI = 49,
    VISITOR_TYPE_RASD_INIT = 34,
    VISITOR_TYPE_RASD_INIT_NI = 50,
    VISITOR_TYPE_CONF_CAP_INIT = 36,  ///< configuration capabilities
    VISITOR_TYPE_CONF_CAP_INIT_NI = 52,
    VISITOR_TYPE_CONF_SERV_INIT = 40,  ///< configuration services
    VISITOR_TYPE_CONF_SERV_INIT_NI = 56,

    VISITOR_TYPE_LPAR_KEY = 1 << 8,  ///< KEY here and below: keys only
    VISITOR_TYPE_LPAR = 1 << 9,
    VISITOR_TYPE_VSSD_KEY = 1 << 10,
    VISITOR_TYPE_VSSD = 1 << 11,
    VISITOR_TYPE_RASD_PROC_KEY = 1 << 12,
    VISITOR_TYPE_RASD_PROC = 1 << 13,
    VISITOR_TYPE_RASD_MEM_KEY = 1 << 14,
    VISITOR_TYPE_RASD_MEM = 1 << 15,
    VISITOR_TYPE_RASD_IOSLOT_KEY = 1 << 16,
    VISITOR_TYPE_RASD_IOSLOT = 1 << 17,
    VISITOR_TYPE_RASD_VSCSI_KEY = 1 << 18,
    VISITOR_TYPE_RASD_VSCSI = 1 << 19,
    VISITOR_TYPE_RASD_VSERIAL_KEY = 1 << 20,
    VISITOR_TYPE_RASD_VSERIAL = 1 << 21,
    VISITOR_TYPE_RASD_VETH_KEY = 1 << 22,
    VISITOR_TYPE_RASD_VETH = 1 << 23
};

#endif
