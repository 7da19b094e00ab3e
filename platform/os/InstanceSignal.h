#pragma once

#include <functional>
#include <thread>

#include <wx/string.h>

namespace wyxos
{

// A second copy's knock on the first: the copy that holds the instance lock
// listens on a Unix socket "<name>.sock" in the same runtime folder (see
// InstanceLock::FolderFor, a folder only this user can write to); a copy that
// found the lock taken connects to it and ends. Only a connection from a
// process of the same user counts.
class InstanceSignal
{
public:
    // Listens until destroyed; onKnock runs on the listening thread, once per
    // knock. Does nothing when the folder is unusable or a non-socket stands
    // at the path (it is left alone).
    InstanceSignal(const wxString& name, std::function<void()> onKnock);
    ~InstanceSignal();
    InstanceSignal(const InstanceSignal&) = delete;
    InstanceSignal& operator=(const InstanceSignal&) = delete;

    bool IsListening() const { return m_listenFd >= 0; }

    // Knocks on the copy listening under name. Never waits: true when the
    // connection was taken.
    static bool Knock(const wxString& name);

private:
    void Listen();

    std::function<void()> m_onKnock;
    wxString m_path;
    int m_listenFd = -1;
    int m_wakeFd = -1;
    std::thread m_thread;
};

} // namespace wyxos
