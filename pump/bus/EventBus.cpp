#include "pump/bus/EventBus.h"

#include <algorithm>

EventBus& EventBus::Get()
{
    // A function-local static: created once even when two threads arrive at once.
    static EventBus bus;
    return bus;
}

EventBus::EventBus()
{
    for (const int id : {-1, 1, 2, 0, 3})
        AddChannel(ChannelKey(id));
}

EventBus::~EventBus() = default;

bool EventBus::AddChannel(const ChannelKey& key)
{
    wxCriticalSectionLocker guard(m_lock);
    if (m_channels.count(key) != 0)
        return false;
    m_channels.emplace(key, std::make_unique<std::vector<wxWeakRef<wxEvtHandler>>>());
    return true;
}

bool EventBus::Subscribe(const ChannelKey& key, wxEvtHandler* handler)
{
    if (handler == nullptr)
        return false;
    wxCriticalSectionLocker guard(m_lock);
    const auto channel = m_channels.find(key);
    if (channel == m_channels.end())
        return false;
    channel->second->emplace_back(handler);
    return true;
}

bool EventBus::Publish(const ChannelKey& key, const wxEvent& event)
{
    // Posting under the lock is what lets Unsubscribe promise that no post is
    // still on its way to a handler once it has returned.
    wxCriticalSectionLocker guard(m_lock);
    const auto channel = m_channels.find(key);
    if (channel == m_channels.end())
        return false;
    for (wxEvtHandler* handler : *channel->second)
    {
        if (handler != nullptr)
            wxPostEvent(handler, event);
    }
    return true;
}

int EventBus::Unsubscribe(wxEvtHandler* handler)
{
    if (handler == nullptr)
        return 0;
    wxCriticalSectionLocker guard(m_lock);
    int removed = 0;
    for (auto& channel : m_channels)
    {
        std::vector<wxWeakRef<wxEvtHandler>>& handlers = *channel.second;
        removed += static_cast<int>(std::count_if(handlers.begin(), handlers.end(),
                                                  [handler](wxEvtHandler* subscribed) { return subscribed == handler; }));
        // Handlers that went without unsubscribing go now as well.
        handlers.erase(std::remove_if(handlers.begin(), handlers.end(), [handler](wxEvtHandler* subscribed)
                                      { return subscribed == handler || subscribed == nullptr; }),
                       handlers.end());
    }
    return removed;
}
