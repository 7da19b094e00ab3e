#include "data/JobReadWriter.h"

#include <algorithm>
#include <functional>
#include <new>

#include <wx/filename.h>

#include "data/JournalText.h"
#include "data/NamedMutex.h"
#include "platform/os/FileContents.h"

namespace wyx
{

namespace
{

constexpr std::size_t kLogTrimThreshold = 10000;
constexpr std::size_t kLogTrimCount = 3000;
constexpr const wchar_t* kLogJournalMarker = L"TiveraJobsLogFile";

enum class Access
{
    Write,
    // Writes without keeping anything read, so any journal can be emptied.
    Overwrite
};

// The work of one operation on the lines in memory; true asks for the file to
// be written back.
using LineEdit = std::function<bool(std::vector<JournalLine>&)>;

wxString TrimmedKey(const wxString& text)
{
    wxString key = text.BeforeFirst('\t');
    key.Trim(true);
    return key;
}

// A key is never empty, so an empty argument matches no line (not every
// blank line of the journal).
bool HasKey(const JournalLine& line, const wxString& key)
{
    return !key.empty() && TrimmedKey(line.text) == key;
}

// The journal's bytes, when there are no more than maxBytes of them.
int ReadBounded(const wxString& path, std::size_t maxBytes, std::string& bytes)
{
    // One byte more than the bound tells a journal at the bound from a larger one.
    if (wyxos::ReadFileContents(path, bytes, maxBytes + 1) != wyxos::ReadResult::Read)
        return JobFileMissing;
    return bytes.size() <= maxBytes ? JobOk : JobFileMissing;
}

// An edit needs every byte to rewrite lines, and none to empty the journal,
// so that even a journal too large to read can be emptied.
int ReadForEdit(const wxString& path, Access access, std::string& bytes)
{
    if (access == Access::Write)
        return ReadBounded(path, kMaxJournalBytes, bytes);
    return wyxos::ReadFileContents(path, bytes, 0) == wyxos::ReadResult::Read ? JobOk : JobFileMissing;
}

// Every line of the journal; the lines are left as they were when it cannot be read.
int ReadTexts(const wxString& path, wxArrayString& lines)
{
    std::string bytes;
    const int read = ReadBounded(path, kMaxJournalBytes, bytes);
    if (read != JobOk)
        return read;
    return DecodeJournalTexts(bytes.data(), bytes.size(), lines) ? JobOk : JobFileMissing;
}

// A journal under its named lock, held from the first read until destruction.
class LockedJournal
{
public:
    explicit LockedJournal(const wxString& path) : m_path(path), m_lock(wxFileName(path).GetName()) {}

    bool Lock(const std::atomic<bool>* keepWaiting) { return m_lock.lock(keepWaiting); }

    int Replace(const std::vector<JournalLine>& lines)
    {
        return wyxos::ReplaceFileContents(m_path, EncodeJournal(lines)) ? JobOk : JobWriteFailed;
    }

private:
    wxString m_path;
    named_mutex_lock m_lock;
};

// One atomic read-modify-write of the whole journal.
int EditLocked(const wxString& path, const std::atomic<bool>* keepWaiting, Access access,
               const LineEdit& edit)
{
    if (path.empty())
        return JobOk;
    LockedJournal locked(path);
    if (!locked.Lock(keepWaiting))
        return JobLockFailed;
    std::string bytes;
    const int read = ReadForEdit(path, access, bytes);
    if (read != JobOk)
        return read;

    DecodedJournal journal = DecodeJournal(bytes.data(), bytes.size());
    if (journal.tooLarge)
        return JobFileMissing;
    // Rewriting a journal that could not be decoded in full would destroy the
    // undecodable part; readers still get the lines with replacements.
    if (access == Access::Write && !journal.exact)
        return JobFileMissing;
    if (!edit(journal.lines))
        return JobOk;
    return locked.Replace(journal.lines);
}

} // namespace

int JobsFileReadWriter::ReadJobsHoldingLock(wxArrayString& lines)
{
    if (m_path.empty())
        return JobOk;
    return ReadTexts(m_path, lines);
}

int JobsFileReadWriter::ReadJobs(wxArrayString& lines)
{
    if (m_path.empty())
        return JobOk;
    LockedJournal locked(m_path);
    if (!locked.Lock(m_keepWaiting))
        return JobLockFailed;
    return ReadTexts(m_path, lines);
}

int JobsFileReadWriter::AddJob(wxString& line)
{
    const bool trims = m_path.Contains(kLogJournalMarker);
    return EditLocked(m_path, m_keepWaiting, Access::Write,
                      [&line, trims](std::vector<JournalLine>& journal)
                      {
                          if (line.empty())
                              return false;
                          line += "\tADDED";
                          if (trims && journal.size() >= kLogTrimThreshold)
                              journal.erase(journal.begin(), journal.begin() + kLogTrimCount);
                          // A last line without a line break would otherwise run into the new one.
                          if (!journal.empty() && journal.back().end == LineEnd::None)
                              journal.back().end = LineEnd::CrLf;
                          journal.push_back(JournalLine{line, LineEnd::CrLf, std::string()});
                          return true;
                      });
}

int JobsFileReadWriter::ModifyJob(wxString line)
{
    const wxString key = TrimmedKey(line);
    const wxString replacement = line + "\tMODIFIED";
    return EditLocked(m_path, m_keepWaiting, Access::Write,
                      [&key, &replacement](std::vector<JournalLine>& journal)
                      {
                          for (JournalLine& existing : journal)
                              if (HasKey(existing, key))
                                  existing.text = replacement;
                          return true;
                      });
}

int JobsFileReadWriter::DeleteJob(wxString key)
{
    key.Trim(true);
    return EditLocked(m_path, m_keepWaiting, Access::Write,
                      [&key](std::vector<JournalLine>& journal)
                      {
                          journal.erase(std::remove_if(journal.begin(), journal.end(),
                                                       [&key](const JournalLine& line)
                                                       { return HasKey(line, key); }),
                                        journal.end());
                          return true;
                      });
}

int JobsFileReadWriter::RemoveJob(wxString key)
{
    return DeleteJob(key);
}

int JobsFileReadWriter::ClearJobs()
{
    return EditLocked(m_path, m_keepWaiting, Access::Overwrite,
                      [](std::vector<JournalLine>& journal)
                      {
                          journal.clear();
                          return true;
                      });
}

int JobsFileReadWriter::CommitJob(wxString key)
{
    key.Trim(true);
    return EditLocked(m_path, m_keepWaiting, Access::Write,
                      [&key](std::vector<JournalLine>& journal)
                      {
                          if (journal.empty())
                              return false;
                          for (JournalLine& line : journal)
                          {
                              if (!HasKey(line, key) || line.text.Contains("DELETE"))
                                  continue;
                              // A line of one field has no tag to replace; its key is kept.
                              const wxString fields =
                                  line.text.Contains("\t") ? line.text.BeforeLast('\t') : line.text;
                              line.text = fields + "\tCOMMIT";
                          }
                          return true;
                      });
}

} // namespace wyx

wyx::IJobReadWriter* CreateJobReadWriter(int kind)
{
    if (kind != kJobsFileReadWriterKind)
        return nullptr;
    return new (std::nothrow) wyx::JobsFileReadWriter();
}
