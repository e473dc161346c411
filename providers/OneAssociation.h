/// What an association provider owes to servers: they differ in which class they hand on when a
/// client asks for a base class of the association, or for no class at all. Some resolve that to
/// the provider's own class, others hand on what was asked for, or nothing.
///
///     class HostedPartition : public OneAssociation<zemNtoNAssociationProvider> {
///     public:
///         HostedPartition(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
///             : CmpiBaseMI(mb, ctx),
///               OneAssociation("ORXC_HostedPartition", mb, ctx, name, ...) {}
///     };
///
/// A provider of one association class derives from its family by way of this class, and answers
/// for its own class whichever of these comes. Thread-safety: that of the family.
#ifndef ONE_ASSOCIATION_H
#define ONE_ASSOCIATION_H

#include <utility>

#include "CmpiObjectPath.h"

/// Where the classes of these providers are, as their registration says.
constexpr const char kNameSpace[] = "root/cimv2";

template <class Family>
class OneAssociation : public Family {
public:
    /// Whether a client that asks for @p name is answered.
    CMPIBoolean isValidAssociationClass(const char* name) override {
        return Family::compareClassNames(name, m_association) ||
               CmpiObjectPath(kNameSpace, m_association).classPathIsA(name);
    }

    void performAssociators(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                            const char*, const char* resultClass, const char* role,
                            const char* resultRole, const char** properties) override {
        Family::performAssociators(ctx, rslt, cop, m_association, resultClass, role, resultRole,
                                   properties);
    }
    void performAssociatorNames(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                                const char*, const char* resultClass, const char* role,
                                const char* resultRole) override {
        Family::performAssociatorNames(ctx, rslt, cop, m_association, resultClass, role,
                                       resultRole);
    }
    void performReferences(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                           const char*, const char* role, const char** properties) override {
        Family::performReferences(ctx, rslt, cop, m_association, role, properties);
    }
    void performReferenceNames(const CmpiContext& ctx, CmpiResult& rslt, const CmpiObjectPath& cop,
                               const char*, const char* role) override {
        Family::performReferenceNames(ctx, rslt, cop, m_association, role);
    }

protected:
    /// @param association  the class served; a literal
    /// @param family  what the family's constructor takes
    template <class... Arguments>
    OneAssociation(const char* association, const CmpiBroker& mb, const CmpiContext& ctx,
                   Arguments&&... family)
        : CmpiBaseMI(mb, ctx),
          Family(mb, ctx, std::forward<Arguments>(family)...),
          m_association(association) {}

private:
    const char* const m_association;
};

#endif
