#include "platform/themer/Themer.h"

#include <wx/settings.h>

#include <cstring>

// One calm light palette: grey-blue surfaces, slate text, a soft blue selection
// that keeps dark text readable whether or not the list has focus.
namespace
{
const wxColour kWhite(0xFF, 0xFF, 0xFF);
const wxColour kSurface(0xF4, 0xF6, 0xF8);
const wxColour kStrip(0xE2, 0xE7, 0xED);
const wxColour kInk(0x1F, 0x29, 0x33);
const wxColour kSlate(0x2B, 0x36, 0x42);
const wxColour kRule(0xDC, 0xE1, 0xE7);
const wxColour kBorder(0xB4, 0xBE, 0xCA);

Theme MakeDefault()
{
    Theme theme;
    theme.backgroundColour = kSurface;
    theme.panelColour = kSurface;
    theme.selectionColour = wxColour(0xC3, 0xDA, 0xF3);
    theme.inactiveSelectionColour = wxColour(0xDD, 0xE3, 0xEA);
    theme.textColour = kInk;
    theme.selectedTextColour = kInk;
    theme.foregroundColour = kSlate;
    theme.controlColour = wxColour(0xE9, 0xED, 0xF2);
    theme.lineColour = kRule;
    theme.alternateRowColour = wxColour(0xF5, 0xF7, 0xFA);
    theme.textFont = wxSystemSettings::GetFont(wxSYS_DEFAULT_GUI_FONT);
    theme.titleFont = theme.textFont.Bold();
    return theme;
}

Theme MakeListControl()
{
    Theme theme = MakeDefault();
    theme.backgroundColour = kWhite;
    theme.selectedTextColour = wxColour(0x0B, 0x1F, 0x33);
    return theme;
}

Theme MakeHeaderView()
{
    Theme theme = MakeDefault();
    theme.lineColour = kBorder;
    return theme;
}

Theme MakeNotebook()
{
    Theme theme = MakeDefault();
    // panelColour fills the tab strip and the idle tabs; backgroundColour is
    // the selected tab, drawn in the colour of the page below it.
    theme.panelColour = kStrip;
    theme.backgroundColour = kSurface;
    theme.textColour = kSlate;
    theme.lineColour = kBorder;
    return theme;
}

Theme MakeFooterView()
{
    Theme theme = MakeDefault();
    theme.backgroundColour = wxColour(0xE9, 0xED, 0xF2);
    return theme;
}

Theme MakeError()
{
    Theme theme = MakeDefault();
    theme.backgroundColour = wxColour(0xFF, 0xF4, 0xE5);
    theme.textColour = *wxBLACK;
    return theme;
}
} // namespace

struct Themer::Records
{
    struct Named
    {
        const char* name;
        Theme theme;
    };
    // "Default" first: it is also the answer to every unknown name.
    Named themes[6] = {{"Default", MakeDefault()},       {"ListControl", MakeListControl()},
                       {"HeaderView", MakeHeaderView()}, {"Notebook", MakeNotebook()},
                       {"FooterView", MakeFooterView()}, {"Error", MakeError()}};
};

Themer::Themer() : m_records(new Records) {}

Themer* Themer::GetThemeService()
{
    // Built on first use (the system font needs the toolkit running) and kept
    // until exit: callers hold references, and wx objects must not be
    // destroyed by static destructors after the toolkit is gone.
    static Themer* const service = new Themer;
    return service;
}

const Theme& Themer::GetTheme(const char* name) const
{
    if (name != nullptr)
    {
        for (const Records::Named& named : m_records->themes)
        {
            if (std::strcmp(named.name, name) == 0)
                return named.theme;
        }
    }
    return m_records->themes[0].theme;
}
