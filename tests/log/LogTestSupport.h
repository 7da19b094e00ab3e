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

// 15 March 2021, 14:05:30 as an MS-DOS date-time.
constexpr const char* kDosTime = "1383035055";

// The fields of a log journal line, without its tag: what a producer passes to AddJob.
inline wxString LogFields(const wxString& key, const wxString& status = "Transferred Successfully",
                          const wxString& hotFolder = "/srv/hotfolders/In")
{
    return key + "\t" + hotFolder + "\t" + hotFolder + "/" + key + ".pdf\tPRN-01\t" + kDosTime + "\t" +
           status + "\tdetail of " + key;
}

// One log journal line with its line end.
inline wxString LogLine(const wxString& key, const wxString& tag,
                        const wxString& status = "Transferred Successfully",
                        const wxString& hotFolder = "/srv/hotfolders/In")
{
    return LogFields(key, status, hotFolder) + "\t" + tag + "\r\n";
}

} // namespace logtest
