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
inline wxString SampleDosTime()
{
    const unsigned long date = ((2021 - 1980) << 9) | (3 << 5) | 15;
    const unsigned long time = (14 << 11) | (5 << 5) | (30 / 2);
    return wxString::Format("%lu", (date << 16) | time);
}

// The fields of a log journal line, without its tag: what a producer passes to AddJob.
inline wxString LogFields(const wxString& key, const wxString& status = "Transferred Successfully",
                          const wxString& hotFolder = "/srv/hotfolders/In")
{
    return key + "\t" + hotFolder + "\t" + hotFolder + "/" + key + ".pdf\tPRN-01\t" + SampleDosTime() + "\t" +
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
