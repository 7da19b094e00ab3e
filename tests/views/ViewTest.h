#pragma once
// The set-up both tab tests share: the tab over its real model, in a frame
// shown on the display, with its rows window laid out.
#include "components/Utility/profilescustomlistctrl.h"

#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
#include <wx/listctrl.h>
#include <wx/statusbr.h>

#include <vector>

using Texts = std::vector<wxString>;

template <class View, class Model, class Root> class ViewTest : public ::testing::Test
{
protected:
    void Open(const wxSize& size)
    {
        frame = new wxFrame(nullptr, wxID_ANY, "view", wxPoint(0, 0), size);
        view = new View(frame, wxID_ANY, model);
        frame->Show();
        ASSERT_TRUE(guitest::PumpUntil([this] { return Rows()->GetMainWindow()->GetClientSize().y > 100; }));
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }
    virtual ProfilesKelvoProfilesListCtrl* Rows() const = 0;
    wxString Footer() const { return view->GetFooter()->GetStatusText(0); }
    Texts Column(int column) const
    {
        Texts texts;
        for (long row = 0; row < Rows()->GetItemCount(); ++row)
            texts.push_back(Rows()->GetItemText(row, column));
        return texts;
    }
    // A list event as the list sends it to the view: a column click, or a row (de)selected.
    void SendList(wxEventType type, int column, long row = -1)
    {
        wxListEvent event(type, Rows()->GetId());
        event.SetEventObject(Rows());
        event.m_col = column;
        event.m_itemIndex = row;
        Rows()->GetEventHandler()->ProcessEvent(event);
    }

    Root root;
    Model model{root.JournalPath()};
    wxFrame* frame = nullptr;
    View* view = nullptr;
};
