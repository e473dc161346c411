/// The table of an association whose sides are instance providers of the same process.
///
/// A zemMultiNtoNAssociationDataSet holds pairs; a pair has a left and a right side, each a class
/// with the handle of the provider that serves it. The set owns its pairs, but no handle: one
/// handle may stand in several pairs, and it may be a provider that the server owns. A final
/// provider that made handles of its own frees each once, through releaseProviderRes() or by
/// deleting it.
///
/// Thread-safety: filled in the constructor of the final provider, then only read.
#ifndef BASE_ZEM_MULTI_NTON_ASSOCIATION_DATA_H
#define BASE_ZEM_MULTI_NTON_ASSOCIATION_DATA_H

#include "DynamicArray.h"
#include "StringUtils.h"
#include "ZemExport.h"

class zemBaseZemInstanceProvider;

/// Positions of two associated objects in the arrays of left and right paths.
struct ZEM_EXPORT objectPathIndexPair {
    int m_copsIndex1;
    int m_copsIndex2;
};

/// One side of a pair.
class ZEM_EXPORT zemMultiNtoNAssociationData {
public:
    /// @param providerHandle  serves the class; null makes requests that need it fail
    /// @param assoPropname    reference property that points at this side
    /// @param nameSpace       of the class; empty means that of the request
    zemMultiNtoNAssociationData(zemBaseZemInstanceProvider* providerHandle, const char* className,
                                const char* assoPropname, const char* nameSpace);

    /// Deletes the provider. Other sides with the same handle must not be used afterwards.
    void releaseProviderRes();

    zemBaseZemInstanceProvider* m_providerHandle;
    zemString m_className;
    zemString m_assoPropname;
    zemString m_nameSpace;
};

/// Two sides, and the association class that joins them.
class ZEM_EXPORT zemMultiNtoNAssociationPair {
public:
    /// Without a class name the pair belongs to whatever association class is asked for.
    zemMultiNtoNAssociationPair(const zemMultiNtoNAssociationData& left,
                                const zemMultiNtoNAssociationData& right,
                                const char* associationClassName = nullptr,
                                const char* associationNamespace = nullptr);

    /// Whether the pair belongs to an association class; a null or empty name is any.
    bool isOf(const char* associationClassName) const;

    zemMultiNtoNAssociationData m_leftAssiData;
    zemMultiNtoNAssociationData m_rightAssiData;
    zemString m_AssociationClassName;
    zemString m_AssociationNamespace;
};

class ZEM_EXPORT zemMultiNtoNAssociationDataSet {
public:
    zemMultiNtoNAssociationDataSet();

    /// Appends a pair, which belongs to the set from here on.
    void addNewAssoPair(zemMultiNtoNAssociationPair* pair);

    const zemDynamicArray<zemMultiNtoNAssociationPair>& getAssoDataSet() const;

    /// The pair at a position, owned by the set; null outside.
    zemMultiNtoNAssociationPair* getAssoPairByID(int id) const;
    int size() const;

    /// Whether a pair names this association class.
    bool isFoundClassName(const char* name) const;

private:
    zemDynamicArray<zemMultiNtoNAssociationPair> m_assoDataSet;
};

/// One candidate target of a navigation: the far side of a pair on which the source stands.
class ZEM_EXPORT zemMultiTargetAssociationData {
public:
    /// @param isFirst  whether the source is on the left, so that the target is on the right
    zemMultiTargetAssociationData(const zemMultiNtoNAssociationPair& pair, bool isFirst);

    bool isFirst() const { return m_type; }

    zemMultiNtoNAssociationData m_AssoData;
    zemString m_OtherSidePropName;
    zemString m_AssoClassName;
    zemString m_AssoNameSpace;
    bool m_type;
};

#endif
