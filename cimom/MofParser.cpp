#include "MofParser.h"

#include <sys/stat.h>

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <charconv>
#include <filesystem>
#include <fstream>
#include <memory>
#include <system_error>
#include <utility>

#include "Literal.h"
#include "MofGrammar.h"
#include "MofInput.h"

// The scanner's entries; flex generates no header that C++ without its types could include.
struct yy_buffer_state;
int moflex_init_extra(cimom::MofInput* extra, void** scanner);
yy_buffer_state* mof_scan_bytes(const char* text, int length, void* scanner);
int moflex_destroy(void* scanner);

namespace cimom {

namespace {

constexpr std::size_t kMaxFileSize = 16u << 20;
constexpr std::size_t kMaxIncludeDepth = 16;
constexpr std::size_t kMaxFiles = 4096;
constexpr std::size_t kShownLength = 40;

// A word that stands for bits, or for their opposite.
struct Word {
    const char* word;
    unsigned bits;
    bool isOn = true;
};

constexpr Word kFlavors[] = {
    {"DisableOverride", DisableOverride}, {"EnableOverride", DisableOverride, false},
    {"Restricted", Restricted},           {"ToSubclass", Restricted, false},
    {"Translatable", Translatable},       {"ToInstance", 0},
};

constexpr Word kScopes[] = {
    {"Class", ScopeClass},           {"Association", ScopeAssociation},
    {"Indication", ScopeIndication}, {"Property", ScopeProperty},
    {"Reference", ScopeReference},   {"Method", ScopeMethod},
    {"Parameter", ScopeParameter},   {"Any", ScopeAny},
};

// The row of a table, or a fault that lists the words.
template <std::size_t N>
const Word& rowOf(const Word (&rows)[N], const MofPlace& place, const std::string& word) {
    std::string words;
    for (const Word& row : rows) {
        if (sameName(row.word, word)) {
            return row;
        }
        words += (words.empty() ? "" : ", ") + std::string(row.word);
    }
    MofInput::fail(place, "expected one of " + words + "; found '" + word + "'");
}

std::string describe(const std::vector<MofFault>& faults) {
    std::string all;
    for (const MofFault& fault : faults) {
        if (!all.empty()) {
            all += '\n';
        }
        all += fault.file;
        if (fault.line > 0) {
            all += ':' + std::to_string(fault.line) + ':' + std::to_string(fault.column);
        }
        all += ": " + fault.text;
    }
    return all;
}

// Reads the hexadecimal digits, up to four, at @p at and leaves @p at behind them.
unsigned readHex(const std::string& text, std::size_t& at) {
    const char* begin = text.data() + at;
    const char* end = begin + std::min<std::size_t>(4, text.size() - at);
    unsigned code = 0;
    at += static_cast<std::size_t>(std::from_chars(begin, end, code, 16).ptr - begin);
    return code;
}

}  // namespace

// ---- files

MofError::MofError(std::vector<MofFault> faults)
    : std::runtime_error(describe(faults)), m_faults(std::move(faults)) {}

std::string readRegularFile(const std::string& path) {
    struct stat status = {};
    if (stat(path.c_str(), &status) != 0) {
        throw std::runtime_error(std::generic_category().message(errno));
    }
    if (!S_ISREG(status.st_mode)) {
        throw std::runtime_error("not a regular file");
    }
    if (static_cast<std::uintmax_t>(status.st_size) > kMaxFileSize) {
        throw std::runtime_error("larger than 16 MiB");
    }
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        throw std::runtime_error(std::generic_category().message(errno));
    }
    std::string text(static_cast<std::size_t>(status.st_size), '\0');
    file.read(text.data(), static_cast<std::streamsize>(text.size()));
    text.resize(static_cast<std::size_t>(file.gcount()));  // it may have shrunk meanwhile
    return text;
}

void MofSession::parseFile(const std::string& path, const MofPlace* includedAt) {
    const std::string name = std::filesystem::path(path).lexically_normal().string();
    auto refuse = [&](const std::string& reason) {
        if (includedAt) {
            MofInput::fail(*includedAt, "cannot read '" + name + "': " + reason);
        }
        throw MofError({{name, 0, 0, "cannot be read: " + reason}});
    };
    if (std::find(m_open.begin(), m_open.end(), name) != m_open.end()) {
        refuse("it includes itself");
    }
    if (m_open.size() >= kMaxIncludeDepth) {
        refuse("files are included too deep");
    }
    if (m_read.size() >= kMaxFiles) {
        refuse("too many files");
    }
    if (!m_read.insert(name).second) {
        return;
    }

    std::string text;
    try {
        text = m_reader(name);
    } catch (const std::runtime_error& failure) {
        refuse(failure.what());
    }
    if (text.size() > kMaxFileSize) {
        refuse("larger than 16 MiB");
    }
    std::string_view body = text;
    if (body.substr(0, 3) == "\xEF\xBB\xBF") {
        body.remove_prefix(3);
    }

    m_open.push_back(name);
    m_declarations.files.push_back(name);
    MofInput input(*this, &m_declarations.files.back());
    void* scanner = nullptr;
    if (moflex_init_extra(&input, &scanner) != 0) {
        throw std::bad_alloc();
    }
    const std::unique_ptr<void, int (*)(void*)> freed(scanner, moflex_destroy);
    mof_scan_bytes(body.data(), static_cast<int>(body.size()), scanner);
    MofGrammar(input, scanner).parse();
    m_open.pop_back();
}

MofDeclarations parseMof(const std::string& path, const MofReader& reader) {
    MofSession session(reader);
    session.parseFile(path, nullptr);
    return std::move(session.declarations());
}

// ---- one file

MofInput::MofInput(MofSession& session, const std::string* file) : m_session(session) {
    m_end.file = file;
}

void MofInput::fail(const MofPlace& place, const std::string& text) {
    throw MofError({{*place.file, place.line, place.column, text}});
}

void MofInput::advance(const char* text, std::size_t length) {
    m_start = m_end;
    m_lexeme.assign(text, length);
    for (char c : m_lexeme) {
        if (c == '\n') {
            ++m_end.line;
            m_end.column = 1;
        } else if ((static_cast<unsigned char>(c) & 0xC0) != 0x80) {  // begins a character
            ++m_end.column;
        }
    }
}

std::string MofInput::shownLexeme() const {
    if (m_lexeme.size() <= kShownLength) {
        return m_lexeme;
    }
    std::size_t length = kShownLength;
    while ((static_cast<unsigned char>(m_lexeme[length]) & 0xC0) == 0x80) {
        --length;
    }
    return m_lexeme.substr(0, length) + "...";
}

MofInteger MofInput::integer(std::string_view digits, int base) const {
    MofInteger number;
    if (digits[0] == '+' || digits[0] == '-') {
        number.isNegative = digits[0] == '-';
        digits.remove_prefix(1);
    }
    if (base == 16) {
        digits.remove_prefix(2);
    }
    auto result =
        std::from_chars(digits.data(), digits.data() + digits.size(), number.magnitude, base);
    if (result.ec != std::errc()) {
        fail(m_start, "'" + shownLexeme() + "' is too large");
    }
    return number;
}

double MofInput::real() const {
    double number = 0;
    std::size_t sign = m_lexeme[0] == '+' ? 1 : 0;  // from_chars takes no plus
    auto result =
        std::from_chars(m_lexeme.data() + sign, m_lexeme.data() + m_lexeme.size(), number);
    if (result.ec != std::errc()) {
        fail(m_start, "'" + shownLexeme() + "' is out of range");
    }
    return number;
}

std::string MofInput::unquoted() const {
    std::string text;
    text.reserve(m_lexeme.size());
    const std::size_t end = m_lexeme.size() - 1;
    for (std::size_t i = 1; i < end;) {
        char c = m_lexeme[i++];
        if (c != '\\') {
            text += c;
            continue;
        }
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(m_lexeme[i++])));
        if (c != 'x') {
            text += meaningOfEscape(c);
            continue;
        }
        unsigned code = readHex(m_lexeme, i);
        if (code == 0 || (code >= 0xD800 && code < 0xE000)) {
            fail(m_start, "a \\x escape here names no character");
        }
        text += utf8(code);
    }
    return text;
}

std::uint16_t MofInput::character() const {
    const std::string text = unquoted();
    if (text.size() > 3) {
        fail(m_start, "this character does not fit 16 bits");
    }
    static constexpr unsigned kBitsOfFirst[] = {0x7F, 0x1F, 0x0F};  // of one, two, three bytes
    unsigned code = static_cast<unsigned char>(text[0]) & kBitsOfFirst[text.size() - 1];
    for (std::size_t i = 1; i < text.size(); ++i) {
        code = code << 6 | (static_cast<unsigned char>(text[i]) & 0x3F);
    }
    return static_cast<std::uint16_t>(code);
}

void MofInput::pragma(const MofPlace& place, const std::string& name,
                      const std::vector<MofLiteral>& arguments) {
    if (!sameName(name, "include")) {
        return;
    }
    const Value* path = arguments.size() == 1 ? std::get_if<Value>(&arguments[0].value) : nullptr;
    if (!path || path->type() != CMPI_string || path->text().empty()) {
        fail(place, "expected one path in quotes behind 'include'");
    }
    std::filesystem::path here(*place.file);
    m_session.parseFile((here.parent_path() / path->text()).string(), &arguments[0].place);
}

std::uint32_t MofInput::arraySize(const MofPlace& place, const MofInteger& size) const {
    if (size.isNegative || size.magnitude == 0 || size.magnitude > UINT32_MAX) {
        fail(place, "expected an array size from 1 to 4294967295");
    }
    return static_cast<std::uint32_t>(size.magnitude);
}

void MofInput::addFlavor(const MofPlace& place, const std::string& name,
                         MofQualifier& qualifier) const {
    const Word& row = rowOf(kFlavors, place, name);
    (row.isOn ? qualifier.flavorsOn : qualifier.flavorsOff) |= row.bits;
}

unsigned MofInput::scope(const MofPlace& place, const std::string& name) const {
    return rowOf(kScopes, place, name).bits;
}

}  // namespace cimom
