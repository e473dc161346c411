/// Associations whose sides are instance providers of the same process.
///
/// A final provider derives from one of two bases and fills m_associationDataSet in its
/// constructor with pairs of sides; each side carries the handle of the provider that serves its
/// class. Objects are fetched by calling that provider directly, past the server. An association
/// class is itself an instance class here, so its provider may be a side of another association.
///
/// zemBaseZemMultiNtoNAssociationProvider asks isValidateAssociation() for every pair of objects.
/// zemEnhanceBaseZemMultiNtoNAssociationProvider is for large sides: it joins them by a key that
/// the subclass computes for an object, asks isValidateAssociationPlus() only for objects with the
/// same key, and hands what BeforeGenerateAssociation() prepared through all hooks.
///
///     class SystemDisk : public zemEnhanceBaseZemMultiNtoNAssociationProvider {
///     public:
///         SystemDisk(const CmpiBroker& mb, const CmpiContext& ctx, Hosts* hosts, Disks* disks)
///             : CmpiBaseMI(mb, ctx),
///               zemEnhanceBaseZemMultiNtoNAssociationProvider(mb, ctx, "SystemDisk", OP_ALLOps) {
///             m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
///                 {hosts, "ORX_Host", "GroupComponent", ""},
///                 {disks, "ORX_Disk", "PartComponent", ""}, "ORX_SystemDisk", ""));
///         }
///         zemString getObjectPathHashKeyString(const CmpiObjectPath& cop, bool isLeft) override {
///             return getKeyBinding(cop, isLeft ? "Name" : "SystemName").getString().charPtr();
///         }
///     };
///
/// Classes of objects are compared by name, ignoring case; subclasses need pairs of their own.
///
/// Filters of a navigation. A role must be the name of the reference property that points at the
/// target, a result role that of the one that points at the source.
///
/// Failures of the handles pass through; what a CmpiStatus becomes is that of the other families.
/// A side without a handle fails the requests that need it.
///
/// Threads. The hooks of the first base run under m_operationLock, one per provider: Before, After,
/// and those for one pair of objects together. While a handle is asked the lock is free, for what
/// the handle does may wait, through the server, for another operation of this provider. So
/// operations interleave, and what the Before hook prepares is kept by thread, not by provider. A
/// hook that asks the server does so with the lock held. The second base has no lock: what it
/// prepares travels in the context.
#ifndef BASE_ZEM_MULTI_NTON_ASSOCIATION_PROVIDER_H
#define BASE_ZEM_MULTI_NTON_ASSOCIATION_PROVIDER_H

#include <functional>
#include <memory>
#include <set>
#include <string>
#include <unordered_map>

#include "AssociationOperations.h"
#include "BaseZemInstanceProvider.h"
#include "BaseZemMultiNtoNAssociationData.h"
#include "Synchronizer.h"

class zemAssociationCall;

/// What the two bases have in common. Not for use by final providers.
class ZEM_EXPORT zemProviderPairAssociation
    : public zemAssociationNavigation<zemBaseZemInstanceProvider> {
public:
    ZEM_ASSOCIATION_OPERATIONS();
    using Paths = zemDynamicArray<CmpiObjectPath>;
    using Targets = zemDynamicArray<zemMultiTargetAssociationData>;

    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::enumInstances;
    using zemBaseZemInstanceProvider::getInstance;

    /// Both referenced objects must exist and be associated.
    /// @return 0, or -1 when they are not
    /// @throws zemInvalidParameterException  for a reference whose class is on no such side
    int getInstance(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties,
                    CmpiInstance& out) override;
    void enumInstanceNames(const CmpiContext& ctx, const CmpiObjectPath& cop, Paths& out,
                           const CmpiObjectPath& origCop) override;
    void enumInstances(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties,
                       zemDynamicArray<CmpiInstance>& out, const CmpiObjectPath& origCop) override;

    CMPIBoolean isValidInstanceClass(const char* name) override;
    CMPIBoolean isValidAssociationClass(const char* name) override;
    void populateEssentialKeys(const char* name, CmpiArray& keys) override;
    const char* getMessageBundlePath() override;

    /// Handle of the first side with that class; null if there is none.
    zemBaseZemInstanceProvider* getProviderHandleByClassName(const char* name) const;

    /// Whether a class stands on the left (first) or right (second) side of any pair.
    bool findClassBySide(const char* name, bool isLeft) const;
    bool isFirstClass(const char* name) const { return findClassBySide(name, true); }
    bool isSecondClass(const char* name) const { return findClassBySide(name, false); }
    bool hasRelationShipBetweenTwoClass(const char* left, const char* right) const;

    /// Reference properties of the first pair; "" without pairs.
    zemString getLeftRefPropName() const;
    zemString getRightRefPropName() const;

protected:
    /// Paths by class that one operation has fetched; names and arrays at the same positions.
    using CachedNames = zemDynamicArray<zemString>;
    using CachedPaths = zemDynamicArray<Paths>;

    zemProviderPairAssociation(const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
                               SupportedOpType supportedOperations);

    /// Lets @p cops read the paths of one side of a pair, which belong to the cache.
    /// @throws zemOperationFailedException  when the side has no handle
    void getCopsByClassName(const CmpiContext& ctx, const CmpiObjectPath& cop,
                            const zemMultiNtoNAssociationPair& pair, Paths& cops,
                            CachedNames& cache1, CachedPaths& cache2, bool isLeft);

    /// Whether the source exists, as the provider of its class says.
    /// @return false also for a class that is on no side
    bool ValidateInputObjectPath(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                 const char* method, const char** properties = nullptr);

    /// Whether the class of @p cop is on a side of the pair, and on which.
    bool CheckClassNameInAssociationPair(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                         const zemMultiNtoNAssociationPair& pair, bool& isFirst);
    /// Whether a target passes the filters of a request; null and empty ones do not restrict.
    bool CheckRolesAndResultClass(const char* resultRole, const char* role, const char* resultClass,
                                  const zemMultiTargetAssociationData& target) const;
    /// The body of CheckAssociationOperationParameters().
    void collectTargets(const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
                        const char* resultClass, const char* role, const char* resultRole,
                        Targets& targets);

    SupportedOpType m_supportedOperations;
    zemMultiNtoNAssociationDataSet m_associationDataSet;

    /// An enumeration: of paths, or of instances where there is no array for paths.
    struct Enumeration {
        const CmpiContext& ctx;
        const CmpiObjectPath& cop;
        const char** properties;
        Paths* paths;
        zemDynamicArray<CmpiInstance>* instances;
    };
    /// The source of a navigation, on its side of a pair.
    struct Source {
        const CmpiContext& ctx;
        const CmpiObjectPath& cop;
        bool isFirst;
        const zemMultiNtoNAssociationPair& pair;
        void* addInfo;

        const CmpiObjectPath& left(const CmpiObjectPath& target) const {
            return isFirst ? cop : target;
        }
        const CmpiObjectPath& right(const CmpiObjectPath& target) const {
            return isFirst ? target : cop;
        }
    };
    using Work = std::function<void(void* addInfo)>;
    using Make = std::function<void(const CmpiObjectPath& left, const CmpiObjectPath& right)>;
    using Found = std::function<void(const CmpiObjectPath& target)>;
    class PathsLike;

    /// Path, resp. instance, of the association of two objects, by the hooks.
    std::unique_ptr<CmpiObjectPath> associate(const PathsLike& request, const CmpiObjectPath& left,
                                              const CmpiObjectPath& right);
    std::unique_ptr<CmpiInstance> associate(const PathsLike& request, const CmpiObjectPath& left,
                                            const CmpiObjectPath& right, const char** properties,
                                            void* addInfo);

private:
    // What the bases do differently; each adapts its hooks.

    /// Does @p work between the Before and the After hook, with what the first has prepared.
    virtual void prepare(const CmpiContext& ctx, const char* className, const CmpiObjectPath& cop,
                         const Work& work) = 0;
    /// Adds the associations between the objects of a pair of sides.
    virtual void join(const Enumeration& e, const Paths& lefts, const Paths& rights,
                      const zemMultiNtoNAssociationPair& pair, void* addInfo) = 0;
    /// Finds the targets that belong to a source: has the association made by @p make, among the
    /// hooks for the two objects, and then calls @p found, which may ask handles.
    virtual void neighbours(const Source& source, const Paths& targets, const Make& make,
                            const Found& found) = 0;
    /// Whether two objects that a client names belong together; if so calls @p make.
    virtual bool belongs(const CmpiContext& ctx, const CmpiObjectPath& left,
                         const CmpiObjectPath& right, const zemMultiNtoNAssociationPair& pair,
                         void* addInfo, const Make& make) = 0;
    virtual void nameKeys(CmpiObjectPath& ncop, const CmpiObjectPath& left,
                          const CmpiObjectPath& right, const char* className) = 0;
    virtual void complete(CmpiInstance& inst, const CmpiObjectPath& left,
                          const CmpiObjectPath& right, const char** properties,
                          const char* className, void* addInfo) = 0;
    virtual void findTargets(const CmpiContext& ctx, const CmpiObjectPath& cop,
                             const char* assocClass, const char* resultClass, const char* role,
                             const char* resultRole, Targets& targets) = 0;
    virtual bool standsLeft(const CmpiContext& ctx, const CmpiObjectPath& cop) = 0;

    void enumerate(zemAssociationCall& call, const Enumeration& e);
    bool exists(const CmpiContext& ctx, const CmpiObjectPath& cop, const char** properties);
    void navigate(const zemAssociationRequest& r) override;
    void visitTarget(zemAssociationCall& call, const zemAssociationRequest& r,
                     const zemMultiTargetAssociationData& target, void* addInfo);
};

class ZEM_EXPORT zemBaseZemMultiNtoNAssociationProvider : public zemProviderPairAssociation {
public:
    /// @param providerName  "zemBaseZemMultiNtoNAssociationProvider" in the first form
    zemBaseZemMultiNtoNAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                           SupportedOpType supportedOperations);
    zemBaseZemMultiNtoNAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                           const char* providerName,
                                           SupportedOpType supportedOperations);

    // ---- Hooks ----------------------------------------------------------------------------------

    /// Sets the two references on the path and on the instance of an association.
    virtual void addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                         const CmpiObjectPath& cop2, const char* className);
    virtual void addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2, const char** properties,
                               const char* className);

    /// Finds the sides on which the neighbours of @p cop can be, under the filters of a request.
    virtual void CheckAssociationOperationParameters(const CmpiContext& ctx,
                                                     const CmpiObjectPath& cop,
                                                     const char* assocClass,
                                                     const char* resultClass, const char* role,
                                                     const char* resultRole, Targets& targets);

    /// With one class on both sides of a pair: whether @p cop stands on the left. By default not.
    virtual bool isFirstClassWhen2ClassTheSame(const CmpiContext& ctx, const CmpiObjectPath& cop);

    /// Whether the left and the right object belong together; by default all do. In a navigation
    /// the sides in @p pair have the namespace of the request where none is configured, that of the
    /// source always.
    virtual bool isValidateAssociation(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                                       const CmpiObjectPath& cop2,
                                       const zemMultiNtoNAssociationPair& pair);

    /// Called before objects are fetched and at the end, in pairs unless the first throws. False
    /// ends the operation without results.
    virtual bool BeforeGenerateAssociation(const CmpiContext& ctx, const char* className);
    virtual void AfterGenerateAssociation(const CmpiContext& ctx, const char* className);

protected:
    zemSynchronizerContext m_operationLock;

private:
    class Preparation;
    void prepare(const CmpiContext& ctx, const char* className, const CmpiObjectPath& cop,
                 const Work& work) override;
    void join(const Enumeration& e, const Paths& lefts, const Paths& rights,
              const zemMultiNtoNAssociationPair& pair, void* addInfo) override;
    void neighbours(const Source& source, const Paths& targets, const Make& make,
                    const Found& found) override;
    bool belongs(const CmpiContext& ctx, const CmpiObjectPath& left, const CmpiObjectPath& right,
                 const zemMultiNtoNAssociationPair& pair, void* addInfo, const Make& make) override;
    void nameKeys(CmpiObjectPath& ncop, const CmpiObjectPath& left, const CmpiObjectPath& right,
                  const char* className) override;
    void complete(CmpiInstance& inst, const CmpiObjectPath& left, const CmpiObjectPath& right,
                  const char** properties, const char* className, void* addInfo) override;
    void findTargets(const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
                     const char* resultClass, const char* role, const char* resultRole,
                     Targets& targets) override;
    bool standsLeft(const CmpiContext& ctx, const CmpiObjectPath& cop) override;
};

class ZEM_EXPORT zemEnhanceBaseZemMultiNtoNAssociationProvider : public zemProviderPairAssociation {
public:
    /// @param providerName  "zemEnhanceBaseZemMultiNtoNAssociationProvider" in the first form
    zemEnhanceBaseZemMultiNtoNAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                                  SupportedOpType supportedOperations);
    zemEnhanceBaseZemMultiNtoNAssociationProvider(const CmpiBroker& mb, const CmpiContext& ctx,
                                                  const char* providerName,
                                                  SupportedOpType supportedOperations);

    // ---- Hooks, as above; addInfo is what BeforeGenerateAssociation() returned ------------------

    virtual void addKeys(CmpiObjectPath& ncop, const CmpiObjectPath& cop1,
                         const CmpiObjectPath& cop2, const char* className);
    virtual void addProperties(CmpiInstance& inst, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2, const char** properties,
                               const char* className, void* addInfo);
    virtual void CheckAssociationOperationParameters(const CmpiContext& ctx,
                                                     const CmpiObjectPath& cop,
                                                     const char* assocClass,
                                                     const char* resultClass, const char* role,
                                                     const char* resultRole, Targets& targets);
    virtual bool isFirstClassWhen2ClassTheSame(const CmpiContext& ctx, const CmpiObjectPath& cop);

    /// Whether two objects belong together that a client names in getInstance.
    virtual bool isValidateAssociation(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                                       const CmpiObjectPath& cop2, void* addInfo);

    /// Prepares the context of one operation, which AfterGenerateAssociation() gets back to
    /// release. A null context is no failure.
    virtual void* BeforeGenerateAssociation(const CmpiContext& ctx, const char* className,
                                            const CmpiObjectPath& cop);
    virtual void AfterGenerateAssociation(const CmpiContext& ctx, const char* className,
                                          void* addInfo);

    /// Whether two objects with the same key belong together; by default all do.
    virtual bool isValidateAssociationPlus(const CmpiContext& ctx, const CmpiObjectPath& cop1,
                                           const CmpiObjectPath& cop2, void* addInfo);

    /// The key that associated objects share; by default all have the same.
    virtual zemString getObjectPathHashKeyString(const CmpiObjectPath& cop, bool isLeft);

protected:
    /// Positions of objects by key.
    class ZEM_EXPORT PathsByKey {
    public:
        void insert(const zemString& key, int position) {
            m_positions[static_cast<const char*>(key)].insert(position);
        }
        /// The positions under a key, in order.
        std::set<int> getElement(const zemString& key) const {
            const auto found = m_positions.find(static_cast<const char*>(key));
            return found != m_positions.end() ? found->second : std::set<int>();
        }

    private:
        std::unordered_map<std::string, std::set<int>> m_positions;
    };

    /// Positions of associated objects, in the order of the left ones.
    zemDynamicArray<objectPathIndexPair> findValidAssociationCopMappingPair(const CmpiContext& ctx,
                                                                            const Paths& leftCops,
                                                                            const Paths& rightCops,
                                                                            void* addInfo);
    /// Positions of the right objects by key.
    PathsByKey getObjectPathHashRes(const Paths& rightCops);

    /// Appends the pairs that one left object belongs to.
    void setValidAssociationIndexPairSet(const CmpiContext& ctx, const CmpiObjectPath& leftCop,
                                         int leftIndex, const Paths& rightCops,
                                         const PathsByKey& hash,
                                         zemDynamicArray<objectPathIndexPair>& pairs,
                                         void* addInfo);

    /// Positions of the targets that belong to a source, which is on the left if @p isFirst.
    std::set<int> getValidIndexSet(const CmpiContext& ctx, const CmpiObjectPath& source,
                                   bool isFirst, const Paths& targets, void* addInfo);

    /// Appends paths, resp. instances, of the associations of pairs of objects.
    void setValidAssociationKeys(const CmpiObjectPath& cop, const Paths& lefts, const Paths& rights,
                                 const zemDynamicArray<objectPathIndexPair>& pairs, Paths& out);
    void setValidAssociationProperties(const CmpiObjectPath& cop, const Paths& lefts,
                                       const Paths& rights,
                                       const zemDynamicArray<objectPathIndexPair>& pairs,
                                       const char** properties, void* addInfo,
                                       zemDynamicArray<CmpiInstance>& out);

private:
    void prepare(const CmpiContext& ctx, const char* className, const CmpiObjectPath& cop,
                 const Work& work) override;
    void join(const Enumeration& e, const Paths& lefts, const Paths& rights,
              const zemMultiNtoNAssociationPair& pair, void* addInfo) override;
    void neighbours(const Source& source, const Paths& targets, const Make& make,
                    const Found& found) override;
    bool belongs(const CmpiContext& ctx, const CmpiObjectPath& left, const CmpiObjectPath& right,
                 const zemMultiNtoNAssociationPair& pair, void* addInfo, const Make& make) override;
    void nameKeys(CmpiObjectPath& ncop, const CmpiObjectPath& left, const CmpiObjectPath& right,
                  const char* className) override;
    void complete(CmpiInstance& inst, const CmpiObjectPath& left, const CmpiObjectPath& right,
                  const char** properties, const char* className, void* addInfo) override;
    void findTargets(const CmpiContext& ctx, const CmpiObjectPath& cop, const char* assocClass,
                     const char* resultClass, const char* role, const char* resultRole,
                     Targets& targets) override;
    bool standsLeft(const CmpiContext& ctx, const CmpiObjectPath& cop) override;
};

#endif
