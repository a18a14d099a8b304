#include "core/display/object_ref.h"

#include "core/display/display_list.h"

ObjectRef::ObjectRef(DisplayList* list, SObject* obj)
    : object(obj), next(list->refs), link(&list->refs)
{
    if (next)
        next->link = &next;
    list->refs = this;
}

ObjectRef::~ObjectRef()
{
    *link = next;
    if (next)
        next->link = link;
}

void DisplayList::ClearRefs(const SObject* obj)
{
    for (ObjectRef* ref = refs; ref; ref = ref->next) {
        if (ref->object == obj)
            ref->object = nullptr;
    }
}
