/*
 * Notifications.  Events are delivered synchronously in the sender's thread
 * to a snapshot of the handlers, so handlers may add or remove handlers (or
 * destroy the dispatcher) while an event is being delivered; a handler
 * removed meanwhile is skipped.
 */
#include "outside/base/blbase.h"
#include "outside/base/base_internal.h"

#include <algorithm>
#include <atomic>
#include <memory>
#include <mutex>
#include <unordered_set>
#include <vector>

namespace {

struct Handler {
    BLNOTIFY_Handler function;
    void *user;
    std::atomic<bool> removed{false};

    Handler(BLNOTIFY_Handler f, void *u) : function(f), user(u) {}
};

using HandlerList = std::vector<std::shared_ptr<Handler>>;

} // namespace

struct BLNotifyDispatcher {
    void *owner = nullptr;
    HandlerList handlers;
};

namespace {

struct NotifyState {
    std::mutex lock;
    std::unordered_set<BLNotifyDispatcher *> live; // for checking handles
    BLNotifyDispatcher global;
    HandlerList defaults;
};

NotifyState &State()
{
    static auto *state = new NotifyState;
    return *state;
}

// The dispatcher behind a handle (null is the global one); null when unknown.
BLNotifyDispatcher *Resolve(NotifyState &state, BLNOTIFY dispatcher)
{
    if (!dispatcher) return &state.global;
    return state.live.count(dispatcher) ? dispatcher : nullptr;
}

int AddTo(HandlerList &list, BLNOTIFY_Handler function, void *user)
{
    const auto same = [&](const auto &h) { return h->function == function && h->user == user; };
    if (std::none_of(list.begin(), list.end(), same))
        list.push_back(std::make_shared<Handler>(function, user));
    return 1;
}

int RemoveFrom(HandlerList &list, BLNOTIFY_Handler function, void *user)
{
    const auto found = std::find_if(list.begin(), list.end(), [&](const auto &h) {
        return h->function == function && h->user == user;
    });
    if (found == list.end()) return 0;
    (*found)->removed = true;
    list.erase(found);
    return 1;
}

// Applies change to the default handlers or to a dispatcher's handlers.
int ChangeHandlers(BLNOTIFY dispatcher, bool defaults, BLNOTIFY_Handler handler, void *user,
                   int (*change)(HandlerList &, BLNOTIFY_Handler, void *))
{
    if (!handler) return 0;
    NotifyState &state = State();
    std::lock_guard guard(state.lock);
    if (defaults) return change(state.defaults, handler, user);
    BLNotifyDispatcher *target = Resolve(state, dispatcher);
    return target ? change(target->handlers, handler, user) : 0;
}

void RemoveAll(HandlerList &list)
{
    for (auto &h : list) h->removed = true;
    list.clear();
}

} // namespace

namespace blbase {

void ResetNotifications()
{
    NotifyState &state = State();
    std::lock_guard guard(state.lock);
    RemoveAll(state.global.handlers);
    RemoveAll(state.defaults);
}

} // namespace blbase

BLNOTIFY BLNOTIFY_CreateDispatcher(void *owner)
{
    auto dispatcher = std::make_unique<BLNotifyDispatcher>();
    dispatcher->owner = owner;
    NotifyState &state = State();
    std::lock_guard guard(state.lock);
    state.live.insert(dispatcher.get());
    return dispatcher.release();
}

int BLNOTIFY_DestroyDispatcher(BLNOTIFY dispatcher)
{
    if (!dispatcher) return 0;
    NotifyState &state = State();
    std::lock_guard guard(state.lock);
    if (!state.live.erase(dispatcher)) return 0;
    RemoveAll(dispatcher->handlers);
    delete dispatcher;
    return 1;
}

int BLNOTIFY_AddHandler(BLNOTIFY dispatcher, BLNOTIFY_Handler handler, void *user)
{
    return ChangeHandlers(dispatcher, false, handler, user, AddTo);
}

int BLNOTIFY_DelHandler(BLNOTIFY dispatcher, BLNOTIFY_Handler handler, void *user)
{
    return ChangeHandlers(dispatcher, false, handler, user, RemoveFrom);
}

int BLNOTIFY_AddDefaultHandler(BLNOTIFY_Handler handler, void *user)
{
    return ChangeHandlers(nullptr, true, handler, user, AddTo);
}

int BLNOTIFY_DelDefaultHandler(BLNOTIFY_Handler handler, void *user)
{
    return ChangeHandlers(nullptr, true, handler, user, RemoveFrom);
}

int BLNOTIFY_SendEvent(BLNOTIFY dispatcher, void *sender, int flags, uint32_t event, void *data1,
                       void *data2)
{
    NotifyState &state = State();
    BLNotifyEvent record{event, data1, data2, dispatcher, nullptr};
    HandlerList snapshot;
    {
        std::lock_guard guard(state.lock);
        BLNotifyDispatcher *target = Resolve(state, dispatcher);
        if (!target) return 0;
        record.owner = target->owner;
        snapshot = target->handlers;
        snapshot.insert(snapshot.end(), state.defaults.begin(), state.defaults.end());
    }
    // Every handler sees the event; the first refusal is what the sender gets.
    int result = 1;
    for (const auto &handler : snapshot) {
        if (handler->removed) continue;
        const int answer = handler->function(&record, handler->user);
        if (result == 1 && answer != 1) result = answer;
    }
    return result;
}
