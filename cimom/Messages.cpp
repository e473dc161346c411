#include "Messages.h"

#include <algorithm>
#include <cstdlib>

#include "Failure.h"
#include "Json.h"
#include "Literal.h"

namespace cimom {

namespace {

constexpr const char* kDefaultBundle = "default";

struct Wish {
    std::string language;
    double weight;
};

std::string trimmed(const std::string& text) {
    const std::size_t from = text.find_first_not_of(" \t");
    if (from == std::string::npos) {
        return {};
    }
    return text.substr(from, text.find_last_not_of(" \t") - from + 1);
}

// "de-AT;q=0.5" or "de_AT.UTF-8@euro"
Wish parseWish(const std::string& item) {
    const std::size_t semicolon = item.find(';');
    Wish wish{trimmed(item.substr(0, semicolon)), 1};
    wish.language = wish.language.substr(0, wish.language.find_first_of(".@"));
    std::replace(wish.language.begin(), wish.language.end(), '-', '_');
    if (semicolon != std::string::npos) {
        const std::size_t q = item.find("q=", semicolon);
        if (q != std::string::npos) {
            wish.weight = std::strtod(item.c_str() + q + 2, nullptr);
        }
    }
    return wish;
}

}  // namespace

std::vector<std::string> wantedLanguages(const std::string& acceptLanguage) {
    std::vector<Wish> wishes;
    for (const std::string& item : splitAtCommas(acceptLanguage)) {
        Wish wish = parseWish(item);
        // A language names part of a file: nothing but letters, digits and underscores.
        const bool plain = std::all_of(wish.language.begin(), wish.language.end(), [](char c) {
            return std::isalnum(static_cast<unsigned char>(c)) || c == '_';
        });
        if (!wish.language.empty() && plain && wish.weight > 0) {
            wishes.push_back(std::move(wish));
        }
    }
    std::stable_sort(wishes.begin(), wishes.end(),
                     [](const Wish& a, const Wish& b) { return a.weight > b.weight; });
    std::vector<std::string> languages;
    for (const Wish& wish : wishes) {
        languages.push_back(wish.language);
        const std::size_t region = wish.language.find('_');
        if (region != std::string::npos) {
            languages.push_back(wish.language.substr(0, region));
        }
    }
    return languages;
}

std::string withInserts(const std::string& text, const std::vector<std::string>& inserts) {
    std::string out;
    for (std::size_t at = 0; at < text.size(); ++at) {
        const bool dollar = text[at] == '$';
        const bool brace = text[at] == '{' && at + 2 < text.size() && text[at + 2] == '}';
        const std::size_t number = (dollar || brace) && at + 1 < text.size() &&
                                           std::isdigit(static_cast<unsigned char>(text[at + 1]))
                                       ? static_cast<std::size_t>(text[at + 1] - '0')
                                       : inserts.size();
        if (number < inserts.size()) {
            out += inserts[number];
            at += dollar ? 1 : 2;
        } else {
            out += text[at];
        }
    }
    return out;
}

MessageStore::Handle MessageStore::read(const std::string& file) {
    const auto known = m_files.find(file);
    if (known != m_files.end()) {
        return known->second.get();
    }
    std::optional<MessageTexts> texts = readTexts(file);
    if (!texts) {
        return nullptr;
    }
    return m_files.emplace(file, std::make_unique<const MessageTexts>(std::move(*texts)))
        .first->second.get();
}

MessageStore::Handle MessageStore::open(const std::string& bundle,
                                        const std::vector<std::string>& languages) {
    std::vector<std::string> stems;
    const std::size_t slash = bundle.rfind('/');
    if (slash != std::string::npos) {
        stems.push_back(bundle);
    }
    const std::string name = bundle.empty() ? kDefaultBundle : bundle.substr(slash + 1);
    if (!m_folder.empty()) {
        stems.push_back(m_folder + "/" + name);
    }

    std::lock_guard<std::mutex> lock(m_mutex);
    for (const std::string& stem : stems) {
        Handle handle = nullptr;
        for (auto at = languages.begin(); !handle && at != languages.end(); ++at) {
            handle = read(stem + "_" + *at + ".json");
        }
        if (!handle) {
            handle = read(stem + ".json");
        }
        if (handle) {
            m_open.insert(handle);
            return handle;
        }
    }
    throw Failure(CMPI_RC_ERR_NOT_FOUND, "no message bundle '" + bundle + "'");
}

bool MessageStore::close(Handle handle) {
    std::lock_guard<std::mutex> lock(m_mutex);
    const auto at = m_open.find(handle);
    if (at == m_open.end()) {
        return false;
    }
    m_open.erase(at);
    return true;
}

const std::string* MessageStore::find(Handle handle, const std::string& id) {
    std::lock_guard<std::mutex> lock(m_mutex);
    if (m_open.count(handle) == 0) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "bundle not open");
    }
    const auto at = handle->find(id);
    return at == handle->end() ? nullptr : &at->second;
}

}  // namespace cimom
