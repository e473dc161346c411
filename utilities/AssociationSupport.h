/// What the association families share; private to their sources.
///
/// A zemAssociationCall lives on the stack of one operation: it traces entry and exit, makes the
/// timed calls to the broker, and turns what the broker refuses into the exception that the client
/// is to see. The free functions are the small rules that are the same everywhere. Where the
/// families differ on purpose (which side a source is on, when locks are held and hooks called)
/// stands in their own sources.
#ifndef ZEM_ASSOCIATION_SUPPORT_H
#define ZEM_ASSOCIATION_SUPPORT_H

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "AssociationOperations.h"
#include "BaseProvider.h"
#include "BaseProviderText.h"
#include "DynamicArray.h"
#include "Synchronizer.h"

class CTimeLoger;
struct zemAssociationRow;

/// Brackets a call to the broker in the timing trace, under a mark for the call and a class. Does
/// nothing while there is no such trace.
class zemBrokerTiming {
public:
    zemBrokerTiming(const char* mark, const char* className);
    ~zemBrokerTiming();
    zemBrokerTiming(const zemBrokerTiming&) = delete;
    zemBrokerTiming& operator=(const zemBrokerTiming&) = delete;

private:
    CTimeLoger* m_loger = nullptr;
    std::string m_id;
};

/// The bits of SupportedOpType for code that serves every family.
struct zemAssociationBits {
    ZEM_ASSOCIATION_OPERATIONS();
};

/// What a client asks: an enumeration of associations, or a navigation, which has filters. In the
/// reference operations resultClass and resultRole are null: what their client calls result class
/// is the association class.
struct zemAssociationRequest {
    int operation;
    const CmpiContext& ctx;
    CmpiResult& rslt;
    const CmpiObjectPath& cop;
    const char** properties;
    const char* assocClass = nullptr;
    const char* resultClass = nullptr;
    const char* role = nullptr;
    const char* resultRole = nullptr;

    bool is(int operations) const { return (operation & operations) != 0; }
};

/// An object on the far side; its instance is there only where the operation returns it.
struct zemAssociationCandidate {
    CmpiObjectPath path;
    std::optional<CmpiInstance> instance;
};

class zemAssociationCall {
public:
    /// What the families put into the exceptions that a status of the broker becomes.
    enum Wording {
        kFixedId,  ///< id "CIM_ERR"; the broker call that the operation stands for
        kCodeAsId  ///< the name of the code as id; always "enumerateInstanceNames"
    };

    /// The one step of a navigation that is traced and reported like an operation of its own.
    static constexpr int kValidateSource = 128;

    /// @param operation  one bit of SupportedOpType, or kValidateSource
    /// @param function   what is traced, if not the perform* of the operation
    zemAssociationCall(const zemBaseProvider& provider, const char* providerName,
                       CmpiBroker& broker, int operation, const CmpiContext& ctx,
                       const CmpiObjectPath& cop, Wording wording = kFixedId,
                       const char* function = nullptr);
    ~zemAssociationCall();
    zemAssociationCall(const zemAssociationCall&) = delete;
    zemAssociationCall& operator=(const zemAssociationCall&) = delete;

    /// Refuses the operation unless @p supported has its bit.
    void require(int supported);

    /// Runs @p work; a CmpiStatus out of it becomes a zemException.
    /// @return false for a status that ends a navigation quietly
    template <class Work>
    bool guard(Work work) {
        try {
            work();
            return true;
        } catch (const CmpiStatus& status) {
            translate(status);
            return false;
        }
    }

    /// Asks the broker for the object of the request, holding @p lock.
    /// @return 0 when it is there, 1 for a status that becomes no exception
    int validateSource(zemSynchronizerContext& lock);

    /// Calls to the broker, timed as enumerations of a class ("ni"); an object is timed under "gi"
    /// and its own class unless a class is given.
    CmpiInstance getInstance(const CmpiObjectPath& path, const char* timedClass = nullptr);
    CmpiEnumeration enumInstanceNames(const CmpiObjectPath& path, const char* timedClass);
    CmpiEnumeration enumInstances(const CmpiObjectPath& path, const char** properties,
                                  const char* timedClass);

    /// The paths of a class, each with @p nameSpace and the host of the request.
    std::vector<CmpiObjectPath> paths(const char* nameSpace, const char* className);

    /// What a navigation goes through: instances where it returns instances, else paths.
    CmpiEnumeration targets(const zemAssociationRequest& request, const CmpiObjectPath& target,
                            const char* timedClass);

    /// The reference that the request's path holds under a key.
    /// @throws zemInvalidParameterException  for a key that is missing or no reference
    CmpiObjectPath reference(const char* property) const;

    /// A path without keys on the host of the request.
    CmpiObjectPath classPath(const char* nameSpace, const char* className) const;

    /// Gives a path from the broker a namespace, and the host of the request.
    void place(CmpiObjectPath& path, const char* nameSpace) const;

    const char* className() const { return m_className; }
    const char* word() const { return m_word; }

    /// Replaces the word for the operation where the operation is handed one.
    void setWord(const char* word) { m_word = word; }

private:
    void translate(const CmpiStatus& status) const;
    void traceExit();

    const zemBaseProvider& m_provider;
    const char* const m_providerName;
    CmpiBroker& m_broker;
    const zemAssociationRow& m_row;
    const CmpiContext& m_ctx;
    const CmpiObjectPath& m_cop;
    const Wording m_wording;
    const char* const m_function;
    const char* const m_access;
    const char* m_word;
    const zemString m_className;
    const zemString m_host;
    bool m_exited = false;
};

/// Hands an element over to an array, which owns it unless there is no room.
template <class T>
void zemAppend(zemDynamicArray<T>& array, std::unique_ptr<T> element) {
    array.addElement(element.get());
    static_cast<void>(element.release());
}

inline bool zemIsGiven(const char* text) { return text != nullptr && *text != '\0'; }

/// A configured namespace, or that of the request where none is configured.
inline zemString zemNameSpaceOr(const zemString& configured, const CmpiObjectPath& cop) {
    return configured.isEmpty() ? zemTextOf(cop.getNameSpace()) : configured;
}

/// Whether a path is of a class or of one derived from it. A class that the server does not know
/// is an ancestor of no other. The second form asks the same about a class.
bool zemPathIsA(const CmpiObjectPath& path, const char* ancestor);
bool zemClassIsA(const char* nameSpace, const char* className, const char* ancestor);

/// Whether a path is of a class, which may be a suffix as compareClassNames() takes it, or of one
/// derived from it.
bool zemIsOfClass(const CmpiObjectPath& path, const char* className);

/// The next element of an enumeration of paths, of instances, or of either.
CmpiObjectPath zemNextPath(CmpiEnumeration& paths);
CmpiInstance zemNextInstance(CmpiEnumeration& instances);
zemAssociationCandidate zemNextCandidate(CmpiEnumeration& enumeration, bool instances);

/// Sets the two references of an association on its path or instance.
void zemSetReferences(CmpiObjectPath& path, const char* property1, const CmpiObjectPath& cop1,
                      const char* property2, const CmpiObjectPath& cop2);
void zemSetReferences(CmpiInstance& instance, const char* property1, const CmpiObjectPath& cop1,
                      const char* property2, const CmpiObjectPath& cop2);

/// Lists the two references as essential keys.
void zemListReferences(CmpiArray& keys, const char* property1, const char* property2);

/// Whether a provider with these operations serves @p name at all: @p mask has the bits that count.
bool zemServesClass(const char* name, const char* assocClass, int supported, int mask);

/// Refuses references that are of the wrong class; each text is null when its reference is right.
/// @throws zemInvalidParameterException  unless both are null
void zemRefuseReferences(const char* text1, const char* property1, const char* text2,
                         const char* property2, const char* className, const char* providerName);

/// Completes an association's path and makes its instance by the hooks of the provider.
template <class Provider>
CmpiInstance zemReferenceInstance(Provider& provider, CmpiObjectPath& ncop,
                                  const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                                  const char** properties, const char* className) {
    provider.addKeys(ncop, cop1, cop2, className);
    CmpiInstance instance(ncop);
    provider.addProperties(instance, cop1, cop2, properties, className);
    return instance;
}

/// Returns one association: its path, or its instance.
template <class Provider>
void zemReturnReference(Provider& provider, CmpiResult& rslt, CmpiObjectPath ncop,
                        const CmpiObjectPath& cop1, const CmpiObjectPath& cop2,
                        const char** properties, const char* className, bool asInstance) {
    if (asInstance) {
        rslt.returnData(zemReferenceInstance(provider, ncop, cop1, cop2, properties, className));
    } else {
        provider.addKeys(ncop, cop1, cop2, className);
        rslt.returnData(ncop);
    }
}

/// Returns what a navigation asks for about one pair: the object on the far side, or the
/// association, whose path is made by @p makePath when it is wanted.
template <class Provider, class MakePath>
void zemReturnNeighbour(Provider& provider, const zemAssociationRequest& r,
                        const zemAssociationCandidate& candidate, const CmpiObjectPath& cop1,
                        const CmpiObjectPath& cop2, const char* className, MakePath makePath) {
    if (r.is(zemAssociationBits::OP_OnlyRefOps)) {
        zemReturnReference(provider, r.rslt, makePath(), cop1, cop2, r.properties, className,
                           r.is(zemAssociationBits::OP_RefsOp));
    } else if (candidate.instance) {
        r.rslt.returnData(*candidate.instance);
    } else {
        r.rslt.returnData(candidate.path);
    }
}

#endif
