/// A temporary folder for the files of a test.
#ifndef TESTS_CIMOM_FOLDER_H
#define TESTS_CIMOM_FOLDER_H

#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

namespace fixture {

/// A folder of its own for a test, which goes with it.
class Folder {
public:
    Folder() {
        std::string name = (std::filesystem::temp_directory_path() / "cimomXXXXXX").string();
        m_path = mkdtemp(name.data());
    }
    ~Folder() { std::filesystem::remove_all(m_path); }

    const std::filesystem::path& path() const { return m_path; }
    std::string operator/(const std::string& name) const { return (m_path / name).string(); }
    /// Writes a file; returns its path.
    std::string write(const std::string& name, const std::string& text) const {
        std::ofstream(m_path / name) << text;
        return *this / name;
    }

private:
    std::filesystem::path m_path;
};

}  // namespace fixture

#endif
