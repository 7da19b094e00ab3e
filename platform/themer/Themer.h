#pragma once

#include <wx/colour.h>
#include <wx/font.h>

// The colours and fonts of one named part of the window. Not every field is
// meaningful for every name; the ones the program reads are listed by name.
struct Theme
{
    wxColour backgroundColour;        // Default, FooterView, Error, Notebook
    wxColour panelColour;             // Notebook
    wxColour selectionColour;         // ListControl: selected rows while the list has focus
    wxColour inactiveSelectionColour; // ListControl: selected rows without focus
    wxColour textColour;              // ListControl rows, Notebook tabs
    wxColour selectedTextColour;      // ListControl: text of selected rows
    wxColour foregroundColour;        // ListControl: header text
    wxColour controlColour;           // ListControl: header background
    wxColour lineColour;              // ListControl rules, HeaderView border and resize guide
    wxColour alternateRowColour;      // ListControl: odd rows
    wxFont textFont;                  // Error: detail text
    wxFont titleFont;                 // Error: heading
};

// The product's theme service. Lookups are cheap and always return the same
// record for a name; records live until the process ends.
class Themer
{
public:
    static Themer* GetThemeService();

    // Names: "Default", "ListControl", "HeaderView", "Notebook", "FooterView",
    // "Error". Any other name (or null) gives the "Default" record.
    const Theme& GetTheme(const char* name) const;

private:
    Themer();
    Themer(const Themer&) = delete;
    Themer& operator=(const Themer&) = delete;

    struct Records;
    Records* m_records;
};
