/// The failures of the appliance: what is thrown when a request cannot be met, and the texts by
/// which people and programs know it.
///
/// A text is a code ("WRTL" and four digits), a blank and a sentence. Programs tell failures apart
/// by the code, so it is the same in every language; the sentence is in the user's.
#ifndef APPLIANCE_FAILURE_H
#define APPLIANCE_FAILURE_H

#include <exception>
#include <string>
#include <vector>

#include "FaultTexts.h"

namespace appliance {

enum class Language { English, German };

/// German when the first of LC_ALL, LC_MESSAGES and LANG that is set and not empty asks for it,
/// otherwise English. Texts are UTF-8 whatever character set the locale names.
Language languageOfEnvironment();

/// What can go wrong; the number is that of the code.
enum class Fault {
#define NUMBER(NAME, CODE, ENGLISH, GERMAN) NAME = (CODE),
    APPLIANCE_FAULTS(NUMBER)
#undef NUMBER
};

/// How a program ends: 0 when the request was met, otherwise one of these.
enum ExitStatus {
    kExitRefused = 1,  ///< the request names something that is not there, or may not be done
    kExitUsage = 2,    ///< the command line is wrong
    kExitState = 3,    ///< the appliance's state cannot be read or written
    kExitOutput = 4,   ///< the output cannot be written
};

class Failure : public std::exception {
public:
    /// @param words  stand for %1 and %2 in the fault's sentence
    explicit Failure(Fault fault, std::vector<std::string> words = {});

    /// The text in English.
    const char* what() const noexcept override { return m_english.c_str(); }
    std::string text(Language language) const;
    Fault fault() const noexcept { return m_fault; }
    ExitStatus exitStatus() const noexcept;

private:
    Fault m_fault;
    std::vector<std::string> m_words;
    std::string m_english;
};

/// @param words  are made whether or not they are needed
/// @throws Failure @p wrong is true
inline void refuseIf(bool wrong, Fault fault, std::vector<std::string> words = {}) {
    if (wrong) {
        throw Failure(fault, std::move(words));
    }
}

}  // namespace appliance

#endif
