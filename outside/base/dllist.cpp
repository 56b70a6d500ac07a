/* An ordered list of pointers.  Not locked: one thread at a time. */
#include "outside/base/blbase.h"

#include <algorithm>
#include <new>
#include <vector>

struct DLList {
    std::vector<void *> items;
};

namespace {

// Growth can fail; a list keeps its items then.
template <typename Change> int Guarded(Change change)
{
    try {
        change();
        return 1;
    } catch (const std::bad_alloc &) {
        return 0;
    }
}

} // namespace

DLList *DLList_Create(void)
{
    return new (std::nothrow) DLList;
}

int DLList_Destroy(DLList *list)
{
    if (!list) return 0;
    delete list;
    return 1;
}

int DLList_Append(DLList *list, void *item)
{
    if (!list || !item) return 0;
    return Guarded([&] { list->items.push_back(item); });
}

int DLList_Insert(DLList *list, size_t index, void *item)
{
    if (!list || !item || index > list->items.size()) return 0;
    return Guarded([&] { list->items.insert(list->items.begin() + static_cast<long>(index), item); });
}

int DLList_Remove(DLList *list, void *item)
{
    if (!list || !item) return 0;
    const auto found = std::find(list->items.begin(), list->items.end(), item);
    if (found == list->items.end()) return 0;
    list->items.erase(found);
    return 1;
}

size_t DLList_Count(const DLList *list)
{
    return list ? list->items.size() : 0;
}

void *DLList_Get(const DLList *list, size_t index)
{
    if (!list || index >= list->items.size()) return nullptr;
    return list->items[index];
}

int DLList_StartIterator(const DLList *list, DLListIterator *it)
{
    if (!list || !it) return 0;
    it->list = list;
    it->index = 0;
    return 1;
}

void *DLList_Next(DLListIterator *it)
{
    if (!it) return nullptr;
    void *item = DLList_Get(it->list, it->index);
    if (item) ++it->index;
    return item;
}
