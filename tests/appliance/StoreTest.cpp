// The state on disk, used by several processes at once.

#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <filesystem>
#include <functional>
#include <stdexcept>

#include "Failure.h"
#include "Store.h"
#include "TestAppliance.h"
#include "Text.h"

namespace {

using namespace appliance;

constexpr int kLpars = 20;

class StoreTest : public testing::Test {
protected:
    StoreTest() {
        Store store = Store::create();
        Transaction change = store.write();
        store.clear(false);
        for (int id = 1; id <= kLpars; ++id) {
            store.put(lpar(id, "0"));
        }
        change.commit();
    }

    static Object lpar(std::int64_t id, const std::string& mem) {
        Object object(Kind::Lpar, {1, id});
        object.set("pend_mem", mem);
        return object;
    }

    static std::int64_t totalMem() {
        Store store = Store::open(Database::Access::Read);
        const Transaction picture = store.read();
        std::int64_t sum = 0;
        for (const Object& object : store.all(Kind::Lpar)) {
            sum += number(object.get("pend_mem"));
        }
        return sum;
    }

    /// Adds 1 to the memory of every partition, as one change.
    static void addToAll(Store& store) {
        Transaction change = store.write();
        for (Object& object : store.all(Kind::Lpar)) {
            object.set("pend_mem", std::to_string(number(object.get("pend_mem")) + 1));
            store.put(object);
        }
        change.commit();
    }

    /// Runs @p work in a process of its own, which ends with 0 unless it throws.
    static pid_t inChild(const std::function<void()>& work) {
        const pid_t child = fork();
        if (child != 0) {
            return child;
        }
        try {
            work();
            _exit(0);
        } catch (const std::exception& error) {
            std::fprintf(stderr, "%s\n", error.what());
            _exit(1);
        }
    }

    static int statusOf(pid_t child) {
        int status = -1;
        waitpid(child, &status, 0);
        return status;
    }

    testing_support::TestAppliance m_appliance{ZEM_PROGRAMS};
};

TEST_F(StoreTest, ProcessesThatWriteTakeTurnsAndReadersSeeWholeChanges) {
    constexpr int kWriters = 4, kReaders = 2, kChanges = 50;
    std::vector<pid_t> children;
    for (int i = 0; i < kWriters; ++i) {
        children.push_back(inChild([] {
            Store store = Store::open(Database::Access::Write);
            for (int change = 0; change < kChanges; ++change) {
                addToAll(store);
            }
        }));
    }
    for (int i = 0; i < kReaders; ++i) {
        children.push_back(inChild([] {
            std::int64_t last = 0;
            while (last < kWriters * kChanges * kLpars) {
                const std::int64_t sum = totalMem();
                if (sum % kLpars != 0) {
                    throw std::runtime_error("half a change was seen");
                }
                if (sum < last) {
                    throw std::runtime_error("a change was undone");
                }
                last = sum;
            }
        }));
    }
    for (pid_t child : children) {
        EXPECT_EQ(0, statusOf(child));
    }
    EXPECT_EQ(kWriters * kChanges * kLpars, totalMem());
}

TEST_F(StoreTest, AnOpenPictureDoesNotMove) {
    Store reader = Store::open(Database::Access::Read);
    const Transaction picture = reader.read();
    EXPECT_EQ("0", reader.all(Kind::Lpar, 1).front().get("pend_mem"));
    Store writer = Store::open(Database::Access::Write);
    addToAll(writer);
    EXPECT_EQ("0", reader.all(Kind::Lpar, 1).back().get("pend_mem"));
    EXPECT_EQ(kLpars, totalMem());
}

TEST_F(StoreTest, AKilledWriterLeavesNothingOfItsChange) {
    int ready[2];
    ASSERT_EQ(0, pipe(ready));
    const pid_t child = inChild([&] {
        Store store = Store::open(Database::Access::Write);
        Transaction change = store.write();
        store.clear(true);
        for (int id = 1; id <= 20'000; ++id) {
            store.put(lpar(id, std::string(500, '7')));
        }
        if (write(ready[1], "x", 1) == 1) {
            pause();
        }
    });
    char byte = 0;
    ASSERT_EQ(1, read(ready[0], &byte, 1));
    kill(child, SIGKILL);
    statusOf(child);
    close(ready[0]);
    close(ready[1]);

    EXPECT_EQ(0, totalMem());
    Store store = Store::open(Database::Access::Write);
    addToAll(store);
    EXPECT_EQ(kLpars, totalMem());
}

TEST_F(StoreTest, AnAbandonedChangeIsRolledBackAndAnObjectCanBeRemoved) {
    Store store = Store::open(Database::Access::Write);
    {
        const Transaction change = store.write();
        store.put(lpar(1, "512"));
    }
    EXPECT_EQ(0, totalMem());
    Transaction change = store.write();
    EXPECT_TRUE(store.remove(Kind::Lpar, {1, 3}));
    EXPECT_FALSE(store.remove(Kind::Lpar, {1, 3}));
    EXPECT_FALSE(store.remove(Kind::Lpar, {2, 4}));
    change.commit();
    EXPECT_EQ(kLpars - 1U, store.all(Kind::Lpar, 1).size());
    EXPECT_TRUE(store.all(Kind::Lpar, 2).empty());
}

TEST_F(StoreTest, AttributesFallBackAndRefuseWhatNoLineCanHold) {
    Object object = lpar(4, "1024");
    EXPECT_EQ("4", object.get("lpar_id"));
    EXPECT_EQ("1024", object.get("run_mem"));  // by way of what is in effect
    object.set("curr_mem", "512");
    EXPECT_EQ("512", object.get("run_mem"));
    object.set("pend_mem", "2048");
    EXPECT_EQ("2048", object.get("pend_mem"));
    object.set("name", "name=pend_mem=\"1\"");
    EXPECT_EQ("name=pend_mem=\"1\"", object.get("name"));
    EXPECT_EQ("2048", Object(Kind::Lpar, {1, 4}, object.stored()).get("pend_mem"));
    EXPECT_THROW(object.set("name", "two\nlines"), Failure);
    EXPECT_THROW(object.set("nmae", "x"), std::logic_error);
    EXPECT_THROW(object.get("lpar_env"), std::logic_error);  // must be set first
}

TEST_F(StoreTest, WhatCannotBeOpenedSaysWhy) {
    const auto folder = m_appliance.folder();
    const auto faultOf = [](const std::function<void()>& work) {
        try {
            work();
        } catch (const Failure& failure) {
            return failure.what() + std::string();
        }
        return std::string("no failure");
    };
    const auto open = [] { Store::open(Database::Access::Read); };
    const auto file = folder / "appliance" / "appliance.db";
    const auto sqlite = [&](const char* sql) {
        Database(file.string(), Database::Access::Write).execute(sql);
    };

    sqlite("PRAGMA user_version = 99");
    EXPECT_EQ("WRTL2003 The appliance's state has version 99; this program reads version 2.",
              faultOf(open));
    EXPECT_EQ(0U, faultOf([] {
                      Store store = Store::create();
                      const Transaction change = store.write();
                      store.clear(false);
                  }).find("WRTL2004 "));
    sqlite("PRAGMA user_version = 0");
    EXPECT_EQ(0U, faultOf(open).find("WRTL2002 "));

    std::filesystem::remove_all(folder / "appliance");
    EXPECT_EQ(0U, faultOf(open).find("WRTL2002 "));
    std::filesystem::create_directory(folder / "appliance");
    std::ofstream(file) << std::string(5000, 'x');
    EXPECT_EQ(0U, faultOf(open).find("WRTL2005 "));
    unsetenv("APPLIANCE_HOME");
    EXPECT_EQ(0U, faultOf(open).find("WRTL2001 "));
}

}  // namespace
