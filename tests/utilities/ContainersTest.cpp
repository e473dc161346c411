#include <gtest/gtest.h>

#include <set>

#include "Array.h"
#include "AtomicType.h"
#include "AutoRelease.h"
#include "DynamicArray.h"
#include "HashTable.h"
#include "MultiHashTable.h"

namespace {

// All point to one number, whose use count tells how many elements live.
using Item = std::shared_ptr<int>;

TEST(DynamicArrayTest, GrowsShrinksAndDeletesWhatItOwns) {
    const Item item = std::make_shared<int>(0);
    for (const int grow : {0, -3, 1, 25}) {
        zemDynamicArray<Item> items(grow);
        for (int i = 0; i < 1000; ++i) {
            items.addElement(new Item(item));
        }
        const Item* const last = items.getElementAt(999);
        EXPECT_EQ(item.use_count(), 1001);
        while (items.size() > 2) {
            EXPECT_EQ(items.removeElementAt(1), 0);
        }
        EXPECT_EQ(items.getElementAt(1), last);
        EXPECT_EQ(items.removeElementAt(2), 1);
        items.clear();
        EXPECT_EQ(item.use_count(), 1);
        items.addElement(new Item(item));
    }
    EXPECT_EQ(item.use_count(), 1);
}

TEST(DynamicArrayTest, OwnershipTravelsOutOfAConstSource) {
    const Item item = std::make_shared<int>(0);
    zemDynamicArray<Item> target;
    target.addElement(new Item(item));
    {
        zemDynamicArray<Item> made;
        made.addElement(new Item(item));
        made.addElement(new Item(item));
        const zemDynamicArray<Item> source(made);
        target = source;
        EXPECT_EQ(item.use_count(), 3) << "the target's own element is gone";
        EXPECT_EQ(*source[1], item) << "the source stays readable";
    }
    EXPECT_EQ(item.use_count(), 3);
    const std::unique_ptr<Item> kept(target.getElementAt(1));
    target.relinquishOwnership();
    target.removeElementAt(1);
    target.reSetOwership();
    target.clear();
    EXPECT_EQ(item.use_count(), 2);
}

TEST(DynamicArrayTest, IndexesPastTheEndExtend) {
    zemDynamicArray<zemString> items(4);
    EXPECT_EQ(items.setElementAt(-1, nullptr), 1);
    EXPECT_EQ(items.setElementAt(6, new zemString("6")), 0);
    items[8] = new zemString("8");
    items[-1] = nullptr;
    EXPECT_EQ(items.setElementAt(6, new zemString("66")), 0);
    EXPECT_TRUE(items[0] == nullptr && items[7] == nullptr && items.getElementAt(9) == nullptr);
    const zemString like("8");
    EXPECT_EQ(items.findElement(&like), 8);
    EXPECT_EQ(items.findElement(items[6]), 6);
    EXPECT_EQ(items.setSize(7), 0);
    EXPECT_EQ(items.findElement(&like), -1);
}

TEST(ArrayTest, Values) {
    zemArray<zemString> texts(0);
    for (int i = 0; i < 20; ++i) {
        texts.append(zemString(i));
    }
    for (int i = 0; i < 5; ++i) {
        texts.append(texts[0]);  // an element of the array that grows
    }
    zemString nine("9");
    EXPECT_EQ(texts.remove(nine), 0);
    EXPECT_EQ(texts.remove(nine), 1);
    EXPECT_EQ(texts.removeAt(0), 0);
    EXPECT_EQ(texts.find("0"), 18);
    const zemArray<zemString> copy(texts);
    texts.clear();
    EXPECT_STREQ(copy[8], "10");
    EXPECT_STREQ(copy[23], "");
    texts = copy;
    texts[30] = "far";
    EXPECT_EQ(texts.size(), 31);
    texts.setSize(2);
    EXPECT_TRUE(texts[2].isEmpty());
}

TEST(HashTableTest, ReturnCodesAndTheThrownThree) {
    zemHashTable<int, zemString, hashFunc> table(0);
    zemString value("before");
    EXPECT_EQ(table.lookup(1, value), 3);
    EXPECT_EQ(table.remove(1), 3);
    for (int key = -20; key < 20; ++key) {
        EXPECT_EQ(table.insert(key, zemString(key)), 0);
    }
    EXPECT_EQ(table.insert(9, "other"), 2);
    EXPECT_EQ(table.lookup(99, value), 3);
    EXPECT_STREQ(value, "before");
    EXPECT_EQ(table.lookup(9, value), 0);
    EXPECT_STREQ(value, "9");
    EXPECT_EQ(table.remove(9), 0);
    EXPECT_STREQ(table[-7], "-7") << "of a chain that lost an entry";
    table.insertBlanks(std::make_shared<std::vector<int>>(std::vector<int>{1, 40, 41, 42}));
    const zemHashTable<int, zemString, hashFunc> copy(table);
    EXPECT_STREQ(copy[1], "1") << "what is there stays";
    EXPECT_STREQ(copy[40], "");
    EXPECT_EQ(table.lookup(41, value), 0);
    EXPECT_STREQ(value, "");
    EXPECT_EQ(table.insert(41, "other"), 2);
    table[41] = "written";
    EXPECT_EQ(table.remove(42), 0);
    EXPECT_EQ(table.remove(42), 3);
    EXPECT_STREQ((table.getElement(40) + table[41] + copy[42]), "written");
    try {
        static_cast<void>(table[9]);
        FAIL();
    } catch (int code) {
        EXPECT_EQ(code, 3);
    }
}

TEST(HashTableTest, EntriesComeAndGoAndCopiesAreDeep) {
    using Table = zemHashTable<int, Item, hashFunc>;
    Table table(3);
    const Item item = std::make_shared<int>(0);
    for (const unsigned chains : {3U, 50U, 1U}) {
        for (int key = 0; key < 9; ++key) {
            table.insert(key, item);
            table.remove(key - 2);
        }
        EXPECT_EQ(item.use_count(), 3) << "the last two and this one";
        Table assigned(chains);
        assigned.insert(1, item);
        assigned = table;
        const Table copy(assigned);
        assigned[8] = nullptr;
        EXPECT_EQ(Table(std::move(assigned)).getElement(8), nullptr);
        table.clear();
        EXPECT_TRUE(copy[7] == item && copy[8] == item);
        EXPECT_EQ(item.use_count(), 3);
        table = copy;
    }
    table = Table(5);
    EXPECT_THROW(table[8], int);
    EXPECT_EQ(item.use_count(), 1);
}

TEST(HashTableTest, HashFunctions) {
    EXPECT_EQ(hashFunc(-1, 10), 4294967295U % 10);
    EXPECT_EQ(lparHashFunc("\xff", 10), 4294967295U % 10) << "negative sums divide unsigned";
    EXPECT_EQ(cecHashFunc("ab", 8), ('a' + 'b') % 8U);
    EXPECT_EQ(objectCacheHashFunc("abc", 7), 0U);
    EXPECT_EQ(objectCacheHashFunc("abcdabcdxyz", 1000), 2U * 0x64636261U % 1000);
}

TEST(MultiHashTableTest, ReadsAllValuesOfAKey) {
    using Table = zemMultiHashTable<zemString, int, assoHashFunc>;
    Table table;
    EXPECT_THROW(static_cast<const Table&>(table)["a"], int);
    EXPECT_TRUE(table["a"].empty());
    for (const int value : {3, 1, 3, 2}) {
        EXPECT_EQ(table.insert("ab", value), 0);
        EXPECT_EQ(table.insert("ba", -value), 0);  // the same chain
    }
    const Table copy(table);
    EXPECT_EQ(table["ab"], (std::set<int>{1, 2, 3}));
    EXPECT_EQ(table.remove("ab"), 0);
    EXPECT_TRUE(table.getElement("ab").empty());
    EXPECT_EQ(copy["ba"], (std::set<int>{-1, -2, -3}));
    EXPECT_TRUE(copy["none"].empty());
}

struct Releaser {
    void operator()(int* number) const { ++*number; }
};

TEST(AutoReleaseTest, ReleasesOnceAndOnlyWhatItHolds) {
    int released[3] = {};
    {
        zemAutoRelease<int, Releaser> held(&released[0]);
        held.reset(&released[0]);
        EXPECT_EQ(released[0], 0);
        held.reset(&released[1]);
        EXPECT_EQ((zemAutoRelease<int, Releaser>(&released[2]).release()), &released[2]);
    }
    EXPECT_TRUE(released[0] == 1 && released[1] == 1 && released[2] == 0);
}

}  // namespace
