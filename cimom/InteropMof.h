/// The classes that the object manager serves by itself, as text.
#ifndef CIMOM_INTEROP_MOF_H
#define CIMOM_INTEROP_MOF_H

#include <string>

namespace cimom {

/// mof/interop.mof.
std::string interopMof();

}  // namespace cimom

#endif
