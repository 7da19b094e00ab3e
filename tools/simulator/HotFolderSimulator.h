#pragma once

#include <functional>
#include <map>
#include <memory>

#include <wx/string.h>

#include "data/JobReadWriter.h"
#include "tools/simulator/SimulatorOptions.h"
#include "tools/simulator/TrafficModel.h"

// Plays the hot-folder service over the journals: jobs arrive at random, pass
// through their stages and are logged when they finish. Every journal change
// is one whole operation of wyx::IJobReadWriter, so stopping between two of
// them never leaves a journal half written.
class HotFolderSimulator
{
public:
    struct Totals
    {
        unsigned started = 0;
        unsigned succeeded = 0;
        unsigned failed = 0;
        unsigned journalErrors = 0;
        unsigned markerErrors = 0; // Error.er files that could not be written

        bool AllWritten() const { return journalErrors == 0 && markerErrors == 0; }
    };

    // shouldStop is asked between operations; true ends the run at once.
    HotFolderSimulator(const SimulatorOptions& options, std::function<bool()> shouldStop);

    // Creates the data folder, the hot folders with their service subfolder,
    // HotFolders.ini and empty journals where none exist.
    bool Prepare(wxString& problem);

    // Jobs arrive for the given duration; those under way are then finished.
    Totals Run();

    const wxString& DataDirectory() const { return m_dataDirectory; }

private:
    struct Step
    {
        unsigned job;
        JobStage stage;  // the stage the job enters
        bool removeLine; // drop the committed line from the status journal
    };

    void Arrive(double now);
    void Advance(const Step& step, double now);
    void Finish(SimulatedJob& job);
    void Count(int result);
    double Elapsed() const;

    SimulatorOptions m_options;
    std::function<bool()> m_shouldStop;
    wxString m_dataDirectory;
    std::unique_ptr<TrafficModel> m_traffic;
    std::unique_ptr<wyx::IJobReadWriter> m_status;
    std::unique_ptr<wyx::IJobReadWriter> m_log;
    std::map<unsigned, SimulatedJob> m_jobs;
    std::multimap<double, Step> m_steps;
    unsigned m_nextJob = 0;
    Totals m_totals;
    wxLongLong m_start;
};
