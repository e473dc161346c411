#include "Objects.h"

#include <algorithm>

namespace cimom {

namespace {

// Free nodes wait in line, so that a released object's face stays as it is for a while. Threads
// use lines of their own as far as possible.
class NodeStore {
public:
    Node& take() {
        Line& line = mine();
        std::lock_guard<std::mutex> lock(line.mutex);
        if (!line.first) refill(line);
        Node& node = *line.first;
        line.first = static_cast<Node*>(node.next);
        if (!line.first) line.last = nullptr;
        return node;
    }

    void give(Node& node) {
        Line& line = mine();
        std::lock_guard<std::mutex> lock(line.mutex);
        node.next = nullptr;
        append(line, node);
    }

private:
    static constexpr std::size_t kLines = 8;
    static constexpr std::size_t kChunk = 256;

    struct alignas(64) Line {
        std::mutex mutex;
        Node* first = nullptr;
        Node* last = nullptr;
        std::vector<std::unique_ptr<Node[]>> chunks;
    };

    Line& mine() {
        thread_local const std::size_t index = m_nextLine.fetch_add(1) % kLines;
        return m_lines[index];
    }

    static void append(Line& line, Node& node) {
        if (line.last)
            line.last->next = &node;
        else
            line.first = &node;
        line.last = &node;
    }

    static void refill(Line& line) {
        line.chunks.push_back(std::make_unique<Node[]>(kChunk));
        for (std::size_t i = 0; i < kChunk; ++i) append(line, line.chunks.back()[i]);
    }

    std::atomic<std::size_t> m_nextLine{0};
    Line m_lines[kLines];
};

// Never destroyed: providers may release objects in destructors that run at exit.
NodeStore& nodeStore() {
    static NodeStore* const store = new NodeStore;
    return *store;
}

std::atomic<std::size_t> staleUses{0};

void retire(Node& node) {
    countLive(*node.broker, -1);
    std::visit([](auto& face) { face.hdl = nullptr; }, node.face);
    std::visit([](auto& body) { body.reset(); }, node.content);
    node.pool = nullptr;
    node.broker = nullptr;
    nodeStore().give(node);
}

}  // namespace

Node& takeNode() { return nodeStore().take(); }
std::size_t staleUseCount() { return staleUses; }
void countStaleUse() { ++staleUses; }

// -- Pool -------------------------------------------------------------------------------------

Pool::Pool() { m_levels.push_back(newLevel()); }

// What could throw is a lock of a broken process, which then ends.
Pool::~Pool() {  // NOLINT(bugprone-exception-escape)
    for (const Level& each : m_levels) clear(*each);
}

Pool::Level Pool::newLevel() {
    auto head = std::make_unique<Link>();
    head->prev = head->next = head.get();
    return head;
}

void Pool::clear(Link& head) {
    // Last in, first out: the heap takes back its end, not ten thousand holes.
    for (Link* at = head.prev; at != &head;) {
        Node& node = *static_cast<Node*>(at);
        at = at->prev;
        retire(node);
    }
}

void Pool::adopt(Node& node) {
    std::lock_guard<std::mutex> lock(m_mutex);
    Link& head = *m_levels.back();
    node.pool = this;
    node.prev = head.prev;
    node.next = &head;
    head.prev->next = &node;
    head.prev = &node;
}

const void* Pool::mark() {
    std::lock_guard<std::mutex> lock(m_mutex);
    m_levels.push_back(newLevel());
    return m_levels.back().get();
}

bool Pool::release(const void* level) {
    std::vector<Level> ended;
    {
        std::lock_guard<std::mutex> lock(m_mutex);
        const auto from = std::find_if(m_levels.begin(), m_levels.end(),
                                       [level](const Level& l) { return l.get() == level; });
        if (from == m_levels.end()) return false;
        std::move(from, m_levels.end(), std::back_inserter(ended));
        m_levels.erase(from, m_levels.end());
        if (m_levels.empty()) m_levels.push_back(newLevel());
    }
    for (const Level& each : ended) clear(*each);
    return true;
}

void Pool::free(Node& node) {
    {
        std::lock_guard<std::mutex> lock(m_mutex);
        node.prev->next = node.next;
        node.next->prev = node.prev;
    }
    retire(node);
}

// -- from C and back -------------------------------------------------------------------------

CMPIString* makeString(Broker& broker, const std::string& text) {
    return make<CMPIString>(broker, {text, false});
}

CMPIData noData() {
    CMPIData data{};
    data.type = CMPI_null;
    data.state = CMPI_nullValue | CMPI_notFound;
    return data;
}

void setStatus(CMPIStatus* out, CMPIrc rc, Broker* broker, const char* text) {
    if (!out) return;
    out->rc = rc;
    out->msg = nullptr;
    if (!broker || !text || !*text) return;
    if (&currentPool(*broker) == &strayPool(*broker)) return;  // nobody would release the text
    try {
        out->msg = makeString(*broker, text);
    } catch (const std::exception&) {  // out of memory: the code alone must do
    }
}

namespace {

Value readArray(const CMPIArray* array, CMPIType type) {
    if (!array) return Value::null(type);
    const ArrayBody& body = bodyOf(array);
    return Value::array(body.elementType, body.elements);
}

Value readObject(const CMPIValue& value, CMPIType type) {
    switch (type) {
        case CMPI_string: {
            if (!value.string) return Value::null(CMPI_string);
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

CMPIType stringFor(CMPIType type) {
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    if (element != CMPI_chars && element != CMPI_charsptr) return type;
    return static_cast<CMPIType>(CMPI_string | (type & CMPI_ARRAY));
}

}  // namespace

Value readValue(const CMPIValue* value, CMPIType type) {
    if (!value) return Value::null(stringFor(type));
    if (type & CMPI_ARRAY) return readArray(value->array, stringFor(type));
    switch (type) {
        case CMPI_null:
            return Value();
        case CMPI_boolean:
            return Value(value->boolean != 0);
        case CMPI_char16:
            return Value::char16(value->char16);
        case CMPI_real32:
            return Value(value->real32);
        case CMPI_real64:
            return Value(value->real64);
        case CMPI_uint8:
            return Value(value->uint8);
        case CMPI_uint16:
            return Value(value->uint16);
        case CMPI_uint32:
            return Value(value->uint32);
        case CMPI_uint64:
            return Value(value->uint64);
        case CMPI_sint8:
            return Value(value->sint8);
        case CMPI_sint16:
            return Value(value->sint16);
        case CMPI_sint32:
            return Value(value->sint32);
        case CMPI_sint64:
            return Value(value->sint64);
        case CMPI_chars:
            return Value(reinterpret_cast<const char*>(value));
        default:
            return readObject(*value, type);
    }
}

Value readData(const CMPIData& data) {
    if (data.state & (CMPI_nullValue | CMPI_notFound)) return Value::null(stringFor(data.type));
    if (data.type == CMPI_chars) return Value(static_cast<const char*>(data.value.chars));
    return readValue(&data.value, data.type);
}

namespace {

CMPIValue makeNumber(const Value& value) {
    CMPIValue out{};
    switch (value.type()) {
        case CMPI_boolean:
            out.boolean = value.boolean() ? 1 : 0;
            break;
        case CMPI_real32:
            out.real32 = static_cast<CMPIReal32>(value.real());
            break;
        case CMPI_real64:
            out.real64 = value.real();
            break;
        case CMPI_char16:
            out.char16 = static_cast<CMPIChar16>(value.uint());
            break;
        case CMPI_uint8:
            out.uint8 = static_cast<CMPIUint8>(value.uint());
            break;
        case CMPI_uint16:
            out.uint16 = static_cast<CMPIUint16>(value.uint());
            break;
        case CMPI_uint32:
            out.uint32 = static_cast<CMPIUint32>(value.uint());
            break;
        case CMPI_uint64:
            out.uint64 = value.uint();
            break;
        case CMPI_sint8:
            out.sint8 = static_cast<CMPISint8>(value.sint());
            break;
        case CMPI_sint16:
            out.sint16 = static_cast<CMPISint16>(value.sint());
            break;
        case CMPI_sint32:
            out.sint32 = static_cast<CMPISint32>(value.sint());
            break;
        default:
            out.sint64 = value.sint();
            break;
    }
    return out;
}

CMPIValue makeObject(Broker& broker, const Value& value) {
    CMPIValue out{};
    if (value.isArray())
        out.array = make<CMPIArray>(
            broker, {static_cast<CMPIType>(value.type() & ~CMPI_ARRAY), value.elements()});
    else if (value.type() == CMPI_string)
        out.string = makeString(broker, value.text());
    else if (value.type() == CMPI_dateTime)
        out.dateTime = make<CMPIDateTime>(broker, value.dateTime());
    else if (value.type() == CMPI_ref)
        out.ref = make<CMPIObjectPath>(broker, value.reference());
    else if (value.type() == CMPI_instance)
        out.inst = make<CMPIInstance>(broker, instanceBody(broker, value.instance()));
    else
        out.dataPtr = value.pointer();
    return out;
}

}  // namespace

CMPIData makeData(Broker& broker, const Value& value) {
    CMPIData data{};
    data.type = value.type();
    data.state = value.isNull() ? CMPI_nullValue : CMPI_goodValue;
    if (value.isNull()) return data;
    const bool encapsulated = (value.type() & (CMPI_ARRAY | CMPI_ENC)) != 0;
    data.value = encapsulated ? makeObject(broker, value) : makeNumber(value);
    return data;
}

}  // namespace cimom
