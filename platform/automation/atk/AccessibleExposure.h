#pragma once

#include <memory>

class wxWindow;

namespace automation
{

class AutomationSource;

// Makes one control the program draws itself readable by accessibility tools
// (screen readers, UI test tools) as its source describes it: a list as a
// table of cells with column headers, a box as a combo box with its list of
// entries. GTK hands the objects to the accessibility bus by itself when a
// session bus is there. The control owns this and destroys it before its
// window: from then on every object a tool still holds answers as gone.
// Queries only read the source; nothing is built until a tool asks.
class AccessibleExposure
{
public:
    AccessibleExposure(wxWindow& window, const AutomationSource& source);
    ~AccessibleExposure();
    AccessibleExposure(const AccessibleExposure&) = delete;
    AccessibleExposure& operator=(const AccessibleExposure&) = delete;

    // News for the tools that listen; nothing is sent before one has asked.
    void RowsChanged();
    void SelectionChanged();
    void CurrentChanged();
    void FocusChanged(bool focused);
    void DroppedChanged();
    void NameChanged();

    // What a tool is given for the window (an AtkObject), for tests.
    static void* AccessibleOf(wxWindow& window);

private:
    struct Impl;
    std::unique_ptr<Impl> m_impl;
};

} // namespace automation
