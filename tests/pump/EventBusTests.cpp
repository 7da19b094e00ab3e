#include <atomic>
#include <condition_variable>
#include <mutex>
#include <thread>
#include <vector>

#include <gtest/gtest.h>
#include <wx/app.h>

#include "pump/bus/CustomEvents.h"
#include "pump/bus/EventBus.h"

namespace
{

// Records the events the GUI thread delivers to it, in one trace shared by
// several handlers so that the delivery order across them shows.
class RecordingHandler : public wxEvtHandler
{
public:
    RecordingHandler(int id, std::vector<int>& trace) : m_id(id), m_trace(trace)
    {
        Bind(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, &RecordingHandler::OnUpdate, this);
        Bind(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, &RecordingHandler::OnUpdate, this);
    }
    ~RecordingHandler() override { EventBus::Get().Unsubscribe(this); }

    int lastEventId = -1;
    wxEventType lastType = wxEVT_NULL;

private:
    void OnUpdate(wxEvent& event)
    {
        lastEventId = event.GetId();
        lastType = event.GetEventType();
        m_trace.push_back(m_id);
    }

    int m_id;
    std::vector<int>& m_trace;
};

// The tests run a console application; wxTheApp would take it for a GUI one.
void DeliverPendingEvents()
{
    wxAppConsole::GetInstance()->ProcessPendingEvents();
}

wxCommandEvent StatusUpdate()
{
    return wxCommandEvent(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS, 0);
}

} // namespace

TEST(EventBusChannels, TheFiveChannelsExistFromFirstUse)
{
    std::vector<int> trace;
    RecordingHandler handler(1, trace);
    for (const int id : {-1, 0, 1, 2, 3})
    {
        SCOPED_TRACE(id);
        EXPECT_FALSE(EventBus::Get().AddChannel(ChannelKey(id)));
        EXPECT_TRUE(EventBus::Get().Subscribe(ChannelKey(id), &handler));
    }
    EXPECT_EQ(EventBus::Get().Unsubscribe(&handler), 5);
}

TEST(EventBusChannels, KeysAreFoundByIdAlone)
{
    std::vector<int> trace;
    RecordingHandler handler(1, trace);
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2, "any name"), &handler));
    EXPECT_FALSE(EventBus::Get().AddChannel(ChannelKey(2, "other")));
    EXPECT_TRUE(EventBus::Get().Publish(ChannelKey(2), StatusUpdate()));
    DeliverPendingEvents();
    EXPECT_EQ(trace, std::vector<int>{1});
}

TEST(EventBusChannels, AnAddedChannelCarriesEvents)
{
    std::vector<int> trace;
    RecordingHandler handler(1, trace);
    // Channels live as long as the process: a repeated run needs a new id.
    static int nextId = 41;
    const ChannelKey key(nextId++);
    ASSERT_TRUE(EventBus::Get().AddChannel(key));
    EXPECT_FALSE(EventBus::Get().AddChannel(key));
    ASSERT_TRUE(EventBus::Get().Subscribe(key, &handler));
    EXPECT_TRUE(EventBus::Get().Publish(key, StatusUpdate()));
    DeliverPendingEvents();
    EXPECT_EQ(trace.size(), 1u);
}

TEST(EventBusRefusals, UnknownChannelsAndNullHandlersChangeNothing)
{
    std::vector<int> trace;
    RecordingHandler handler(1, trace);
    EXPECT_FALSE(EventBus::Get().Subscribe(ChannelKey(7), &handler));
    EXPECT_FALSE(EventBus::Get().Subscribe(ChannelKey(2), nullptr));
    EXPECT_FALSE(EventBus::Get().Publish(ChannelKey(7), StatusUpdate()));
    EXPECT_EQ(EventBus::Get().Unsubscribe(nullptr), 0);
    DeliverPendingEvents();
    EXPECT_TRUE(trace.empty());
    EXPECT_EQ(EventBus::Get().Unsubscribe(&handler), 0);
}

TEST(EventBusDelivery, APublicationWithoutSubscribersSucceeds)
{
    EXPECT_TRUE(EventBus::Get().Publish(ChannelKey(0), StatusUpdate()));
    EXPECT_TRUE(EventBus::Get().Publish(ChannelKey(3), StatusUpdate()));
}

TEST(EventBusDelivery, EachSubscriberGetsACopyInSubscriptionOrder)
{
    std::vector<int> trace;
    RecordingHandler second(2, trace), first(1, trace);
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &first));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(1), &second));
    {
        wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG, 0);
        ASSERT_TRUE(EventBus::Get().Publish(ChannelKey(1), update));
    } // the publisher's own event is gone before delivery
    EXPECT_TRUE(trace.empty()) << "delivery is queued, never synchronous";
    DeliverPendingEvents();
    EXPECT_EQ(trace, (std::vector<int>{1, 2}));
    EXPECT_EQ(first.lastType, wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBLOG);
    EXPECT_EQ(first.lastEventId, 0);
}

TEST(EventBusDelivery, ADoubleSubscriptionDeliversTwice)
{
    std::vector<int> trace;
    RecordingHandler handler(1, trace);
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), &handler));
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), &handler));
    ASSERT_TRUE(EventBus::Get().Publish(ChannelKey(2), StatusUpdate()));
    DeliverPendingEvents();
    EXPECT_EQ(trace, (std::vector<int>{1, 1}));
}

TEST(EventBusDelivery, ChannelsDoNotLeakIntoEachOther)
{
    std::vector<int> trace;
    RecordingHandler status(2, trace), log(1, trace);
    EventBus::Get().Subscribe(ChannelKey(2), &status);
    EventBus::Get().Subscribe(ChannelKey(0), &status);
    EventBus::Get().Subscribe(ChannelKey(1), &log);
    EventBus::Get().Subscribe(ChannelKey(3), &log);
    ASSERT_TRUE(EventBus::Get().Publish(ChannelKey(2), StatusUpdate()));
    DeliverPendingEvents();
    EXPECT_EQ(trace, std::vector<int>{2});
}

TEST(EventBusUnsubscribe, RemovesEverySubscriptionOfTheHandlerOnly)
{
    std::vector<int> trace;
    RecordingHandler leaving(1, trace), staying(2, trace);
    EventBus::Get().Subscribe(ChannelKey(2), &leaving);
    EventBus::Get().Subscribe(ChannelKey(2), &staying);
    EventBus::Get().Subscribe(ChannelKey(2), &leaving);
    EventBus::Get().Subscribe(ChannelKey(0), &leaving);

    EXPECT_EQ(EventBus::Get().Unsubscribe(&leaving), 3);
    EXPECT_EQ(EventBus::Get().Unsubscribe(&leaving), 0);
    ASSERT_TRUE(EventBus::Get().Publish(ChannelKey(2), StatusUpdate()));
    DeliverPendingEvents();
    EXPECT_EQ(trace, std::vector<int>{2});
}

namespace
{

// Subscribes in its constructor and leaves in its destructor, as the views do;
// tells the test when the publishing thread has reached it.
class ShortLivedHandler : public wxEvtHandler
{
public:
    ShortLivedHandler(std::mutex& lock, std::condition_variable& reached, bool& wasReached)
        : m_lock(lock), m_reached(reached), m_wasReached(wasReached)
    {
        EventBus::Get().Subscribe(ChannelKey(2), this);
    }
    ~ShortLivedHandler() override { EventBus::Get().Unsubscribe(this); }

    void QueueEvent(wxEvent* event) override
    {
        wxEvtHandler::QueueEvent(event);
        {
            std::lock_guard<std::mutex> guard(m_lock);
            m_wasReached = true;
        }
        m_reached.notify_all();
    }

private:
    std::mutex& m_lock;
    std::condition_variable& m_reached;
    bool& m_wasReached;
};

} // namespace

TEST(EventBusUnsubscribe, AHandlerThatForgotToUnsubscribeIsNeverPostedTo)
{
    auto* forgetful = new wxEvtHandler;
    ASSERT_TRUE(EventBus::Get().Subscribe(ChannelKey(2), forgetful));
    delete forgetful;
    // Under AddressSanitizer a post to the deleted handler fails here.
    wxCommandEvent update(wxEVT_MY_CUSTOM_COMMAND_UPDATEJOBSTATUS);
    EXPECT_TRUE(EventBus::Get().Publish(ChannelKey(2), update));
    wxEvtHandler other;
    EXPECT_EQ(EventBus::Get().Unsubscribe(&other), 0) << "the dead entry is dropped, and not counted";
}

TEST(EventBusUnsubscribe, HandlersDestroyedWhileTheThreadPublishesAreNeverReached)
{
    std::atomic<bool> publishing{true};
    std::thread publisher(
        [&]
        {
            const wxCommandEvent update = StatusUpdate();
            while (publishing)
                EventBus::Get().Publish(ChannelKey(2), update);
        });

    std::mutex lock;
    std::condition_variable reached;
    constexpr int kHandlers = 300;
    for (int i = 0; i < kHandlers; ++i)
    {
        bool wasReached = false;
        auto handler = std::make_unique<ShortLivedHandler>(lock, reached, wasReached);
        {
            std::unique_lock<std::mutex> guard(lock);
            reached.wait(guard, [&] { return wasReached; });
        }
        // Destroyed while the thread keeps publishing: a post that still
        // reached it would touch freed memory (AddressSanitizer reports it).
        handler.reset();
    }
    publishing = false;
    publisher.join();
    DeliverPendingEvents();
}
