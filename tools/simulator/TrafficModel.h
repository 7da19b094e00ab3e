#pragma once

#include <cstdint>
#include <random>
#include <vector>

#include <wx/datetime.h>
#include <wx/string.h>

// The stages a job passes through; a failing job stops in the stage it fails in.
enum class JobStage : int
{
    Queued = 0,
    Converting,
    Saving,
    Transferring,
    Finished
};

// The status text the service writes for a stage.
wxString StageStatus(JobStage stage);

struct HotFolder
{
    wxString path;
    wxString server; // where its jobs go
};

// One job as the service sees it.
struct SimulatedJob
{
    wxString key;
    wxString hotFolderPath;
    wxString filePath;
    wxString server;
    std::uint32_t dosTime = 0;
    wxString size; // bytes in decimal, or "N/A"
    wxString format;
    bool fails = false;
    JobStage failingStage = JobStage::Converting;
    wxString failureStatus;
    wxString failureDetail;
};

// The status journal's fields of a job without the tag, TAB-separated.
wxString StatusFields(const SimulatedJob& job, const wxString& status);
// The log journal's fields of a finished job without the tag.
wxString LogFields(const SimulatedJob& job);

// A local moment as the journals' MS-DOS date-time.
std::uint32_t DosTimeOf(const wxDateTime& localMoment);

// Makes up hot folders, servers and jobs that look like a print shop's: the
// same seed gives the same sequence.
class TrafficModel
{
public:
    TrafficModel(std::uint32_t seed, double failureShare, const wxString& hotFolderRoot,
                 const wxString& keyPrefix);

    const std::vector<HotFolder>& HotFolders() const { return m_hotFolders; }
    std::vector<wxString> Servers() const;

    SimulatedJob NextJob(std::uint32_t dosTime);
    // Seconds until the next arrival, for a mean rate.
    double ArrivalGap(double jobsPerSecond);
    // Seconds a job stays in one stage, around the mean.
    double StageTime(double meanSeconds);

private:
    template <typename T> const T& Pick(const std::vector<T>& from);

    std::mt19937 m_random;
    double m_failureShare;
    wxString m_keyPrefix;
    unsigned m_jobCount = 0;
    std::vector<HotFolder> m_hotFolders;
};
