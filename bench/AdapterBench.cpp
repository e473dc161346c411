// Are adapters read from the tools' strings, and written, nearly as fast as their plain fields?
//
// A hundred thousand elements, of the four kinds in turn. The other side cuts each with string
// views and keeps and writes the same fields, with no object around them and no rules of its own.

#include <benchmark/benchmark.h>

#include <charconv>
#include <string>
#include <string_view>
#include <vector>

#include "VirtualSystemResourceAdapters.h"

namespace {

constexpr int kElements = 100000;

/// Elements of one kind, so that both sides know it.
struct Elements {
    std::vector<zemString> slots, serials, scsis, ethernets;

    Elements() {
        for (int i = 0; i < kElements; i += 4) {
            const auto add = [i](std::vector<zemString>& list, const char* form) {
                list.emplace_back().format(form, i, i);
            };
            add(slots, "21%08d/3/1");
            add(serials, "%d/server/1/any//any/0");
            add(scsis, "%d/client/2/io server/%d/1");
            add(ethernets, "%d/1/1/\"3,4,%d\"/0/1/ETHERNET0");
        }
    }
};

std::string_view take(std::string_view& rest, char delimiter) {
    std::size_t from = 0;
    std::string_view field;
    if (!rest.empty() && rest[0] == '"') {
        from = rest.find('"', 1);
        field = rest.substr(1, from - 1);
    }
    const std::size_t end = rest.find(delimiter, from);
    if (from == 0) {
        field = rest.substr(0, end);
    }
    rest = end == std::string_view::npos ? std::string_view() : rest.substr(end + 1);
    return field;
}

int number(std::string_view field) {
    int value = -1;
    std::from_chars(field.data(), field.data() + field.size(), value);
    return value;
}

void append(std::string& text, int value) {
    char digits[16];
    text.append(digits, std::to_chars(digits, digits + sizeof digits, value).ptr);
}

struct PlainSlot {
    std::string drcIndex;
    int pool, isRequired;

    explicit PlainSlot(std::string_view rest)
        : drcIndex(take(rest, '/')),
          pool(number(take(rest, '/'))),
          isRequired(number(take(rest, '/'))) {}

    std::string write() const {
        std::string text = drcIndex + '/';
        append(text, pool);
        text += '/';
        append(text, isRequired);
        return text;
    }
};

/// One end of a line, serial with a flag of the console, or SCSI.
template <bool isSerial>
struct PlainEnd {
    int slot, isServer, supports, remote, remoteSlot, isRequired;
    std::string name;

    explicit PlainEnd(std::string_view rest)
        : slot(number(take(rest, '/'))), isServer(take(rest, '/') == "server" ? 1 : 0) {
        supports = isSerial ? number(take(rest, '/')) : -1;
        remote = number(take(rest, '/'));
        name = take(rest, '/');
        remoteSlot = number(take(rest, '/'));
        isRequired = number(take(rest, '/'));
    }

    std::string write() const {
        std::string text;
        append(text, slot);
        text += isServer != 0 ? "/server/" : "/client/";
        if (isSerial) {
            append(text, supports);
            text += '/';
        }
        appendEnd(text, remote);
        text += '/' + name + '/';
        appendEnd(text, remoteSlot);
        text += '/';
        append(text, isRequired);
        return text;
    }

private:
    static void appendEnd(std::string& text, int value) {
        if (value == -1) {
            text += "any";
        } else {
            append(text, value);
        }
    }
};

struct PlainEthernet {
    int slot, isIeee, vlan, priority, isRequired;
    std::vector<int> vlans;
    std::string vswitch;

    explicit PlainEthernet(std::string_view rest)
        : slot(number(take(rest, '/'))),
          isIeee(number(take(rest, '/'))),
          vlan(number(take(rest, '/'))) {
        for (std::string_view list = take(rest, '/'); !list.empty();) {
            vlans.push_back(number(take(list, ',')));
        }
        priority = number(take(rest, '/'));
        isRequired = number(take(rest, '/'));
        vswitch = rest;
    }

    std::string write() const {
        std::string text;
        for (const int value : {slot, isIeee, vlan}) {
            append(text, value);
            text += '/';
        }
        text += '"';
        for (const int value : vlans) {
            append(text, value);
        }
        text += '"';
        for (const int value : {priority, isRequired}) {
            text += '/';
            append(text, value);
        }
        return text + '/' + vswitch;
    }
};

template <class Slot, class Serial, class Scsi, class Ethernet, class Use>
void run(benchmark::State& state, Use use) {
    const Elements elements;
    const auto all = [&use](const std::vector<zemString>& list, auto kind) {
        for (const zemString& element : list) {
            use(element, kind);
        }
    };
    for (auto _ : state) {
        all(elements.slots, static_cast<Slot*>(nullptr));
        all(elements.serials, static_cast<Serial*>(nullptr));
        all(elements.scsis, static_cast<Scsi*>(nullptr));
        all(elements.ethernets, static_cast<Ethernet*>(nullptr));
    }
    state.SetItemsProcessed(state.iterations() * kElements);
}

void Adapters(benchmark::State& state) {
    run<zemIOSlotAdapter, zemVirtualSerialAdapter, zemVirtualSCSIAdapter,
        zemVirtualEthernetAdapter>(state, [](const zemString& element, auto* kind) {
        std::remove_pointer_t<decltype(kind)> adapter(element);
        benchmark::DoNotOptimize(adapter.getValue());
    });
}

void PlainFields(benchmark::State& state) {
    run<PlainSlot, PlainEnd<true>, PlainEnd<false>, PlainEthernet>(
        state, [](const zemString& element, auto* kind) {
            const std::remove_pointer_t<decltype(kind)> fields(
                std::string_view(element, element.length()));
            benchmark::DoNotOptimize(fields.write());
        });
}

BENCHMARK(Adapters)->Unit(benchmark::kMillisecond);
BENCHMARK(PlainFields)->Unit(benchmark::kMillisecond);

}  // namespace
