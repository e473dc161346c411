#include "Passwords.h"

#include <crypt.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <map>
#include <memory>
#include <sstream>
#include <stdexcept>

namespace cimom {

namespace {

using Hashes = std::map<std::string, std::string>;

constexpr off_t kLargestFile = 1 << 20;

std::string contentOf(const std::string& file) {
    struct Descriptor {
        int number;
        ~Descriptor() {
            if (number >= 0) {
                close(number);
            }
        }
    } const descriptor{open(file.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK)};
    struct stat status = {};
    if (descriptor.number < 0 || fstat(descriptor.number, &status) != 0) {
        throw std::runtime_error(file + ": " + std::strerror(errno));
    }
    if (!S_ISREG(status.st_mode) || status.st_size > kLargestFile) {
        throw std::runtime_error(file + ": no file of passwords");
    }
    const bool ours = status.st_uid == 0 || status.st_uid == geteuid();
    if (!ours || (status.st_mode & (S_IWGRP | S_IRWXO)) != 0) {
        throw std::runtime_error(file + ": others may read or change it; make it mode 600");
    }
    std::string content(static_cast<std::size_t>(status.st_size), '\0');
    const ssize_t count = read(descriptor.number, content.data(), content.size());
    if (count < 0) {
        throw std::runtime_error(file + ": " + std::strerror(errno));
    }
    content.resize(static_cast<std::size_t>(count));
    return content;
}

Hashes hashesIn(const std::string& file) {
    Hashes hashes;
    std::istringstream lines(contentOf(file));
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        if (line.empty() || line[0] == '#') {
            continue;
        }
        const std::size_t colon = line.find(':');
        // A hash begins with $ and its method; what begins otherwise may be a password as it is.
        if (colon == 0 || colon == std::string::npos || line[colon + 1] != '$' ||
            crypt_checksalt(line.c_str() + colon + 1) == CRYPT_SALT_INVALID) {
            throw std::runtime_error(file + ":" + std::to_string(number) +
                                     ": not a name, a colon and a hash of crypt(3)");
        }
        hashes[line.substr(0, colon)] = line.substr(colon + 1);
    }
    return hashes;
}

/// In the same time wherever they differ.
bool sameText(const std::string& a, const std::string& b) {
    unsigned different = a.size() == b.size() ? 0U : 1U;
    for (std::size_t i = 0; i < a.size() && i < b.size(); ++i) {
        different |= static_cast<unsigned>(a[i] ^ b[i]);
    }
    return different == 0;
}

}  // namespace

Passwords::Passwords(std::string file) : m_file(std::move(file)) { hashesIn(m_file); }

bool Passwords::match(const std::string& name, const std::string& password) const {
    Hashes hashes;
    try {
        hashes = hashesIn(m_file);
    } catch (const std::runtime_error&) {
        return false;
    }
    const auto found = hashes.find(name);
    // Somebody's hash is worked out for nobody, too.
    const auto& judged = found == hashes.end() ? hashes.begin() : found;
    if (judged == hashes.end()) {
        return false;
    }
    const auto room = std::make_unique<crypt_data>();
    const char* hash = crypt_r(password.c_str(), judged->second.c_str(), room.get());
    return hash && sameText(hash, judged->second) && found != hashes.end();
}

}  // namespace cimom
