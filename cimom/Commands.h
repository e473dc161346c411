/// The verbs of the command line, one row each.
#ifndef CIMOM_COMMANDS_H
#define CIMOM_COMMANDS_H

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "Output.h"
#include "PathText.h"
#include "Server.h"

namespace cimom {

/// What stands behind a verb, as text.
struct Arguments : AssociationFilter {
    std::string object;  ///< class or path
    std::string name;    ///< method or property
    std::string value;
    std::vector<std::string> assignments;  ///< name=value
    std::string query;
    std::string queryLanguage = "WQL";
    std::size_t count = 0;  ///< indications to wait for; 0 for any number
    std::string address = "127.0.0.1";
    std::optional<std::uint16_t> port;  ///< 0 for any that is free
    std::string certificate;            ///< files in PEM
    std::string key;
    std::string passwords;
    std::string state;    ///< folder or file
    std::string trusted;  ///< file in PEM
    bool log = false;
};

/// Everything that a verb works with.
struct Session {
    Server& server;
    Request request;
    const ClassRepository* classes;
    /// Kept where the broker leaves names and types to the provider, as small servers do.
    Unfit unfit;
    Format format;
    ResultStream& out;
};

/// What a verb may take, as bits; the command line is made from it.
enum Takes : unsigned {
    kClass = 1,
    kOptionalClass = 2,
    kPath = 4,
    kMethodName = 8,
    kPropertyName = 16,
    kValue = 32,
    kPropertyValues = 64,
    kInputValues = 128,
    kPropertyList = 256,
    kAssociationEnds = 512,  ///< --assoc-class and --result-role
    kNavigation = 1024,      ///< --result-class and --role
    kFilter = 2048,
    kNoProvider = 4096,  ///< nothing of a registration
    kServing = 8192,
};

struct Verb {
    const char* name;
    const char* help;
    unsigned takes;
    Reply (*run)(Session& session, const Arguments& arguments);
};

/// All verbs, in the order of --help.
const std::vector<Verb>& verbs();

}  // namespace cimom

#endif
