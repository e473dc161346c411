/// Names and passwords of those who may sign in, out of a file.
///
/// Each line of the file is `name:hash`, the hash one of crypt(3) as mkpasswd prints it; empty
/// lines, and lines that begin with #, are skipped. The file is read anew whenever somebody signs
/// in, so that who is taken out of it is out at once. It must belong to the user of the process or
/// to root, and only that user and the file's group may read it, and only the former change it.
/// Thread-safety: any number of threads at once.
#ifndef CIMOM_PASSWORDS_H
#define CIMOM_PASSWORDS_H

#include <string>

namespace cimom {

class Passwords {
public:
    /// @throws std::runtime_error when the file cannot be used, with the reason
    explicit Passwords(std::string file);

    /// Whether that is the password of that name; false also when the file has become unusable.
    /// Takes as long for a name that is not there.
    bool match(const std::string& name, const std::string& password) const;

private:
    const std::string m_file;
};

}  // namespace cimom

#endif
