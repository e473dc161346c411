/// What the providers of hosts and partitions share: a CIM_ComputerSystem read from qyplat.
///
/// A subclass names its class and the rows that turn tool attributes into CIM properties, and
/// says how to find one system and how to walk all. The tool runs under the client's user and in
/// the client's language, and is asked only for the attributes that the wanted properties need.
///
/// Thread-safety: as the frame demands, no state beside the constant rows; any number of
/// operations at once.
#ifndef COMPUTER_SYSTEM_PROVIDER_H
#define COMPUTER_SYSTEM_PROVIDER_H

#include <functional>
#include <string>
#include <vector>

#include "BaseProvider.h"
#include "Exception.h"
#include "QyplatCmdCaller.h"

/// How the text of a tool attribute becomes the value of a property. An empty text is null.
enum class ValueKind {
    Text,
    TextList,      ///< "a,b" as an array of texts
    Uint16,        ///< decimal; anything else is null
    Uint32,        ///< likewise
    Flag,          ///< "1" true, "0" false
    Timestamp,     ///< "MM/DD/YYYY HH:MM:SS" as a date-time
    EnabledState,  ///< state word as the number of CIM_EnabledLogicalElement.EnabledState
    Status         ///< state word as a one-element CIM_ManagedSystemElement.OperationalStatus
};

/// One property and the attribute that fills it.
struct PropertyRow {
    const char* property;
    ValueKind kind;
    int attribute;
};

class ComputerSystemProvider : public zemBaseProvider {
protected:
    using Attributes = std::vector<int>;  ///< enumerators of one qyplat table
    /// Receives each record found, with the value of the Name key.
    using Sink = std::function<void(const std::string& name, const zemRecordType& record)>;

    ComputerSystemProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
                           const char* className, std::vector<PropertyRow> rows,
                           Attributes identity);

    /// Hands the system with this Name to @p sink; a Name that no system can have, or that none
    /// has, leaves the sink uncalled.
    /// @param attributes  those to ask the tool for, closed by ATTR_END
    virtual void find(zemQyplatCmdCaller& tool, const std::string& name, int* attributes,
                      const Sink& sink) = 0;
    /// Hands every system to @p sink.
    virtual void walk(zemQyplatCmdCaller& tool, int* attributes, const Sink& sink) = 0;
    /// Adds what follows from the Name alone.
    virtual void complete(CmpiInstance& instance, const std::string& name, const char** properties);

    // the frame's hooks
    CmpiInstance performGetInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties) override;
    void performEnumInstances(const CmpiContext& context, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& context, CmpiResult& result,
                                  const CmpiObjectPath& path) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;
    const char* getMessageBundlePath() override;

private:
    zemQyplatCmdCaller toolFor(const CmpiContext& context);
    Attributes attributesFor(const char** properties);
    CmpiObjectPath systemPath(const CmpiObjectPath& near, const std::string& name);
    CmpiInstance systemInstance(const CmpiObjectPath& near, const char** properties,
                                const std::string& name, const zemRecordType& record);

    const char* const m_className;
    const std::vector<PropertyRow> m_rows;
    const Attributes m_identity;  ///< what find and walk need to form the Name
};

/// Whether a text has the form of a host's key, <type_model>*<serial_num>. Keys come from
/// clients and go into command lines, so nothing else may pass.
bool isHostName(const std::string& text);

/// Whether a tool failed because it knows no such host or partition.
bool isUnknownObject(const zemException& failure);

/// The key of the host that a qyplat host record describes.
std::string hostName(const zemRecordType& host);

#endif
