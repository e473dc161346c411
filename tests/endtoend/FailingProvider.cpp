// A provider of disks of which one exists, and which fails on demand: the Name that is asked for,
// or the argument Failure, says how. Written as a user would write one.
#include <cstring>

#include "BaseZemProvider.h"
#include "Exception.h"
#include "ProviderFactories.h"

namespace {

using Base = const zemBaseZemProvider&;

constexpr const char kClass[] = "Test_Disk";
constexpr const char kGet[] = "getInstance";
constexpr const char kDisk[] = "sda";
constexpr const char kRefusedUser[] = "guest";
constexpr CMPIUint32 kSlot = 1;
constexpr CMPIUint64 kLarge = 18446744073709551615U;

struct Failure {
    const char* name;
    void (*raise)(Base p);
};

// clang-format off
constexpr Failure kFailures[] = {
    {"MethodNotSupported", [](Base p) { p.throwMethodNotSupportedExc(kGet, kClass); }},
    {"MethodNotFound", [](Base p) { p.throwMethodNotFoundExc(kGet, kClass); }},
    {"UserAccessDenied", [](Base p) { p.throwUserAccessDeniedExc(kGet, kClass, "kim"); }},
    {"KeyNotFound", [](Base p) { p.throwKeyNotFoundExc(kGet, kClass, "k"); }},
    {"InvalidKey", [](Base p) { p.throwInvalidKeyExc(kGet, kClass, "k"); }},
    {"DuplicateKey", [](Base p) { p.throwDuplicateKeyExc(kGet, kClass, "k"); }},
    {"KeyValueDoesntMatch", [](Base p) { p.throwKeyValueDoesntMatchExc(kGet, kClass, "k", "1", "2"); }},
    {"PropertyNotFound", [](Base p) { p.throwPropertyNotFoundExc(kClass, "p"); }},
    {"DuplicateProperty", [](Base p) { p.throwDuplicatePropertyExc(kGet, kClass, "p"); }},
    {"InvalidProperty", [](Base p) { p.throwInvalidPropertyExc(kGet, kClass, "p"); }},
    {"ObjectNotFound", [](Base p) { p.throwObjectNotFoundExc(kGet, kClass, "o"); }},
    {"WrongMethodArg", [](Base p) { p.throwWrongMethodArgExc("a", "m"); }},
    {"DuplicateMethodArg", [](Base p) { p.throwDuplicateMethodArgExc("a", "m"); }},
    {"InvalidMethodArgValue", [](Base p) { p.throwInvalidMethodArgValueExc("a", "v", "m"); }},
    {"ParameterNotFound", [](Base p) { p.throwParameterNotFoundExc("a"); }},
    {"PropertyValueDoesntMatch", [](Base p) { p.throwPropertyValueDoesntMatchExc(kClass, "p", "1", "2"); }},
    {"MultiResource", [](Base p) { p.throwMultiResourceExc("memory", "lp1", "host"); }},
    {"DuplicateResource", [](Base p) { p.throwDuplicateResourceExc("slot", "v", "lp1", "host"); }},
    {"ResourceHasExisted", [](Base p) { p.throwResourceHasExistedExc("slot", "v", "lp1", "host"); }},
    {"ResourceNotExisting", [](Base p) { p.throwResourceNotExistingExc("slot", "v", "lp1", "host", "w,x"); }},
    {"MinGtDesiredValue", [](Base p) { p.throwMinGtDesiredValueExc(kLarge, 1, kClass, "lp1", "host", "memory"); }},
    {"MinGtMaxValue", [](Base p) { p.throwMinGtMaxValueExc(kLarge, 1, kClass, "lp1", "host", "memory"); }},
    {"DesiredGtMaxValue", [](Base p) { p.throwDesiredGtMaxValueExc(kLarge, 1, kClass, "lp1", "host", "memory"); }},
    {"AlreadyExists", [](Base) { throw zemObjectAlreadyExistsException("there is one"); }},
    {"NoSuchProperty", [](Base) { throw zemPropertyNotFoundException("there is none"); }},
    {"OtherKind", [](Base) { throw zemException(99, "of no kind"); }},
    {"PropertiesAccessException1", [](Base) { throw zemAccessDeniedException("Tool", "run", "it \"broke\""); }},
    {"PropertiesAccessException2", [](Base) { throw zemOperationFailedException("Tool", "run", "readDisks", "E7", "broke"); }},
    {"Status", [](Base) { throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND, "the binding's own"); }},
};
// clang-format on

CmpiData slotOf(CMPIUint32 slot) {
    CmpiData data;
    data.setUint32(slot);
    return data;
}

class FailingProvider : public zemBaseZemProvider {
public:
    FailingProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseZemProvider(mb, ctx, name) {}

protected:
    CMPIBoolean isValidInstanceClass(const char* name) override {
        return compareClassNames(name, kClass);
    }
    CMPIBoolean isValidMethodClass(const char* name) override {
        return compareClassNames(name, kClass);
    }
    CMPIBoolean isStaticMethod(const char*, const char* method) override {
        return strcmp(method, "Fail") == 0;
    }
    void populateEssentialKeys(const char*, CmpiArray& keys) override {
        setText(keys, 0, "Name");
        setText(keys, 1, "Slot");
    }
    void populateMethodArgs(const char*, zemDynamicArray<zemString>& args,
                            const char* method) override {
        const char* const name = strcmp(method, "Fail") == 0     ? "Failure"
                                 : strcmp(method, "Attach") == 0 ? "Host"
                                                                 : "Disk";
        args.addElement(new zemString(name));
    }

    /// "moved" is a disk that has another name meanwhile.
    CmpiInstance performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                    const char**) override {
        const CmpiString asked = getKeyBinding(path, "Name").getString();
        fail(asked.charPtr());
        if (!asked.equals(kDisk) && !asked.equals("moved")) {
            throwObjectNotFoundExc(kGet, kClass, objectPathToString(path));
        }
        return CmpiInstance(diskPath(path));
    }
    void performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const char**) override {
        result.returnData(CmpiInstance(diskPath(path)));
        const zemString user = getUserContext(ctx);
        if (user == kRefusedUser) {
            throwUserAccessDeniedExc("enumerateInstances", kClass, user);
        }
        if (!user.isEmpty()) {
            fail(user);
        }
    }
    void performCreateInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                               const CmpiInstance& disk) override {
        getInstanceProperty(disk, "Size", CMPI_uint64);
        validateRequestedProperty(disk, "Caption");
        validateUnsupportedProperty(disk, "Firmware");
        validateUnimplementedProperty(disk, "Vendor");
        validateCannotSpecifiedProperty(disk, "State");
        validateFixedValueProperty(disk, "Kind", "disk", true);
    }
    void performSetInstance(const CmpiContext& ctx, CmpiResult&, const CmpiObjectPath&,
                            const CmpiInstance& disk, const char** properties) override {
        getInstanceProperty(disk, "Size", CMPI_uint64);
        if (!containsProperty(properties, "Host")) {
            return;
        }
        validateEmbeddedObject(ctx, getPropVal(disk, "Host").getInstance().getObjectPath(), "Host",
                               "modifyInstance");
    }
    void performInvokeMethod(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath&,
                             const char* method, const CmpiArgs& in, CmpiArgs&) override {
        if (strcmp(method, "Fail") == 0) {
            fail(getParmVal(in, "Failure").getString().charPtr());
        } else if (strcmp(method, "Attach") == 0) {
            validateEmbeddedObject(ctx, getParmVal(in, "Host").getObjectPath(), "Host", method);
        } else if (strcmp(method, "Replace") == 0) {
            const CmpiInstance disk = getParmVal(in, "Disk").getInstance();
            validateEmbededInstanceProerties(disk, method);
            getInstanceProperty(disk, "Size", CMPI_uint64);
            validateEmbeddedObject(ctx, disk.getObjectPath(), "Disk", method);
        } else {
            throwMethodNotFoundExc(method, kClass);
        }
        result.returnData(slotOf(0));
    }

private:
    void fail(const char* name) const {
        for (const Failure& failure : kFailures) {
            if (strcmp(failure.name, name) == 0) {
                failure.raise(*this);
            }
        }
    }
    static CmpiObjectPath diskPath(const CmpiObjectPath& near) {
        CmpiObjectPath path = createObjectPath(near);
        path.setKey("Name", CmpiData(kDisk));
        path.setKey("Slot", slotOf(kSlot));
        return path;
    }
};

}  // namespace

ZEM_PROVIDER(Test_DiskProvider, FailingProvider)
