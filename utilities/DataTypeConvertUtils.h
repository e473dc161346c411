/// From the path of a CIM object to the host and the partition that it belongs to.
///
/// The classes of the schema carry that identity in different keys and shapes;
/// zemDataTypeConvertManager knows them class by class, so that association providers can tell
/// whether two objects stand on one host without asking anyone. A host is named by its MTMS,
/// "<type_model>*<serial_num>", a partition by "<lparId>*<MTMS>".
///
/// The two operations know different classes and cut some keys differently; callers rely on each
/// as it is. An empty MTMS means that the path names no host, and never matches another.
///
/// Thread-safety: no state; any thread may call.
#ifndef DATA_TYPE_CONVERT_UTILS_H
#define DATA_TYPE_CONVERT_UTILS_H

#include "CmpiObjectPath.h"
#include "StringUtils.h"
#include "ZemExport.h"

struct zemIdentityCuts;

class ZEM_EXPORT zemDataTypeConvertManager {
public:
    /// The host of an object; "" for a class that is not known or a key of another shape.
    /// @throws CmpiStatus  the binding's, when the path lacks the key of its class
    static zemString getMTMSByOP(const CmpiObjectPath& cop);

    /// Host and partition as far as the class has them; both are emptied first.
    /// @throws CmpiStatus  as above
    static void getMTMSAndLparIDByOp(const CmpiObjectPath& cop, zemString& mtms, zemString& lparid);

private:
    friend struct zemIdentityCuts;

    /// Splits at the first "*"; leaves both alone when there is none.
    static void seperateMTMSAndLparID(const zemString& key, zemString& mtms, zemString& lparid);
};

#endif
