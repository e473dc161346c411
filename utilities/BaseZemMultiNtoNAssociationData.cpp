#include "BaseZemMultiNtoNAssociationData.h"

#include "BaseZemInstanceProvider.h"

zemMultiNtoNAssociationData::zemMultiNtoNAssociationData(zemBaseZemInstanceProvider* providerHandle,
                                                         const char* className,
                                                         const char* assoPropname,
                                                         const char* nameSpace)
    : m_providerHandle(providerHandle),
      m_className(className),
      m_assoPropname(assoPropname),
      m_nameSpace(nameSpace) {}

void zemMultiNtoNAssociationData::releaseProviderRes() {
    delete m_providerHandle;
    m_providerHandle = nullptr;
}

zemMultiNtoNAssociationPair::zemMultiNtoNAssociationPair(const zemMultiNtoNAssociationData& left,
                                                         const zemMultiNtoNAssociationData& right,
                                                         const char* associationClassName,
                                                         const char* associationNamespace)
    : m_leftAssiData(left),
      m_rightAssiData(right),
      m_AssociationClassName(associationClassName),
      m_AssociationNamespace(associationNamespace) {}

bool zemMultiNtoNAssociationPair::isOf(const char* associationClassName) const {
    return m_AssociationClassName.isEmpty() || zemString(associationClassName).isEmpty() ||
           zemBaseProvider::compareClassNames(associationClassName, m_AssociationClassName);
}

zemMultiNtoNAssociationDataSet::zemMultiNtoNAssociationDataSet() : m_assoDataSet(25) {}

void zemMultiNtoNAssociationDataSet::addNewAssoPair(zemMultiNtoNAssociationPair* pair) {
    if (pair != nullptr) {
        m_assoDataSet.addElement(pair);
    }
}

const zemDynamicArray<zemMultiNtoNAssociationPair>& zemMultiNtoNAssociationDataSet::getAssoDataSet()
    const {
    return m_assoDataSet;
}

zemMultiNtoNAssociationPair* zemMultiNtoNAssociationDataSet::getAssoPairByID(int id) const {
    return m_assoDataSet.getElementAt(id);
}

int zemMultiNtoNAssociationDataSet::size() const { return m_assoDataSet.size(); }

bool zemMultiNtoNAssociationDataSet::isFoundClassName(const char* name) const {
    for (int i = 0; i < m_assoDataSet.size(); ++i) {
        if (zemBaseProvider::compareClassNames(name, m_assoDataSet[i]->m_AssociationClassName)) {
            return true;
        }
    }
    return false;
}

zemMultiTargetAssociationData::zemMultiTargetAssociationData(
    const zemMultiNtoNAssociationPair& pair, bool isFirst)
    : m_AssoData(isFirst ? pair.m_rightAssiData : pair.m_leftAssiData),
      m_OtherSidePropName(isFirst ? pair.m_leftAssiData.m_assoPropname
                                  : pair.m_rightAssiData.m_assoPropname),
      m_AssoClassName(pair.m_AssociationClassName),
      m_AssoNameSpace(pair.m_AssociationNamespace),
      m_type(isFirst) {}
