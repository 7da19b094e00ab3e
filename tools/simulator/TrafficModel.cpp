#include "tools/simulator/TrafficModel.h"

#include <algorithm>

namespace
{

struct FileFormat
{
    const char* name; // as the journal's Format field says it
    const char* extension;
    unsigned minKilobytes;
    unsigned maxKilobytes;
};

const std::vector<FileFormat> kFormats = {
    {"PDF", "pdf", 40, 48000},     {"PDF", "pdf", 200, 12000},  {"PostScript", "ps", 300, 90000},
    {"TIFF", "tif", 2000, 250000}, {"JPEG", "jpg", 150, 18000}, {"PNG", "png", 80, 9000},
    {"EPS", "eps", 100, 30000},    {"PCL", "pcl", 20, 4000},    {"XPS", "xps", 60, 15000},
};

const std::vector<wxString> kDocuments = {"Q3 Sales Report",      "Brochure_Spring_Collection",
                                          "invoice_10482",        "Floorplan Level 2",
                                          "Menu-Autumn",          "Poster A1 final",
                                          "catalogue_p001-048",   "IMG_4821",
                                          "Annual Report 2025",   "business-cards_JSmith",
                                          "Wedding album 07",     "Datasheet_X200_rev4",
                                          "Flyer Open Day",       "Banner 3x1m v2",
                                          "Newsletter_Nov",       "Label sheet 24-up",
                                          "Thesis_final_FINAL",   "Map Old Town",
                                          "Price list (DE)",      "Photo_Scan_0093",
                                          "Packaging die-line",   "Calendar 2026 cover",
                                          "Training manual ch05", "Exhibition stand panel"};

const std::vector<wxString> kHotFolderNames = {"Proofs",    "Brochures", "Large Format",
                                               "Photo Lab", "Invoices",  "Daily Newspaper"};

const std::vector<wxString> kServers = {"PRN-LONDON-01", "PRN-LONDON-02",     "OCE-VARIO-6250",
                                        "HP-INDIGO-7K",  "KM-ACCURIO-C14000", "CANON-IPF-TX4100"};

struct Failure
{
    JobStage stage;
    const char* status;
    const char* detail; // %s: the server
};

const std::vector<Failure> kFailures = {
    {JobStage::Converting, "Conversion failed",
     "The file is damaged and could not be repaired (cross-reference table missing)."},
    {JobStage::Converting, "Conversion failed",
     "Font 'HelveticaNeue-Condensed' is not embedded and has no substitute."},
    {JobStage::Converting, "Unsupported file format", "The file's content does not match its extension."},
    {JobStage::Saving, "Saving failed", "The spool volume is full (0 bytes free)."},
    {JobStage::Saving, "Saving failed", "Access to the spool folder was denied."},
    {JobStage::Transferring, "Transfer failed", "Connection to %s timed out after 30 seconds."},
    {JobStage::Transferring, "Transfer failed", "%s refused the job: media 'SRA3 Gloss 170g' is not loaded."},
    {JobStage::Transferring, "Server not available", "%s is offline or does not answer on port 9100."},
};

} // namespace

wxString StageStatus(JobStage stage)
{
    switch (stage)
    {
    case JobStage::Queued:
        return "Queued";
    case JobStage::Converting:
        return "Converting file type";
    case JobStage::Saving:
        return "Saving...";
    case JobStage::Transferring:
        return "Transferring to server";
    case JobStage::Finished:
        break;
    }
    return "Transferred Successfully";
}

wxString StatusFields(const SimulatedJob& job, const wxString& status)
{
    return job.key + "\t" + job.hotFolderPath + "\t" + job.filePath + "\t" + job.server + "\t" +
           wxString::Format("%u", job.dosTime) + "\t" + status + "\t" + job.size + "\t" + job.format;
}

wxString LogFields(const SimulatedJob& job)
{
    const wxString status = job.fails ? job.failureStatus : StageStatus(JobStage::Finished);
    const wxString detail = job.fails ? job.failureDetail : "Transferred to " + job.server + ".";
    return job.key + "\t" + job.hotFolderPath + "\t" + job.filePath + "\t" + job.server + "\t" +
           wxString::Format("%u", job.dosTime) + "\t" + status + "\t" + detail;
}

std::uint32_t DosTimeOf(const wxDateTime& localMoment)
{
    const wxDateTime::Tm tm = localMoment.GetTm(wxDateTime::Local);
    const unsigned year = static_cast<unsigned>(std::clamp(tm.year, 1980, 2107)) - 1980;
    return (year << 25) | ((static_cast<unsigned>(tm.mon) + 1) << 21) |
           (static_cast<unsigned>(tm.mday) << 16) | (static_cast<unsigned>(tm.hour) << 11) |
           (static_cast<unsigned>(tm.min) << 5) | (static_cast<unsigned>(tm.sec) / 2);
}

TrafficModel::TrafficModel(std::uint32_t seed, double failureShare, const wxString& hotFolderRoot,
                           const wxString& keyPrefix)
    : m_random(seed), m_failureShare(failureShare), m_keyPrefix(keyPrefix)
{
    wxString root = hotFolderRoot;
    while (root.length() > 1 && root.EndsWith("/"))
        root.RemoveLast();
    for (size_t i = 0; i < kHotFolderNames.size(); ++i)
        m_hotFolders.push_back({root + "/" + kHotFolderNames[i], kServers[i % kServers.size()]});
}

std::vector<wxString> TrafficModel::Servers() const
{
    return kServers;
}

template <typename T> const T& TrafficModel::Pick(const std::vector<T>& from)
{
    std::uniform_int_distribution<size_t> index(0, from.size() - 1);
    return from[index(m_random)];
}

SimulatedJob TrafficModel::NextJob(std::uint32_t dosTime)
{
    SimulatedJob job;
    job.key = wxString::Format("%s-%05u", m_keyPrefix, ++m_jobCount);
    const HotFolder& folder = Pick(m_hotFolders);
    job.hotFolderPath = folder.path;
    // Most jobs go to the folder's own printer, some are routed elsewhere.
    job.server =
        std::uniform_real_distribution<double>(0, 1)(m_random) < 0.8 ? folder.server : Pick(kServers);
    const FileFormat& format = Pick(kFormats);
    job.format = format.name;
    job.filePath = folder.path + "/" + Pick(kDocuments) + "." + format.extension;
    job.dosTime = dosTime;
    if (std::uniform_real_distribution<double>(0, 1)(m_random) < 0.03)
        job.size = "N/A";
    else
    {
        std::uniform_int_distribution<unsigned long long> bytes(format.minKilobytes * 1024ULL,
                                                                format.maxKilobytes * 1024ULL);
        job.size = wxString::Format("%llu", bytes(m_random));
    }
    job.fails = std::uniform_real_distribution<double>(0, 1)(m_random) < m_failureShare;
    if (job.fails)
    {
        const Failure& failure = Pick(kFailures);
        job.failingStage = failure.stage;
        job.failureStatus = failure.status;
        job.failureDetail = wxString(failure.detail);
        job.failureDetail.Replace("%s", job.server);
    }
    return job;
}

double TrafficModel::ArrivalGap(double jobsPerSecond)
{
    return std::exponential_distribution<double>(jobsPerSecond)(m_random);
}

double TrafficModel::StageTime(double meanSeconds)
{
    return meanSeconds * std::uniform_real_distribution<double>(0.4, 1.6)(m_random);
}
