#pragma once

#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"

#include <gtest/gtest.h>
#include <wx/app.h>
#include <wx/dcmemory.h>
#include <wx/frame.h>
#include <wx/image.h>

#include <string>
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

// The rows window (or the header) as it would paint now, rendered into a bitmap.
inline wxImage RenderRows(ProfilesKelvoProfilesListCtrl* list, bool header = false)
{
    ProfilesKelvoListMainWindow* rows = list->GetMainWindow();
    rows->LayoutIfNeeded();
    wxWindow* window = header ? static_cast<wxWindow*>(list->GetHeaderWindow()) : rows;
    wxBitmap bitmap(window->GetClientSize());
    {
        wxMemoryDC dc(bitmap);
        if (header)
            list->GetHeaderWindow()->Render(dc);
        else
            rows->Render(dc, wxRect(rows->GetClientSize()));
    }
    return bitmap.ConvertToImage();
}

// A shown frame holding one list of 600 x 400; destroyed after each test.
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
    List* MakeList(long style, const headerStyle* header = nullptr)
    {
        m_frame = new wxFrame(nullptr, wxID_ANY, wxS("list test"));
        m_frame->SetClientSize(600, 400);
        auto* list = new List(header, m_frame, wxID_ANY, wxDefaultPosition, wxSize(600, 400), style);
        m_frame->Show();
        return list;
    }

    // A report list with columns of the given widths and `items` rows of `text` (or "row n").
    ProfilesKelvoProfilesListCtrl* MakeRows(long style, const std::vector<int>& widths, long items,
                                            const wxString& text = wxString())
    {
        auto* list = MakeList(wxLC_REPORT | style);
        for (size_t col = 0; col < widths.size(); ++col)
            list->InsertColumn(long(col), wxString::Format("C%zu", col), wxLIST_FORMAT_LEFT, widths[col]);
        if (style & wxLC_VIRTUAL)
            list->SetItemCount(items);
        for (long item = 0; item < items && !(style & wxLC_VIRTUAL); ++item)
            list->InsertItem(item, text.empty() ? wxString::Format("row %ld", item) : text);
        list->GetMainWindow()->LayoutIfNeeded();
        return list;
    }

    wxFrame* m_frame = nullptr;
};

} // namespace listtest
