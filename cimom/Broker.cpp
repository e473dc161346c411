#include "Broker.h"

#include <cstdlib>
#include <cstring>

namespace cimom {

namespace {

thread_local Activation* innermost = nullptr;

ObjectTables makeTables(bool lean) {
    ObjectTables tables{};
    fillObjectTables(tables);
    fillInstanceTables(tables);
    fillQueryTables(tables);
    fillErrorTable(tables);
    std::apply([lean](auto&... table) { ((table.ftVersion = lean ? 1 : CMPIVersion200), ...); },
               tables);
    if (lean) {
        endTableAfter(std::get<CMPIContextFT>(tables), &CMPIContextFT::getEntryCount);
        endTableAfter(std::get<CMPIInstanceFT>(tables), &CMPIInstanceFT::setObjectPath);
        endTableAfter(std::get<CMPIObjectPathFT>(tables), &CMPIObjectPathFT::getParameterQualifier);
        endTableAfter(std::get<CMPIResultFT>(tables), &CMPIResultFT::returnDone);
        endTableAfter(std::get<CMPISelectExpFT>(tables), &CMPISelectExpFT::getString);
    }
    return tables;
}

}  // namespace

// -- what Objects.h needs ---------------------------------------------------------------------

Pool& strayPool(Broker& broker) { return broker.strays(); }
Pool& currentPool(Broker& broker) {
    Activation* activation = Activation::current(broker);
    return activation ? activation->pool() : broker.strays();
}
ObjectTables& objectTables(Broker& broker) { return broker.tables(); }
CMPIData noData(const Broker* broker) {
    CMPIData data{};
    data.type = CMPI_null;
    data.state = broker && broker->lean() ? CMPI_notFound : CMPI_nullValue | CMPI_notFound;
    return data;
}
void countLive(Broker& broker, std::ptrdiff_t by) { broker.live() += by; }

// -- Broker -----------------------------------------------------------------------------------

Broker::Broker(Server& server, const Options& options)
    : m_server(server),
      m_options(options),
      m_operations(operationTable(lean())),
      m_encapsulation(encapsulationTable(lean())),
      m_extension(extensionTable(lean())),
      m_memory(memoryTable(lean())),
      m_tables(makeTables(lean())),
      m_messages(options.messageFolder),
      m_strays(*this) {
    m_face.hdl = this;
    m_face.bft = &m_operations;
    m_face.eft = &m_encapsulation;
    m_face.xft = &m_extension;
    m_face.mft = &m_memory;
}

Broker::~Broker() {
    for (void* block : m_blocks) {
        std::free(block);
    }
}

Broker& Broker::of(const CMPIBroker* face) {
    if (!face || !face->hdl) {
        throw Failure(CMPI_RC_ERR_INVALID_HANDLE, "no broker");
    }
    return *static_cast<Broker*>(face->hdl);
}

const CimClass* Broker::classOf(const ObjectPath& path) const {
    return classes() ? classes()->findClass(path.className) : nullptr;
}

void Broker::setLogHook(std::function<void(const LogLine&)> hook) {
    std::lock_guard<std::mutex> lock(m_hookMutex);
    m_hook = std::move(hook);
}

void Broker::log(const LogLine& line) {
    std::function<void(const LogLine&)> hook;
    {
        std::lock_guard<std::mutex> lock(m_hookMutex);
        hook = m_hook;
    }
    if (hook) {
        hook(line);
    }
}

void* Broker::allocate(void* old, std::size_t size, bool zeroed) {
    std::lock_guard<std::mutex> lock(m_blocksMutex);
    if (old && m_blocks.count(old) == 0) {
        return nullptr;
    }
    void* block = zeroed ? std::calloc(1, size) : std::realloc(old, size ? size : 1);
    if (!block) {
        return nullptr;
    }
    if (old) {
        m_blocks.erase(old);
    }
    m_blocks.insert(block);
    return block;
}

void Broker::freeBlock(void* block) {
    if (!block) {
        return;
    }
    std::lock_guard<std::mutex> lock(m_blocksMutex);
    if (m_blocks.erase(block) != 0) {
        std::free(block);
    } else {
        countStaleUse();
    }
}

std::vector<std::string> namesIn(const char** names) {
    const char** end = names;
    while (*end) {
        ++end;
    }
    return {names, end};
}

// -- Activation -----------------------------------------------------------------------------------

Activation::Activation(Broker& broker, const NamedValues& contextEntries)
    : m_outer(innermost), m_pool(broker), m_context(makeIn<CMPIContext>(m_pool, contextEntries)) {
    innermost = this;
}

Activation::~Activation() { innermost = m_outer; }

Activation* Activation::current(const Broker& broker) {
    Activation* at = innermost;
    while (at && &at->m_pool.broker() != &broker) {
        at = at->m_outer;
    }
    return at;
}

// -- contexts -------------------------------------------------------------------------------------

NamedValues contextOf(const Request& request, bool lean) {
    NamedValues entries;
    if (request.user) {
        entries.set(CMPIPrincipal, *request.user);
    } else {
        entries.set(CMPIPrincipal, lean ? Value::null(CMPI_string) : Value(""));
    }
    if (!request.language.empty()) {
        entries.set(CMPIAcceptLanguage, request.language);
    }
    entries.set(CMPIInitNameSpace, request.nameSpace);
    entries.set(CMPIInvocationFlags, Value(static_cast<std::uint32_t>(request.flags)));
    for (const auto& entry : request.context) {
        entries.set(entry.name, entry.value);
    }
    return entries;
}

Request requestOf(const NamedValues& contextEntries) {
    Request request;
    for (const auto& [name, value] : contextEntries) {
        const bool isText = value.type() == CMPI_string && !value.isNull();
        if (sameName(name, CMPIPrincipal) && value.type() == CMPI_string) {
            if (isText) {
                request.user = value.text();
            }
        } else if (sameName(name, CMPIAcceptLanguage) && isText) {
            request.language = value.text();
        } else if (sameName(name, CMPIInitNameSpace) && isText) {
            request.nameSpace = value.text();
        } else if (sameName(name, CMPIInvocationFlags) && value.type() == CMPI_uint32 &&
                   !value.isNull()) {
            request.flags = static_cast<CMPIFlags>(value.uint());
        } else {
            request.context.set(name, value);
        }
    }
    return request;
}

}  // namespace cimom
