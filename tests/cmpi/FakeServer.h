// A server's side of CMPI, small enough to lie: tables can be thinned out, answers withheld.
//
// All objects live in the server until it ends, as in a server that frees them after the operation,
// and what the binding did to them is counted.
#ifndef FAKE_SERVER_H
#define FAKE_SERVER_H

#include <deque>
#include <string>
#include <utility>
#include <vector>

#include "cmpift.h"

class FakeServer {
public:
    /// What is behind every handle but strings: named values, in order.
    struct Bag {
        FakeServer* server = nullptr;
        std::vector<std::pair<std::string, CMPIData>> values;
        std::string host;
        CMPIType elementType = CMPI_null;
        CMPIUint64 time = 0;
        CMPIBoolean interval = 0;
    };

    using B = const CMPIBroker*;
    using Rc = CMPIStatus*;

    FakeServer() {
        cloned = released = 0;
        fillBroker();
        fillObjects();
    }
    FakeServer(const FakeServer&) = delete;
    FakeServer& operator=(const FakeServer&) = delete;

    CMPIBrokerFT bft{};
    CMPIBrokerEncFT eft{};
    CMPIContextFT contextFt{};
    CMPIResultFT resultFt{};
    CMPIInstanceFT instanceFt{};
    CMPIObjectPathFT pathFt{};
    CMPIArgsFT argsFt{};
    CMPIArrayFT arrayFt{};
    CMPIStringFT stringFt{};
    CMPIDateTimeFT dateTimeFt{};
    CMPIBroker broker{this, &bft, &eft, nullptr, nullptr};

    /// What creating entries and searches report. Whatever it is, with withhold they return null.
    CMPIStatus outcome{CMPI_RC_OK, nullptr};
    bool withhold = false;
    /// What a search reports that finds nothing.
    CMPIrc missing = CMPI_RC_ERR_NOT_FOUND;

    static inline int cloned = 0;
    static inline int released = 0;
    int made() const { return static_cast<int>(bags.size() + strings.size()); }

    template <class Handle, class Table>
    Handle* make(Table& table) {
        bags.emplace_back();
        bags.back().server = this;
        // All handles are a pointer and a table; one store keeps them all.
        static std::deque<Handle> handles;
        handles.push_back(Handle{&bags.back(), &table});
        return &handles.back();
    }
    CMPIString* string(const char* s) {
        texts.emplace_back(s ? s : "");
        strings.push_back(CMPIString{s ? &texts.back()[0] : nullptr, &stringFt});
        return &strings.back();
    }
    template <class Handle>
    static Bag& bag(const Handle* handle) {
        return *static_cast<Bag*>(handle->hdl);
    }

private:
    void fillBroker() {
        eft.newString = [](B b, const char* s, Rc rc) { return of(b).answer(of(b).string(s), rc); };
        eft.newObjectPath = [](B b, const char*, const char*, Rc rc) { return of(b).path(rc); };
        eft.newInstance = [](B b, const CMPIObjectPath*, Rc rc) { return of(b).instance(rc); };
        eft.newArgs = [](B b, Rc rc) {
            return of(b).answer(of(b).make<CMPIArgs>(of(b).argsFt), rc);
        };
        eft.newArray = [](B b, CMPICount max, CMPIType type, Rc rc) {
            CMPIArray* array = of(b).make<CMPIArray>(of(b).arrayFt);
            bag(array).elementType = type;
            bag(array).values.assign(max, {"", CMPIData{type, CMPI_nullValue, {}}});
            return of(b).answer(array, rc);
        };
        eft.newDateTime = [](B b, Rc rc) { return of(b).dateTime(1, 0, rc); };
        eft.newDateTimeFromBinary = [](B b, CMPIUint64 time, CMPIBoolean interval, Rc rc) {
            return of(b).dateTime(time, interval, rc);
        };
        bft.getInstance = [](B b, const CMPIContext*, const CMPIObjectPath*, const char**, Rc rc) {
            return of(b).instance(rc);
        };
    }

    void fillObjects() {
        fill(contextFt, resultFt, instanceFt, pathFt, argsFt, arrayFt, stringFt, dateTimeFt);
        contextFt.getEntry = get;
        resultFt.returnData = [](const CMPIResult* r, const CMPIValue* v, CMPIType t) {
            return set(r, "returned", v, t);
        };
        instanceFt.getProperty = get;
        instanceFt.getPropertyAt = getAt;
        instanceFt.setProperty = set;
        instanceFt.getObjectPath = [](const CMPIInstance* i, Rc rc) { return of(i).path(rc); };
        pathFt.getKey = get;
        pathFt.addKey = set;
        pathFt.setHostname = [](CMPIObjectPath* p, const char* s) {
            bag(p).host = s;
            return of(p).outcome;
        };
        pathFt.getHostname = [](const CMPIObjectPath* p, Rc rc) {
            return of(p).answer(of(p).string(bag(p).host.c_str()), rc);
        };
        argsFt.getArg = get;
        argsFt.getArgAt = getAt;
        argsFt.addArg = set;
        arrayFt.getSize = count;
        arrayFt.getSimpleType = [](const CMPIArray* a, CMPIStatus*) { return bag(a).elementType; };
        arrayFt.getElementAt = [](const CMPIArray* a, CMPICount at, CMPIStatus*) {
            return bag(a).values.at(at).second;
        };
        arrayFt.setElementAt = [](CMPIArray* a, CMPICount at, const CMPIValue* v, CMPIType t) {
            bag(a).values.at(at).second = data(v, t);
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        dateTimeFt.getBinaryFormat = [](const CMPIDateTime* d, CMPIStatus*) { return bag(d).time; };
        dateTimeFt.isInterval = [](const CMPIDateTime* d, CMPIStatus*) { return bag(d).interval; };
        stringFt.getCharPtr = [](const CMPIString* s, CMPIStatus*) {
            return static_cast<const char*>(s->hdl);
        };
    }

    static FakeServer& of(B b) { return *static_cast<FakeServer*>(b->hdl); }
    template <class Handle>
    static FakeServer& of(const Handle* handle) {
        return *bag(handle).server;
    }
    CMPIObjectPath* path(Rc rc) { return answer(make<CMPIObjectPath>(pathFt), rc); }
    CMPIInstance* instance(Rc rc) { return answer(make<CMPIInstance>(instanceFt), rc); }
    CMPIDateTime* dateTime(CMPIUint64 time, CMPIBoolean interval, Rc rc) {
        CMPIDateTime* made = make<CMPIDateTime>(dateTimeFt);
        bag(made).time = time;
        bag(made).interval = interval;
        return answer(made, rc);
    }

    template <class Handle>
    Handle* answer(Handle* handle, CMPIStatus* rc) {
        if (rc) *rc = outcome;
        return withhold || outcome.rc != CMPI_RC_OK ? nullptr : handle;
    }

    static CMPIData data(const CMPIValue* value, CMPIType type) {
        CMPIData made{type, CMPI_goodValue, {}};
        if (!value) {
            made.state = CMPI_nullValue;
        } else if (type == CMPI_chars) {
            made.value.chars = const_cast<char*>(reinterpret_cast<const char*>(value));
        } else {
            made.value = *value;
        }
        return made;
    }

    template <class Handle>
    static CMPIStatus set(Handle* handle, const char* name, const CMPIValue* value, CMPIType type) {
        bag(handle).values.emplace_back(name, data(value, type));
        return of(handle).outcome;
    }
    template <class Handle>
    static CMPIData get(const Handle* handle, const char* name, CMPIStatus* rc) {
        for (const auto& v : bag(handle).values) {
            if (v.first == name) return found(handle, v.second, rc);
        }
        // Garbage, as a careless server leaves it.
        rc->rc = of(handle).missing;
        return CMPIData{CMPI_string, CMPI_goodValue, {0xdeadbeef}};
    }
    template <class Handle>
    static CMPIData getAt(const Handle* handle, CMPICount at, CMPIString** name, CMPIStatus* rc) {
        Bag& b = bag(handle);
        if (at >= b.values.size()) return get(handle, "", rc);
        *name = b.server->string(b.values[at].first.c_str());
        return found(handle, b.values[at].second, rc);
    }
    template <class Handle>
    static CMPIData found(const Handle* handle, const CMPIData& data, CMPIStatus* rc) {
        *rc = of(handle).outcome;
        return data;
    }
    template <class Handle>
    static CMPICount count(const Handle* handle, CMPIStatus*) {
        return static_cast<CMPICount>(bag(handle).values.size());
    }

    template <class... Tables>
    static void fill(Tables&... tables) {
        ((tables.ftVersion = 1, countLife(tables.release, tables.clone)), ...);
    }
    template <class Handle>
    static void countLife(CMPIStatus (*&release)(Handle*),
                          Handle* (*&clone)(const Handle*, CMPIStatus*)) {
        release = [](Handle*) {
            ++released;
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
        clone = [](const Handle* h, CMPIStatus*) {
            ++cloned;
            return const_cast<Handle*>(h);
        };
    }

    std::deque<Bag> bags;
    std::deque<CMPIString> strings;
    std::deque<std::string> texts;
};

#endif
