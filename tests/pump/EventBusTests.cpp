#include <atomic>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <thread>

#include <gtest/gtest.h>
#include <wx/app.h>

#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace
{

EventBus& Bus()
{
    return EventBus::Get();
}

// Counts the update events the GUI thread delivers to it; leaves the bus in
// its destructor, as the views do.
struct Recorder : wxEvtHandler
{
    Recorder()
    {
        Bind(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, &Recorder::OnUpdate, this);
        Bind(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, &Recorder::OnUpdate, this);
    }
    ~Recorder() override { Bus().Unsubscribe(this); }
    void OnUpdate(wxEvent& event)
    {
        ++count;
        lastType = event.GetEventType();
    }

    int count = 0;
    wxEventType lastType = wxEVT_NULL;
};

// The tests run a console application; wxTheApp would take it for a GUI one.
void Deliver()
{
    wxAppConsole::GetInstance()->ProcessPendingEvents();
}

wxCommandEvent StatusUpdate()
{
    return wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, 0);
}

} // namespace

TEST(EventBusChannels, TheFiveChannelsExistFromFirstUseAndAreFoundByIdAlone)
{
    Recorder handler;
    for (const int id : {-1, 0, 1, 2, 3})
    {
        SCOPED_TRACE(id);
        EXPECT_FALSE(Bus().AddChannel(ChannelKey(id)));
        EXPECT_TRUE(Bus().Subscribe(ChannelKey(id), &handler));
    }
    EXPECT_FALSE(Bus().AddChannel(ChannelKey(2, "other")));
    EXPECT_TRUE(Bus().Publish(ChannelKey(2, "any name"), StatusUpdate()));
    Deliver();
    EXPECT_EQ(handler.count, 1) << "one channel's publication reaches no other";

    // Channels live as long as the process: a repeated run needs a new id.
    static int nextId = 41;
    const ChannelKey added(nextId++);
    EXPECT_FALSE(Bus().Subscribe(added, &handler));
    EXPECT_FALSE(Bus().Publish(added, StatusUpdate()));
    EXPECT_TRUE(Bus().AddChannel(added));
    EXPECT_TRUE(Bus().Subscribe(added, &handler));
    EXPECT_FALSE(Bus().Subscribe(ChannelKey(2), nullptr));
    EXPECT_EQ(Bus().Unsubscribe(nullptr), 0);
    EXPECT_EQ(Bus().Unsubscribe(&handler), 6);
}

TEST(EventBusDelivery, EachSubscriptionGetsAQueuedCopyUntilItsHandlerLeaves)
{
    Recorder once, twice, leaving;
    for (Recorder* handler : {&twice, &leaving, &once, &twice, &leaving})
        ASSERT_TRUE(Bus().Subscribe(ChannelKey(1), handler));
    ASSERT_TRUE(Bus().Subscribe(ChannelKey(0), &leaving));
    EXPECT_EQ(Bus().Unsubscribe(&leaving), 3);
    EXPECT_EQ(Bus().Unsubscribe(&leaving), 0);
    {
        wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, 0);
        ASSERT_TRUE(Bus().Publish(ChannelKey(1), update));
    } // the publisher's own event is gone before delivery
    EXPECT_EQ(once.count, 0) << "delivery is queued, never synchronous";
    Deliver();
    EXPECT_EQ(once.count, 1);
    EXPECT_EQ(twice.count, 2);
    EXPECT_EQ(leaving.count, 0);
    EXPECT_EQ(once.lastType, wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG);
}

TEST(EventBusUnsubscribe, AHandlerThatForgotToUnsubscribeIsNeverPostedTo)
{
    auto* forgetful = new wxEvtHandler;
    ASSERT_TRUE(Bus().Subscribe(ChannelKey(2), forgetful));
    delete forgetful;
    // The bus holds it by weak reference; under AddressSanitizer a post to it fails here.
    EXPECT_TRUE(Bus().Publish(ChannelKey(2), StatusUpdate()));
    wxEvtHandler other;
    EXPECT_EQ(Bus().Unsubscribe(&other), 0) << "the dead entry is dropped, and not counted";
}

namespace
{

std::mutex reachedLock;
std::condition_variable reachedChanged;

// Tells the test when the publishing thread has posted to it. It leaves the
// bus in its own destructor, before its QueueEvent override goes away.
struct ShortLivedHandler : wxEvtHandler
{
    ShortLivedHandler() { Bus().Subscribe(ChannelKey(2), this); }
    ~ShortLivedHandler() override { Bus().Unsubscribe(this); }
    void QueueEvent(wxEvent* event) override
    {
        wxEvtHandler::QueueEvent(event);
        std::lock_guard<std::mutex> guard(reachedLock);
        reached = true;
        reachedChanged.notify_all();
    }

    bool reached = false; // under reachedLock
};

} // namespace

TEST(EventBusUnsubscribe, HandlersDestroyedWhileTheThreadPublishesAreNeverReached)
{
    std::atomic<bool> publishing{true};
    std::thread publisher(
        [&]
        {
            const wxCommandEvent update = StatusUpdate();
            while (publishing)
                Bus().Publish(ChannelKey(2), update);
        });
    for (int i = 0; i < 300; ++i)
    {
        auto handler = std::make_unique<ShortLivedHandler>();
        {
            std::unique_lock<std::mutex> guard(reachedLock);
            reachedChanged.wait(guard, [&] { return handler->reached; });
        }
        // Destroyed while the thread keeps publishing: a post that still
        // reached it would touch freed memory (AddressSanitizer reports it).
        handler.reset();
    }
    publishing = false;
    publisher.join();
    Deliver();
}
