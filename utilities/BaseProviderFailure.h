/// The failures that providers throw by name: one row of words each; private to the sources of the
/// provider bases.
#ifndef ZEM_BASE_PROVIDER_FAILURE_H
#define ZEM_BASE_PROVIDER_FAILURE_H

#include <initializer_list>
#include <string>

#include "cmpidt.h"

/// A text for one mark of a sentence.
struct zemInsert {
    char mark;
    const char* text;
};

/// One failure. In the default sentence "$" and a letter stand for the insert with that mark, "$P"
/// for the provider's name; the message of the bundle gets the inserts of @a arguments in order.
struct zemFailure {
    const char* function;
    const char* messageKey;
    const char* sentence;
    const char* arguments;
    /// Throws the exception whose kind the failure has.
    void (*throwIt)(const char* text);
    bool localised = true;
    /// Opens a line on standard output with the text of the failure; null for none.
    const char* printedAs = nullptr;
};

/// The sentence with its inserts; a mark without a text stands for nothing.
std::string zemFillSentence(const char* sentence, const char* provider,
                            std::initializer_list<zemInsert> inserts);

/// Throws one failure on behalf of a provider, with the texts in @p inserts put into its sentence.
[[noreturn]] void zemRaise(CMPIBroker* broker, const char* provider, const zemFailure& failure,
                           std::initializer_list<zemInsert> inserts);

template <class Exception>
[[noreturn]] void zemThrow(const char* text) {
    throw Exception(text);
}

#endif
