/// The one class through which every CIM operation enters the system.
///
/// zemBaseProvider implements the operations of the five CMPI interfaces as a frame: it traces,
/// times, tests class and keys, validates, calls a worker, finishes the result, and turns whatever
/// the worker throws into the status that goes back to the CIM server. A concrete provider
/// overrides the perform*() workers, the isValid*Class() predicates and a few hooks:
///
///     class DiskProvider : public zemBaseProvider {
///     public:
///         DiskProvider(const CmpiBroker& mb, const CmpiContext& ctx)
///             : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, "DiskProvider") {}
///         CMPIBoolean isValidInstanceClass(const char* name) override {
///             return compareClassNames(name, "ORX_Disk");
///         }
///         void performEnumInstances(const CmpiContext&, CmpiResult& result,
///                                   const CmpiObjectPath& path, const char**) override;
///         const char* getMessageBundlePath() override { return ""; }
///     };
///
/// Failures. A worker throws a zemException, best through the throw*Exc() family, whose texts are
/// localised; its kind decides the status code. A CmpiStatus thrown by the CMPI binding is answered
/// as it stands. Two rules differ: enumInstances() and enumInstanceNames() log most failures and
/// answer OK with what they have, and invokeMethod() turns every zemException into
/// CMPI_RC_ERR_FAILED. Exceptions of other types pass through to the caller.
///
/// Threads. The server may call any operation on several threads at once. The object has no state
/// besides its name, and takes no lock; workers must be reentrant.
///
/// The order in which the virtual operations are declared is the order of their slots, which
/// libraries built on this one rely on: add new ones at the end only.
#ifndef ZEM_BASE_PROVIDER_H
#define ZEM_BASE_PROVIDER_H

#include <sys/time.h>

#include "Array.h"
#include "CmpiArgs.h"
#include "CmpiArray.h"
#include "CmpiAssociationMI.h"
#include "CmpiBroker.h"
#include "CmpiContext.h"
#include "CmpiData.h"
#include "CmpiDateTime.h"
#include "CmpiIndicationMIEx.h"
#include "CmpiInstance.h"
#include "CmpiInstanceMI.h"
#include "CmpiMethodMI.h"
#include "CmpiObjectPath.h"
#include "CmpiPropertyMI.h"
#include "CmpiResult.h"
#include "CmpiStatus.h"
#include "DynamicArray.h"
#include "ProviderTracer.h"
#include "StringUtils.h"
#include "ZemExport.h"

class zemException;
class zemOperationFrame;

/// The locals that the macros of ProviderTracer.h use, inside a member of a provider and inside a
/// friend of one.
#define PROV_TRACE_LOCALS() PROV_TRACE_LOCALS_OF(*this)
#define PROV_TRACE_LOCALS_OF(provider) \
    PROV_TRACE_OF((provider).rawBroker(), (provider).m_providerName)

/// Gives numbers that make the keys of the timing trace more distinct. They are not unique: two
/// racing calls may get the same one.
ZEM_EXPORT int getID();

class ZEM_EXPORT zemBaseProvider : public CmpiInstanceMI,
                                   public CmpiAssociationMI,
                                   public CmpiMethodMI,
                                   public zemCmpiIndicationMI,
                                   public CmpiPropertyMI {
public:
    /// @param providerName  component of every trace line and part of every error text
    zemBaseProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* providerName);
    ~zemBaseProvider() override;

    // ---- The frame: operations as the CIM server calls them -------------------------------------

    CmpiStatus enumInstanceNames(const CmpiContext& ctx, CmpiResult& result,
                                 const CmpiObjectPath& path) override;
    CmpiStatus enumInstances(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                             const char** properties) override;
    CmpiStatus getInstance(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                           const char** properties) override;
    CmpiStatus createInstance(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const CmpiInstance& instance) override;
    CmpiStatus setInstance(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                           const CmpiInstance& instance, const char** properties) override;
    CmpiStatus deleteInstance(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path) override;

    /// The inner frame of getInstance: class and key tests, worker, and the test that the instance
    /// found has the keys asked for. Serves subclasses, and the frame itself as existence test.
    /// @throws zemException, CmpiStatus  whatever a test or the worker throws, untranslated
    virtual CmpiInstance getInstance(const CmpiContext& ctx, const CmpiObjectPath& path,
                                     const char** properties);

    /// Life of the provider; these only trace. A provider with resources overrides cleanup(), one
    /// that must stay loaded answers 0 from isUnloadable().
    CmpiStatus initialize(const CmpiContext& ctx) override;
    CmpiStatus cleanup(CmpiContext& ctx) override;
    int isUnloadable() const override;

    CmpiStatus associators(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                           const char* assocClass, const char* resultClass, const char* role,
                           const char* resultRole, const char** properties) override;
    CmpiStatus associatorNames(const CmpiContext& ctx, CmpiResult& result,
                               const CmpiObjectPath& path, const char* assocClass,
                               const char* resultClass, const char* role,
                               const char* resultRole) override;
    CmpiStatus references(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                          const char* resultClass, const char* role,
                          const char** properties) override;
    CmpiStatus referenceNames(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const char* resultClass,
                              const char* role) override;
    CmpiStatus invokeMethod(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                            const char* method, const CmpiArgs& in, CmpiArgs& out) override;
    CmpiStatus enableIndications(const CmpiContext& ctx) override;
    CmpiStatus disableIndications(const CmpiContext& ctx) override;
    CmpiStatus mustPoll(const CmpiContext& ctx, const CMPISelectExp* filter, const char* eventType,
                        const CmpiObjectPath& path) override;
    CmpiStatus activateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                              const char* eventType, const CmpiObjectPath& path,
                              CMPIBoolean firstActivation) override;
    CmpiStatus authorizeFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                               const char* eventType, const CmpiObjectPath& path,
                               const char* owner) override;
    CmpiStatus deActivateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                const char* eventType, const CmpiObjectPath& path,
                                CMPIBoolean lastActivation) override;
    CmpiStatus getProperty(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                           const char* name) override;
    CmpiStatus setProperty(const CmpiContext& ctx, CmpiResult& result, const CmpiObjectPath& path,
                           const char* name, const CmpiData& data) override;

    // ---- Workers: what a concrete provider overrides --------------------------------------------

    /// Every worker that is not overridden refuses with throwMethodNotSupportedExc(), except
    /// performEnableIndications, performDisableIndications and performAuthorizeFilter, which do
    /// nothing. A worker hands its objects to @p result; the frame calls returnDone() afterwards,
    /// but not after performSetInstance.
    virtual CmpiInstance performGetInstance(const CmpiContext& ctx, const CmpiObjectPath& path,
                                            const char** properties);
    virtual void performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                                      const CmpiObjectPath& path, const char** properties);
    virtual void performEnumInstanceNames(const CmpiContext& ctx, CmpiResult& result,
                                          const CmpiObjectPath& path);
    virtual void performSetInstance(const CmpiContext& ctx, CmpiResult& result,
                                    const CmpiObjectPath& path, const CmpiInstance& instance,
                                    const char** properties);
    virtual void performCreateInstance(const CmpiContext& ctx, CmpiResult& result,
                                       const CmpiObjectPath& path, const CmpiInstance& instance);
    virtual void performDeleteInstance(const CmpiContext& ctx, CmpiResult& result,
                                       const CmpiObjectPath& path);
    virtual void performAssociators(const CmpiContext& ctx, CmpiResult& result,
                                    const CmpiObjectPath& path, const char* assocClass,
                                    const char* resultClass, const char* role,
                                    const char* resultRole, const char** properties);
    virtual void performAssociatorNames(const CmpiContext& ctx, CmpiResult& result,
                                        const CmpiObjectPath& path, const char* assocClass,
                                        const char* resultClass, const char* role,
                                        const char* resultRole);
    virtual void performReferences(const CmpiContext& ctx, CmpiResult& result,
                                   const CmpiObjectPath& path, const char* resultClass,
                                   const char* role, const char** properties);
    virtual void performReferenceNames(const CmpiContext& ctx, CmpiResult& result,
                                       const CmpiObjectPath& path, const char* resultClass,
                                       const char* role);
    virtual void performInvokeMethod(const CmpiContext& ctx, CmpiResult& result,
                                     const CmpiObjectPath& path, const char* method,
                                     const CmpiArgs& in, CmpiArgs& out);
    virtual void performEnableIndications();
    virtual void performDisableIndications();

    /// The filter workers get the class name of @p path, not the event type of the filter. What
    /// performMustPoll returns is dropped: a refusal must be thrown.
    virtual CmpiStatus performMustPoll(const CmpiContext& ctx, const CMPISelectExp* filter,
                                       const char* className, const CmpiObjectPath& path);
    virtual void performActivateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                       const char* className, const CmpiObjectPath& path,
                                       CMPIBoolean firstActivation);
    virtual void performAuthorizeFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                        const char* className, const CmpiObjectPath& path,
                                        const char* owner);
    virtual void performDeActivateFilter(const CmpiContext& ctx, const CMPISelectExp* filter,
                                         const char* className, const CmpiObjectPath& path,
                                         CMPIBoolean lastActivation);

    // ---- Predicates and hooks -------------------------------------------------------------------

    /// Which classes the provider serves, and which methods run on the class itself; all false by
    /// default.
    virtual CMPIBoolean isValidInstanceClass(const char* className);
    virtual CMPIBoolean isValidAssociationClass(const char* className);
    virtual CMPIBoolean isValidMethodClass(const char* className);
    virtual CMPIBoolean isStaticMethod(const char* className, const char* method);
    virtual CMPIBoolean isValidIndicationClass(const char* className);

    /// Lists the keys without which an operation on one object is refused.
    /// @param keys  room for ten texts, set by setText; the first entry left null ends the list
    virtual void populateEssentialKeys(const char* className, CmpiArray& keys);

    /// Lists the arguments that a method knows; every argument not listed is refused.
    /// @param args  takes new strings, which it will own
    virtual void populateMethodArgs(const char* className, zemDynamicArray<zemString>& args,
                                    const char* method);

    /// Message bundle of the provider's own texts, "" for the server's default source.
    virtual const char* getMessageBundlePath() = 0;

    // ---- Helpers of the frame -------------------------------------------------------------------

    /// Always true here. A deployment that must keep the provider silent defines this member
    /// itself, ahead of this library in the order of symbol lookup.
    CMPIBoolean isProviderEnabled(const CmpiContext& ctx);

    /// The status of success, without a message.
    CmpiStatus returnOK() const;

    /// A status with a message, made by the broker; without one that makes strings, the bare code.
    CmpiStatus returnStatus(CMPIrc rc, const char* text) const;

    /// Hands @p text to the server's trace alone, at level 0 under the name "ProviderAgent".
    void trace(const char* text) const;

    // ---- Status, errors and localisation (BaseProviderStatus.cpp) -------------------------------

    /// The status that a failure becomes: the code follows from the exception's kind. An exception
    /// with a throwing class gets a localised sentence around its text, others keep theirs.
    /// @param accessMethod  operation during which @p e was thrown
    CmpiStatus handleException(const char* accessMethod, const zemException& e) const;

    /// A text from a message bundle, with up to ten inserts; the list ends at the first null.
    /// Never fails: without bundle, message or broker functions the answer is @p dfltString.
    /// The first form reads getMessageBundlePath(); @p ignore is not used.
    zemString retrieveLocalizedString(const char* msgKey, const char* dfltString,
                                      const char* arg0 = nullptr, const char* arg1 = nullptr,
                                      const char* arg2 = nullptr, const char* arg3 = nullptr,
                                      const char* arg4 = nullptr, const char* arg5 = nullptr,
                                      const char* arg6 = nullptr, const char* arg7 = nullptr,
                                      const char* arg8 = nullptr, const char* arg9 = nullptr);
    zemString retrieveLocalizedString(const char* msgBundle, const char* msgKey,
                                      const char* dfltString, int ignore,
                                      const char* arg0 = nullptr, const char* arg1 = nullptr,
                                      const char* arg2 = nullptr, const char* arg3 = nullptr,
                                      const char* arg4 = nullptr, const char* arg5 = nullptr,
                                      const char* arg6 = nullptr, const char* arg7 = nullptr,
                                      const char* arg8 = nullptr, const char* arg9 = nullptr);
    static zemString retrieveLocalizedString(
        CMPIBroker* brkr, const char* providerName, const char* msgBundle, const char* msgKey,
        const char* dfltString, int ignore, const char* arg0 = nullptr, const char* arg1 = nullptr,
        const char* arg2 = nullptr, const char* arg3 = nullptr, const char* arg4 = nullptr,
        const char* arg5 = nullptr, const char* arg6 = nullptr, const char* arg7 = nullptr,
        const char* arg8 = nullptr, const char* arg9 = nullptr);

    /// Writes "id: text", or the text alone without an id, to the server's log. Never fails.
    /// @param severity  LOG_INFO to LOG_FATAL of Log.h
    void logMessage(int severity, const char* id, const char* text) const;
    static void logMessage(CMPIBroker* brkr, const char* providerName, int severity, const char* id,
                           const char* text);

    /// logMessage() with a text from a bundle, read in the locale of the process, not of the
    /// client: logs are for the appliance's administrator.
    void logICUMessage(const CmpiContext& ctx, int severity, const char* msgId,
                       const char* msgBundle, const char* msgKey, const char* dfltString,
                       const char* arg0 = nullptr, const char* arg1 = nullptr,
                       const char* arg2 = nullptr, const char* arg3 = nullptr,
                       const char* arg4 = nullptr, const char* arg5 = nullptr,
                       const char* arg6 = nullptr, const char* arg7 = nullptr,
                       const char* arg8 = nullptr, const char* arg9 = nullptr) const;
    static void logICUMessage(CMPIBroker* brkr, CMPIContext* ctx, const char* providerName,
                              int severity, const char* msgId, const char* msgBundle,
                              const char* msgKey, const char* dfltString,
                              const char* arg0 = nullptr, const char* arg1 = nullptr,
                              const char* arg2 = nullptr, const char* arg3 = nullptr,
                              const char* arg4 = nullptr, const char* arg5 = nullptr,
                              const char* arg6 = nullptr, const char* arg7 = nullptr,
                              const char* arg8 = nullptr, const char* arg9 = nullptr);

    /// The client's preferred language as a locale name, such as "pt_BR.UTF-8"; empty if it has
    /// none.
    static zemString getExternalLanguageName(const CmpiContext& ctx);

    /// Name of the user on whose behalf the operation runs; empty if the server does not say.
    static zemString getUserContext(const CmpiContext& ctx);

    /// The standard failures. Each throws a zemException whose only content is one localised text
    /// (throwInvalidMethodArgValueExc: its English one). @p M is the method, @p K the class.
    /// @throws zemNotSupportedException, zemMethodNotFoundException, zemAccessDeniedException,
    ///         zemObjectNotFoundException  as the name says
    /// @throws zemInvalidParameterException  all others, for a missing property as well
    [[noreturn]] void throwMethodNotSupportedExc(const char* M, const char* K) const;
    [[noreturn]] void throwMethodNotFoundExc(const char* M, const char* K) const;
    [[noreturn]] void throwUserAccessDeniedExc(const char* M, const char* K,
                                               const char* user) const;
    [[noreturn]] void throwKeyNotFoundExc(const char* M, const char* K, const char* key) const;
    [[noreturn]] void throwInvalidKeyExc(const char* M, const char* K, const char* key) const;
    [[noreturn]] void throwDuplicateKeyExc(const char* M, const char* K, const char* key) const;
    /// @p value1 was given where @p value2 was expected.
    [[noreturn]] void throwKeyValueDoesntMatchExc(const char* M, const char* K, const char* key,
                                                  const char* value1, const char* value2) const;
    [[noreturn]] void throwPropertyNotFoundExc(const char* K, const char* property) const;
    [[noreturn]] void throwDuplicatePropertyExc(const char* M, const char* K,
                                                const char* property) const;
    [[noreturn]] void throwInvalidPropertyExc(const char* M, const char* K,
                                              const char* property) const;
    [[noreturn]] void throwObjectNotFoundExc(const char* M, const char* K,
                                             const char* object) const;
    [[noreturn]] void throwWrongMethodArgExc(const char* parameter, const char* method) const;
    [[noreturn]] void throwDuplicateMethodArgExc(const char* parameter, const char* method) const;
    [[noreturn]] void throwInvalidMethodArgValueExc(const char* parameter, const char* value,
                                                    const char* method) const;
    [[noreturn]] void throwParameterNotFoundExc(const char* parameter) const;

    // ---- CIM values (BaseProviderValues.cpp) ----------------------------------------------------

    /// Names of codes and types: "CIM_ERR_NOT_FOUND", "uint32[]". Never null or empty.
    static const char* cmpiRcToString(CMPIrc rc);
    static zemString cmpiDataTypeToString(CMPIType type);

    /// Texts of values, for traces and messages; they never throw. A null or unreadable value is
    /// "", strings stand in double quotes, arrays as "{1,2}", paths as "//host/ns:Class.k=v,l=w".
    static zemString cmpidata2String(CmpiData data);
    static zemString instanceToString(CmpiInstance& instance);
    static zemString objectPathToString(const CmpiObjectPath& path);

    /// CIM date-times of now and of a time since the epoch; 0 seconds give the zero interval.
    static CmpiDateTime getCurrentDateTime();
    static CmpiDateTime convertDateTime(long seconds);
    static CmpiDateTime convertDateTime(timeval time);
    /// Seconds of a date-time.
    static long convertDateTime(const CmpiDateTime& dateTime);

    /// A path with the host and, unless given, the namespace and class of another; no keys.
    static CmpiObjectPath createObjectPath(const CmpiObjectPath& path);
    static CmpiObjectPath createObjectPath(const CmpiObjectPath& path, const char* className);
    static CmpiObjectPath createObjectPath(const CmpiObjectPath& path, const char* ns,
                                           const char* className);

    /// Parses "//host/namespace:Class.key=value,key=value"; host, namespace ("root/cimv2") and keys
    /// may be missing. All keys become strings, without their quotes; nothing escapes a comma.
    /// @throws zemInvalidParameterException  with @p text, when it is none of these forms
    static CmpiObjectPath createObjectPath(const zemString& text);

    /// A key of a path; a value that tests as not found when it cannot be read.
    static CmpiData getKeyBinding(const CmpiObjectPath& path, const char* name);

    /// An argument or a property that must be there: its value, which is never null.
    /// @throws zemInvalidParameterException  when it is missing, null or unreadable
    CmpiData getParmVal(const CmpiArgs& args, const char* name) const;
    CmpiData getPropVal(const CmpiInstance& instance, const char* name) const;

    /// Sets an element of an array that was made for CMPI_chars to a text, which is copied; a null
    /// text leaves it as it is. Some servers make such an array one of strings, and some bindings
    /// take a text only in the form that the array has: this gives it in that form.
    /// @throws CmpiStatus  CMPI_RC_ERR_NO_SUCH_PROPERTY for an index beyond the end
    static void setText(CmpiArray& array, CMPICount index, const char* text);

    /// An array of CMPI_chars with these texts; a null pointer leaves its element null.
    static CmpiArray convertStringArray(const zemDynamicArray<zemString>& strings);
    static CmpiArray convertStringArray(const zemArray<const char*>& strings);
    /// The texts of an array, "" for a null element; the result owns them.
    static zemDynamicArray<zemString> convertStringArray(const CmpiArray& strings);

    /// Compares ignoring case. A @p compareName that begins with "_" stands for every class with
    /// that suffix: it is compared with @p className from its first "_" on.
    static CMPIBoolean compareClassNames(const char* className, const char* compareName);

    /// Full and short name of this host.
    static zemString getCSName();
    static zemString getSystemName();

    /// The operating-system and computer-system class of the schema that @p className belongs to.
    static const char* getOSClassName(const char* className);
    static const char* getCSClassName(const char* className);

    // ---- Validation (BaseProviderValidation.cpp) ------------------------------------------------

    /// Tests that the path given by the client has exactly the keys of the instance found.
    /// @param copt  path given by the client
    /// @param cop   path of the instance found
    /// @throws zemInvalidParameterException  for a key missing, unknown, given twice or with
    ///         another value; values are not looked at when @p checkKeyNameOnly is set
    void validateKeys(const CmpiObjectPath& copt, const CmpiObjectPath& cop,
                      const char* callingMethod, CMPIBoolean checkKeyNameOnly) const;

    /// Whether two key values are equal, texts ignoring case; of texts and paths, the two strings
    /// get the texts compared, else "".
    static CMPIBoolean compareKeyValues(const CmpiData& value1, const CmpiData& value2,
                                        zemString& valueString1, zemString& valueString2);

    /// Tests that a null-ended property list names properties of the class, each once.
    /// @throws zemInvalidParameterException  for an unknown or repeated name
    void validateProerties(const CmpiObjectPath& cop, const char** properties,
                           const char* callingMethod) const;

    /// Whether a null-ended list has @p name, ignoring case; a null or empty list has every name.
    static CMPIBoolean containsProperty(const char** properties, const char* name);

    /// Tests that the arguments are among those of populateMethodArgs(), each once.
    /// @throws zemInvalidParameterException  for an unknown or repeated argument
    void validateMethodArgs(const char* methodName, const CmpiArgs& in, const char* className);

protected:
    /// The server's broker, null only in a provider built without one.
    CMPIBroker* rawBroker() const;

    zemString m_providerName;

private:
    friend class zemOperationFrame;

    void traceDefault(const char* function) const;
    [[noreturn]] void refuse(const char* function, const char* operation,
                             const char* className) const;
};

#endif
