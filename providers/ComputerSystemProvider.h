/// What the providers of hosts and partitions share: a CIM_ComputerSystem read from qyplat.
///
/// A subclass names its class and the rows that turn tool attributes into CIM properties, and says
/// how to read one system and how to read all. The tool runs under the client's user and in the
/// client's language, and is asked only for the attributes that the wanted properties need.
///
/// A modification changes what the subclass can change; of the rest it may only repeat what is
/// already so, and is refused before anything is changed. RequestStateChange answers "Not
/// Supported" to every state there is unless the subclass knows better.
///
/// Thread-safety: as the frame demands, no state beside the constant rows; any number of operations
/// at once.
#ifndef COMPUTER_SYSTEM_PROVIDER_H
#define COMPUTER_SYSTEM_PROVIDER_H

#include <functional>
#include <string>
#include <vector>

#include "BaseZemProvider.h"
#include "PropertyRows.h"
#include "QyplatCmdCaller.h"

class ComputerSystemProvider : public zemBaseZemProvider {
public:
    /// States that clients may ask for by RequestStateChange, and its answers; the schema's
    /// numbers.
    enum RequestedState : CMPIUint16 {
        Enabled = 2,
        Disabled = 3,
        ShutDown = 4,
        Offline = 6,
        Test = 7,
        Defer = 8,
        Quiesce = 9,
        Reboot = 10,
        Reset = 11
    };
    enum StateChangeAnswer : CMPIUint32 {
        Completed = 0,
        NotSupported = 1,
        InvalidTransition = 4097,
        TimeoutNotSupported = 4098
    };

protected:
    /// On whose behalf tools run, and in which language they speak.
    struct Client {
        zemString user;
        zemString locale;
    };

    /// Receives each record found, with the value of the Name key.
    using Sink = std::function<void(const std::string& name, const zemRecordType& record)>;

    ComputerSystemProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name,
                           const char* className, std::vector<PropertyRow> rows,
                           Attributes identity);

    /// Hands the system with this Name to @p sink; a Name that no system can have leaves the sink
    /// uncalled. What the tool says of a Name that none has is find()'s business.
    /// @param attributes  those to ask the tool for, closed by ATTR_END
    virtual void read(const Client& client, const std::string& name, int* attributes,
                      const Sink& sink) = 0;
    /// Hands every system to @p sink.
    virtual void readAll(const Client& client, int* attributes, const Sink& sink) = 0;
    /// As read(); a Name that no system has leaves the sink uncalled, too.
    void find(const Client& client, const std::string& name, int* attributes, const Sink& sink);

    /// Whether change() can change the property.
    virtual bool isChangeable(const char* property) const;
    virtual void change(const Client& client, const std::string& name, const char* property,
                        const std::string& value);
    /// Brings the system into a state that clients may ask for.
    virtual StateChangeAnswer requestState(const Client& client, const std::string& name,
                                           RequestedState state);

    static Client clientOf(const CmpiContext& context);
    static zemQyplatCmdCaller toolFor(const Client& client);
    static CmpiData methodResult(CMPIUint32 value);

    // the frame's hooks
    CmpiInstance performGetInstance(const CmpiContext& context, const CmpiObjectPath& path,
                                    const char** properties) override;
    void performEnumInstances(const CmpiContext& context, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override;
    void performEnumInstanceNames(const CmpiContext& context, CmpiResult& result,
                                  const CmpiObjectPath& path) override;
    void performSetInstance(const CmpiContext& context, CmpiResult& result,
                            const CmpiObjectPath& path, const CmpiInstance& instance,
                            const char** properties) override;
    void performInvokeMethod(const CmpiContext& context, CmpiResult& result,
                             const CmpiObjectPath& path, const char* method, const CmpiArgs& in,
                             CmpiArgs& out) override;
    CMPIBoolean isValidInstanceClass(const char* className) override;
    CMPIBoolean isValidMethodClass(const char* className) override;
    void populateEssentialKeys(const char* className, CmpiArray& keys) override;
    void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                            const char* method) override;

    const char* const m_className;

private:
    CmpiInstance makeInstance(const CmpiObjectPath& near, const char** properties,
                              const std::string& name, const zemRecordType& record);

    const std::vector<PropertyRow> m_rows;
    const Attributes m_identity;  ///< what it takes to form the Name
};

#endif
