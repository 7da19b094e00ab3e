// The window icon file the program loads from beside itself.
#include <gtest/gtest.h>
#include <wx/filename.h>
#include <wx/iconbndl.h>
#include <wx/stdpaths.h>

namespace
{
wxString IconBesideTheProgram()
{
    wxFileName path(wxStandardPaths::Get().GetExecutablePath());
    path.SetFullName("wyx_folder.ico");
    return path.GetFullPath();
}

TEST(WindowIconFile, LiesBesideTheBuiltProgram)
{
    EXPECT_TRUE(wxFileName::FileExists(IconBesideTheProgram())) << IconBesideTheProgram();
}

TEST(WindowIconFile, LoadsWithItsSixteenThirtyTwoAndFortyEightPixelImages)
{
    const wxIconBundle bundle(IconBesideTheProgram(), wxBITMAP_TYPE_ANY);
    ASSERT_TRUE(bundle.IsOk());
    EXPECT_EQ(bundle.GetIconCount(), 3u);
    for (int size : {16, 32, 48})
    {
        const wxIcon icon = bundle.GetIconOfExactSize(wxSize(size, size));
        ASSERT_TRUE(icon.IsOk()) << size;
        EXPECT_EQ(icon.GetWidth(), size);
        EXPECT_EQ(icon.GetHeight(), size);
    }
}
} // namespace
