#include "base_test_support.h"

#include <string>
#include <utility>
#include <vector>

namespace {

// A handler that records what it saw and answers as told.
struct Listener {
    explicit Listener(std::string n, int a = 1, std::vector<std::string> *j = nullptr)
        : name(std::move(n)), answer(a), journal(j)
    {
    }
    std::string name;
    int answer;
    std::vector<std::string> *journal;
    std::vector<BLNotifyEvent> seen;

    static int Handle(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<Listener *>(user);
        self->seen.push_back(*event);
        if (self->journal) self->journal->push_back(self->name);
        return self->answer;
    }
};

} // namespace

using Notify = BaseTest;

TEST_F(Notify, HandlersSeeTheEventInOrderThenTheDefaults)
{
    std::vector<std::string> journal;
    int owner = 0, payload1 = 1, payload2 = 2;
    Listener first{"first", 1, &journal}, second{"second", 1, &journal}, fallback{"default", 1, &journal};
    BLNOTIFY d = BLNOTIFY_CreateDispatcher(&owner);
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(BLNOTIFY_AddHandler(d, Listener::Handle, &first), 1);
    EXPECT_EQ(BLNOTIFY_AddHandler(d, Listener::Handle, &second), 1);
    EXPECT_EQ(BLNOTIFY_AddDefaultHandler(Listener::Handle, &fallback), 1);

    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x20024, &payload1, &payload2), 1);
    EXPECT_EQ(journal, (std::vector<std::string>{"first", "second", "default"}));
    ASSERT_EQ(first.seen.size(), 1u);
    EXPECT_EQ(first.seen[0].event, 0x20024u);
    EXPECT_EQ(first.seen[0].data1, &payload1);
    EXPECT_EQ(first.seen[0].data2, &payload2);
    EXPECT_EQ(first.seen[0].dispatcher, d);
    EXPECT_EQ(first.seen[0].owner, &owner);

    // The global dispatcher reaches its own handlers and the default ones only.
    Listener global{"global", 1, &journal};
    BLNOTIFY_AddHandler(nullptr, Listener::Handle, &global);
    journal.clear();
    EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, 0x20003, nullptr, nullptr), 1);
    EXPECT_EQ(journal, (std::vector<std::string>{"global", "default"}));
    EXPECT_EQ(fallback.seen.back().owner, nullptr);
    EXPECT_EQ(BLNOTIFY_DestroyDispatcher(d), 1);
}

TEST_F(Notify, FirstRefusalIsTheAnswerAndEveryHandlerStillRuns)
{
    BLNOTIFY d = BLNOTIFY_CreateDispatcher(nullptr);
    Listener agree{"agree", 1}, veto{"veto", 0}, odd{"odd", 7};
    BLNOTIFY_AddHandler(d, Listener::Handle, &agree);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x2000B, nullptr, nullptr), 1);
    BLNOTIFY_AddHandler(d, Listener::Handle, &veto);
    BLNOTIFY_AddDefaultHandler(Listener::Handle, &odd);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x2000B, nullptr, nullptr), 0);
    EXPECT_EQ(odd.seen.size(), 1u) << "handlers after a refusal still see the event";
    BLNOTIFY_DelHandler(d, Listener::Handle, &veto);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x20009, nullptr, nullptr), 7);
    // With no handler at all, nobody refused.
    BLNOTIFY_DelHandler(d, Listener::Handle, &agree);
    BLNOTIFY_DelDefaultHandler(Listener::Handle, &odd);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x20009, nullptr, nullptr), 1);
    BLNOTIFY_DestroyDispatcher(d);
}

TEST_F(Notify, RegistrationRulesAndBadHandles)
{
    BLNOTIFY d = BLNOTIFY_CreateDispatcher(nullptr);
    Listener a{"a"};
    EXPECT_EQ(BLNOTIFY_AddHandler(d, Listener::Handle, &a), 1);
    EXPECT_EQ(BLNOTIFY_AddHandler(d, Listener::Handle, &a), 1) << "a pair is kept once";
    BLNOTIFY_SendEvent(d, nullptr, 0, 1, nullptr, nullptr);
    EXPECT_EQ(a.seen.size(), 1u);
    EXPECT_EQ(BLNOTIFY_DelHandler(d, Listener::Handle, &a), 1);
    EXPECT_EQ(BLNOTIFY_DelHandler(d, Listener::Handle, &a), 0);
    EXPECT_EQ(BLNOTIFY_AddHandler(d, nullptr, &a), 0);
    EXPECT_EQ(BLNOTIFY_AddDefaultHandler(nullptr, nullptr), 0);
    EXPECT_EQ(BLNOTIFY_DelDefaultHandler(Listener::Handle, &a), 0);
    EXPECT_EQ(BLNOTIFY_DestroyDispatcher(d), 1);
    EXPECT_EQ(BLNOTIFY_DestroyDispatcher(d), 0) << "a destroyed dispatcher is refused";
    EXPECT_EQ(BLNOTIFY_AddHandler(d, Listener::Handle, &a), 0);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 1, nullptr, nullptr), 0);
    EXPECT_EQ(BLNOTIFY_DestroyDispatcher(nullptr), 0);
}

namespace {

// Handlers that change the registrations while an event is delivered.
struct Reentrant {
    BLNOTIFY dispatcher = nullptr;
    Listener added{"added"};
    Listener removed{"removed"};
    int calls = 0;

    static int RemoveItself(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<Reentrant *>(user);
        ++self->calls;
        BLNOTIFY_DelHandler(event->dispatcher, RemoveItself, user);
        return 1;
    }
    static int AddAndRemoveOthers(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<Reentrant *>(user);
        ++self->calls;
        BLNOTIFY_AddHandler(event->dispatcher, Listener::Handle, &self->added);
        BLNOTIFY_DelHandler(event->dispatcher, Listener::Handle, &self->removed);
        return 1;
    }
    static int DestroyDispatcher(const BLNotifyEvent *event, void *user)
    {
        auto *self = static_cast<Reentrant *>(user);
        ++self->calls;
        BLNOTIFY_DestroyDispatcher(event->dispatcher);
        return 0;
    }
};

} // namespace

TEST_F(Notify, HandlersMayChangeRegistrationsDuringDelivery)
{
    Reentrant r;
    r.dispatcher = BLNOTIFY_CreateDispatcher(nullptr);
    BLNOTIFY_AddHandler(r.dispatcher, Reentrant::RemoveItself, &r);
    BLNOTIFY_AddHandler(r.dispatcher, Reentrant::AddAndRemoveOthers, &r);
    BLNOTIFY_AddHandler(r.dispatcher, Listener::Handle, &r.removed);

    EXPECT_EQ(BLNOTIFY_SendEvent(r.dispatcher, nullptr, 0, 1, nullptr, nullptr), 1);
    EXPECT_EQ(r.calls, 2);
    EXPECT_TRUE(r.removed.seen.empty()) << "removed before its turn: skipped";
    EXPECT_TRUE(r.added.seen.empty()) << "added during delivery: from the next event on";

    EXPECT_EQ(BLNOTIFY_SendEvent(r.dispatcher, nullptr, 0, 2, nullptr, nullptr), 1);
    EXPECT_EQ(r.calls, 3) << "the self-removing handler ran once";
    EXPECT_EQ(r.added.seen.size(), 1u);
    BLNOTIFY_DestroyDispatcher(r.dispatcher);
}

TEST_F(Notify, AHandlerMayDestroyItsDispatcher)
{
    Reentrant r;
    Listener after{"after"}, fallback{"default"};
    BLNOTIFY d = BLNOTIFY_CreateDispatcher(nullptr);
    BLNOTIFY_AddHandler(d, Reentrant::DestroyDispatcher, &r);
    BLNOTIFY_AddHandler(d, Listener::Handle, &after);
    BLNOTIFY_AddDefaultHandler(Listener::Handle, &fallback);
    EXPECT_EQ(BLNOTIFY_SendEvent(d, nullptr, 0, 0x20009, nullptr, nullptr), 0);
    EXPECT_TRUE(after.seen.empty()) << "the dispatcher's handlers went with it";
    EXPECT_EQ(fallback.seen.size(), 1u);
    EXPECT_EQ(BLNOTIFY_DestroyDispatcher(d), 0);
}

TEST_F(Notify, FinalizeForgetsGlobalAndDefaultHandlers)
{
    Listener global{"global"}, fallback{"default"};
    BLNOTIFY_AddHandler(nullptr, Listener::Handle, &global);
    BLNOTIFY_AddDefaultHandler(Listener::Handle, &fallback);
    BLCORE_Finalize();
    BLNOTIFY_SendEvent(nullptr, nullptr, 0, 1, nullptr, nullptr);
    EXPECT_TRUE(global.seen.empty());
    EXPECT_TRUE(fallback.seen.empty());
}
