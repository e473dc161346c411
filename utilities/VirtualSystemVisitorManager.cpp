#include "VirtualSystemVisitorManager.h"

#include "VirtualSystemVisitorCEC.h"

zemCECVisitor* zemVirtualizationManager::createCECVisitor() { return createCECVisitor({}); }

zemCECVisitor* zemVirtualizationManager::createCECVisitor(const zemOperEnv& env) {
    auto visitor = std::make_unique<zemCECVisitor>(this, "");
    visitor->setOperEnv(env);
    return visitor.release();
}

zemLPARonCECVisitor* zemVirtualizationManager::createLPARVisitor(const zemString& type) {
    return createLPARVisitor(type, {});
}
zemLPARonCECVisitor* zemVirtualizationManager::createLPARVisitor(const zemString& type,
                                                                 const zemOperEnv& env) {
    return new zemLPARonCECVisitor(this, type, env);
}

zemVSSDonCECVisitor* zemVirtualizationManager::createVSSDVisitor(const zemString& type) {
    return createVSSDVisitor(type, {});
}
zemVSSDonCECVisitor* zemVirtualizationManager::createVSSDVisitor(const zemString& type,
                                                                 const zemOperEnv& env) {
    return new zemVSSDonCECVisitor(this, type, env);
}

zemRPonCECVisitor* zemVirtualizationManager::createRPonCECVisitor(const zemString& type) {
    return createRPonCECVisitor(type, {});
}
zemRPonCECVisitor* zemVirtualizationManager::createRPonCECVisitor(const zemString& type,
                                                                  const zemOperEnv& env) {
    return new zemRPonCECVisitor(this, type, env);
}

zemCEC* zemVirtualizationManager::getCEC(const zemString& mtms, const zemOperEnv& env) {
    zemCECVisitor visitor(this, "");
    visitor.setOperEnv(env);
    return visitor.getData(mtms);
}
