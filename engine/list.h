// Intrusive doubly linked record lists: every engine list keeps head and tail, appends
// at the tail and unlinks in place through the record's own `prev` and `next` fields.
#pragma once

namespace vrx::engine {

template <class T> struct RecordList {
    T* head; // first record, or null
    T* tail; // last record, or null

    void append(T* rec) noexcept {
        rec->prev = tail;
        rec->next = nullptr;
        if (tail)
            tail->next = rec;
        else
            head = rec;
        tail = rec;
    }

    void unlink(T* rec) noexcept {
        if (rec->prev)
            rec->prev->next = rec->next;
        else
            head = rec->next;
        if (rec->next)
            rec->next->prev = rec->prev;
        else
            tail = rec->prev;
        rec->prev = rec->next = nullptr;
    }

    void clear() noexcept { head = tail = nullptr; }
    bool empty() const noexcept { return head == nullptr; }
};

} // namespace vrx::engine
