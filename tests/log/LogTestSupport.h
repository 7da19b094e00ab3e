#pragma once

#include <initializer_list>
#include <memory>

#include <gtest/gtest.h>

#include <wx/app.h>
#include <wx/dir.h>
#include <wx/ffile.h>
#include <wx/filefn.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/string.h>
#include <wx/utils.h>

#include "data/DataLocations.h"

namespace logtest
{

// Event queues need an application object; the unit tests have no window.
class WxEnvironment : public ::testing::Environment
{
public:
    void SetUp() override { m_init = std::make_unique<wxInitializer>(); }
    void TearDown() override { m_init.reset(); }

private:
    std::unique_ptr<wxInitializer> m_init;
};

inline wxArrayString Strings(std::initializer_list<const char*> texts)
{
    wxArrayString array;
    for (const char* text : texts)
        array.Add(wxString::FromUTF8(text));
    return array;
}

// A fresh system root per test, so journals, hot folders and locks of one test
// never meet another's (tests of several binaries may run at once).
class SystemRoot
{
public:
    SystemRoot()
    {
        wxString base = wxFileName::CreateTempFileName("wyx-log");
        wxRemoveFile(base);
        m_root = base;
        wxFileName::Mkdir(m_root, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
        wxSetEnv("WYX_SYSTEM_ROOT", m_root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
    }
    ~SystemRoot()
    {
        wxFileName::Rmdir(m_root, wxPATH_RMDIR_RECURSIVE);
        wxUnsetEnv("WYX_SYSTEM_ROOT");
    }

    const wxString& Path() const { return m_root; }
    wxString JournalPath() const { return GetDataDirectory() + "TiveraJobsLogFile.txt"; }

    // Creates the hot folders, lists them in the data source's file and returns their paths.
    wxArrayString MakeHotFolders(const wxArrayString& names) const
    {
        wxArrayString paths;
        wxString ini = "[HotFolders]\n";
        for (const wxString& name : names)
        {
            const wxString path = m_root + "/srv/hotfolders/" + name;
            wxFileName::Mkdir(path + "/[_KELVO_HotFolder_]", wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
            paths.Add(path);
            ini += path + "\n";
        }
        WriteFile(GetDataDirectory() + "HotFolders.ini", ini);
        return paths;
    }

    static void WriteFile(const wxString& path, const wxString& text)
    {
        wxFFile file(path, "wb");
        ASSERT_TRUE(file.IsOpened()) << path;
        file.Write(text, wxConvUTF8);
    }
    static void AppendFile(const wxString& path, const wxString& text)
    {
        wxFFile file(path, "ab");
        ASSERT_TRUE(file.IsOpened()) << path;
        file.Write(text, wxConvUTF8);
    }

private:
    wxString m_root;
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
