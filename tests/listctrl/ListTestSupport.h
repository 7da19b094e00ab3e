#pragma once

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"

#include <gtest/gtest.h>
#include <wx/app.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/image.h>

#include <vector>

namespace listtest
{

inline const Theme& ListTheme()
{
    return Themer::GetThemeService()->GetTheme("ListControl");
}

inline wxColour PixelAt(const wxImage& image, int x, int y)
{
    return wxColour(image.GetRed(x, y), image.GetGreen(x, y), image.GetBlue(x, y));
}

inline int CountPixels(const wxImage& image, const wxRect& area, const wxColour& colour)
{
    int count = 0;
    for (int y = area.GetTop(); y <= area.GetBottom(); ++y)
        for (int x = area.GetLeft(); x <= area.GetRight(); ++x)
            count += PixelAt(image, x, y) == colour ? 1 : 0;
    return count;
}

// The rows window as it would paint now, rendered into a bitmap.
inline wxImage RenderRows(ProfilesKelvoProfilesListCtrl* list)
{
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    rows->LayoutIfNeeded();
    const wxSize size = rows->GetClientSize();
    wxBitmap bitmap(size);
    {
        wxMemoryDC dc(bitmap);
        rows->Render(dc, wxRect(size));
    }
    return bitmap.ConvertToImage();
}

inline wxImage RenderHeader(ProfilesKelvoProfilesListCtrl* list)
{
    ProfilesKelvoListHeaderWindow* header = list->GetHeaderWindow();
    const wxSize size = header->GetClientSize();
    wxBitmap bitmap(size);
    {
        wxMemoryDC dc(bitmap);
        header->Render(dc);
    }
    return bitmap.ConvertToImage();
}

// A shown frame holding one list of a known size; destroyed after each test.
class ListFixture : public ::testing::Test
{
protected:
    void TearDown() override
    {
        if (m_frame)
            m_frame->Destroy();
        wxTheApp->ProcessPendingEvents();
    }

    template <typename List = ProfilesKelvoProfilesListCtrl>
    List* MakeList(long style, const headerStyle* header = nullptr, const wxSize& size = wxSize(600, 400))
    {
        m_frame = new wxFrame(nullptr, wxID_ANY, wxS("list test"));
        m_frame->SetClientSize(size);
        auto* list = new List(header, m_frame, wxID_ANY, wxDefaultPosition, size, style);
        list->SetSize(0, 0, size.GetWidth(), size.GetHeight());
        m_frame->Show();
        return list;
    }

    wxFrame* m_frame = nullptr;
};

// Every list event the control sends, in order.
struct EventRecord
{
    wxEventType type;
    long index;
    int column;

    bool operator==(const EventRecord& other) const
    {
        return type == other.type && index == other.index && column == other.column;
    }
};

inline std::ostream& operator<<(std::ostream& out, const EventRecord& record)
{
    return out << "{type " << record.type << ", index " << record.index << ", column " << record.column
               << "}";
}

class EventLog
{
public:
    explicit EventLog(wxWindow* list)
    {
        for (wxEventType type :
             {wxEVT_LIST_ITEM_SELECTED, wxEVT_LIST_ITEM_DESELECTED, wxEVT_LIST_ITEM_ACTIVATED,
              wxEVT_LIST_ITEM_FOCUSED, wxEVT_LIST_COL_CLICK, wxEVT_LIST_COL_RIGHT_CLICK,
              wxEVT_LIST_COL_BEGIN_DRAG, wxEVT_LIST_COL_DRAGGING, wxEVT_LIST_COL_END_DRAG,
              wxEVT_LIST_KEY_DOWN, wxEVT_LIST_CACHE_HINT, wxEVT_LIST_ITEM_RIGHT_CLICK})
        {
            list->Bind(wxEventTypeTag<wxListEvent>(type),
                       [this](wxListEvent& event)
                       {
                           const bool column = event.GetEventType() == wxEVT_LIST_COL_CLICK ||
                                               event.GetEventType() == wxEVT_LIST_COL_RIGHT_CLICK ||
                                               event.GetEventType() == wxEVT_LIST_COL_BEGIN_DRAG ||
                                               event.GetEventType() == wxEVT_LIST_COL_DRAGGING ||
                                               event.GetEventType() == wxEVT_LIST_COL_END_DRAG;
                           records.push_back({event.GetEventType(), column ? -1 : event.GetIndex(),
                                              column ? event.GetColumn() : -1});
                           if (event.GetEventType() == wxEVT_LIST_KEY_DOWN)
                               lastKeyCode = event.GetKeyCode();
                           event.Skip();
                       });
        }
    }

    std::vector<EventRecord> Take()
    {
        std::vector<EventRecord> taken;
        taken.swap(records);
        return taken;
    }

    std::vector<EventRecord> records;
    int lastKeyCode = 0;
};

inline EventRecord Selected(long item)
{
    return {wxEVT_LIST_ITEM_SELECTED, item, -1};
}
inline EventRecord Deselected(long item)
{
    return {wxEVT_LIST_ITEM_DESELECTED, item, -1};
}
inline EventRecord Focused(long item)
{
    return {wxEVT_LIST_ITEM_FOCUSED, item, -1};
}
inline EventRecord Activated(long item)
{
    return {wxEVT_LIST_ITEM_ACTIVATED, item, -1};
}
inline EventRecord KeyDown(long item)
{
    return {wxEVT_LIST_KEY_DOWN, item, -1};
}

// Events delivered straight to a window's handler, as the toolkit would.
inline void SendMouse(wxWindow* window, wxEventType type, int x, int y, bool ctrl = false, bool shift = false,
                      bool leftIsDown = false)
{
    wxMouseEvent event(type);
    event.SetEventObject(window);
    event.SetPosition(wxPoint(x, y));
    event.SetControlDown(ctrl);
    event.SetShiftDown(shift);
    event.SetLeftDown(leftIsDown || type == wxEVT_LEFT_DOWN);
    window->GetEventHandler()->ProcessEvent(event);
}

inline void SendKey(wxWindow* window, int keyCode, bool ctrl = false, bool shift = false)
{
    wxKeyEvent event(wxEVT_KEY_DOWN);
    event.SetEventObject(window);
    event.m_keyCode = keyCode;
    event.SetControlDown(ctrl);
    event.SetShiftDown(shift);
    window->GetEventHandler()->ProcessEvent(event);
}

inline void SendFocus(wxWindow* window, bool gained)
{
    wxFocusEvent event(gained ? wxEVT_SET_FOCUS : wxEVT_KILL_FOCUS);
    event.SetEventObject(window);
    window->GetEventHandler()->ProcessEvent(event);
}

} // namespace listtest
