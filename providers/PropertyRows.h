/// What all providers here share: rows that turn attributes of a tool's record into CIM properties,
/// and the few facts about hosts and partitions on which every class depends.
///
/// A provider names its rows once. From them follow the attributes that a query must ask for and
/// the properties that an instance gets, so that the tool is asked for nothing that nobody wants.
///
/// Thread-safety: functions on their arguments alone.
#ifndef PROPERTY_ROWS_H
#define PROPERTY_ROWS_H

#include <string>
#include <utility>
#include <vector>

#include "CmpiArgs.h"
#include "CmpiInstance.h"
#include "CommandCaller.h"
#include "Exception.h"

/// How the text of a tool attribute becomes the value of a property. An empty text is null.
enum class ValueKind {
    Text,
    TextList,      ///< "a,b" as an array of texts
    Uint16,        ///< decimal; anything else is null
    Uint32,        ///< likewise
    Uint64,        ///< likewise
    Hundredths,    ///< "1.25" as the 32-bit number 125
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

using Attributes = std::vector<int>;  ///< enumerators of one tool table

/// The attributes of @p identity and those of the wanted properties, each once, closed by -1 as the
/// callers want their lists.
/// @param properties  null-ended list of wanted properties; null or empty: all
Attributes attributesFor(const std::vector<PropertyRow>& rows, const Attributes& identity,
                         const char** properties);

/// Sets the wanted properties that have a value in @p record; the others stay null.
void setProperties(CmpiInstance& instance, const std::vector<PropertyRow>& rows,
                   const char** properties, const zemRecordType& record);

/// The tools' text for a number of hundredths, 125 as "1.25".
std::string hundredthsText(unsigned long hundredths);

/// Whether a text has the form of a host's key, <type_model>*<serial_num>. Keys come from clients
/// and go into command lines, so nothing else may pass.
bool isHostName(const std::string& text);

/// Whether a tool or the management library failed because it knows no such host or partition.
bool isUnknownObject(const zemException& failure);

/// The key of the host that a qyplat host record describes.
std::string hostName(const zemRecordType& host);

/// The text of a key; empty without it.
std::string keyOf(const CmpiObjectPath& path, const char* name);

/// Hosts and partitions have the keys CreationClassName, which is their class, and Name: their
/// list, and a path with both, in the namespace of @p near.
void listSystemKeys(CmpiArray& keys);
CmpiObjectPath systemPath(const CmpiObjectPath& near, const char* className,
                          const std::string& name);

/// A new instance that has the keys of @p path as properties. Servers make instances with the
/// defaults of their class; one for a list of properties takes no others, so that no default is
/// told of a property that nobody read.
/// @param properties  as for attributesFor()
CmpiInstance newInstance(const CmpiObjectPath& path, const char** properties);

/// The same for who has the keys at hand, and need not have them read from the path.
using Keys = std::vector<std::pair<const char*, CmpiData>>;
CmpiInstance newInstance(const CmpiObjectPath& path, const Keys& keys, const char** properties);

/// An argument of a method; null when it was not given, in whichever way the server says so.
CmpiData argumentOf(const CmpiArgs& in, const char* name);

/// What a client asks for with an instance that it sends: the wanted properties that have a value,
/// but for those at the default of @p className. Servers fill defaults in for what a client leaves
/// out, so a default asks for nothing.
/// @param near  in the namespace of the class
std::vector<std::pair<std::string, CmpiData>> askedFor(const CmpiInstance& instance,
                                                       const CmpiObjectPath& near,
                                                       const char* className,
                                                       const char** properties);

/// Whether the client limits the time that a change of state may take, by TimeoutPeriod.
bool hasTimeout(const CmpiArgs& in);

#endif
