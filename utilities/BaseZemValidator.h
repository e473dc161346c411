/// What the provider bases of this schema add to zemBaseProvider: tests of the properties of
/// incoming instances, and the failures of the resource providers.
///
/// Final providers derive from zemBaseZemProvider or zemBaseZemInstanceProvider, which both stand
/// on this class. It has no state, and any thread may call.
///
/// All failures are zemInvalidParameterException unless said otherwise.
#ifndef ZEM_BASE_ZEM_VALIDATOR_H
#define ZEM_BASE_ZEM_VALIDATOR_H

#include "BaseProvider.h"

class ZEM_EXPORT zemBaseZemValidator : public zemBaseProvider {
public:
    zemBaseZemValidator(const CmpiBroker& mb, const CmpiContext& ctx, const char* name);

    const char* getMessageBundlePath() override;

    /// A property of an incoming instance; a missing or null value comes back as it is.
    /// @param expected  type that a value must have, strings and characters being one; CMPI_null
    ///                  for any
    /// @throws zemInvalidParameterException  for a value of another type
    /// @throws zemOperationFailedException  when the server cannot read the property
    virtual CmpiData getInstanceProperty(const CmpiInstance& instance, const char* name,
                                         CMPIType expected);

    /// The property must have a value.
    void validateRequestedProperty(const CmpiInstance& instance, const char* name);

    /// The property must have no value, each with a sentence of its own.
    void validateUnsupportedProperty(const CmpiInstance& instance, const char* name);
    void validateUnimplementedProperty(const CmpiInstance& instance, const char* name);
    void validateCannotSpecifiedProperty(const CmpiInstance& instance, const char* name);

    /// The property of @p newInstance must be missing or print as the one of @p oldInstance.
    void validateUnmodifiableProperty(const CmpiInstance& oldInstance,
                                      const CmpiInstance& newInstance, const char* name);

    /// The property must read as @p value; with @p allowEmpty it may also be missing.
    void validateFixedValueProperty(const CmpiInstance& instance, const char* propertyName,
                                    const zemString& value, bool allowEmpty);

    /// validateProerties() for the names of the properties that an embedded instance has.
    void validateEmbededInstanceProerties(const CmpiInstance& instance, const char* callingMethod);

    /// The instance behind a reference given as a method argument.
    /// @throws zemInvalidParameterException  for a path without keys, and when the server does not
    ///         find the object
    /// @throws zemOperationFailedException   for any other failure of the server
    CmpiInstance validateEmbeddedObject(const CmpiContext& ctx, const CmpiObjectPath& cop,
                                        const char* parameterName, const char* methodName);

    /// Failures of the resource providers, not localised. @p kind names the resource.
    [[noreturn]] void throwMultiResourceExc(const char* kind, const char* partition,
                                            const char* system) const;
    [[noreturn]] void throwDuplicateResourceExc(const char* kind, const char* value,
                                                const char* partition, const char* system) const;
    [[noreturn]] void throwResourceHasExistedExc(const char* kind, const char* value,
                                                 const char* partition, const char* system) const;
    [[noreturn]] void throwResourceNotExistingExc(const char* kind, const char* value,
                                                  const char* partition, const char* system,
                                                  const char* existing) const;
    [[noreturn]] void throwMinGtDesiredValueExc(CMPIUint64 first, CMPIUint64 second,
                                                const char* className, const char* partition,
                                                const char* system, const char* kind) const;
    [[noreturn]] void throwMinGtMaxValueExc(CMPIUint64 first, CMPIUint64 second,
                                            const char* className, const char* partition,
                                            const char* system, const char* kind) const;
    [[noreturn]] void throwDesiredGtMaxValueExc(CMPIUint64 first, CMPIUint64 second,
                                                const char* className, const char* partition,
                                                const char* system, const char* kind) const;

    /// A property had the value @p found instead of @p expected; localised.
    [[noreturn]] void throwPropertyValueDoesntMatchExc(const char* className, const char* property,
                                                       const char* found,
                                                       const char* expected) const;

private:
    CmpiData anyProperty(const CmpiInstance& instance, const char* name);
    void refuseValue(const CmpiInstance& instance, const char* name, const char* sentence);
    void traceInvalid(const CmpiInstance& instance, const char* name) const;
};

#endif
