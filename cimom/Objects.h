/// The C objects of CMPI, and who owns them.
///
/// Each object that a provider sees is the face of a node: the C struct of its kind, by whose
/// address the node is found, and a body that holds the content in the value model. The hdl of a
/// string is its text, as in all brokers of the field, for there are bindings that read it there.
/// Nodes made during a request are owned by the request's pool and freed with it; clones, and
/// objects made on threads without a request, are owned by the broker's stray pool until they are
/// released.
///
/// The memory of nodes is reused for nodes of their kind and never given back. A released object's
/// face stays readable with a null hdl, so that its use is answered with CMPI_RC_ERR_INVALID_HANDLE
/// and counted, instead of corrupting the heap.
///
/// Thread-safety: objects may be made and released on any thread; one object must not be used
/// by two threads at a time while it changes.
#ifndef CIMOM_OBJECTS_H
#define CIMOM_OBJECTS_H

#include <cstddef>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <tuple>
#include <type_traits>
#include <vector>

#include "ClassRepository.h"
#include "Failure.h"
#include "Value.h"
#include "cmpidt.h"
#include "cmpift.h"

namespace cimom {

class Broker;
class Pool;
class Query;
struct Reply;
struct Condition;
struct SubCondition;
struct Predicate;

// -- bodies ----------------------------------------------------------------------------------

struct StringBody {
    std::string text;
    bool null = false;  ///< getCharPtr answers null
};
struct InstanceBody {
    Instance value;
    std::shared_ptr<const NameSet> filter;  ///< what setPropertyFilter lets through; null for all
    const CimClass* cls = nullptr;          ///< null when the class is not known
    Positions unset = {};  ///< properties of the class that are certainly not among the values
};
struct ArrayBody {
    CMPIType elementType = CMPI_null;  ///< CMPI_chars for elements that a provider sees as such
    Value::Array elements;
};
struct EnumerationBody {
    Value::Array items;
    std::size_t next = 0;
};
struct ResultBody {
    std::shared_ptr<Reply> reply;
};

/// The kinds of objects: C type and body, in one order.
template <class C, class B>
struct Kind {
    using Face = C;
    using Body = B;
};
using Kinds =
    std::tuple<Kind<CMPIString, StringBody>, Kind<CMPIInstance, InstanceBody>,
               Kind<CMPIObjectPath, ObjectPath>, Kind<CMPIArgs, NamedValues>,
               Kind<CMPIContext, NamedValues>, Kind<CMPIArray, ArrayBody>,
               Kind<CMPIDateTime, DateTime>, Kind<CMPIEnumeration, EnumerationBody>,
               Kind<CMPIResult, ResultBody>, Kind<CMPISelectExp, std::shared_ptr<const Query>>,
               Kind<CMPISelectCond, std::shared_ptr<const Condition>>,
               Kind<CMPISubCond, std::shared_ptr<const SubCondition>>,
               Kind<CMPIPredicate, std::shared_ptr<const Predicate>>, Kind<CMPIError, NamedValues>>;
constexpr std::size_t kKindCount = std::tuple_size_v<Kinds>;

template <class C, std::size_t I = 0>
constexpr std::size_t kindOf() {
    if constexpr (std::is_same_v<typename std::tuple_element_t<I, Kinds>::Face, C>) {
        return I;
    } else {
        return kindOf<C, I + 1>();
    }
}
template <class C>
using BodyOf = typename std::tuple_element_t<kindOf<C>(), Kinds>::Body;
template <class C>
using TableOf = std::remove_pointer_t<decltype(C::ft)>;

// -- nodes -----------------------------------------------------------------------------------

/// The function tables of the object kinds.
template <class>
struct TablesOf;
template <class... K>
struct TablesOf<std::tuple<K...>> {
    using Type = std::tuple<TableOf<typename K::Face>...>;
};
using ObjectTables = TablesOf<Kinds>::Type;

/// A place in a ring; the head of the ring is one too.
struct Link {
    Link* prev = this;
    Link* next = this;

    void insertBefore(Link& other);
    void remove();
};

/// Nodes of one kind that lie together. A chunk belongs to one pool at a time, or is free.
struct Chunk : Link {
    static constexpr unsigned kNodes = 32;

    explicit Chunk(std::size_t ofKind) : kind(ofKind) {}

    const std::size_t kind;  ///< position in Kinds
    Pool* pool = nullptr;
    unsigned used = 0;   ///< nodes that have been handed out, the first ones
    unsigned alive = 0;  ///< of these, the ones that have not been released
};

struct Node {
    Chunk* chunk = nullptr;
};

template <class C>
struct NodeOf : Node {
    static_assert(alignof(C) == alignof(Node), "a face lies right behind its Node");

    C face{};
    std::optional<BodyOf<C>> body;  ///< none when released
};
/// The node of a face of any kind.
inline Node& nodeAt(const void* face) {
    auto* address = static_cast<char*>(const_cast<void*>(face));
    return *reinterpret_cast<Node*>(address - sizeof(Node));
}

template <class C>
struct ChunkOf : Chunk {
    ChunkOf() : Chunk(kindOf<C>()) {
        for (Node& node : nodes) {
            node.chunk = this;
        }
    }
    NodeOf<C> nodes[kNodes];
};

/// Calls @p f with the Kind at a position in Kinds.
template <std::size_t I = 0, class F>
decltype(auto) withKind(std::size_t kind, F f) {
    if constexpr (I + 1 < kKindCount) {
        if (kind != I) {
            return withKind<I + 1>(kind, f);
        }
    }
    return f(std::tuple_element_t<I, Kinds>());
}

/// Owns nodes in levels, as mark and release stack them; the lowest level lasts as long as
/// the pool.
class Pool {
public:
    explicit Pool(Broker& broker);
    ~Pool();  // NOLINT(bugprone-exception-escape)
    Pool(const Pool&) = delete;
    Pool& operator=(const Pool&) = delete;

    Broker& broker() const { return m_broker; }

    /// Takes a node, whose body the caller makes; it belongs to the level that is on top now.
    template <class C>
    NodeOf<C>& take() {
        std::lock_guard<std::mutex> lock(m_mutex);
        Chunk& chunk = openChunk(kindOf<C>());
        ++chunk.alive;
        return static_cast<ChunkOf<C>&>(chunk).nodes[chunk.used++];
    }
    /// Opens a level; the result names it.
    const void* mark();
    /// Frees the level of that name and those above it; false when there is none.
    bool release(const void* level);
    /// Frees one node of this pool.
    void free(Node& node);

private:
    struct Level {
        Link chunks;  // head of the ring
        Chunk* open[kKindCount] = {};
    };

    Chunk& openChunk(std::size_t kind);
    void clear(Level& level);
    static void giveBack(Chunk& chunk);

    Broker& m_broker;
    std::mutex m_mutex;
    std::vector<std::unique_ptr<Level>> m_levels;
};

/// Uses of released objects in this process so far.
std::size_t staleUseCount();
void countStaleUse();

/// Where objects made by this thread for this broker go.
Pool& currentPool(Broker& broker);
Pool& strayPool(Broker& broker);
ObjectTables& objectTables(Broker& broker);
void countLive(Broker& broker, std::ptrdiff_t by);

// -- making and using objects -----------------------------------------------------------------

template <class C>
C* makeIn(Pool& pool, BodyOf<C> body) {
    NodeOf<C>& node = pool.take<C>();
    node.body.emplace(std::move(body));
    if constexpr (std::is_same_v<C, CMPIString>) {
        node.face.hdl = node.body->null ? nullptr : node.body->text.data();
    } else {
        node.face.hdl = &node;
    }
    node.face.ft = &std::get<TableOf<C>>(objectTables(pool.broker()));
    countLive(pool.broker(), 1);
    return &node.face;
}

/// A new object that belongs to the request of this thread.
template <class C>
C* make(Broker& broker, BodyOf<C> body) {
    return makeIn<C>(currentPool(broker), std::move(body));
}

/// The node of an object.
/// @throws Failure CMPI_RC_ERR_INVALID_HANDLE for null, released, or of another kind
template <class C>
NodeOf<C>& nodeOf(const C* object) {
    if (!object) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "null object");
    }
    Node& node = nodeAt(object);
    if (node.chunk->kind != kindOf<C>()) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "object of another kind");
    }
    auto& own = static_cast<NodeOf<C>&>(node);
    if (!own.body) {
        countStaleUse();
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "released object");
    }
    return own;
}
template <class C>
BodyOf<C>& bodyOf(const C* object) {
    return *nodeOf(object).body;
}

// -- from C and back -----------------------------------------------------------------------------

/// A text made into an object of the request.
CMPIString* makeString(Broker& broker, const std::string& text);
/// The element of a list that a caller asks for by its position.
/// @throws Failure with @p missing when there is none
template <class List>
auto& elementAt(List& list, CMPICount index, CMPIrc missing = CMPI_RC_ERR_NO_SUCH_PROPERTY) {
    if (index >= list.size()) {
        throw Failure(missing, "index " + std::to_string(index));
    }
    return list.begin()[index];
}
/// Reads a C value. A null @p value gives a null of the type; CMPI_chars values are the text
/// itself, as everywhere in CMPI.
/// @throws Failure CMPI_RC_ERR_INVALID_DATA_TYPE for a type that a value cannot have
Value readValue(const CMPIValue* value, CMPIType type);
Value readData(const CMPIData& data);
/// The C form of a value; objects in it belong to the request of this thread.
CMPIData makeData(Broker& broker, const Value& value);
/// The body of a C instance, with its class looked up.
InstanceBody instanceBody(Broker& broker, Instance value);
/// Answer of the getters when there is nothing; small brokers do not call that a null.
/// @param broker  may be null
CMPIData noData(const Broker* broker);
/// The type of values that come in: texts of C are strings.
CMPIType stringFor(CMPIType type);

inline std::string textOf(const char* text) { return text ? text : ""; }

/// Stores a status for the caller, with its text as an object of the request, if there is one.
void setStatus(CMPIStatus* out, CMPIrc rc, Broker* broker = nullptr, const char* text = nullptr);

/// Runs the body of a C entry: no exception leaves, a Failure becomes the status, and the
/// answer is then the empty one of its type.
template <class F>
auto entry(CMPIStatus* rc, Broker* broker, F body) -> decltype(body()) {
    setStatus(rc, CMPI_RC_OK);
    try {
        return body();
    } catch (const Failure& failure) {
        setStatus(rc, failure.rc(), broker, failure.what());
    } catch (const std::exception& e) {
        setStatus(rc, CMPI_RC_ERROR_SYSTEM, broker, e.what());
    }
    if constexpr (std::is_same_v<decltype(body()), CMPIData>) {
        return noData(broker);
    } else if constexpr (!std::is_void_v<decltype(body())>) {
        return {};
    }
}

/// Runs @p body with the content of an object and its broker.
template <class C, class F>
auto objectEntry(const C* object, CMPIStatus* rc, F body) {
    const bool alive = object && nodeAt(object).chunk->kind == kindOf<C>() &&
                       static_cast<NodeOf<C>&>(nodeAt(object)).body;
    Broker* broker = alive ? &nodeAt(object).chunk->pool->broker() : nullptr;
    return entry(rc, broker, [&] {
        auto& content = bodyOf(object);
        return body(content, *broker);
    });
}

/// The C function that runs a body of C++, for objects `R body(BodyOf<C>&, Broker&, arguments...)`
/// and for the broker `R body(Broker&, arguments...)`. It reports by the CMPIStatus* behind the
/// arguments, or, where the body answers nothing, by the status that it returns.
template <class Object, auto Body, class Signature = decltype(Body)>
struct EntryPoint;
template <class Object, auto Body, class R, class Content, class... A>
struct EntryPoint<Object, Body, R (*)(Content&, Broker&, A...)> {
    static R run(Object* object, A... arguments, CMPIStatus* rc) {
        return objectEntry(object, rc, [&](Content& content, Broker& broker) {
            return Body(content, broker, arguments...);
        });
    }
};
template <class Object, auto Body, class Content, class... A>
struct EntryPoint<Object, Body, void (*)(Content&, Broker&, A...)> {
    static CMPIStatus run(Object* object, A... arguments) {
        CMPIStatus status{CMPI_RC_OK, nullptr};
        objectEntry(object, &status,
                    [&](Content& content, Broker& broker) { Body(content, broker, arguments...); });
        return status;
    }
};

/// Stands for that function in a table, whose entry says which object it takes, const or not.
template <auto Body>
struct Entry {
    template <class R, class Object, class... A>
    using Function = R (*)(Object*, A...);

    template <class R, class Object, class... A>
    constexpr operator Function<R, Object, A...>() const {  // NOLINT: a table takes it as it is
        return EntryPoint<Object, Body>::run;
    }
};
template <auto Body>
constexpr Entry<Body> entryOf{};

/// release, the same for every kind.
template <class C>
CMPIStatus releaseObject(C* object) {
    CMPIStatus status{CMPI_RC_OK, nullptr};
    entry(&status, nullptr, [&] {
        Node& node = nodeOf(object);
        node.chunk->pool->free(node);
    });
    return status;
}
template <class C>
C* cloneBody(const BodyOf<C>& body, Broker& broker) {
    return makeIn<C>(strayPool(broker), body);
}

/// The table of a kind: release, clone, and the entries of its own. The version is set by the
/// broker.
template <class C, class... Entries>
TableOf<C> tableOf(Entries... own) {
    return {0, releaseObject<C>, entryOf<cloneBody<C>>, own...};
}

}  // namespace cimom

#endif
