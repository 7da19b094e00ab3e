#pragma once

#include <cstdint>

#include <wx/string.h>

// What the command line of wyx-simulator asks for.
struct SimulatorOptions
{
    double jobsPerSecond = 0.5;
    double durationSeconds = 60;
    double failureShare = 0.2;
    double stepSeconds = 2.0; // mean time a job spends in each stage
    std::uint32_t seed = 0;
    bool seedGiven = false;
    wxString dataDirectory; // empty: the program's data directory
    wxString hotFolderRoot; // empty: /srv/hotfolders below the system root
    bool help = false;
};

extern const char* const kSimulatorUsage;

// Reads the arguments after the program name. False with a message for the
// user when one is malformed or unknown.
bool ParseSimulatorOptions(int argc, const char* const* argv, SimulatorOptions& options, wxString& problem);

// "30", "30/min", "2/s" or "0.5/sec": jobs per second, false when unreadable.
bool ParseRate(const wxString& text, double& jobsPerSecond);
