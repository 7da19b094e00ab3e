#include <atomic>
#include <cstdlib>
#include <map>
#include <thread>

#include <gtest/gtest.h>

#include "LogTestSupport.h"
#include "data/JobLogManager.h"
#include "data/JobReadWriter.h"

namespace
{

const auto* const g_wx = ::testing::AddGlobalTestEnvironment(new logtest::WxEnvironment);

// The producer trims the journal by its oldest 3000 lines when an append finds
// 10000 or more. The journal starts below that point by a third of the appends,
// so that they cross it.
int SeedLines(int jobs)
{
    return 10000 - jobs / 3;
}

// Every append rereads and rewrites the whole journal; WYX_LOG_PRODUCER_JOBS
// overrides the build's default (fewer under the sanitizers).
int ProducerJobs()
{
    wxString value;
    long jobs = 0;
    if (wxGetEnv("WYX_LOG_PRODUCER_JOBS", &value) && value.ToLong(&jobs) && jobs > 0)
        return static_cast<int>(jobs);
    return WYX_LOG_PRODUCER_JOBS_DEFAULT;
}

std::size_t JournalLineCount(const wxString& path)
{
    wyx::JobsFileReadWriter journal;
    journal.SetPath(path);
    wxArrayString lines;
    EXPECT_EQ(wyx::JobOk, journal.ReadJobs(lines));
    return lines.size();
}

TEST(LogModelBesideAProducerProcess, ListsEveryJobExactlyOnceAcrossTrimming)
{
    logtest::SystemRoot root;
    const int jobs = ProducerJobs();
    const int seedLines = SeedLines(jobs);
    ASSERT_GE(jobs, 3) << "the appends must cross the trimming point";

    wxString seed;
    for (int i = 0; i < seedLines; ++i)
        seed += logtest::LogLine(wxString::Format("seed-%d", i), "ADDED");
    logtest::SystemRoot::WriteFile(root.JournalPath(), seed);

    JobLogManager model(root.JournalPath());
    ASSERT_EQ(1, model.Parse());

    // The producer: one wyx-journal process appending every finished job, each
    // append a whole locked read and rewrite of the journal, as the service does.
    const wxString input = root.Path() + "/finished-jobs.txt";
    wxString finished;
    for (int i = 0; i < jobs; ++i)
        finished += wxString::Format("job-%d\t/hf/In\t/hf/In/%d.pdf\tPRN-01\t1112223334\t"
                                     "Transferred Successfully\tok\n",
                                     i, i);
    logtest::SystemRoot::WriteFile(input, finished);
    const std::string command =
        wxString::Format("'%s' log add - < '%s'", WYX_JOURNAL_TOOL, input).utf8_string();
    std::atomic<bool> producing{true};
    int producerStatus = -1;
    std::thread producer(
        [&]
        {
            producerStatus = std::system(command.c_str());
            producing = false;
        });
    // The polling thread's part, driven here: poll until the producer is done.
    while (producing)
    {
        model.Parse();
        wxMilliSleep(1);
    }
    producer.join();
    model.Parse();

    ASSERT_EQ(0, producerStatus);
    EXPECT_LT(JournalLineCount(root.JournalPath()), 10000u);

    std::map<wxString, int> seen;
    std::vector<JobRecord> records;
    model.GetAllRecords(records);
    for (const JobRecord& record : records)
        ++seen[record[LogField::Key]];
    EXPECT_EQ(static_cast<std::size_t>(seedLines + jobs), records.size());
    for (int i = 0; i < seedLines; ++i)
        EXPECT_EQ(1, seen[wxString::Format("seed-%d", i)]) << i;
    for (int i = 0; i < jobs; ++i)
        EXPECT_EQ(1, seen[wxString::Format("job-%d", i)]) << i;
}

} // namespace
