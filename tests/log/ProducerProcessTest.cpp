#include <chrono>
#include <cstdlib>
#include <future>
#include <set>

#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/JobLogManager.h"

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

// The producer trims the journal by its oldest 3000 lines when an append finds
// 10000 or more. The journal starts a third of the appends below that point, so
// that they cross it; every append rereads and rewrites the whole journal.
TEST(LogModelBesideAProducerProcess, ListsEveryJobExactlyOnceAcrossTrimming)
{
    logtest::SystemRoot root;
    const int jobs = WYX_LOG_PRODUCER_JOBS, seedLines = 10000 - jobs / 3;
    wxString seed, finished;
    for (int i = 0; i < seedLines; ++i)
        seed += logtest::LogLine(wxString::Format("seed-%d", i), "ADDED");
    for (int i = 0; i < jobs; ++i)
        finished += logtest::LogLine(wxString::Format("job-%d", i), "").BeforeLast('\t') + "\n";
    logtest::SystemRoot::WriteFile(root.JournalPath(), seed);
    logtest::SystemRoot::WriteFile(root.Path() + "/finished-jobs.txt", finished);
    JobLogManager model(root.JournalPath());
    ASSERT_EQ(1, model.Parse());

    // One wyx-journal process appends every finished job, each append a whole
    // locked read and rewrite of the journal, as the service does.
    const std::string command =
        wxString::Format("'%s' log add - < '%s/finished-jobs.txt'", WYX_JOURNAL_TOOL, root.Path())
            .utf8_string();
    auto producer = std::async(std::launch::async, [&] { return std::system(command.c_str()); });
    // What the polling thread does, driven here until the producer is done.
    while (producer.wait_for(std::chrono::seconds(0)) != std::future_status::ready)
        model.Parse();
    ASSERT_EQ(0, producer.get());
    model.Parse();

    EXPECT_LT(wxFileName::GetSize(root.JournalPath()), wxULongLong(seed.utf8_str().length()))
        << "the journal was trimmed";
    // Only seed-* and job-* keys were written: as many distinct keys as records means each once.
    std::vector<JobRecord> records;
    model.GetAllRecords(records);
    std::set<wxString> keys;
    for (const JobRecord& record : records)
        keys.insert(record[LogField::Key]);
    EXPECT_EQ(static_cast<std::size_t>(seedLines + jobs), records.size());
    EXPECT_EQ(records.size(), keys.size());
}

} // namespace
