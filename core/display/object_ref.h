// ObjectRef: a pointer to a display object that outlives a call.
#pragma once

class DisplayList;
struct SObject;

// Null as soon as its object is removed, so that a pool record used again is never taken for the
// object that was meant. Every live one is linked into its display list, which must outlive it.
class ObjectRef {
public:
    explicit ObjectRef(DisplayList* list, SObject* obj = nullptr);
    ~ObjectRef();
    ObjectRef(const ObjectRef&) = delete;
    ObjectRef& operator=(const ObjectRef&) = delete;

    SObject* Get() const { return object; }
    void Set(SObject* obj) { object = obj; }
    explicit operator bool() const { return object != nullptr; }

private:
    friend class DisplayList;

    SObject* object;
    ObjectRef* next; // links of the display list's references
    ObjectRef** link;
};
