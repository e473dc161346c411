/// Raw calls into a server's function tables, past the binding; private to the library.
#ifndef ZEM_SERVER_CALL_H
#define ZEM_SERVER_CALL_H

#include "cmpift.h"

/// Calls the function at @p entry. Small servers leave functions and whole tables out.
/// @param missing  the answer where there is no such function
template <class Table, class Function, class Answer, class... Args>
Answer zemCallServer(const Table* table, Function Table::*entry, Answer missing, Args... args) {
    if (table == nullptr || table->*entry == nullptr) {
        return missing;
    }
    return (table->*entry)(args...);
}

constexpr CMPIStatus kZemServed = {CMPI_RC_OK, nullptr};
constexpr CMPIStatus kZemNotServed = {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};

#endif
