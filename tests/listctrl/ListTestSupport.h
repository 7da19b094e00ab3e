#pragma once

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"

#include <gtest/gtest.h>
#include <wx/app.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/image.h>

#include <string>
#include <utility>
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
    wxBitmap bitmap(rows->GetClientSize());
    {
        wxMemoryDC dc(bitmap);
        rows->Render(dc, wxRect(rows->GetClientSize()));
    }
    return bitmap.ConvertToImage();
}

inline wxImage RenderHeader(ProfilesKelvoProfilesListCtrl* list)
{
    wxBitmap bitmap(list->GetHeaderWindow()->GetClientSize());
    {
        wxMemoryDC dc(bitmap);
        list->GetHeaderWindow()->Render(dc);
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

    // A list of report style with columns of the given widths and `items` rows of `text`.
    ProfilesKelvoProfilesListCtrl* MakeRows(long style, const std::vector<int>& widths, long items,
                                            const wxString& text = wxString())
    {
        auto* list = MakeList(wxLC_REPORT | style);
        for (size_t col = 0; col < widths.size(); ++col)
            list->InsertColumn(static_cast<long>(col), wxString::Format("C%zu", col), wxLIST_FORMAT_LEFT,
                               widths[col]);
        if (style & wxLC_VIRTUAL)
            list->SetItemCount(items);
        for (long item = 0; item < items && !(style & wxLC_VIRTUAL); ++item)
            list->InsertItem(item, text.empty() ? wxString::Format("row %ld", item) : text);
        list->GetMainWindow()->LayoutIfNeeded();
        return list;
    }

    wxFrame* m_frame = nullptr;
};

// The list events in order, a word each: S, D, F, A, K, R and the item for
// selected, deselected, focused, activated, key down and right click; C, X, B,
// G, E and the column for column click, right click, drag begin, dragging, end.
class EventLog
{
public:
    explicit EventLog(wxWindow* list)
    {
        const wxEventType types[] = {
            wxEVT_LIST_ITEM_SELECTED,  wxEVT_LIST_ITEM_DESELECTED, wxEVT_LIST_ITEM_FOCUSED,
            wxEVT_LIST_ITEM_ACTIVATED, wxEVT_LIST_KEY_DOWN,        wxEVT_LIST_ITEM_RIGHT_CLICK,
            wxEVT_LIST_COL_CLICK,      wxEVT_LIST_COL_RIGHT_CLICK, wxEVT_LIST_COL_BEGIN_DRAG,
            wxEVT_LIST_COL_DRAGGING,   wxEVT_LIST_COL_END_DRAG};
        for (int kind = 0; kind < 11; ++kind)
            list->Bind(wxEventTypeTag<wxListEvent>(types[kind]),
                       [this, kind](wxListEvent& event)
                       {
                           text += (text.empty() ? "" : " ") + std::string(1, "SDFAKRCXBGE"[kind]) +
                                   std::to_string(kind >= 6 ? event.GetColumn() : event.GetIndex());
                           lastKeyCode = kind == 4 ? event.GetKeyCode() : lastKeyCode;
                           event.Skip();
                       });
    }

    std::string Take() { return std::exchange(text, std::string()); }

    std::string text;
    int lastKeyCode = 0;
};

} // namespace listtest
