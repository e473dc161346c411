/// The declarations of the class repository in terms of the value model.
#ifndef CIMOM_CLASSES_H
#define CIMOM_CLASSES_H

#include "ClassRepository.h"
#include "Value.h"

namespace cimom {

/// CMPI type of a declared element; strings that carry instances are CMPI_instance.
CMPIType typeOf(const CimElement& element);
/// A declared value: a default of a property or the value of a qualifier.
Value valueOf(const CimValue& value, CimType type, bool isArray);

}  // namespace cimom

#endif
