#include "tools/simulator/SimulatorOptions.h"

#include <cmath>

const char* const kSimulatorUsage =
    "usage: wyx-simulator [OPTIONS]\n"
    "\n"
    "Plays the hot-folder service: sets up hot folders, print servers and the\n"
    "journals, then submits jobs that are converted, saved, transferred and\n"
    "logged as finished, about one in five failing.\n"
    "\n"
    "  --rate R            jobs arriving: N or N/min per minute, N/s per second (default 30/min)\n"
    "  --duration S        seconds during which jobs arrive (default 60); the jobs\n"
    "                      under way are then finished\n"
    "  --failure-share F   share of jobs that fail, 0 to 1 (default 0.2)\n"
    "  --step-seconds S    mean time a job spends in each stage (default 2)\n"
    "  --seed N            repeat the same sequence of jobs\n"
    "  --data-dir DIR      folder of the journals and of HotFolders.ini\n"
    "                      (default: the data directory below WYX_SYSTEM_ROOT)\n"
    "  --hotfolder-root D  where the hot folders are created\n"
    "                      (default: /srv/hotfolders below WYX_SYSTEM_ROOT)\n"
    "  --help              this text\n"
    "\n"
    "SIGTERM or SIGINT ends it after the journal operation under way.\n"
    "\n"
    "exit status: 0 done, 1 could not set up, 2 usage error, 3 some journal\n"
    "operations or error markers failed (counted on standard error)\n";

namespace
{

bool ParseNumber(const wxString& text, double& value)
{
    double parsed = 0;
    if (text.empty() || !text.ToCDouble(&parsed) || !std::isfinite(parsed))
        return false;
    value = parsed;
    return true;
}

} // namespace

bool ParseRate(const wxString& text, double& jobsPerSecond)
{
    wxString unit;
    const wxString number = text.BeforeFirst('/', &unit);
    double count = 0;
    if (!ParseNumber(number, count) || count <= 0)
        return false;
    unit.MakeLower();
    if (unit.empty() || unit == "min" || unit == "m")
        jobsPerSecond = count / 60.0;
    else if (unit == "s" || unit == "sec")
        jobsPerSecond = count;
    else
        return false;
    return true;
}

bool ParseSimulatorOptions(int argc, const char* const* argv, SimulatorOptions& options, wxString& problem)
{
    for (int i = 1; i < argc; ++i)
    {
        const wxString name = wxString::FromUTF8(argv[i]);
        if (name == "--help" || name == "-h")
        {
            options.help = true;
            continue;
        }
        if (i + 1 >= argc)
        {
            problem = name.StartsWith("--") ? name + " needs a value" : "unknown argument " + name;
            return false;
        }
        const wxString value = wxString::FromUTF8(argv[++i]);
        bool ok = true;
        if (name == "--rate")
            ok = ParseRate(value, options.jobsPerSecond);
        else if (name == "--duration")
            ok = ParseNumber(value, options.durationSeconds) && options.durationSeconds >= 0;
        else if (name == "--failure-share")
            ok = ParseNumber(value, options.failureShare) && options.failureShare >= 0 &&
                 options.failureShare <= 1;
        else if (name == "--step-seconds")
            ok = ParseNumber(value, options.stepSeconds) && options.stepSeconds >= 0;
        else if (name == "--seed")
        {
            unsigned long seed = 0;
            ok = value.ToULong(&seed) && seed <= UINT32_MAX;
            options.seed = static_cast<std::uint32_t>(seed);
            options.seedGiven = true;
        }
        else if (name == "--data-dir")
            options.dataDirectory = value;
        else if (name == "--hotfolder-root")
            options.hotFolderRoot = value;
        else
        {
            problem = "unknown option " + name;
            return false;
        }
        if (!ok || value.empty())
        {
            problem = "bad value for " + name + ": " + value;
            return false;
        }
    }
    return true;
}
