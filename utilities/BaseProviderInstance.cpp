// Instance and property operations of zemBaseProvider.
#include "BaseProvider.h"
#include "BaseProviderFrame.h"
#include "BaseProviderText.h"

namespace {

// Some servers report an unknown property by code, others by a value that tests as not found.
CmpiData propertyOrNull(const CmpiInstance& instance, const char* name) {
    try {
        return instance.getProperty(name);
    } catch (const CmpiStatus& status) {
        if (status.rc() != CMPI_RC_ERR_NOT_FOUND && status.rc() != CMPI_RC_ERR_NO_SUCH_PROPERTY) {
            throw;
        }
        return CmpiData();
    }
}

}  // namespace

CmpiStatus zemBaseProvider::getInstance(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const char** properties) {
    zemOperationFrame frame(*this, zemOperation::GetInstance, ctx, &path, &result);
    return frame.run([&] { result.returnData(getInstance(ctx, path, properties)); });
}

CmpiInstance zemBaseProvider::getInstance(const CmpiContext& ctx, const CmpiObjectPath& path,
                                          const char** properties) {
    zemOperationFrame frame(*this, zemOperation::InnerGetInstance, ctx, &path);
    frame.enter();
    frame.admit();
    CmpiInstance instance = performGetInstance(ctx, path, properties);
    validateProerties(path, properties, "getInstance");
    validateKeys(path, instance.getObjectPath(), "getInstance", false);
    frame.leave();
    return instance;
}

CmpiStatus zemBaseProvider::enumInstances(const CmpiContext& ctx, CmpiResult& result,
                                          const CmpiObjectPath& path, const char** properties) {
    zemOperationFrame frame(*this, zemOperation::EnumInstances, ctx, &path, &result);
    return frame.run([&] {
        validateProerties(path, properties, "enumerateInstances");
        performEnumInstances(ctx, result, path, properties);
    });
}

CmpiStatus zemBaseProvider::enumInstanceNames(const CmpiContext& ctx, CmpiResult& result,
                                              const CmpiObjectPath& path) {
    zemOperationFrame frame(*this, zemOperation::EnumInstanceNames, ctx, &path, &result);
    return frame.run([&] { performEnumInstanceNames(ctx, result, path); });
}

CmpiStatus zemBaseProvider::setInstance(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const CmpiInstance& instance,
                                        const char** properties) {
    zemOperationFrame frame(*this, zemOperation::SetInstance, ctx, &path, &result);
    frame.setInstance(instance);
    return frame.run([&] {
        if (path.getKeyCount() != 0) {
            // An exit line precedes the existence test and a second one ends the operation; the
            // readers of these traces know the pair.
            frame.traceExit();
            getInstance(ctx, path, properties);
        }
        performSetInstance(ctx, result, path, instance, properties);
    });
}

CmpiStatus zemBaseProvider::createInstance(const CmpiContext& ctx, CmpiResult& result,
                                           const CmpiObjectPath& path,
                                           const CmpiInstance& instance) {
    zemOperationFrame frame(*this, zemOperation::CreateInstance, ctx, &path, &result);
    frame.setInstance(instance);
    return frame.run([&] {
        validateProerties(path, zemPropertyNames(instance), "createInstance");
        performCreateInstance(ctx, result, path, instance);
    });
}

CmpiStatus zemBaseProvider::deleteInstance(const CmpiContext& ctx, CmpiResult& result,
                                           const CmpiObjectPath& path) {
    zemOperationFrame frame(*this, zemOperation::DeleteInstance, ctx, &path, &result);
    return frame.run([&] { performDeleteInstance(ctx, result, path); });
}

CmpiStatus zemBaseProvider::getProperty(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const char* name) {
    zemOperationFrame frame(*this, zemOperation::GetProperty, ctx, &path, &result);
    return frame.run([&] {
        const char* properties[] = {name, nullptr};
        const CmpiInstance instance = performGetInstance(ctx, path, properties);
        validateKeys(path, instance.getObjectPath(), "getProperty", false);
        const CmpiData value = propertyOrNull(instance, name);
        if (zemIsMissing(value)) {
            result.returnDone();
            frame.answer(returnStatus(CMPI_RC_ERR_NO_SUCH_PROPERTY, name));
            return;
        }
        result.returnData(value);
    });
}

CmpiStatus zemBaseProvider::setProperty(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const char* name,
                                        const CmpiData& data) {
    zemOperationFrame frame(*this, zemOperation::SetProperty, ctx, &path, &result);
    return frame.run([&] {
        const char* properties[] = {name, nullptr};
        CmpiInstance instance(path);
        instance.setProperty(name, CmpiData(data));
        performSetInstance(ctx, result, path, instance, properties);
    });
}

CmpiInstance zemBaseProvider::performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                                 const char**) {
    refuse(__func__, "getInstance", zemClassOf(path));
}

void zemBaseProvider::performEnumInstances(const CmpiContext&, CmpiResult&,
                                           const CmpiObjectPath& path, const char**) {
    refuse(__func__, "enumerateInstances", zemClassOf(path));
}

void zemBaseProvider::performEnumInstanceNames(const CmpiContext&, CmpiResult&,
                                               const CmpiObjectPath& path) {
    refuse(__func__, "enumerateInstanceNames", zemClassOf(path));
}

void zemBaseProvider::performSetInstance(const CmpiContext&, CmpiResult&,
                                         const CmpiObjectPath& path, const CmpiInstance&,
                                         const char**) {
    refuse(__func__, "modifyInstance", zemClassOf(path));
}

void zemBaseProvider::performCreateInstance(const CmpiContext&, CmpiResult&,
                                            const CmpiObjectPath& path, const CmpiInstance&) {
    refuse(__func__, "createInstance", zemClassOf(path));
}

void zemBaseProvider::performDeleteInstance(const CmpiContext&, CmpiResult&,
                                            const CmpiObjectPath& path) {
    refuse(__func__, "deleteInstance", zemClassOf(path));
}
