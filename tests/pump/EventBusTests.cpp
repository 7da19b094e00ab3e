#include <atomic>
#include <memory>
#include <thread>

#include <gtest/gtest.h>
#include <wx/app.h>

#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace
{

EventBus& bus = EventBus::Get();

// Counts the status updates the GUI thread delivers to it; leaves the bus in
// its destructor, as the views do.
struct Recorder : wxEvtHandler
{
    Recorder()
    {
        Bind(wxEventTypeTag<wxCommandEvent>(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS),
             [this](wxCommandEvent&) { ++count; });
    }
    ~Recorder() override { bus.Unsubscribe(this); }

    int count = 0;
};

// Tells the test when the publishing thread has posted to it. It leaves the
// bus in its own destructor, before its QueueEvent override goes away.
struct ShortLivedHandler : wxEvtHandler
{
    ShortLivedHandler() { bus.Subscribe(ChannelKey(2), this); }
    ~ShortLivedHandler() override { bus.Unsubscribe(this); }
    void QueueEvent(wxEvent* event) override
    {
        wxEvtHandler::QueueEvent(event);
        reached.Post();
    }

    wxSemaphore reached;
};

} // namespace

TEST(EventBusChannels, TheFiveChannelsExistFromFirstUseAndAreFoundByIdAlone)
{
    Recorder handler;
    const wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS);
    for (const int id : {-1, 0, 1, 2, 3})
    {
        SCOPED_TRACE(id);
        EXPECT_FALSE(bus.AddChannel(ChannelKey(id)));
        EXPECT_TRUE(bus.Subscribe(ChannelKey(id), &handler));
    }
    EXPECT_FALSE(bus.AddChannel(ChannelKey(2, "other")));
    EXPECT_TRUE(bus.Publish(ChannelKey(2, "any name"), update));
    // The tests run a console application; wxTheApp would take it for a GUI one.
    wxAppConsole::GetInstance()->ProcessPendingEvents();
    EXPECT_EQ(handler.count, 1) << "one channel's publication reaches no other";

    // Channels live as long as the process: a repeated run needs a new id.
    static int nextId = 41;
    const ChannelKey added(nextId++);
    EXPECT_FALSE(bus.Subscribe(added, &handler));
    EXPECT_FALSE(bus.Publish(added, update));
    EXPECT_TRUE(bus.AddChannel(added));
    EXPECT_TRUE(bus.Subscribe(added, &handler));
    EXPECT_FALSE(bus.Subscribe(ChannelKey(2), nullptr));
    EXPECT_EQ(bus.Unsubscribe(nullptr), 0);
    EXPECT_EQ(bus.Unsubscribe(&handler), 6);
}

// The bus holds its subscribers by weak reference: a handler that forgot to
// unsubscribe is skipped (under AddressSanitizer a post to it fails here), and
// its dead entry is dropped without being counted.
TEST(EventBusDelivery, EachLiveSubscriptionGetsAQueuedCopyUntilItsHandlerLeaves)
{
    Recorder once, twice, leaving;
    auto* forgetful = new wxEvtHandler;
    for (wxEvtHandler* handler :
         std::initializer_list<wxEvtHandler*>{&twice, &leaving, forgetful, &once, &twice, &leaving})
        ASSERT_TRUE(bus.Subscribe(ChannelKey(1), handler));
    ASSERT_TRUE(bus.Subscribe(ChannelKey(0), &leaving));
    delete forgetful;
    EXPECT_EQ(bus.Unsubscribe(&leaving), 3);
    // A temporary: the publisher's own event is gone before delivery.
    ASSERT_TRUE(bus.Publish(ChannelKey(1), wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS)));
    EXPECT_EQ(once.count, 0) << "delivery is queued, never synchronous";
    wxAppConsole::GetInstance()->ProcessPendingEvents();
    EXPECT_EQ(once.count, 1);
    EXPECT_EQ(twice.count, 2);
    EXPECT_EQ(leaving.count, 0);
}

TEST(EventBusUnsubscribe, HandlersDestroyedWhileTheThreadPublishesAreNeverReached)
{
    std::atomic<bool> publishing{true};
    std::thread publisher(
        [&]
        {
            const wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS);
            while (publishing)
                bus.Publish(ChannelKey(2), update);
        });
    for (int i = 0; i < 300; ++i)
    {
        auto handler = std::make_unique<ShortLivedHandler>();
        handler->reached.Wait();
        // Destroyed while the thread keeps publishing: a post that still
        // reached it would touch freed memory (AddressSanitizer reports it).
        handler.reset();
    }
    publishing = false;
    publisher.join();
}
