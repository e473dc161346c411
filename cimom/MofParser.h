/// Reads MOF text into declarations, without judging what they mean together.
///
/// The reader of declarations is ClassRepository, which resolves names and inheritance; few
/// others need this header for more than MofError and MofReader. A parse keeps all its state to
/// itself, so any number may run at once.
#ifndef CIMOM_MOF_PARSER_H
#define CIMOM_MOF_PARSER_H

#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <stdexcept>
#include <string>
#include <variant>
#include <vector>

#include "Value.h"

namespace cimom {

/// Flavors of a qualifier, as bits. Override and propagation are on unless switched off.
enum MofFlavor : unsigned { DisableOverride = 1, Restricted = 2, Translatable = 4 };

/// Elements that a qualifier may stand on, as bits.
enum MofScope : unsigned {
    ScopeClass = 1,
    ScopeAssociation = 2,
    ScopeIndication = 4,
    ScopeProperty = 8,
    ScopeReference = 16,
    ScopeMethod = 32,
    ScopeParameter = 64,
    ScopeAny = 127
};

/// Where something stands; line and column count from 1, a column being one character.
struct MofPlace {
    const std::string* file = nullptr;  ///< lives as long as the declarations
    int line = 1;
    int column = 1;
};

/// One fault in MOF text.
struct MofFault {
    std::string file;
    int line = 0;
    int column = 0;
    std::string text;
};

/// MOF that cannot be taken. what() is one line `file:line:column: text` for each fault.
class MofError : public std::runtime_error {
public:
    explicit MofError(std::vector<MofFault> faults);
    const std::vector<MofFault>& faults() const { return m_faults; }

private:
    std::vector<MofFault> m_faults;
};

/// Yields the text of a file by its path; throws std::runtime_error, whose text tells the reason.
using MofReader = std::function<std::string(const std::string& path)>;

/// The MofReader of files on disk: regular ones of up to 16 MiB.
std::string readRegularFile(const std::string& path);

/// An integer as written: any that fits 64 bits with either sign.
struct MofInteger {
    std::uint64_t magnitude = 0;
    bool isNegative = false;
};

struct MofLiteral {
    MofPlace place;
    std::variant<Value, MofInteger> value;
};

/// What stands behind "=" or in a qualifier's parentheses or braces.
struct MofInitializer {
    MofPlace place;
    bool isArray = false;
    std::vector<MofLiteral> literals;
};

struct MofQualifier {
    MofPlace place;
    std::string name;
    std::optional<MofInitializer> value;
    unsigned flavorsOn = 0;   ///< MofFlavor bits named
    unsigned flavorsOff = 0;  ///< bits whose opposite is named
};

/// A type as it is declared: of a property, parameter, method or qualifier.
struct CimType {
    CMPIType type = CMPI_boolean;  ///< of the value, or of each element
    bool isArray = false;
    std::uint32_t arraySize = 0;  ///< 0: any number of elements
    std::string referenceClass;   ///< of a CMPI_ref; else empty

    CMPIType cmpiType() const { return static_cast<CMPIType>(type | (isArray ? CMPI_ARRAY : 0)); }
};

struct MofParameter {
    MofPlace place;
    std::string name;
    CimType type;
    std::vector<MofQualifier> qualifiers;
};

/// A property, a reference or a method.
struct MofFeature : MofParameter {
    std::optional<MofInitializer> defaultValue;
    bool isMethod = false;
    std::vector<MofParameter> parameters;
};

struct MofClass {
    MofPlace place;
    std::string name;
    MofPlace superclassPlace;
    std::string superclass;  ///< empty: none
    std::vector<MofQualifier> qualifiers;
    std::vector<MofFeature> features;
};

struct CimQualifierType {
    std::string name;
    CimType type;
    unsigned scopes = 0;   ///< MofScope bits
    unsigned flavors = 0;  ///< MofFlavor bits
};

struct MofQualifierType : CimQualifierType {
    MofPlace place;
    std::optional<MofInitializer> defaultValue;
};

struct MofDeclarations {
    std::deque<std::string> files;  ///< names of all files read, for the places
    std::vector<MofClass> classes;
    std::vector<MofQualifierType> qualifierTypes;
};

/// Parses @p path and what it includes by `#pragma include ("...")`, a path relative to the
/// including file. A file is read once, however often it is included; one that includes itself
/// is a fault, as is a nesting of more than 16 files. Other pragmas are skipped.
/// @throws MofError with the first fault, among them a file that @p reader cannot read
MofDeclarations parseMof(const std::string& path, const MofReader& reader);

}  // namespace cimom

#endif
