// The program's log target drops every message, and quietly: a target that
// left the text to the base class would be caught complaining, as assertions
// stay on here.
#include <gtest/gtest.h>
#include <wx/debug.h>
#include <wx/log.h>

#include <memory>

#include "app/NoLog.h"
#include "app/WyxAppTraits.h"

int g_asserts = 0;

TEST(NoLog, IsTheTraitsTargetAndDropsEveryMessageWithoutComplaint)
{
    std::unique_ptr<wxLog> target(WyxAppTraits().CreateLogTarget());
    ASSERT_NE(dynamic_cast<NoLog*>(target.get()), nullptr);
    wxSetAssertHandler([](const wxString&, int, const wxString&, const wxString&, const wxString&)
                       { ++g_asserts; });
    wxLog::EnableLogging(true); // the test main turns it off
    wxLog* const previous = wxLog::SetActiveTarget(target.get());
    wxLogError("cannot open file '%s'", "wyx_folder.ico");
    wxLogInfo("information");
    wxLog::FlushActive();
    wxLog::SetActiveTarget(previous);
    EXPECT_EQ(g_asserts, 0);
}
