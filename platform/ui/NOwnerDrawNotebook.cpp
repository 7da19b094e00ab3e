#include "platform/ui/NOwnerDrawNotebook.h"

#include "platform/ui/BitmapFromMemory.h"
#include "resources/EmbeddedImages.h"

#include <wx/dcbuffer.h>
#include <wx/imaglist.h>
#include <wx/settings.h>

#include <algorithm>

namespace
{
// Geometry of the strip, in pixels.
constexpr int kStripMarginLeft = 6;
constexpr int kStripMarginTop = 4;
constexpr int kTabGap = 2;
constexpr int kDefaultPaddingX = 12;
constexpr int kDefaultPaddingY = 6;
constexpr int kImageGap = 6;
constexpr int kAccentHeight = 3;
constexpr int kFocusInset = 3;

wxColour Mix(const wxColour& a, const wxColour& b, double weightOfB)
{
    auto channel = [weightOfB](unsigned char x, unsigned char y)
    { return static_cast<unsigned char>(x + (y - x) * weightOfB + 0.5); };
    return wxColour(channel(a.Red(), b.Red()), channel(a.Green(), b.Green()), channel(a.Blue(), b.Blue()));
}
} // namespace

// The strip is only a surface: the notebook lays it out and handles its input.
class CNNotebookTabStrip : public wxWindow
{
public:
    explicit CNNotebookTabStrip(CNOwnerDrawNotebook* book)
        : wxWindow(book, wxID_ANY, wxDefaultPosition, wxDefaultSize, wxBORDER_NONE | wxWANTS_CHARS,
                   "CNNotebookTabStrip"),
          m_book(book)
    {
        SetBackgroundStyle(wxBG_STYLE_PAINT);
    }

    bool AcceptsFocus() const override { return m_book->GetPageCount() > 0; }

protected:
    wxSize DoGetBestSize() const override { return wxSize(-1, m_book->GetTabStripHeight()); }

private:
    CNOwnerDrawNotebook* m_book;
};

CNOwnerDrawNotebook::CNOwnerDrawNotebook(bool equalWidthTabs, int tabWidth, int tabHeight)
    : m_equalWidthTabs(equalWidthTabs), m_fixedTabSize(tabWidth, tabHeight),
      m_padding(kDefaultPaddingX, kDefaultPaddingY)
{
}

bool CNOwnerDrawNotebook::Create(wxWindow* parent, wxWindowID id, const wxPoint& pos, const wxSize& size,
                                 long style, const wxString& name)
{
    if (!wxNotebookBase::Create(parent, id, pos, size, style, name))
        return false;

    m_strip = new CNNotebookTabStrip(this);
    m_bookctrl = m_strip;
    SetupCustomInfo();
    if (!GetImageList())
        InstallDefaultImages();
    SetBackgroundColour(m_customInfo.baseColours[1]);

    Bind(wxEVT_CHAR_HOOK, &CNOwnerDrawNotebook::OnCharHook, this);
    Bind(wxEVT_NAVIGATION_KEY, &CNOwnerDrawNotebook::OnNavigationKey, this);
    m_strip->Bind(wxEVT_PAINT, &CNOwnerDrawNotebook::OnStripPaint, this);
    m_strip->Bind(wxEVT_LEFT_DOWN, &CNOwnerDrawNotebook::OnStripLeftDown, this);
    m_strip->Bind(wxEVT_LEFT_DCLICK, &CNOwnerDrawNotebook::OnStripLeftDown, this);
    m_strip->Bind(wxEVT_MOTION, &CNOwnerDrawNotebook::OnStripMotion, this);
    m_strip->Bind(wxEVT_LEAVE_WINDOW, &CNOwnerDrawNotebook::OnStripLeave, this);
    m_strip->Bind(wxEVT_KEY_DOWN, &CNOwnerDrawNotebook::OnStripKeyDown, this);
    m_strip->Bind(wxEVT_SET_FOCUS, &CNOwnerDrawNotebook::OnStripFocus, this);
    m_strip->Bind(wxEVT_KILL_FOCUS, &CNOwnerDrawNotebook::OnStripFocus, this);
    Relayout();
    return true;
}

void CNOwnerDrawNotebook::InstallDefaultImages()
{
    auto* images = new wxImageList(16, 16, true, 3);
    for (const wyx::images::EmbeddedImage& image : wyx::images::tabImages)
        images->Add(CUGetBitmapFromMemory(image.data, image.length));
    AssignImageList(images);
}

// ---------------------------------------------------------------------------
// Custom drawing information and hooks

void CNOwnerDrawNotebook::DefaultCustomInfo()
{
    CNNotebookCustomInfo& info = m_customInfo;
    if (!info.baseColours[0].IsOk())
        info.baseColours[0] = wxSystemSettings::GetColour(wxSYS_COLOUR_BTNFACE);
    if (!info.baseColours[1].IsOk())
        info.baseColours[1] = wxSystemSettings::GetColour(wxSYS_COLOUR_WINDOW);

    info.states[CNNotebookCustomInfo::Normal].fillColour = info.baseColours[0];
    info.states[CNNotebookCustomInfo::Hover].fillColour = Mix(info.baseColours[0], info.baseColours[1], 0.5);
    info.states[CNNotebookCustomInfo::Selected].fillColour = info.baseColours[1];
    info.states[CNNotebookCustomInfo::Normal].textColour = wxSystemSettings::GetColour(wxSYS_COLOUR_BTNTEXT);
    info.states[CNNotebookCustomInfo::Hover].textColour = wxSystemSettings::GetColour(wxSYS_COLOUR_BTNTEXT);
    info.states[CNNotebookCustomInfo::Selected].textColour =
        wxSystemSettings::GetColour(wxSYS_COLOUR_WINDOWTEXT);
    info.borderColour = info.baseColours[0].ChangeLightness(80);
    info.accentColour = wxSystemSettings::GetColour(wxSYS_COLOUR_HIGHLIGHT);
}

void CNOwnerDrawNotebook::SetupCustomInfo()
{
    DefaultCustomInfo();
}

wxSize CNOwnerDrawNotebook::GetExtraTabPadding() const
{
    return wxSize(0, 0);
}

void CNOwnerDrawNotebook::DrawTabDecoration(wxDC&, const wxRect&, size_t) const {}

wxSize CNOwnerDrawNotebook::AdjustTabSize(const wxSize& size) const
{
    return size;
}

wxRect CNOwnerDrawNotebook::GetPageInsets() const
{
    return wxRect(0, 0, 0, 0);
}

wxPoint CNOwnerDrawNotebook::GetLabelOffset() const
{
    return wxPoint(0, 0);
}

// ---------------------------------------------------------------------------
// Pages

bool CNOwnerDrawNotebook::AddPage(wxWindow* page, const wxString& text, bool select, int imageId,
                                  wxWindow* focusWindow, int tabWidth, bool emphasised)
{
    const size_t index = GetPageCount();
    if (!InsertPage(index, page, text, select, imageId))
        return false;
    m_tabs[index].focusWindow = focusWindow;
    m_tabs[index].width = tabWidth;
    m_tabs[index].emphasised = emphasised;
    Relayout();
    return true;
}

bool CNOwnerDrawNotebook::InsertPage(size_t n, wxWindow* page, const wxString& text, bool select, int imageId)
{
    if (page == nullptr || n > GetPageCount() || page->GetParent() != this)
        return false;

    m_pages.insert(m_pages.begin() + n, page);
    TabInfo tab;
    tab.text = text;
    tab.image = imageId;
    m_tabs.insert(m_tabs.begin() + n, tab);
    if (m_selection != wxNOT_FOUND && static_cast<int>(n) <= m_selection)
        ++m_selection;
    DoInvalidateBestSize();

    page->Hide();
    if (select)
        SetSelection(n);
    else if (m_selection == wxNOT_FOUND)
        ChangeSelection(n);
    Relayout();
    return true;
}

wxWindow* CNOwnerDrawNotebook::DoRemovePage(size_t n)
{
    if (n >= GetPageCount())
        return nullptr;

    wxWindow* page = m_pages[n];
    // A page taken out (not deleted) must not stay drawn over its successor.
    page->Hide();
    m_pages.erase(m_pages.begin() + n);
    m_tabs.erase(m_tabs.begin() + n);
    m_hoverTab = wxNOT_FOUND;
    if (m_selection == static_cast<int>(n))
    {
        // The neighbour that slides into the removed tab's place takes over.
        m_selection = wxNOT_FOUND;
        if (!m_pages.empty())
            ChangeSelection(std::min(n, m_pages.size() - 1));
    }
    else if (m_selection > static_cast<int>(n))
    {
        --m_selection;
    }
    Relayout();
    return page;
}

bool CNOwnerDrawNotebook::DeleteAllPages()
{
    wxNotebookBase::DeleteAllPages();
    m_tabs.clear();
    m_hoverTab = wxNOT_FOUND;
    Relayout();
    return true;
}

int CNOwnerDrawNotebook::SetSelection(size_t n)
{
    return DoSetSelection(n, SetSelection_SendEvent);
}

int CNOwnerDrawNotebook::ChangeSelection(size_t n)
{
    return DoSetSelection(n);
}

void CNOwnerDrawNotebook::UpdateSelectedPage(size_t newSelection)
{
    m_selection = static_cast<int>(newSelection);
    if (m_strip)
        m_strip->Refresh();
}

wxBookCtrlEvent* CNOwnerDrawNotebook::CreatePageChangingEvent() const
{
    return new wxBookCtrlEvent(wxEVT_NOTEBOOK_PAGE_CHANGING, GetId());
}

void CNOwnerDrawNotebook::MakeChangedEvent(wxBookCtrlEvent& event)
{
    event.SetEventType(wxEVT_NOTEBOOK_PAGE_CHANGED);
}

bool CNOwnerDrawNotebook::SetPageText(size_t n, const wxString& text)
{
    if (n >= m_tabs.size())
        return false;
    m_tabs[n].text = text;
    Relayout();
    return true;
}

wxString CNOwnerDrawNotebook::GetPageText(size_t n) const
{
    return n < m_tabs.size() ? m_tabs[n].text : wxString();
}

int CNOwnerDrawNotebook::GetPageImage(size_t n) const
{
    return n < m_tabs.size() ? m_tabs[n].image : NO_IMAGE;
}

bool CNOwnerDrawNotebook::SetPageImage(size_t n, int imageId)
{
    if (n >= m_tabs.size())
        return false;
    m_tabs[n].image = imageId;
    Relayout();
    return true;
}

void CNOwnerDrawNotebook::SetPadding(const wxSize& padding)
{
    m_padding = padding;
    Relayout();
}

void CNOwnerDrawNotebook::SetTabSize(const wxSize& size)
{
    m_fixedTabSize = size;
    Relayout();
}

// ---------------------------------------------------------------------------
// Layout

wxFont CNOwnerDrawNotebook::TabFont(const TabInfo& tab) const
{
    return tab.emphasised ? GetFont().Bold() : GetFont();
}

wxSize CNOwnerDrawNotebook::MeasureTab(const TabInfo& tab) const
{
    const wxSize padding = m_padding + GetExtraTabPadding();
    const wxFont font = TabFont(tab);
    int textWidth = 0;
    int textHeight = 0;
    GetTextExtent(tab.text.empty() ? wxString("Ag") : tab.text, &textWidth, &textHeight, nullptr, nullptr,
                  &font);
    if (tab.text.empty())
        textWidth = 0;

    wxSize content(textWidth, textHeight);
    if (HasImages() && tab.image != NO_IMAGE && tab.image < GetImageCount())
    {
        const wxSize image = GetImageLogicalSize(this, tab.image);
        content.x += image.x + (textWidth > 0 ? kImageGap : 0);
        content.y = std::max(content.y, image.y);
    }
    wxSize size(content.x + 2 * padding.x, content.y + 2 * padding.y + kAccentHeight);
    if (m_fixedTabSize.x > 0)
        size.x = m_fixedTabSize.x;
    if (tab.width > 0)
        size.x = tab.width;
    if (m_fixedTabSize.y > 0)
        size.y = m_fixedTabSize.y;
    return AdjustTabSize(size);
}

std::vector<wxRect> CNOwnerDrawNotebook::GetTabRects() const
{
    std::vector<wxSize> sizes;
    int widest = 0;
    int tallest = 0;
    for (const TabInfo& tab : m_tabs)
    {
        sizes.push_back(MeasureTab(tab));
        widest = std::max(widest, sizes.back().x);
        tallest = std::max(tallest, sizes.back().y);
    }

    std::vector<wxRect> rects;
    int x = kStripMarginLeft;
    for (const wxSize& size : sizes)
    {
        const int width = m_equalWidthTabs ? widest : size.x;
        rects.emplace_back(x, kStripMarginTop, width, tallest);
        x += width + kTabGap;
    }
    return rects;
}

int CNOwnerDrawNotebook::GetTabStripHeight() const
{
    int tallest = MeasureTab(TabInfo()).y;
    for (const wxRect& rect : GetTabRects())
        tallest = std::max(tallest, rect.height);
    return kStripMarginTop + tallest;
}

wxWindow* CNOwnerDrawNotebook::GetTabStrip() const
{
    return m_strip;
}

wxRect CNOwnerDrawNotebook::GetPageRect() const
{
    const wxSize client = GetClientSize();
    const wxRect insets = GetPageInsets();
    const int top = GetTabStripHeight() + insets.y;
    return wxRect(insets.x, top, std::max(0, client.x - insets.x - insets.width),
                  std::max(0, client.y - top - insets.height));
}

wxSize CNOwnerDrawNotebook::CalcSizeFromPage(const wxSize& pageSize) const
{
    const wxRect insets = GetPageInsets();
    return wxSize(pageSize.x + insets.x + insets.width,
                  pageSize.y + GetTabStripHeight() + insets.y + insets.height);
}

void CNOwnerDrawNotebook::DoSize()
{
    if (!m_strip)
        return;
    m_strip->SetSize(0, 0, GetClientSize().x, GetTabStripHeight());
    if (wxWindow* page = GetCurrentPage())
        page->SetSize(GetPageRect());
}

void CNOwnerDrawNotebook::Relayout()
{
    if (!m_strip)
        return;
    m_strip->InvalidateBestSize();
    DoSize();
    m_strip->Refresh();
}

int CNOwnerDrawNotebook::HitTest(const wxPoint& pt, long* flags) const
{
    if (flags)
        *flags = wxBK_HITTEST_NOWHERE;
    const std::vector<wxRect> rects = GetTabRects();
    for (size_t i = 0; i < rects.size(); ++i)
    {
        if (rects[i].Contains(pt))
        {
            if (flags)
                *flags = wxBK_HITTEST_ONITEM;
            return static_cast<int>(i);
        }
    }
    if (flags && GetPageRect().Contains(pt))
        *flags = wxBK_HITTEST_ONPAGE;
    return wxNOT_FOUND;
}

// ---------------------------------------------------------------------------
// Painting

CNNotebookCustomInfo::State CNOwnerDrawNotebook::TabState(size_t page) const
{
    if (static_cast<int>(page) == m_selection)
        return CNNotebookCustomInfo::Selected;
    if (static_cast<int>(page) == m_hoverTab)
        return CNNotebookCustomInfo::Hover;
    return CNNotebookCustomInfo::Normal;
}

void CNOwnerDrawNotebook::RenderTabStrip(wxDC& dc) const
{
    const wxSize size = m_strip ? m_strip->GetClientSize() : wxSize(0, 0);
    const CNNotebookCustomInfo& info = m_customInfo;
    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(info.baseColours[0]));
    dc.DrawRectangle(0, 0, size.x, size.y);

    const std::vector<wxRect> rects = GetTabRects();
    for (size_t i = 0; i < rects.size(); ++i)
        DrawTab(dc, rects[i], i);

    // The line under the strip, broken where the selected tab opens onto its page.
    dc.SetPen(wxPen(info.borderColour));
    const int bottom = size.y - 1;
    if (m_selection != wxNOT_FOUND && m_selection < static_cast<int>(rects.size()))
    {
        const wxRect& selected = rects[m_selection];
        dc.DrawLine(0, bottom, selected.GetLeft(), bottom);
        dc.DrawLine(selected.GetRight() + 1, bottom, size.x, bottom);
    }
    else
    {
        dc.DrawLine(0, bottom, size.x, bottom);
    }
}

void CNOwnerDrawNotebook::DrawTab(wxDC& dc, const wxRect& rect, size_t page) const
{
    const CNNotebookCustomInfo& info = m_customInfo;
    const CNNotebookCustomInfo::State state = TabState(page);
    const TabInfo& tab = m_tabs[page];

    dc.SetPen(*wxTRANSPARENT_PEN);
    dc.SetBrush(wxBrush(info.states[state].fillColour));
    dc.DrawRectangle(rect);
    if (state == CNNotebookCustomInfo::Selected)
    {
        dc.SetPen(wxPen(info.borderColour));
        dc.DrawLine(rect.GetLeft(), rect.GetBottom() + 1, rect.GetLeft(), rect.GetTop());
        dc.DrawLine(rect.GetRight(), rect.GetTop(), rect.GetRight(), rect.GetBottom() + 1);
        dc.SetPen(*wxTRANSPARENT_PEN);
        dc.SetBrush(wxBrush(info.accentColour));
        dc.DrawRectangle(rect.x, rect.y, rect.width, kAccentHeight);
    }

    // Image and label, centred in the part of the tab below the accent bar.
    const wxRect body(rect.x, rect.y + kAccentHeight, rect.width, rect.height - kAccentHeight);
    const wxFont font = TabFont(tab);
    dc.SetFont(font);
    const wxSize text = tab.text.empty() ? wxSize(0, 0) : dc.GetTextExtent(tab.text);
    wxBitmap image;
    if (HasImages() && tab.image != NO_IMAGE && tab.image < GetImageCount())
        image = GetImageBitmapFor(this, tab.image);
    const int imageWidth = image.IsOk() ? image.GetLogicalWidth() : 0;
    const int gap = imageWidth > 0 && text.x > 0 ? kImageGap : 0;
    const wxPoint offset = GetLabelOffset();
    int x = body.x + std::max(0, (body.width - imageWidth - gap - text.x) / 2) + offset.x;

    wxDCClipper clip(dc, rect);
    if (image.IsOk())
    {
        dc.DrawBitmap(image, x, body.y + (body.height - image.GetLogicalHeight()) / 2 + offset.y, true);
        x += imageWidth + gap;
    }
    if (text.x > 0)
    {
        dc.SetTextForeground(info.states[state].textColour);
        dc.SetBackgroundMode(wxBRUSHSTYLE_TRANSPARENT);
        dc.DrawText(tab.text, x, body.y + (body.height - text.y) / 2 + offset.y);
    }
    if (state == CNNotebookCustomInfo::Selected && m_strip && m_strip->HasFocus())
    {
        dc.SetPen(wxPen(info.accentColour));
        dc.SetBrush(*wxTRANSPARENT_BRUSH);
        dc.DrawRoundedRectangle(wxRect(body).Deflate(kFocusInset), 2);
    }
    DrawTabDecoration(dc, rect, page);
}

void CNOwnerDrawNotebook::OnStripPaint(wxPaintEvent&)
{
    wxAutoBufferedPaintDC dc(m_strip);
    RenderTabStrip(dc);
}

// ---------------------------------------------------------------------------
// Input

void CNOwnerDrawNotebook::OnStripLeftDown(wxMouseEvent& event)
{
    const int hit = HitTest(event.GetPosition());
    if (hit == wxNOT_FOUND)
    {
        event.Skip();
        return;
    }
    if (hit != m_selection)
        SetSelection(hit);
    m_strip->SetFocus();
}

void CNOwnerDrawNotebook::OnStripMotion(wxMouseEvent& event)
{
    const int hit = HitTest(event.GetPosition());
    if (hit != m_hoverTab)
    {
        m_hoverTab = hit;
        m_strip->Refresh();
    }
    event.Skip();
}

void CNOwnerDrawNotebook::OnStripLeave(wxMouseEvent& event)
{
    if (m_hoverTab != wxNOT_FOUND)
    {
        m_hoverTab = wxNOT_FOUND;
        m_strip->Refresh();
    }
    event.Skip();
}

void CNOwnerDrawNotebook::OnStripFocus(wxFocusEvent& event)
{
    m_strip->Refresh();
    event.Skip();
}

void CNOwnerDrawNotebook::OnStripKeyDown(wxKeyEvent& event)
{
    if (GetPageCount() == 0 || event.HasAnyModifiers())
    {
        event.Skip();
        return;
    }
    switch (event.GetKeyCode())
    {
    case WXK_LEFT:
    case WXK_NUMPAD_LEFT:
        if (m_selection > 0)
            SetSelection(m_selection - 1);
        break;
    case WXK_RIGHT:
    case WXK_NUMPAD_RIGHT:
        if (m_selection + 1 < static_cast<int>(GetPageCount()))
            SetSelection(m_selection + 1);
        break;
    case WXK_HOME:
    case WXK_NUMPAD_HOME:
        SetSelection(0);
        break;
    case WXK_END:
    case WXK_NUMPAD_END:
        SetSelection(GetPageCount() - 1);
        break;
    default:
        event.Skip();
    }
}

void CNOwnerDrawNotebook::SelectFromKeyboard(bool forward)
{
    // The focus was inside the page that is about to be hidden: follow the
    // user to the new page. On the strip it stays on the strip.
    const bool focusOnStrip = m_strip && m_strip->HasFocus();
    const int before = m_selection;
    AdvanceSelection(forward);
    if (m_selection == before || focusOnStrip || m_selection == wxNOT_FOUND)
        return;
    const TabInfo& tab = m_tabs[m_selection];
    if (tab.focusWindow)
        tab.focusWindow->SetFocus();
    else
        m_pages[m_selection]->SetFocus();
}

void CNOwnerDrawNotebook::OnCharHook(wxKeyEvent& event)
{
    const int key = event.GetKeyCode();
    const int modifiers = event.GetModifiers();
    if (key == WXK_TAB && (modifiers == wxMOD_CONTROL || modifiers == (wxMOD_CONTROL | wxMOD_SHIFT)))
    {
        SelectFromKeyboard(!event.ShiftDown());
        return;
    }
    if (modifiers == wxMOD_CONTROL && (key == WXK_PAGEDOWN || key == WXK_NUMPAD_PAGEDOWN))
    {
        SelectFromKeyboard(true);
        return;
    }
    if (modifiers == wxMOD_CONTROL && (key == WXK_PAGEUP || key == WXK_NUMPAD_PAGEUP))
    {
        SelectFromKeyboard(false);
        return;
    }
    event.Skip();
}

void CNOwnerDrawNotebook::OnNavigationKey(wxNavigationKeyEvent& event)
{
    if (event.IsWindowChange())
        SelectFromKeyboard(event.GetDirection());
    else
        event.Skip();
}
