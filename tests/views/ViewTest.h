#pragma once
// The set-up both tab tests share: the tab over its real model, in a frame
// shown on the display, with its rows window laid out.
#include "GuiTest.h"

#include <gtest/gtest.h>
#include <wx/frame.h>
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
        ASSERT_TRUE(guitest::PumpUntil([this] { return RowsWindow()->GetClientSize().y > 100; }));
    }
    void TearDown() override
    {
        frame->Destroy();
        guitest::Pump(10);
    }
    virtual wxWindow* RowsWindow() const = 0;
    wxString Footer() const { return view->GetFooter()->GetStatusText(0); }

    Root root;
    Model model{root.JournalPath()};
    wxFrame* frame = nullptr;
    View* view = nullptr;
};
