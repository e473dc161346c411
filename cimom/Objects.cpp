#include "Objects.h"

#include <algorithm>
#include <atomic>

namespace cimom {

namespace {

// Free chunks wait in line, so that a released object's face stays as it is for a while. Threads
// use lines of their own as far as possible. Nothing is ever destroyed: providers may release
// objects in destructors that run at exit.
class ChunkStore {
public:
    Chunk& take(std::size_t kind) {
        Lines& lines = mine();
        std::lock_guard<std::mutex> lock(lines.mutex);
        Link& line = lines.ofKind[kind];
        if (line.next == &line) {
            return make(kind);
        }
        auto& chunk = static_cast<Chunk&>(*line.next);
        chunk.remove();
        return chunk;
    }

    void give(Chunk& chunk) {
        Lines& lines = mine();
        std::lock_guard<std::mutex> lock(lines.mutex);
        chunk.insertBefore(lines.ofKind[chunk.kind]);
    }

private:
    struct alignas(64) Lines {
        std::mutex mutex;
        Link ofKind[kKindCount];
    };

    Lines& mine() {
        thread_local const std::size_t index = m_next.fetch_add(1) % std::size(m_lines);
        return m_lines[index];
    }

    static Chunk& make(std::size_t kind) {
        return withKind(
            kind, [](auto of) -> Chunk& { return *new ChunkOf<typename decltype(of)::Face>; });
    }

    std::atomic<std::size_t> m_next{0};
    Lines m_lines[8];
};

ChunkStore& chunkStore() {
    static ChunkStore* const store = new ChunkStore;
    return *store;
}

std::atomic<std::size_t> staleUses{0};

template <class C>
void retire(NodeOf<C>& node) {
    node.face.hdl = nullptr;
    node.body.reset();
}

}  // namespace

std::size_t staleUseCount() { return staleUses; }
void countStaleUse() { ++staleUses; }

void Link::insertBefore(Link& other) {
    prev = other.prev;
    next = &other;
    prev->next = next->prev = this;
}
void Link::remove() {
    prev->next = next;
    next->prev = prev;
}

// -- Pool -------------------------------------------------------------------------------------

Pool::Pool(Broker& broker) : m_broker(broker) { mark(); }

// What could throw is a lock of a broken process, which then ends.
Pool::~Pool() {  // NOLINT(bugprone-exception-escape)
    for (const auto& each : m_levels) {
        clear(*each);
    }
}

void Pool::clear(Level& level) {
    // Last in, first out: the heap takes back its end, not ten thousand holes.
    while (level.chunks.prev != &level.chunks) {
        auto& chunk = static_cast<Chunk&>(*level.chunks.prev);
        withKind(chunk.kind, [&chunk](auto of) {
            auto& nodes = static_cast<ChunkOf<typename decltype(of)::Face>&>(chunk).nodes;
            for (unsigned i = chunk.used; i-- > 0;) {
                if (nodes[i].body) {
                    retire(nodes[i]);
                }
            }
        });
        countLive(m_broker, -static_cast<std::ptrdiff_t>(chunk.alive));
        giveBack(chunk);
    }
}

void Pool::giveBack(Chunk& chunk) {
    chunk.remove();
    chunk.used = chunk.alive = 0;
    chunkStore().give(chunk);
}

// The chunk of the top level that has room.
Chunk& Pool::openChunk(std::size_t kind) {
    Level& level = *m_levels.back();
    Chunk*& open = level.open[kind];
    if (!open) {
        open = &chunkStore().take(kind);
        open->pool = this;
        open->insertBefore(level.chunks);
    }
    Chunk& chunk = *open;
    if (chunk.used + 1 == Chunk::kNodes) {
        open = nullptr;
    }
    return chunk;
}

const void* Pool::mark() {
    std::lock_guard<std::mutex> lock(m_mutex);
    m_levels.push_back(std::make_unique<Level>());
    return m_levels.back().get();
}

bool Pool::release(const void* level) {
    std::vector<std::unique_ptr<Level>> ended;
    {
        std::lock_guard<std::mutex> lock(m_mutex);
        const auto from = std::find_if(m_levels.begin() + 1, m_levels.end(),
                                       [level](const auto& l) { return l.get() == level; });
        if (from == m_levels.end()) {
            return false;
        }
        std::move(from, m_levels.end(), std::back_inserter(ended));
        m_levels.erase(from, m_levels.end());
    }
    for (const auto& each : ended) {
        clear(*each);
    }
    return true;
}

void Pool::free(Node& node) {
    Chunk& chunk = *node.chunk;
    withKind(chunk.kind,
             [&node](auto of) { retire(static_cast<NodeOf<typename decltype(of)::Face>&>(node)); });
    countLive(m_broker, -1);
    std::lock_guard<std::mutex> lock(m_mutex);
    if (--chunk.alive == 0 && chunk.used == Chunk::kNodes) {
        giveBack(chunk);
    }
}

// -- from C and back -------------------------------------------------------------------------

CMPIString* makeString(Broker& broker, const std::string& text) {
    return make<CMPIString>(broker, {text, false});
}

void setStatus(CMPIStatus* out, CMPIrc rc, Broker* broker, const char* text) {
    if (!out) {
        return;
    }
    out->rc = rc;
    out->msg = nullptr;
    if (!broker || !text || !*text) {
        return;
    }
    if (&currentPool(*broker) == &strayPool(*broker)) {
        return;  // nobody would release the text
    }
    try {
        out->msg = makeString(*broker, text);
    } catch (const std::exception&) {  // out of memory: the code alone must do
    }
}

namespace {

template <class T>
struct Number {
    CMPIType type;
    T CMPIValue::*member;
};
constexpr auto kNumbers = std::make_tuple(Number<CMPIReal32>{CMPI_real32, &CMPIValue::real32},
                                          Number<CMPIReal64>{CMPI_real64, &CMPIValue::real64},
                                          Number<CMPIUint8>{CMPI_uint8, &CMPIValue::uint8},
                                          Number<CMPIUint16>{CMPI_uint16, &CMPIValue::uint16},
                                          Number<CMPIUint32>{CMPI_uint32, &CMPIValue::uint32},
                                          Number<CMPIUint64>{CMPI_uint64, &CMPIValue::uint64},
                                          Number<CMPISint8>{CMPI_sint8, &CMPIValue::sint8},
                                          Number<CMPISint16>{CMPI_sint16, &CMPIValue::sint16},
                                          Number<CMPISint32>{CMPI_sint32, &CMPIValue::sint32},
                                          Number<CMPISint64>{CMPI_sint64, &CMPIValue::sint64});

// Calls @p f with the member of CMPIValue that holds numbers of a type; false for other types.
template <class F>
bool withNumber(CMPIType type, F f) {
    return std::apply(
        [&](const auto&... row) { return ((row.type == type && (f(row.member), true)) || ...); },
        kNumbers);
}

Value readArray(const CMPIArray* array, CMPIType type) {
    if (!array) {
        return Value::null(type);
    }
    const ArrayBody& body = bodyOf(array);
    return Value::array(stringFor(body.elementType), body.elements);
}

Value readObject(const CMPIValue& value, CMPIType type) {
    switch (type) {
        case CMPI_string: {
            if (!value.string) {
                return Value::null(CMPI_string);
            }
            const StringBody& body = bodyOf(value.string);
            return body.null ? Value::null(CMPI_string) : Value(body.text);
        }
        case CMPI_charsptr:
            return Value(static_cast<const char*>(value.chars));
        case CMPI_dateTime:
            return value.dateTime ? Value(bodyOf(value.dateTime)) : Value::null(type);
        case CMPI_ref:
            return value.ref ? Value(bodyOf(value.ref)) : Value::null(type);
        case CMPI_instance:
            return value.inst ? Value(bodyOf(value.inst).value) : Value::null(type);
        case CMPI_ptr:
            return Value::pointer(value.dataPtr);
        default:
            throw Failure(CMPI_RC_ERR_INVALID_DATA_TYPE, "type " + std::to_string(type));
    }
}

}  // namespace

CMPIType stringFor(CMPIType type) {
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (element != CMPI_chars && element != CMPI_charsptr) {
        return type;
    }
    return static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY));
}

Value readValue(const CMPIValue* value, CMPIType type) {
    if (!value) {
        return Value::null(stringFor(type));
    }
    if (type & CMPI_ARRAY) {
        return readArray(value->array, stringFor(type));
    }
    if (type == CMPI_null) {
        return Value();
    }
    if (type == CMPI_boolean) {
        return Value(value->boolean != 0);
    }
    if (type == CMPI_char16) {
        return Value::char16(value->char16);
    }
    if (type == CMPI_chars) {
        return Value(reinterpret_cast<const char*>(value));
    }
    Value number;
    if (withNumber(type, [&](auto member) { number = Value(value->*member); })) {
        return number;
    }
    return readObject(*value, type);
}

Value readData(const CMPIData& data) {
    if (data.state & (CMPI_nullValue | CMPI_notFound)) {
        return Value::null(stringFor(data.type));
    }
    if (data.type == CMPI_chars) {
        return Value(static_cast<const char*>(data.value.chars));
    }
    return readValue(&data.value, data.type);
}

namespace {

CMPIValue makeNumber(const Value& value) {
    CMPIValue out{};
    if (value.type() == CMPI_boolean) {
        out.boolean = value.boolean() ? 1 : 0;
    }
    if (value.type() == CMPI_char16) {
        out.char16 = static_cast<CMPIChar16>(value.uint());
    }
    withNumber(value.type(), [&](auto member) {
        using Number = std::decay_t<decltype(out.*member)>;
        if constexpr (std::is_floating_point_v<Number>) {
            out.*member = static_cast<Number>(value.real());
        } else if constexpr (std::is_signed_v<Number>) {
            out.*member = static_cast<Number>(value.sint());
        } else {
            out.*member = static_cast<Number>(value.uint());
        }
    });
    return out;
}

CMPIValue makeObject(Broker& broker, const Value& value) {
    CMPIValue out{};
    if (value.isArray()) {
        out.array = make<CMPIArray>(
            broker, {static_cast<CMPIType>(value.type() & ~CMPI_ARRAY), value.elements()});
    } else if (value.type() == CMPI_string) {
        out.string = makeString(broker, value.text());
    } else if (value.type() == CMPI_dateTime) {
        out.dateTime = make<CMPIDateTime>(broker, value.dateTime());
    } else if (value.type() == CMPI_ref) {
        out.ref = make<CMPIObjectPath>(broker, value.reference());
    } else if (value.type() == CMPI_instance) {
        out.inst = make<CMPIInstance>(broker, instanceBody(broker, value.instance()));
    } else {
        out.dataPtr = value.pointer();
    }
    return out;
}

}  // namespace

CMPIData makeData(Broker& broker, const Value& value) {
    CMPIData data{};
    data.type = value.type();
    data.state = value.isNull() ? CMPI_nullValue : CMPI_goodValue;
    if (value.isNull()) {
        return data;
    }
    const bool encapsulated = (value.type() & (CMPI_ARRAY | CMPI_ENC)) != 0;
    data.value = encapsulated ? makeObject(broker, value) : makeNumber(value);
    return data;
}

}  // namespace cimom
