#include "Failure.h"

#include <cstdlib>

namespace appliance {

namespace {

/// The fault's sentence.
const char* sentenceOf(Fault fault, Language language) {
    switch (fault) {
#define SENTENCE(NAME, CODE, ENGLISH, GERMAN) \
    case Fault::NAME:                         \
        return language == Language::German ? (GERMAN) : (ENGLISH);
        APPLIANCE_FAULTS(SENTENCE)
#undef SENTENCE
    }
    return "";
}

std::string filled(const char* sentence, const std::vector<std::string>& words) {
    std::string text;
    for (const char* c = sentence; *c != '\0'; ++c) {
        const auto index = static_cast<std::size_t>(c[1] - '1');
        if (*c == '%' && index < words.size()) {
            text += words[index];
            ++c;
        } else {
            text += *c;
        }
    }
    return text;
}

}  // namespace

Language languageOfEnvironment() {
    for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        const char* value = std::getenv(variable);
        if (value == nullptr || *value == '\0') {
            continue;
        }
        const std::string locale = value;
        const std::string language = locale.substr(0, locale.find_first_of("_.@"));
        return language == "de" ? Language::German : Language::English;
    }
    return Language::English;
}

Failure::Failure(Fault fault, std::vector<std::string> words)
    : m_fault(fault), m_words(std::move(words)), m_english(text(Language::English)) {}

std::string Failure::text(Language language) const {
    return "WRTL" + std::to_string(static_cast<int>(m_fault)) + ' ' +
           filled(sentenceOf(m_fault, language), m_words);
}

ExitStatus Failure::exitStatus() const noexcept {
    // These end otherwise than their like: what a host refuses, what --force allows, lost output.
    if (m_fault == Fault::BadValue || m_fault == Fault::StateExists) {
        return kExitRefused;
    }
    if (m_fault == Fault::Output) {
        return kExitOutput;
    }
    const int group = static_cast<int>(m_fault) / 1000;
    return group == 1 ? kExitUsage : group == 2 ? kExitState : kExitRefused;
}

}  // namespace appliance
