#include <gtest/gtest.h>
#include <wx/debug.h>
#include <wx/log.h>

#include <memory>
#include <vector>

#include "app/NoLog.h"
#include "app/WyxAppTraits.h"

namespace
{

std::vector<wxString> g_asserts;

TEST(NoLog, IsTheTraitsTargetAndDropsEveryMessageWithoutComplaint)
{
    WyxAppTraits traits;
    std::unique_ptr<wxLog> target(traits.CreateLogTarget());
    ASSERT_NE(dynamic_cast<NoLog*>(target.get()), nullptr);
    // Assertions stay on here, so a target that left the text to the base
    // class would be caught complaining.
    const wxAssertHandler_t previousHandler =
        wxSetAssertHandler([](const wxString&, int, const wxString&, const wxString& cond,
                              const wxString& msg) { g_asserts.push_back(msg.empty() ? cond : msg); });
    const bool wasEnabled = wxLog::EnableLogging(true);
    const wxLogLevel previousLevel = wxLog::GetLogLevel();
    wxLog::SetLogLevel(wxLOG_Info);
    wxLog* const previousTarget = wxLog::SetActiveTarget(target.get());
    wxLogError("cannot open file '%s'", "wyx_folder.ico");
    wxLogWarning("catalog '%s' not found", "wyx3");
    wxLogMessage("message");
    wxLogInfo("information");
    wxLog::FlushActive();
    wxLog::SetActiveTarget(previousTarget);
    wxLog::SetLogLevel(previousLevel);
    wxLog::EnableLogging(wasEnabled);
    wxSetAssertHandler(previousHandler);
    EXPECT_TRUE(g_asserts.empty()) << g_asserts.front();
}

} // namespace
