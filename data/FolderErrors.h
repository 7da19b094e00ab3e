#pragma once

#include <wx/string.h>

// The error marks the hot-folder service leaves in a hot folder, and the icon
// refresh that follows their removal.

// <hot folder>/[_KELVO_HotFolder_]/Error.er
wxString ErrorMarkerPath(const wxString& hotFolderPath);

enum class MarkerRemoval
{
    NoMarker,  // nothing to remove
    Removed,   // the marker is gone
    NotRemoved // a marker is there and could not be removed (a non-empty folder of that name)
};

// Removes the folder's marker, whatever kind of file system entry it is; a
// symbolic link is removed itself, never what it points to.
MarkerRemoval RemoveErrorMarker(const wxString& hotFolderPath);

// How hot-folder icons are redrawn, from "ICON_SHELL_NOTIFY" ("0" when absent).
enum class IconRefreshMode
{
    ShellNotification, // "1": one broadcast makes the shell redraw every icon
    FolderIcons,       // "0": the data source sets each affected folder's icon
    None               // anything else
};

IconRefreshMode IconRefreshModeFromSetting(const wxString& setting);

// Reloads the configuration first, as the setting may have been added since.
wxString ReadIconRefreshSetting();

// Sends the refresh for the given mode; folderPath is used by FolderIcons only.
void RefreshFolderIcon(IconRefreshMode mode, const wxString& folderPath);
