/// Queries and changes through the appliance's command-line tools.
///
/// zemCommandCaller builds a tool's line, runs it under the user and locale of one operation and
/// judges the result. It is the base of the callers of the single tools (QyplatCmdCaller.h ...),
/// and serves for one-off lines by itself:
///
///     zemCommandCaller caller(userName, locale);
///     zemString output;
///     caller.callGenericCommand("qyplat -r sys -F name", &output, true);
///
/// An object holds two strings and is made on the stack for one operation; objects are not shared
/// between threads. The tool's own words reach the client unchanged. What running a tool can throw
/// (PropertiesHelper.h) comes out of every operation here.
///
/// A line is cut into arguments at blanks, quotes and backslashes. What the callers themselves put
/// between quotes, such as names of systems, partitions and profiles, reaches the tool as it is.
/// What a header says to stand in the line unquoted (whole lines and filters, values of
/// tagAttributePair, some names) is quoted by whoever hands it over, with quoted(), itemValue() and
/// filterItem(). A text from outside must never go into a line without:
///
///     using Caller = zemCommandCaller;
///     zemString filter = Caller::quoted(Caller::filterItem("lpar_names", name));
#ifndef COMMAND_CALLER_H
#define COMMAND_CALLER_H

#include <string>

#include "AttributeTable.h"
#include "DynamicArray.h"
#include "RecordSets.h"
#include "StringUtils.h"
#include "ZemExport.h"

/// One attribute for a change tool.
struct tagAttributePair {
    tagAttributePair() = default;
    tagAttributePair(int index, const zemString& value)
        : m_attributeIndex(index), m_attributeValue(value) {}

    int m_attributeIndex = 0;    ///< position in the tool's table of names
    zemString m_attributeValue;  ///< written to the command line as it is, see itemValue()
};

/// One query of a tool: what its lines begin with, which fields there are, and when the line names
/// the managed system.
struct zemQuery {
    enum SystemTest { WHEN_NOT_EMPTY, WHEN_NOT_NULL };

    const char* command;
    zemAttributeNames attributes;
    SystemTest systemTest = WHEN_NOT_EMPTY;
};

class ZEM_EXPORT zemCommandCaller {
public:
    /// What a change does to a multi-valued attribute: "+=", "=" or "-=".
    enum CH_OP_TYPE : int { CH_OP_ADD = 0, CH_OP_MODIFY = 1, CH_OP_REMOVE = 2 };
    typedef CH_OP_TYPE ChOperateType;

    /// @param auth  user to run tools as; null or empty: the process's own
    /// @param locale  LC_ALL of the tools; null or empty leaves it alone
    zemCommandCaller(const char* auth, const char* locale);
    virtual ~zemCommandCaller();

    /// Runs @p command without a time limit, timed by the logger "callGenericCommand".
    /// @param pCmdOutput  receives standard output if not null
    /// @param forceTimeOut  has no effect; callers say true for queries and false for changes
    /// @return 0
    /// @throws zemObjectNotFoundException the tool says "No results were found."
    /// @throws zemOperationFailedException the tool fails: the id is the code beginning with "WRTL"
    ///         in its text, else "UNKNOWN". Of both the access method is the quoted line.
    int callGenericCommand(const char* command, zemString* pCmdOutput, bool forceTimeOut);

    /// The same for @p command as arguments of "xbrgcli", in which the caller has quoted names.
    int callXBRGCommand(const char* command, zemString* pCmdOutput);

    /// @p text in double quotes, escaped so that the tool receives exactly this one argument. Null
    /// is as empty, here and below.
    static zemString quoted(const char* text);

    /// @p text as the value of a tagAttributePair, of which the tool takes this very text.
    static zemString itemValue(const char* text);

    /// "<name>=<value>" as an item of a tool's filter: a list that still needs quoted() around it.
    /// A value with commas stays as it is, because the tools know names with commas; one that they
    /// would take for more than a value is quoted in their manner.
    static zemString filterItem(const char* name, const char* value);

protected:
    /// Runs the query @p cmd, of which at most 2048 bytes count, for named fields. Here and in the
    /// next two, a @p cmd that would end within quotes there is refused
    /// (zemInvalidParameterException, id "INVALID_LENGTH").
    /// @param paramAttr  positions of the wanted fields in @p allAttrNames, ending in
    ///        @p paramAttrEndFlag and used as keys of the records; null: all, in table order
    /// @param results  receives the records
    /// @throws zemOperationFailedException id "INVALID_RECORD": a record ends inside quotes; the
    ///         records before it are in @p results
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table
    virtual void callLsCommand(const char* cmd, int* paramAttr, int paramAttrEndFlag,
                               const char* const* allAttrNames, unsigned int allAttrNumber,
                               zemRecordSetsType& results);

    /// Runs the change @p cmd, of which at most 512 bytes count, with the option that
    /// BuildChCmdString() adds, and throws what that throws. Returns 0.
    virtual int callChCommand(const char* cmd,
                              const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                              const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                              const char* const* allAttrNames, unsigned int allAttrNumber,
                              CH_OP_TYPE op, const char* attrOpt);

    /// Runs the creation @p cmd, of which at most 512 bytes count, with the option -i and
    /// @p attrPairs; the option stands even if they are empty. Returns 0.
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table
    virtual int callMkCommand(const char* cmd, const zemDynamicArray<tagAttributePair>& attrPairs,
                              const char* const* allAttrNames, unsigned int allAttrNumber);

    /// Appends the option @p attrOpt to @p strCmd with the single-valued attributes and then the
    /// multi-valued ones, or nothing when both arrays are empty:
    ///
    ///      -i "\"name=value\",\"attr+=v1\""
    ///
    /// The splitter makes this one argument that keeps the inner quotes, so a value may hold
    /// commas.
    /// @throws zemInvalidParameterException id "INVALID_INDEX": a position outside the table, or no
    ///         such @p op
    void BuildChCmdString(zemString& strCmd,
                          const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                          const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                          const char* const* allAttrNames, unsigned int allAttrNumber,
                          CH_OP_TYPE op, const char* attrOpt);

    /// The same for a line in the making.
    static void appendAttributes(std::string& line,
                                 const zemDynamicArray<tagAttributePair>& singleValAttrPairs,
                                 const zemDynamicArray<tagAttributePair>& multiValAttrPairs,
                                 zemAttributeNames table, CH_OP_TYPE op, const char* attrOpt);

    /// Runs one query of a tool. The line is the query's command, @p firstOptions, the managed
    /// system, the filter, @p lastOptions and the wanted fields.
    /// @param paramAttr  as in callLsCommand(), ending in -1
    /// @param filter  with its own quoting; null or empty: none
    zemRecordSetsType query(const zemQuery& query, int* paramAttr, const char* managedSystem,
                            const char* filter = nullptr, const char* firstOptions = "",
                            const char* lastOptions = "");

    /// The option -m with @p managedSystem in double quotes; nothing for null.
    static std::string systemOption(const char* managedSystem);

    /// Logs @p line behind @p what, between two rules, and runs it.
    void callStateChange(const char* what, const std::string& line);

    zemString m_auth;
    zemString m_locale;
};

#endif
