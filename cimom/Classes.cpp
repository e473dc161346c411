#include "Classes.h"

namespace cimom {

namespace {

// In the order of CimType.
constexpr CMPIType kCmpiTypes[] = {CMPI_boolean, CMPI_uint8,    CMPI_sint8,  CMPI_uint16,
                                   CMPI_sint16,  CMPI_uint32,   CMPI_sint32, CMPI_uint64,
                                   CMPI_sint64,  CMPI_real32,   CMPI_real64, CMPI_char16,
                                   CMPI_string,  CMPI_dateTime, CMPI_ref};

CMPIType cmpiType(CimType type) { return kCmpiTypes[static_cast<std::size_t>(type)]; }

Value scalarOf(const CimScalar& scalar, CimType type) {
    const Value plain = std::visit(
        [](const auto& held) -> Value {
            if constexpr (std::is_same_v<std::decay_t<decltype(held)>, std::monostate>)
                return Value();
            else
                return Value(held);
        },
        scalar);
    if (type == CimType::Char16 && !plain.isNull())
        return Value::char16(static_cast<std::uint16_t>(plain.uint()));
    Value typed;
    return plain.convertTo(cmpiType(type), typed) ? typed : plain;
}

}  // namespace

CMPIType typeOf(const CimElement& element) {
    const CMPIType type =
        element.isEmbeddedObject ? CMPIType{CMPI_instance} : cmpiType(element.type);
    return static_cast<CMPIType>(type | (element.isArray ? CMPI_ARRAY : 0));
}

Value valueOf(const CimValue& value, CimType type, bool isArray) {
    if (!value)
        return Value::null(static_cast<CMPIType>(cmpiType(type) | (isArray ? CMPI_ARRAY : 0)));
    if (!isArray) return scalarOf(value->front(), type);
    Value::Array elements;
    for (const CimScalar& scalar : *value) elements.push_back(scalarOf(scalar, type));
    return Value::array(cmpiType(type), std::move(elements));
}

}  // namespace cimom
