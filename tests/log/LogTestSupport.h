#pragma once

#include <initializer_list>

#include <wx/app.h>
#include <wx/dir.h>

#include "SystemRoot.h"

namespace logtest
{

using wyxtest::WxEnvironment;

inline wxArrayString Strings(std::initializer_list<const char*> texts)
{
    wxArrayString array;
    for (const char* text : texts)
        array.Add(wxString::FromUTF8(text));
    return array;
}

class SystemRoot : public wyxtest::SystemRoot
{
public:
    wxString JournalPath() const { return GetDataDirectory() + "TiveraJobsLogFile.txt"; }
};

// One log journal line with its line end; its DosTime is 15 March 2021, 14:05:30.
// Without the tab, the tag and the line end: the fields a producer passes to AddJob.
inline wxString LogLine(const wxString& key, const wxString& tag,
                        const wxString& status = "Transferred Successfully",
                        const wxString& hotFolder = "/srv/hotfolders/In")
{
    return key + "\t" + hotFolder + "\t" + hotFolder + "/" + key + ".pdf\tPRN-01\t1383035055\t" + status +
           "\tdetail of " + key + "\t" + tag + "\r\n";
}

} // namespace logtest
