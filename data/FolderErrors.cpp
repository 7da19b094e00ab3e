#include "data/FolderErrors.h"

#include <wx/filefn.h>
#include <wx/filename.h>

#include "data/DataLocations.h"
#include "platform/datasource/WyxDataSource.h"
#include "platform/os/ShellNotify.h"

wxString ErrorMarkerPath(const wxString& hotFolderPath)
{
    wxFileName marker = wxFileName::DirName(hotFolderPath);
    marker.AppendDir("[_KELVO_HotFolder_]");
    marker.SetFullName("Error.er");
    return marker.GetFullPath();
}

MarkerRemoval RemoveErrorMarker(const wxString& hotFolderPath)
{
    const wxString marker = ErrorMarkerPath(hotFolderPath);
    // wxFILE_EXISTS_ANY does not follow links, so a dangling link is a marker too.
    if (!wxFileName::Exists(marker, wxFILE_EXISTS_ANY))
        return MarkerRemoval::NoMarker;
    return wxRemoveFile(marker) ? MarkerRemoval::Removed : MarkerRemoval::NotRemoved;
}

IconRefreshMode IconRefreshModeFromSetting(const wxString& setting)
{
    if (setting == "1")
        return IconRefreshMode::ShellNotification;
    if (setting == "0")
        return IconRefreshMode::FolderIcons;
    return IconRefreshMode::None;
}

wxString ReadIconRefreshSetting()
{
    ConfigStore& config = ConfigStore::Instance();
    config.Load();
    wxString setting = "0";
    config.Lookup("ICON_SHELL_NOTIFY", setting);
    return setting;
}

void RefreshFolderIcon(IconRefreshMode mode, const wxString& folderPath)
{
    switch (mode)
    {
    case IconRefreshMode::ShellNotification:
        wyxos::NotifyAssociationsChanged();
        break;
    case IconRefreshMode::FolderIcons:
    {
        const bool hasErrors = false;
        WyxDataSource::GetInstance().ChangeHotfolderIcon(folderPath, hasErrors);
        break;
    }
    case IconRefreshMode::None:
        break;
    }
}
