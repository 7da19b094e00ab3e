#pragma once

#include <memory>

#include <gtest/gtest.h>

#include <wx/arrstr.h>
#include <wx/ffile.h>
#include <wx/filename.h>
#include <wx/init.h>
#include <wx/utils.h>

#include "TempFolder.h"
#include "data/DataLocations.h"

namespace wyxtest
{

// Event queues need an application object; the unit tests have no window.
class WxEnvironment : public ::testing::Environment
{
    std::unique_ptr<wxInitializer> m_init;
    void SetUp() override { m_init = std::make_unique<wxInitializer>(); }
    void TearDown() override { m_init.reset(); }
};

// A fresh system root per test, with its data directory: journals, hot folders
// and locks of one test never meet another's, also when several test
// processes run at once.
class SystemRoot
{
public:
    SystemRoot() : m_root(wxString::FromUTF8(m_folder.Path().string()))
    {
        wxSetEnv("WYX_SYSTEM_ROOT", m_root);
        wxFileName::Mkdir(GetDataDirectory(), wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
    }
    ~SystemRoot() { wxUnsetEnv("WYX_SYSTEM_ROOT"); }

    const wxString& Path() const { return m_root; }

    // Creates the hot folders, lists them in the data source's file and returns their paths.
    wxArrayString MakeHotFolders(const wxArrayString& names) const
    {
        wxArrayString paths;
        wxString ini = "[HotFolders]\n";
        for (const wxString& name : names)
        {
            paths.Add(m_root + "/srv/hotfolders/" + name);
            wxFileName::Mkdir(paths.Last() + "/[_KELVO_HotFolder_]", wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
            ini += paths.Last() + "\n";
        }
        WriteFile(GetDataDirectory() + "HotFolders.ini", ini);
        return paths;
    }

    static void WriteFile(const wxString& path, const wxString& text) { Put(path, text, "wb"); }
    static void AppendFile(const wxString& path, const wxString& text) { Put(path, text, "ab"); }

private:
    static void Put(const wxString& path, const wxString& text, const char* mode)
    {
        wxFFile file(path, mode);
        ASSERT_TRUE(file.IsOpened() && file.Write(text, wxConvUTF8)) << path;
    }

    TempFolder m_folder; // removed after the variable is unset
    wxString m_root;
};

} // namespace wyxtest
