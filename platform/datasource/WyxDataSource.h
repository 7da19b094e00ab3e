#pragma once

#include <mutex>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

// The hot-folder configuration service: which hot folders and print servers are
// configured, and the icon of each hot folder. Called on the GUI thread only.
//
// The configuration is the text file "HotFolders.ini" in the data directory
// (<system root>/var/lib/Corvane/HotFolders/), UTF-8, read anew on every call:
//
//     ; comment (also "#")
//     [HotFolders]
//     /srv/hotfolders/PDF Proofs
//     [Servers]
//     PRN-LONDON-01
//
// One entry per line below its section header, surrounding white space
// ignored; blank lines, comments, lines before any known section and lines of
// other sections are skipped. Section names ignore case. An absent or
// unreadable file gives empty lists.
//
// Icons are not drawn on Linux: each ChangeHotfolderIcon call is recorded, in
// memory (GetIconChanges) and as one line "<path> TAB <0|1>" appended to
// "IconChanges.log" in the data directory, so that tests and tools can see it.
class WyxDataSource
{
public:
    static WyxDataSource& GetInstance();

    // Fills names with the print servers, as written in the status journal.
    // Returns the number of names.
    long GetServersList(wxArrayString& names);
    // Fills paths with the full path of every configured hot folder. Returns
    // the number of paths.
    long GetHotFoldersList(wxArrayString& paths);
    // Sets a hot folder's icon to match its error state. Returns 0 when the call
    // was recorded, 1 for an empty path (nothing recorded).
    long ChangeHotfolderIcon(const wxString& hotFolderPath, const bool& errorState);

    struct IconChange
    {
        wxString hotFolderPath;
        bool errorState;
    };
    // Every recorded icon change of this process, oldest first.
    std::vector<IconChange> GetIconChanges() const;

    // The configuration file and the icon log, from the system root at each call.
    static wxString ConfigurationPath();
    static wxString IconLogPath();

    // Reads one configuration text (the file's content) into the two lists.
    static void ParseConfiguration(const wxString& text, wxArrayString& hotFolders, wxArrayString& servers);

private:
    WyxDataSource() = default;

    mutable std::mutex m_lock;
    std::vector<IconChange> m_iconChanges;
};
