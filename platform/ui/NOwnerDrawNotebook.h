#pragma once

#include <wx/containr.h>
#include <wx/notebook.h>

#include <vector>

class CNNotebookTabStrip;

// How one tab looks in one of its three states.
struct CNTabStateInfo
{
    wxColour fillColour;
    wxColour textColour;
};

// Everything the notebook draws with. The two base colours are the owner's
// choice; DefaultCustomInfo() derives the rest from them.
struct CNNotebookCustomInfo
{
    enum State
    {
        Normal,
        Hover,
        Selected,
        StateCount
    };

    // [0] the tab strip and idle tabs, [1] the selected tab, which joins the page.
    wxColour baseColours[2];
    CNTabStateInfo states[StateCount];
    wxColour borderColour;
    // Marks the selected tab and, while the strip has the focus, its label.
    wxColour accentColour;
};

// A notebook whose tab strip is drawn by the program rather than the toolkit,
// so that it takes the product's colours. Tabs run along the top. Keyboard:
// Ctrl+Tab / Ctrl+Page Down go to the next page, Ctrl+Shift+Tab / Ctrl+Page Up
// to the previous one, from anywhere inside the notebook; Left/Right/Home/End
// while the strip has the focus. Clicking a tab selects it. Page changes send
// wxEVT_NOTEBOOK_PAGE_CHANGING (which may veto) and wxEVT_NOTEBOOK_PAGE_CHANGED.
//
// Unless the owner sets its own, the image list holds the product's tab images
// (0 hot folder, 1 status, 2 log).
class CNOwnerDrawNotebook : public wxNavigationEnabled<wxNotebookBase>
{
public:
    // equalWidthTabs: every tab as wide as the widest; tabWidth / tabHeight: a
    // fixed size of every tab in pixels, or -1 to measure the labels.
    explicit CNOwnerDrawNotebook(bool equalWidthTabs = false, int tabWidth = -1, int tabHeight = -1);

    bool Create(wxWindow* parent, wxWindowID id, const wxPoint& pos = wxDefaultPosition,
                const wxSize& size = wxDefaultSize, long style = wxNB_TOP,
                const wxString& name = wxNotebookNameStr);

    using wxNotebookBase::AddPage;
    // focusWindow: given the focus when the page is brought forward from the
    // keyboard (null: the page itself); tabWidth: this tab's width in pixels or
    // -1 to measure; emphasised: the label is drawn bold.
    bool AddPage(wxWindow* page, const wxString& text, bool select, int imageId, wxWindow* focusWindow,
                 int tabWidth, bool emphasised);
    bool InsertPage(size_t n, wxWindow* page, const wxString& text, bool select = false,
                    int imageId = NO_IMAGE) override;

    int SetSelection(size_t n) override;
    int ChangeSelection(size_t n) override;
    bool SetPageText(size_t n, const wxString& text) override;
    wxString GetPageText(size_t n) const override;
    int GetPageImage(size_t n) const override;
    bool SetPageImage(size_t n, int imageId) override;
    bool DeleteAllPages() override;
    void SetPadding(const wxSize& padding) override;
    void SetTabSize(const wxSize& size) override;
    int HitTest(const wxPoint& pt, long* flags = nullptr) const override;
    wxSize CalcSizeFromPage(const wxSize& pageSize) const override;

    const CNNotebookCustomInfo& GetCustomInfo() const { return m_customInfo; }
    // The rectangle of each tab in strip coordinates, in page order.
    std::vector<wxRect> GetTabRects() const;
    int GetTabStripHeight() const;
    // Where the current page lies, in notebook coordinates.
    wxRect GetPageRect() const override;
    wxWindow* GetTabStrip() const;
    // Paints the strip as it looks now; the strip's paint handler uses it too.
    void RenderTabStrip(wxDC& dc) const;

protected:
    // Fills what the owner has not chosen: missing base colours, the state
    // colours and the lines. Base colours already set are kept.
    void DefaultCustomInfo();
    CNNotebookCustomInfo& CustomInfo() { return m_customInfo; }

    // Drawing hooks. Answered as below they leave the default look in place.
    // Sets up the custom drawing information once the window exists; the
    // default is DefaultCustomInfo().
    virtual void SetupCustomInfo();
    // Added to the padding around each tab's image and label; default (0, 0).
    virtual wxSize GetExtraTabPadding() const;
    // Called after each tab is drawn, to add marks; default nothing.
    virtual void DrawTabDecoration(wxDC& dc, const wxRect& tabRect, size_t page) const;
    // The final size of a tab given its measured size; default unchanged.
    virtual wxSize AdjustTabSize(const wxSize& size) const;
    // Extra space between the notebook's edges and the page: x is the left,
    // y the top, width the right and height the bottom inset; default none.
    virtual wxRect GetPageInsets() const;
    // Moves each tab's image and label within the tab; default (0, 0).
    virtual wxPoint GetLabelOffset() const;

    void DoSize() override;
    wxWindow* DoRemovePage(size_t page) override;
    void UpdateSelectedPage(size_t newSelection) override;
    wxBookCtrlEvent* CreatePageChangingEvent() const override;
    void MakeChangedEvent(wxBookCtrlEvent& event) override;

private:
    struct TabInfo
    {
        wxString text;
        int image = NO_IMAGE;
        wxWindow* focusWindow = nullptr;
        int width = -1;
        bool emphasised = false;
    };

    wxSize MeasureTab(const TabInfo& tab) const;
    wxFont TabFont(const TabInfo& tab) const;
    void DrawTab(wxDC& dc, const wxRect& rect, size_t page) const;
    CNNotebookCustomInfo::State TabState(size_t page) const;
    void InstallDefaultImages();
    void Relayout();
    void SelectFromKeyboard(bool forward);

    void OnCharHook(wxKeyEvent& event);
    void OnNavigationKey(wxNavigationKeyEvent& event);
    void OnStripPaint(wxPaintEvent& event);
    void OnStripLeftDown(wxMouseEvent& event);
    void OnStripMotion(wxMouseEvent& event);
    void OnStripLeave(wxMouseEvent& event);
    void OnStripKeyDown(wxKeyEvent& event);
    void OnStripFocus(wxFocusEvent& event);

    const bool m_equalWidthTabs;
    wxSize m_fixedTabSize;
    wxSize m_padding;
    CNNotebookCustomInfo m_customInfo;
    std::vector<TabInfo> m_tabs;
    CNNotebookTabStrip* m_strip = nullptr;
    int m_hoverTab = wxNOT_FOUND;

    wxDECLARE_NO_COPY_CLASS(CNOwnerDrawNotebook);
};
