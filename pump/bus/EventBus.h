#pragma once

#include <map>
#include <memory>
#include <vector>

#include <wx/event.h>
#include <wx/string.h>
#include <wx/thread.h>
#include <wx/weakref.h>

// Identifies a channel of the bus. Keys are ordered, and so looked up, by id
// alone; every key in the program has an empty name.
struct ChannelKey
{
    ChannelKey(int channelId = 0, const wxString& channelName = wxString()) : name(channelName), id(channelId)
    {
    }

    bool operator<(const ChannelKey& other) const { return id < other.id; }

    wxString name;
    int id;
};

// Process-wide bus that carries the models' update events from the polling
// thread to the views. Publish posts a copy of the event into each subscriber's
// pending-event queue; the GUI thread's event loop delivers it later.
//
// Channels: -1, 1 (log update), 2 (status update), 0 and 3 (carry nothing).
class EventBus
{
public:
    static EventBus& Get();

    bool AddChannel(const ChannelKey& key);
    bool Subscribe(const ChannelKey& key, wxEvtHandler* handler);
    bool Publish(const ChannelKey& key, const wxEvent& event);

    // Removes every subscription of the handler on every channel; returns how
    // many were removed. A handler calls it from its destructor: once it has
    // returned, no Publish can reach the handler any more.
    int Unsubscribe(wxEvtHandler* handler);

    ~EventBus();

private:
    EventBus();
    EventBus(const EventBus&) = delete;
    EventBus& operator=(const EventBus&) = delete;

    // Weak: a handler destroyed without unsubscribing is skipped, not posted to.
    std::map<ChannelKey, std::unique_ptr<std::vector<wxWeakRef<wxEvtHandler>>>> m_channels;
    wxCriticalSection m_lock;
};
