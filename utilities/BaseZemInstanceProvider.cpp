#include "BaseZemInstanceProvider.h"

#include "BaseProviderText.h"

namespace {

// Where the host's key begins in a key: behind the first of two stars, else at the start.
unsigned hostKeyStart(const zemString& key) {
    if (key.count('*') < 2) {
        return 0;
    }
    return static_cast<unsigned>(key.find('*')) + 1;
}

template <class Object>
void returnAll(CmpiResult& result, const zemDynamicArray<Object>& objects) {
    for (int i = 0; i < objects.size(); ++i) {
        if (objects[i] != nullptr) {
            result.returnData(*objects[i]);
        }
    }
}

}  // namespace

zemBaseZemInstanceProvider::zemBaseZemInstanceProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                                       const char* name)
    : CmpiBaseMI(mb, ctx), zemBaseZemValidator(mb, ctx, name), m_broker(mb) {}

int zemBaseZemInstanceProvider::getInstance(const CmpiContext&, const CmpiObjectPath&, const char**,
                                            CmpiInstance&) {
    return -1;
}

void zemBaseZemInstanceProvider::enumInstanceNames(const CmpiContext&, const CmpiObjectPath&,
                                                   zemDynamicArray<CmpiObjectPath>&,
                                                   const CmpiObjectPath&) {}

void zemBaseZemInstanceProvider::enumInstances(const CmpiContext&, const CmpiObjectPath&,
                                               const char**, zemDynamicArray<CmpiInstance>&,
                                               const CmpiObjectPath&) {}

CmpiInstance zemBaseZemInstanceProvider::performGetInstance(const CmpiContext& ctx,
                                                            const CmpiObjectPath& path,
                                                            const char** properties) {
    CmpiInstance instance(path);
    if (getInstance(ctx, path, properties, instance) != 0) {
        throwObjectNotFoundExc("getInstance", zemClassOf(path), objectPathToString(path));
    }
    return instance;
}

void zemBaseZemInstanceProvider::performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                                                      const CmpiObjectPath& path,
                                                      const char** properties) {
    zemDynamicArray<CmpiInstance> instances(25);
    enumInstances(ctx, path, properties, instances, path);
    returnAll(result, instances);
}

void zemBaseZemInstanceProvider::performEnumInstanceNames(const CmpiContext& ctx,
                                                          CmpiResult& result,
                                                          const CmpiObjectPath& path) {
    zemDynamicArray<CmpiObjectPath> paths(25);
    enumInstanceNames(ctx, path, paths, path);
    returnAll(result, paths);
}

// By value, as final providers call them.
// NOLINTBEGIN(performance-unnecessary-value-param)
zemString zemBaseZemInstanceProvider::getLparID(zemString key) {
    const unsigned start = hostKeyStart(key);
    return start > 0 ? key.extractSubstring(0, start - 1) : zemString();
}

zemString zemBaseZemInstanceProvider::getMtms(zemString key) {
    return key.extractSubstring(hostKeyStart(key));
}
// NOLINTEND(performance-unnecessary-value-param)
