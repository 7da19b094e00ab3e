// The program's log target drops every message, and quietly: a target that
// left the text to the base class would be caught complaining, as assertions
// stay on here.
#include <gtest/gtest.h>
#include <wx/debug.h>
#include <wx/log.h>

#include <memory>
#include <vector>

#include "app/NoLog.h"
#include "app/WyxAppTraits.h"

std::vector<wxString> g_asserts;

TEST(NoLog, IsTheTraitsTargetAndDropsEveryMessageWithoutComplaint)
{
    std::unique_ptr<wxLog> target(WyxAppTraits().CreateLogTarget());
    ASSERT_NE(dynamic_cast<NoLog*>(target.get()), nullptr);
    const wxAssertHandler_t previousHandler =
        wxSetAssertHandler([](const wxString&, int, const wxString&, const wxString& cond,
                              const wxString& msg) { g_asserts.push_back(msg.empty() ? cond : msg); });
    const bool wasEnabled = wxLog::EnableLogging(true);
    wxLog::SetLogLevel(wxLOG_Info);
    wxLog* const previousTarget = wxLog::SetActiveTarget(target.get());
    wxLogError("cannot open file '%s'", "wyx_folder.ico");
    wxLogWarning("catalog '%s' not found", "wyx3");
    wxLogInfo("information");
    wxLog::FlushActive();
    wxLog::SetActiveTarget(previousTarget);
    wxLog::EnableLogging(wasEnabled);
    wxSetAssertHandler(previousHandler);
    EXPECT_TRUE(g_asserts.empty()) << g_asserts.front();
}
