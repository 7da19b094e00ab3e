#include "tools/simulator/HotFolderSimulator.h"

#include <string>

#include <wx/datetime.h>
#include <wx/filename.h>
#include <wx/time.h>
#include <wx/utils.h>

#include "data/DataLocations.h"
#include "platform/os/FileContents.h"
#include "platform/os/SystemPaths.h"

namespace
{

const wxString kServiceFolder = "[_KELVO_HotFolder_]";
// How many stage times a committed line stays in the status journal before the
// service removes it.
constexpr double kCommittedLineStages = 3.0;
// The longest nap between two checks of the stop request.
constexpr long kLongestNapMs = 100;

bool MakeFolder(const wxString& path)
{
    return wxFileName::DirExists(path) || wxFileName::Mkdir(path, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);
}

std::string Utf8(const wxString& text)
{
    const wxScopedCharBuffer bytes = text.utf8_str();
    return std::string(bytes.data(), bytes.length());
}

std::unique_ptr<wyx::IJobReadWriter> JournalAt(const wxString& path)
{
    std::unique_ptr<wyx::IJobReadWriter> reader(CreateJobReadWriter(kJobsFileReadWriterKind));
    if (auto* file = dynamic_cast<wyx::JobsFileReadWriter*>(reader.get()))
        file->SetPath(path);
    return reader;
}

} // namespace

HotFolderSimulator::HotFolderSimulator(const SimulatorOptions& options, std::function<bool()> shouldStop)
    : m_options(options), m_shouldStop(std::move(shouldStop))
{
    m_dataDirectory = options.dataDirectory.empty() ? GetDataDirectory() : options.dataDirectory;
    if (!m_dataDirectory.EndsWith("/"))
        m_dataDirectory += "/";
    const wxString hotFolderRoot =
        options.hotFolderRoot.empty() ? wyxos::UnderSystemRoot("/srv/hotfolders") : options.hotFolderRoot;
    const std::uint32_t seed =
        options.seedGiven ? options.seed : static_cast<std::uint32_t>(wxGetUTCTimeMillis().GetValue());
    // Keys stay unique across runs: the log model never takes a key twice.
    const wxString keyPrefix =
        wxString::Format("J%llx", static_cast<unsigned long long>(wxGetUTCTimeMillis().GetValue()));
    m_traffic = std::make_unique<TrafficModel>(seed, options.failureShare, hotFolderRoot, keyPrefix);
    m_status = JournalAt(m_dataDirectory + "TiveraJobsStatusFile.txt");
    m_log = JournalAt(m_dataDirectory + "TiveraJobsLogFile.txt");
}

bool HotFolderSimulator::Prepare(wxString& problem)
{
    if (!MakeFolder(m_dataDirectory))
    {
        problem = "cannot create the data folder " + m_dataDirectory;
        return false;
    }
    wxString ini = "; Written by wyx-simulator\n[HotFolders]\n";
    for (const HotFolder& folder : m_traffic->HotFolders())
    {
        if (!MakeFolder(folder.path + "/" + kServiceFolder))
        {
            problem = "cannot create the hot folder " + folder.path;
            return false;
        }
        ini += folder.path + "\n";
    }
    ini += "[Servers]\n";
    for (const wxString& server : m_traffic->Servers())
        ini += server + "\n";
    // Put in place as one step, so the program never reads half of it.
    if (!wyxos::WriteFileContents(m_dataDirectory + "HotFolders.ini", Utf8(ini)))
    {
        problem = "cannot write " + m_dataDirectory + "HotFolders.ini";
        return false;
    }
    for (const char* journal : {"TiveraJobsStatusFile.txt", "TiveraJobsLogFile.txt"})
    {
        if (!wyxos::CreateFileIfMissing(m_dataDirectory + journal))
        {
            problem = "cannot create " + m_dataDirectory + journal;
            return false;
        }
    }
    return true;
}

double HotFolderSimulator::Elapsed() const
{
    return (wxGetUTCTimeMillis() - m_start).ToDouble() / 1000.0;
}

void HotFolderSimulator::Count(int result)
{
    if (result != wyx::JobOk)
        ++m_totals.journalErrors;
}

void HotFolderSimulator::Arrive(double now)
{
    const unsigned id = m_nextJob++;
    SimulatedJob job = m_traffic->NextJob(DosTimeOf(wxDateTime::Now()));
    wxString line = StatusFields(job, StageStatus(JobStage::Queued));
    Count(m_status->AddJob(line));
    ++m_totals.started;
    m_jobs.emplace(id, std::move(job));
    m_steps.emplace(now + m_traffic->StageTime(m_options.stepSeconds), Step{id, JobStage::Converting, false});
}

void HotFolderSimulator::Advance(const Step& step, double now)
{
    auto found = m_jobs.find(step.job);
    if (found == m_jobs.end())
        return;
    SimulatedJob& job = found->second;
    if (step.removeLine)
    {
        Count(m_status->DeleteJob(job.key));
        m_jobs.erase(found);
        return;
    }
    // A failing job ends in the stage that went wrong instead of entering the next.
    const bool failsNow = job.fails && static_cast<int>(step.stage) == static_cast<int>(job.failingStage) + 1;
    if (step.stage == JobStage::Finished || failsNow)
    {
        Finish(job);
        m_steps.emplace(now + kCommittedLineStages * m_options.stepSeconds,
                        Step{step.job, JobStage::Finished, true});
        return;
    }
    Count(m_status->ModifyJob(StatusFields(job, StageStatus(step.stage))));
    const auto next = static_cast<JobStage>(static_cast<int>(step.stage) + 1);
    m_steps.emplace(now + m_traffic->StageTime(m_options.stepSeconds), Step{step.job, next, false});
}

void HotFolderSimulator::Finish(SimulatedJob& job)
{
    Count(m_status->CommitJob(job.key));
    wxString line = LogFields(job);
    Count(m_log->AddJob(line));
    if (job.fails)
    {
        ++m_totals.failed;
        if (!wyxos::AppendFileContents(job.hotFolderPath + "/" + kServiceFolder + "/Error.er",
                                       Utf8(job.key + "\t" + job.failureStatus + "\n")))
            ++m_totals.markerErrors;
    }
    else
    {
        ++m_totals.succeeded;
    }
}

HotFolderSimulator::Totals HotFolderSimulator::Run()
{
    m_start = wxGetUTCTimeMillis();
    double nextArrival = m_traffic->ArrivalGap(m_options.jobsPerSecond);
    while (!m_shouldStop())
    {
        const double now = Elapsed();
        const bool arriving = nextArrival < m_options.durationSeconds;
        if (arriving && nextArrival <= now)
        {
            Arrive(now);
            nextArrival += m_traffic->ArrivalGap(m_options.jobsPerSecond);
            continue;
        }
        if (!m_steps.empty() && m_steps.begin()->first <= now)
        {
            const Step step = m_steps.begin()->second;
            m_steps.erase(m_steps.begin());
            Advance(step, now);
            continue;
        }
        if (!arriving && m_steps.empty())
            break;
        double due = arriving ? nextArrival : m_steps.begin()->first;
        if (arriving && !m_steps.empty())
            due = std::min(due, m_steps.begin()->first);
        const long napMs = std::min(kLongestNapMs, static_cast<long>((due - now) * 1000.0) + 1);
        wxMilliSleep(static_cast<unsigned long>(napMs));
    }
    return m_totals;
}
