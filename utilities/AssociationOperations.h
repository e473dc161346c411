/// The operations that an association provider can be given, as bits.
///
/// Every association family takes them in its constructor as its own SupportedOpType; a client
/// that asks for an operation whose bit is missing is answered "not supported".
///
///     using Base = zemNtoNAssociationProvider;
///     Base(mb, ctx, ..., Base::OP_AllInstOps | Base::OP_OnlyAssocOps, ...)
#ifndef ASSOCIATION_OPERATIONS_H
#define ASSOCIATION_OPERATIONS_H

/// Declares SupportedOpType and its enumerators inside a provider class.
#define ZEM_ASSOCIATION_OPERATIONS()                                                    \
    enum SupportedOpType {                                                              \
        OP_GetInstOp = 1,                                                               \
        OP_EnumInstsOp = 2,                                                             \
        OP_EnumInstNamesOp = 4,                                                         \
        OP_AssocsOp = 8,                                                                \
        OP_AssocNamesOp = 16,                                                           \
        OP_RefsOp = 32,                                                                 \
        OP_RefNamesOp = 64,                                                             \
        OP_AllInstOps = 7,                                                              \
        OP_OnlyAssocOps = 24,                                                           \
        OP_OnlyRefOps = 96,                                                             \
        OP_ALLOps = 127                                                                 \
    };                                                                                  \
    friend constexpr SupportedOpType operator|(SupportedOpType a, SupportedOpType b) {  \
        return static_cast<SupportedOpType>(static_cast<int>(a) | static_cast<int>(b)); \
    }

#endif
