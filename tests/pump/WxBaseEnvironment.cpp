// The pump needs the library's thread module and an application object for its
// pending-event queues; a console application is enough.
#include <gtest/gtest.h>
#include <wx/init.h>
#include <wx/log.h>

namespace
{

class WxBaseEnvironment : public ::testing::Environment
{
public:
    void SetUp() override
    {
        ASSERT_TRUE(wxInitialize());
        wxLog::EnableLogging(false);
    }
    void TearDown() override { wxUninitialize(); }
};

const auto* const registered = ::testing::AddGlobalTestEnvironment(new WxBaseEnvironment);

} // namespace
