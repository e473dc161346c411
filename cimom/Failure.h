/// How failures travel inside the object manager: as one exception with a CIM status, turned
/// into a CMPIStatus where C begins and into a Reply where the facade begins.
#ifndef CIMOM_FAILURE_H
#define CIMOM_FAILURE_H

#include <exception>
#include <string>
#include <utility>

#include "cmpidt.h"

namespace cimom {

class Failure : public std::exception {
public:
    explicit Failure(CMPIrc rc, std::string text = {}) : m_rc(rc), m_text(std::move(text)) {}
    CMPIrc rc() const { return m_rc; }
    const char* what() const noexcept override { return m_text.c_str(); }

private:
    CMPIrc m_rc;
    std::string m_text;
};

}  // namespace cimom

#endif
