#pragma once

#include "text/CPool.h"
#include "text/CString256.h"

#include <cstdint>
#include <cstring>

/**
 * The text layer's own collections: a singly linked list with one built-in cursor, a linked
 * stack, and a map ordered by byte comparison of its keys that also remembers its records in
 * insertion order. Each node type draws from a CPool of its own.
 *
 * Containers own copies of their elements (an element that is a pointer is not released: what
 * it points at belongs to others). They cannot be copied; a container's clear() or destructor
 * gives every node back to its pool. Single-threaded, like the pools.
 */

/** Node of CList<T>. The element is the first field: its address identifies the node. */
template <class T>
struct elem : CPooled<elem<T>> {
    T data;
    elem* next = nullptr;

    explicit elem(const T& value) : data(value) {}
};

/** Node of CStack<T>. */
template <class T>
struct stack_elem : CPooled<stack_elem<T>> {
    T data;
    stack_elem* next = nullptr;

    stack_elem(const T& value, stack_elem* below) : data(value), next(below) {}
};

/** Record of CMap<K,V>: a key, its value and the two subtrees. */
template <class K, class V>
struct Link : CPooled<Link<K, V>> {
    K key;
    V value;
    Link* left = nullptr;
    Link* right = nullptr;
    Link* spare = nullptr; // cleared on construction, read by nothing

    Link(const K& k, const V& v) : key(k), value(v) {}
};

/**
 * Singly linked list with a tail pointer, a count and one cursor.
 *
 * To iterate: rewind(), then next_item() until it answers null. The cursor moves past an
 * element before handing it out, so the element just taken may be remove()d. append() moves
 * the cursor too (to the former tail), so a loop never appends to the list it walks.
 */
template <class T>
struct CList {
    elem<T>* first = nullptr;
    elem<T>* last = nullptr;
    elem<T>* current = nullptr;
    int32_t count = 0;

    CList() = default;
    CList(const CList&) = delete;
    CList& operator=(const CList&) = delete;
    ~CList() { clear(); }

    /** Copies item to the tail; leaves the cursor on the former tail. Nothing when out of memory.
     */
    void append(const T& item) {
        auto* node = new elem<T>(item);
        if (node == nullptr)
            return;
        current = last;
        if (last != nullptr)
            last->next = node;
        else
            first = node;
        last = node;
        ++count;
    }

    void clear() {
        elem<T>* node = first;
        while (node != nullptr) {
            elem<T>* next = node->next;
            delete node;
            node = next;
        }
        first = last = current = nullptr;
        count = 0;
    }

    /**
     * Removes the node whose element is stored at item (identity, not equality): 1 when
     * removed, with the cursor on the node that followed it; 0 otherwise, with the cursor null.
     */
    int remove(const T* item) {
        elem<T>* previous = nullptr;
        current = first;
        while (current != nullptr) {
            elem<T>* node = current;
            current = node->next;
            if (&node->data == item) {
                unlink(previous, node);
                return 1;
            }
            previous = node;
        }
        return 0;
    }

    void reverse();

    void rewind() { current = first; }

    /** The element under the cursor, which moves on first; null at the end. */
    T* next_item() {
        elem<T>* node = current;
        if (node == nullptr)
            return nullptr;
        current = node->next;
        return &node->data;
    }

private:
    void unlink(elem<T>* previous, elem<T>* node) {
        if (previous != nullptr)
            previous->next = node->next;
        else
            first = node->next;
        if (node == last)
            last = previous;
        delete node;
        --count;
        if (count == 0)
            last = nullptr;
        else if (count == 1)
            last = first;
    }
};

/** Linked stack. */
template <class T>
struct CStack {
    stack_elem<T>* top = nullptr;

    CStack() = default;
    CStack(const CStack&) = delete;
    CStack& operator=(const CStack&) = delete;
    ~CStack() {
        T discarded{};
        while (pop(discarded)) {
        }
    }

    /** 1 when pushed, 0 when the pool had no node. */
    int push(const T& item) {
        auto* node = new stack_elem<T>(item, top);
        if (node == nullptr)
            return 0;
        top = node;
        return 1;
    }

    /** Moves the top element to out: 1, or 0 on an empty stack. */
    int pop(T& out) {
        stack_elem<T>* node = top;
        if (node == nullptr)
            return 0;
        out = node->data;
        top = node->next;
        delete node;
        return 1;
    }
};

template <class T>
void CList<T>::reverse() {
    if (count < 2)
        return;
    CStack<T> stack;
    for (elem<T>* node = first; node != nullptr; node = node->next)
        stack.push(node->data);
    clear();
    T item{};
    while (stack.pop(item))
        append(item);
}

/**
 * Unbalanced binary search tree keyed by case-sensitive byte comparison (strcmp) of
 * CString256 keys, whose records are also listed in insertion order in `list`.
 *
 * insert() keeps the first value of a key. Records belong to the map; a Link pointer from
 * lookup(), insert() or `list` is valid until clear() or the map's destruction.
 */
template <class K, class V>
struct CMap {
    Link<K, V>* root = nullptr;
    V default_value;
    K default_key;
    CList<Link<K, V>*> list;
    int32_t count = 0;

    CMap() : default_value(vdef()), default_key(kdef()) {}
    CMap(const CMap&) = delete;
    CMap& operator=(const CMap&) = delete;
    ~CMap() { clear(); }

    static const K& kdef() {
        static const K k{};
        return k;
    }
    static const V& vdef() {
        static const V v{};
        return v;
    }

    /** The record of key, or null. */
    Link<K, V>* lookup(const K& key) const {
        Link<K, V>* record = root;
        while (record != nullptr) {
            const int order = std::strcmp(key.c_str(), record->key.c_str());
            if (order == 0)
                return record;
            record = order > 0 ? record->right : record->left;
        }
        return nullptr;
    }

    /** The new record; the existing one, unchanged, when key is present; null when out of memory.
     */
    Link<K, V>* insert(const K& key, const V& value) {
        if (Link<K, V>* existing = lookup(key))
            return existing;
        auto* record = new Link<K, V>(key, value);
        if (record == nullptr)
            return nullptr;
        ++count;
        ins(root, record);
        list.append(record);
        return record;
    }

    /** Places record under slot; 1 when this call filled the slot itself. */
    static int ins(Link<K, V>*& slot, Link<K, V>*& record) {
        if (slot == nullptr) {
            slot = record;
            return 1;
        }
        const int order = std::strcmp(record->key.c_str(), slot->key.c_str());
        if (order < 0)
            ins(slot->left, record);
        else if (order > 0)
            ins(slot->right, record);
        return 0;
    }

    void clear() {
        for (elem<Link<K, V>*>* node = list.first; node != nullptr; node = node->next)
            delete node->data;
        list.clear();
        root = nullptr;
        count = 0;
    }
};
