#include "text/Containers.h"

#include <QString>
#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

template <class T>
std::vector<T> items(CList<T>& list) {
    std::vector<T> out;
    list.rewind();
    while (T* item = list.next_item())
        out.push_back(*item);
    return out;
}

std::vector<std::string> texts(CList<CString256>& list) {
    std::vector<std::string> out;
    for (const CString256& s : items(list))
        out.emplace_back(s.c_str());
    return out;
}

TEST(CList, AppendKeepsOrderAndLeavesTheCursorOnTheFormerTail) {
    CList<CString256> list;
    list.append(CString256("one"));
    EXPECT_EQ(list.current, nullptr); // the list was empty
    EXPECT_EQ(list.first, list.last);
    list.append(CString256("two"));
    EXPECT_EQ(list.current, list.first);
    elem<CString256>* formerTail = list.last;
    list.append(CString256("three"));
    EXPECT_EQ(list.current, formerTail);
    EXPECT_EQ(list.count, 3);
    EXPECT_EQ(list.last->next, nullptr);
    EXPECT_EQ(texts(list), (std::vector<std::string>{"one", "two", "three"}));

    list.clear();
    EXPECT_EQ(list.count, 0);
    EXPECT_EQ(list.first, nullptr);
    EXPECT_EQ(list.last, nullptr);
    EXPECT_EQ(list.current, nullptr);
}

TEST(CList, ElementsAreCopiesCutAt255) {
    CList<CString256> list;
    CString256 source("original");
    list.append(source);
    source = "changed";
    EXPECT_STREQ(list.first->data.c_str(), "original");
    list.append(CString256(std::string(400, 'k').c_str()));
    EXPECT_EQ(list.last->data.length(), 255);
}

TEST(CList, RemoveGoesByAddressAndFixesTheTail) {
    CList<QString> list;
    for (const char* s : {"a", "b", "c"})
        list.append(QString::fromLatin1(s));

    // Removing the tail of three makes the second one last.
    EXPECT_EQ(list.remove(&list.last->data), 1);
    EXPECT_EQ(list.count, 2);
    EXPECT_EQ(list.last->data, "b");
    EXPECT_EQ(list.last->next, nullptr);
    EXPECT_EQ(list.current, nullptr); // the removed tail had no follower

    // An equal value at another address is not an element.
    QString lookalike = QStringLiteral("a");
    list.rewind();
    EXPECT_EQ(list.remove(&lookalike), 0);
    EXPECT_EQ(list.current, nullptr);
    EXPECT_EQ(list.count, 2);

    // Removing from two leaves last equal to first.
    EXPECT_EQ(list.remove(&list.first->data), 1);
    EXPECT_EQ(list.first, list.last);
    EXPECT_EQ(list.current, list.first); // the follower of the removed head
    EXPECT_EQ(list.first->data, "b");

    EXPECT_EQ(list.remove(&list.first->data), 1);
    EXPECT_EQ(list.first, nullptr);
    EXPECT_EQ(list.last, nullptr);
    EXPECT_EQ(list.count, 0);
}

TEST(CList, TheElementJustTakenMayBeRemovedDuringIteration) {
    CList<QString> list;
    for (const char* s : {"keep1", "drop", "keep2", "drop", "drop"})
        list.append(QString::fromLatin1(s));
    std::vector<QString> visited;
    list.rewind();
    while (QString* item = list.next_item()) {
        visited.push_back(*item);
        if (*item == "drop")
            list.remove(item);
    }
    EXPECT_EQ(visited.size(), 5u);
    EXPECT_EQ(items(list), (std::vector<QString>{"keep1", "keep2"}));
    EXPECT_EQ(list.last->data, "keep2");
}

TEST(CList, ReverseUsesAStackAndLeavesShortListsAlone) {
    CList<QString> list;
    list.append(QStringLiteral("only"));
    list.current = nullptr;
    list.reverse();
    EXPECT_EQ(list.current, nullptr); // not even the cursor moves
    EXPECT_EQ(list.first->data, "only");

    CList<CString256> numbers;
    for (const char* s : {"1", "2", "3"})
        numbers.append(CString256(s));
    numbers.reverse();
    EXPECT_EQ(texts(numbers), (std::vector<std::string>{"3", "2", "1"}));
    EXPECT_EQ(numbers.count, 3);
    EXPECT_STREQ(numbers.last->data.c_str(), "1");

    CList<CString256> empty;
    empty.reverse();
    EXPECT_EQ(empty.count, 0);
}

TEST(CStack, PopsInReverseOrder) {
    CStack<QString> stack;
    QString out;
    EXPECT_EQ(stack.pop(out), 0);
    stack.push(QStringLiteral("bottom"));
    stack.push(QStringLiteral("top"));
    ASSERT_EQ(stack.pop(out), 1);
    EXPECT_EQ(out, "top");
    ASSERT_EQ(stack.pop(out), 1);
    EXPECT_EQ(out, "bottom");
    EXPECT_EQ(stack.top, nullptr);
}

using UrlMap = CMap<CString256, CString256>;

TEST(CMap, FirstValueWinsAndCaseMatters) {
    UrlMap map;
    EXPECT_EQ(map.lookup(CString256("absent")), nullptr);

    Link<CString256, CString256>* first = map.insert(CString256("index.html"), CString256("first"));
    ASSERT_NE(first, nullptr);
    Link<CString256, CString256>* again =
        map.insert(CString256("index.html"), CString256("second"));
    EXPECT_EQ(again, first);
    EXPECT_STREQ(first->value.c_str(), "first");
    EXPECT_EQ(map.count, 1);
    EXPECT_EQ(map.list.count, 1);

    Link<CString256, CString256>* upper = map.insert(CString256("Index.html"), CString256("upper"));
    EXPECT_NE(upper, first);
    EXPECT_EQ(map.count, 2);
    EXPECT_STREQ(map.lookup(CString256("Index.html"))->value.c_str(), "upper");
    EXPECT_STREQ(map.lookup(CString256("index.html"))->value.c_str(), "first");
    EXPECT_EQ(map.lookup(CString256("INDEX.HTML")), nullptr);
}

TEST(CMap, ListIsInInsertionOrderWhateverTheTreeShape) {
    UrlMap map;
    const std::vector<std::string> keys = {"m", "c", "x", "a", "e", "z", "b"};
    for (const std::string& k : keys)
        map.insert(CString256(k.c_str()), CString256(("v" + k).c_str()));

    std::vector<std::string> order;
    for (auto* node = map.list.first; node != nullptr; node = node->next)
        order.emplace_back(node->data->key.c_str());
    EXPECT_EQ(order, keys);

    // The tree itself is ordered by strcmp: m at the root, c left, x right.
    ASSERT_NE(map.root, nullptr);
    EXPECT_STREQ(map.root->key.c_str(), "m");
    EXPECT_STREQ(map.root->left->key.c_str(), "c");
    EXPECT_STREQ(map.root->right->key.c_str(), "x");
    EXPECT_STREQ(map.root->left->left->right->key.c_str(), "b");
    for (const std::string& k : keys)
        EXPECT_STREQ(map.lookup(CString256(k.c_str()))->value.c_str(), ("v" + k).c_str());

    map.clear();
    EXPECT_EQ(map.root, nullptr);
    EXPECT_EQ(map.count, 0);
    EXPECT_EQ(map.list.count, 0);
    EXPECT_EQ(map.lookup(CString256("m")), nullptr);
    map.clear(); // twice is harmless
    EXPECT_NE(map.insert(CString256("after"), CString256("clear")), nullptr);
}

TEST(CMap, SortedKeysMakeADeepChainThatStillWorks) {
    UrlMap map;
    char key[16];
    for (int i = 0; i < 5000; ++i) {
        std::snprintf(key, sizeof key, "k%05d", i);
        map.insert(CString256(key), CString256(key));
    }
    EXPECT_EQ(map.count, 5000);
    EXPECT_STREQ(map.lookup(CString256("k04999"))->value.c_str(), "k04999");
    EXPECT_EQ(map.root->left, nullptr); // ascending keys: every record hangs to the right
}

struct Entry {
    char type[4];
    unsigned creator;
};

TEST(CMap, DefaultsAreEmptyAndZero) {
    CMap<CString256, Entry> map;
    EXPECT_STREQ(map.default_key.c_str(), "");
    EXPECT_EQ(map.default_value.creator, 0u);
    Entry e{{'T', 'E', 'X', 'T'}, 7};
    map.insert(CString256(".txt"), e);
    EXPECT_EQ(map.lookup(CString256(".txt"))->value.creator, 7u);
}

TEST(Pools, EveryNodeTypeHasItsOwnBlocksAndReusesFreedNodes) {
    using Node = elem<CString256>;
    using Pool = CPool<Node>;
    using RecordPool = CPool<Link<CString256, CString256>>;
    CList<CString256> filler;
    while (Pool::free_count() > 0)
        filler.append(CString256("fill"));
    const size_t blocks = Pool::blocks();
    const size_t linkBlocks = RecordPool::blocks();

    CList<CString256> list;
    for (int i = 0; i < 256; ++i)
        list.append(CString256("n"));
    EXPECT_EQ(Pool::blocks(), blocks + 1);
    list.append(CString256("257th"));
    EXPECT_EQ(Pool::blocks(), blocks + 2);
    EXPECT_EQ(RecordPool::blocks(), linkBlocks); // other types untouched

    Node* tail = list.last;
    list.remove(&tail->data);
    list.append(CString256("reused"));
    EXPECT_EQ(list.last, tail); // the node just freed comes back first

    list.clear();
    filler.clear();
    EXPECT_EQ(Pool::blocks(), blocks + 2);
    EXPECT_GE(Pool::free_count(), 512u);
}

} // namespace
