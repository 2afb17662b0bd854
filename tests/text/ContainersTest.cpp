#include "text/Containers.h"

#include <gtest/gtest.h>

#include <string>

namespace {

std::string listed(const CList<CString256>& list) {
    std::string out;
    for (const elem<CString256>* node = list.first; node != nullptr; node = node->next)
        out += std::string(node->data.c_str()) + (node == list.last ? "" : "|");
    return out;
}

TEST(CList, CursorAndRemoval) {
    CList<CString256> list;
    for (const char* s : {"a", "drop", "b", "c", "drop"})
        list.append(CString256(s));
    EXPECT_EQ(list.current, list.first->next->next->next); // the tail before the last append
    CString256 lookalike("a");
    EXPECT_EQ(list.remove(&lookalike), 0); // an element is known by its address, not its value
    EXPECT_EQ(list.current, nullptr);
    list.rewind();
    while (CString256* item = list.next_item()) { // the element just taken may be removed
        if (std::string(item->c_str()) == "drop")
            list.remove(item);
    }
    EXPECT_EQ(list.remove(&list.first->data), 1);
    EXPECT_EQ(list.current, list.first); // the removed head's follower
    EXPECT_EQ(list.remove(&list.last->data), 1);
    list.append(CString256("d")); // after the new tail
    list.reverse();
    EXPECT_EQ(listed(list) + std::to_string(list.count), "d|b2");
}

TEST(CMap, FirstValueWinsInInsertionOrder) {
    CMap<CString256, CString256> map;
    for (const char* key : {"m", "c", "x", "a", "e", "z", "b", "Index", "index"})
        map.insert(CString256(key), CString256(key));
    EXPECT_STREQ(map.insert(CString256("x"), CString256("second"))->value.c_str(), "x");
    CList<CString256> keys;
    for (const auto* node = map.list.first; node != nullptr; node = node->next)
        keys.append(map.lookup(node->data->key)->value);
    EXPECT_EQ(listed(keys) + std::to_string(map.count), "m|c|x|a|e|z|b|Index|index9");
    map.clear();
    EXPECT_EQ(map.lookup(CString256("m")), nullptr);
}

} // namespace
