#include "tools/journal/JournalCommand.h"

#include <memory>
#include <vector>

#include <wx/arrstr.h>
#include <wx/string.h>

#include "data/DataLocations.h"
#include "data/JobReadWriter.h"

namespace
{

constexpr int kUsageError = 2;
// After wyx::JobResult's: what was read could not all be written out.
constexpr int kOutputFailed = 4;

const char* const kUsage =
    "usage: wyx-journal JOURNAL OPERATION [ARGUMENT]\n"
    "\n"
    "JOURNAL    status, log (the journals of the data directory) or a path containing \"/\"\n"
    "OPERATION  read            print every line as stored, one per output line (UTF-8)\n"
    "           add LINE        append LINE with the tag ADDED\n"
    "           modify LINE     replace the lines with LINE's key by LINE with the tag MODIFIED\n"
    "           delete KEY      remove the lines with KEY\n"
    "           remove KEY      the same as delete\n"
    "           commit KEY      tag the lines with KEY COMMIT, except those holding DELETE\n"
    "           clear           remove every line\n"
    "\n"
    "LINE is the fields without the tag, separated by TABs, given as one argument;\n"
    "its first field is the key. Keys compare exactly, trailing blanks ignored.\n"
    "An ARGUMENT of \"-\" reads one argument a line from standard input and runs\n"
    "the operation once for each, each under the lock, stopping at the first\n"
    "failure; a producer can so append many jobs without a process for each.\n"
    "No operation creates a journal: on a missing journal, add (like every other\n"
    "operation) changes nothing and exits with 1. Create it first, e.g. with touch.\n"
    "The journal's lock is waited for as long as another process holds it.\n"
    "\n"
    "exit status: 0 done, 1 journal missing or unreadable, 2 lock not taken or\n"
    "usage error, 3 journal could not be written (it is unchanged), 4 the output\n"
    "could not be written (a full disk, say)\n";

enum class Operation
{
    Read,
    Add,
    Modify,
    Delete,
    Remove,
    Commit,
    Clear
};

struct OperationName
{
    const char* name;
    Operation operation;
    bool takesArgument;
};

const OperationName kOperations[] = {
    {"read", Operation::Read, false},    {"add", Operation::Add, true},
    {"modify", Operation::Modify, true}, {"delete", Operation::Delete, true},
    {"remove", Operation::Remove, true}, {"commit", Operation::Commit, true},
    {"clear", Operation::Clear, false},
};

struct Command
{
    wxString journal;
    Operation operation = Operation::Read;
    wxString argument;
    bool argumentsFromInput = false;
};

int UsageError(std::FILE* err, const wxString& problem)
{
    std::fprintf(err,
                 "wyx-journal: %s\nusage: wyx-journal JOURNAL OPERATION [ARGUMENT] (--help tells more)\n",
                 static_cast<const char*>(problem.utf8_str()));
    return kUsageError;
}

wxString JournalPath(const wxString& journal)
{
    if (journal == "status")
        return GetDataDirectory() + "TiveraJobsStatusFile.txt";
    if (journal == "log")
        return GetDataDirectory() + "TiveraJobsLogFile.txt";
    if (journal.Contains("/"))
        return journal;
    return wxString();
}

// Takes one ARGUMENT into command, or returns what is wrong with it.
wxString CheckArgument(const std::string& raw, Command& command)
{
    command.argument = wxString::FromUTF8(raw.data(), raw.size());
    if (command.argument.empty() && !raw.empty())
        return "the argument is not valid UTF-8";
    if (command.argument.find_first_of("\r\n") != wxString::npos)
        return "the argument must be a single line";
    if (command.operation != Operation::Add && command.argument.empty())
        return "the key must not be empty";
    return wxString();
}

// Fills command, or returns the problem with the arguments.
wxString Parse(int argc, const char* const* argv, Command& command)
{
    if (argc < 3)
        return "a journal and an operation are needed";

    command.journal = JournalPath(wxString::FromUTF8(argv[1]));
    if (command.journal.empty())
        return wxString::Format("unknown journal \"%s\": use status, log or a path containing \"/\"",
                                wxString::FromUTF8(argv[1]));

    const wxString name = wxString::FromUTF8(argv[2]);
    const OperationName* found = nullptr;
    for (const OperationName& candidate : kOperations)
        if (name == candidate.name)
            found = &candidate;
    if (found == nullptr)
        return wxString::Format("unknown operation \"%s\"", name);
    command.operation = found->operation;

    const int expected = found->takesArgument ? 4 : 3;
    if (argc != expected)
        return wxString::Format(
            found->takesArgument ? "%s needs exactly one argument" : "%s takes no argument", name);
    if (!found->takesArgument)
        return wxString();

    if (std::string(argv[3]) == "-")
    {
        command.argumentsFromInput = true;
        return wxString();
    }
    return CheckArgument(argv[3], command);
}

int Run(const Command& command, std::FILE* out)
{
    std::unique_ptr<wyx::IJobReadWriter> created(CreateJobReadWriter(kJobsFileReadWriterKind));
    auto* journal = static_cast<wyx::JobsFileReadWriter*>(created.get());
    if (journal == nullptr)
        return wyx::JobFileMissing;
    journal->SetPath(command.journal);

    wxString argument = command.argument;
    switch (command.operation)
    {
    case Operation::Read:
    {
        wxArrayString lines;
        const int result = journal->ReadJobs(lines);
        if (result == wyx::JobOk)
            for (const wxString& line : lines)
            {
                const wxScopedCharBuffer text = line.utf8_str();
                std::fwrite(text.data(), 1, text.length(), out);
                std::fputc('\n', out);
            }
        return result;
    }
    case Operation::Add:
        return journal->AddJob(argument);
    case Operation::Modify:
        return journal->ModifyJob(argument);
    case Operation::Delete:
        return journal->DeleteJob(argument);
    case Operation::Remove:
        return journal->RemoveJob(argument);
    case Operation::Commit:
        return journal->CommitJob(argument);
    case Operation::Clear:
        return journal->ClearJobs();
    }
    return kUsageError;
}

void ReportFailure(std::FILE* err, int result, const wxString& journal)
{
    const char* problem = nullptr;
    switch (result)
    {
    case wyx::JobFileMissing:
        problem = "the journal is missing or cannot be read";
        break;
    case wyx::JobLockFailed:
        problem = "the journal's lock could not be taken";
        break;
    case wyx::JobWriteFailed:
        problem = "the journal could not be written; it is unchanged";
        break;
    default:
        return;
    }
    std::fprintf(err, "wyx-journal: %s: %s\n", static_cast<const char*>(journal.utf8_str()), problem);
}

// Output goes out in blocks, so a failure to write it (a full disk) shows only
// when it is flushed; whoever reads our output must not take what arrived for
// the whole journal.
int FlushOutput(std::FILE* out, std::FILE* err, int result)
{
    if (std::fflush(out) == 0 && !std::ferror(out))
        return result;
    std::fputs("wyx-journal: the output could not be written\n", err);
    return result == wyx::JobOk ? kOutputFailed : result;
}

// One operation per line of input ("\n" or "\r\n" ends a line).
int RunForEachInputLine(Command command, std::FILE* in, std::FILE* out, std::FILE* err)
{
    std::string line;
    int character;
    bool more = true;
    while (more)
    {
        line.clear();
        while ((character = std::fgetc(in)) != EOF && character != '\n')
            line.push_back(static_cast<char>(character));
        more = character != EOF;
        if (!line.empty() && line.back() == '\r')
            line.pop_back();
        if (line.empty() && !more)
            break;
        const wxString problem = CheckArgument(line, command);
        if (!problem.empty())
            return UsageError(err, problem);
        const int result = Run(command, out);
        if (result != wyx::JobOk)
        {
            ReportFailure(err, result, command.journal);
            return result;
        }
    }
    return FlushOutput(out, err, wyx::JobOk);
}

} // namespace

int RunJournalCommand(int argc, const char* const* argv, std::FILE* in, std::FILE* out, std::FILE* err)
{
    if (argc == 2 && (wxString(argv[1]) == "--help" || wxString(argv[1]) == "-h"))
    {
        std::fputs(kUsage, out);
        return FlushOutput(out, err, 0);
    }
    Command command;
    const wxString problem = Parse(argc, argv, command);
    if (!problem.empty())
        return UsageError(err, problem);
    if (command.argumentsFromInput)
        return RunForEachInputLine(command, in, out, err);
    const int result = Run(command, out);
    ReportFailure(err, result, command.journal);
    return FlushOutput(out, err, result);
}
