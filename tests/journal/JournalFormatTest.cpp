// The journal as the producer command writes it and the reader sees it: lines,
// keys, encodings, line ends and the bounds of one read.
#include <memory>

#include <wx/strconv.h>

#include "JournalTestSupport.h"
#include "data/JournalText.h"

namespace journaltest
{
namespace
{

using JournalFormat = JournalTest;

// UTF-8 lines around two that are not (a Latin-1 line from an old producer and
// a stray byte), with CR LF and LF ends: an edit keeps every line it is not about.
const std::string kZurich = "1\tZ\xC3\xBCrich\tADDED\r\n", kMunich = "2\tM\xFCnchen\tADDED\r\n";
const std::string kTokyo = "3\t\xE6\x9D\xB1\xE4\xBA\xAC\tADDED\n", kStray = "4\tx\xFF\tMODIFIED\r\n";
const std::string kMixed = kZurich + kMunich + kTokyo + kStray;

TEST_F(JournalFormat, AnEditLeavesEveryOtherLineByteForByte)
{
    // The journal before, the command's arguments after the journal's name, the journal after.
    for (const auto& [before, arguments, after] :
         std::vector<std::tuple<std::string, Arguments, std::string>>{
             {kMixed, {"add", "5\tK\xC3\xB6ln"}, kMixed + "5\tK\xC3\xB6ln\tADDED\r\n"},
             {kMixed, {"modify", "3\tKyoto"}, kZurich + kMunich + "3\tKyoto\tMODIFIED\n" + kStray},
             {kMixed, {"modify", "2\tM\xC3\xBC"}, kZurich + "2\tM\xC3\xBC\tMODIFIED\r\n" + kTokyo + kStray},
             {kMixed + kZurich, {"delete", "1"}, kMunich + kTokyo + kStray},
             {kMixed + kTokyo, {"remove", "3"}, kZurich + kMunich + kStray},
             {kMixed, {"commit", "1"}, "1\tZ\xC3\xBCrich\tCOMMIT\r\n" + kMunich + kTokyo + kStray},
             {kMixed, {"clear"}, ""},
             {"4\ta\tADDED\r\n4\tDELETE\r\n", {"commit", "4"}, "4\ta\tCOMMIT\r\n4\tDELETE\r\n"},
             {"7\r\n", {"commit", "7"}, "7\tCOMMIT\r\n"},
             {"1\ta\r\n", {"modify", "9\tz"}, "1\ta\r\n"},
             // Every kind of line end, a LF before a CR and a CR before a CR LF among them.
             {"1\ta\r\n2\n\r3\r\r\n4", {"add", "5\te"}, "1\ta\r\n2\n\r3\r\r\n4\r\n5\te\tADDED\r\n"},
             {"1\ta\n2\tb\r\n3\tc", {"delete", "2"}, "1\ta\n3\tc"},
             {"1\ta", {"add", ""}, "1\ta"},
             // A key matches when equal but for trailing blanks; a blank before it counts.
             {"42   \ta\r\n4\tb\r\n 42\tc\r\n042\td\r\n", {"delete", "42 "}, "4\tb\r\n 42\tc\r\n042\td\r\n"},
             {"42\ta\tADDED\r\n 42\tb\r\n", {"commit", "42  "}, "42\ta\tCOMMIT\r\n 42\tb\r\n"},
             {"42   \ta\r\n4\tb\r\n", {"modify", "42 \tz"}, "42 \tz\tMODIFIED\r\n4\tb\r\n"},
             // Kept as they came, the first bytes would make the rewrite a UTF-16 file.
             {"1\r\n\xFF\xFE\tb\r\n3\t\xFF\r\n", {"delete", "1"}, "\xC3\xBF\xC3\xBE\tb\r\n3\t\xFF\r\n"}})
    {
        SCOPED_TRACE(::testing::PrintToString(arguments) + " on " + ::testing::PrintToString(before));
        WriteBytes(StatusJournal(), before);
        Arguments command{"status"};
        command.insert(command.end(), arguments.begin(), arguments.end());
        ASSERT_EQ(RunTool(command), 0);
        EXPECT_EQ(ReadBytes(StatusJournal()), after);
        EXPECT_TRUE(fs::is_regular_file(StatusJournal())) << "an empty journal is still a journal";
    }
}

// Only the log journal is trimmed, by 3,000 lines once it holds 10,000.
TEST_F(JournalFormat, AppendTrimsOnlyAFullLogJournal)
{
    for (const auto& [journal, before, after, firstKept] :
         {std::tuple<std::string, std::size_t, std::size_t, std::size_t>{"log", 10000, 7001, 3001},
          {"log", 9999, 10000, 1},
          {"status", 10000, 10001, 1}})
    {
        SCOPED_TRACE(journal + " " + std::to_string(before));
        const std::string path = journal == "log" ? LogJournal() : StatusJournal();
        std::string text;
        for (std::size_t i = 1; i <= before; ++i)
            text += std::to_string(i) + "\tjob.pdf\tADDED\r\n";
        WriteBytes(path, text);
        ASSERT_EQ(RunTool({journal, "add", "new\tn.pdf"}), 0);
        const Lines lines = ReadLines(path);
        ASSERT_EQ(lines.size(), after);
        EXPECT_EQ(lines.front(), std::to_string(firstKept) + "\tjob.pdf\tADDED");
        EXPECT_EQ(lines[after - 2], std::to_string(before) + "\tjob.pdf\tADDED");
        EXPECT_EQ(lines.back(), "new\tn.pdf\tADDED");
    }
}

TEST_F(JournalFormat, TheCommandRefusesWrongUsageWithStatus2AndReadPrintsTheLines)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n\r\n2\tb\tADDED\n\n3\tc");
    for (const Arguments& arguments : {Arguments{},
                                       {"journal", "read"},
                                       {"status", "rename", "1"},
                                       {"status", "add", "1\ta", "extra"},
                                       {"status", "clear", "now"},
                                       {"status", "add", "1\ta\n2\tb"}})
        EXPECT_EQ(Run("exec " + Quoted(WYX_JOURNAL_TOOL), arguments), std::make_pair(2, std::string()))
            << ::testing::PrintToString(arguments);
    EXPECT_EQ(Run("exec " + Quoted(WYX_JOURNAL_TOOL), {"status", "read"}),
              std::make_pair(0, std::string("1\ta\tADDED\n\n2\tb\tADDED\n\n3\tc\n")));
    // A journal may also be named by its path; output it cannot write is an error.
    WriteBytes(Root() + "/elsewhere.txt", "2\tb\r\n");
    EXPECT_EQ(Run("exec " + Quoted(WYX_JOURNAL_TOOL), {Root() + "/elsewhere.txt", "read"}).second, "2\tb\n");
    EXPECT_EQ(RunTool({"status", "read"}, "exec > /dev/full;"), 4);
}

using Operation = int (*)(wyx::IJobReadWriter&);
const std::vector<std::pair<const char*, Operation>> kOperations = {
    {"ReadJobs", [](wyx::IJobReadWriter& j) { return j.ReadJobs(*std::make_unique<wxArrayString>()); }},
    {"AddJob", [](wyx::IJobReadWriter& j) { return j.AddJob(*std::make_unique<wxString>("1\ta")); }},
    {"ModifyJob", [](wyx::IJobReadWriter& j) { return j.ModifyJob("1\tb"); }},
    {"DeleteJob", [](wyx::IJobReadWriter& j) { return j.DeleteJob("1"); }},
    {"RemoveJob", [](wyx::IJobReadWriter& j) { return j.RemoveJob("1"); }},
    {"ClearJobs", [](wyx::IJobReadWriter& j) { return j.ClearJobs(); }},
    {"CommitJob", [](wyx::IJobReadWriter& j) { return j.CommitJob("1"); }},
};

TEST_F(JournalFormat, NoOperationCreatesAJournalAndAnEmptyKeyMatchesNothing)
{
    wyx::JobsFileReadWriter pathless, journal = Journal(StatusJournal());
    for (const auto& [name, operation] : kOperations)
        EXPECT_EQ(operation(pathless), wyx::JobOk) << name;
    EXPECT_FALSE(fs::exists(Root() + "/dev/shm")) << "a reader without a journal takes no lock";
    for (const auto& [name, operation] : kOperations)
        EXPECT_EQ(operation(journal), wyx::JobFileMissing) << name;
    EXPECT_EQ(RunTool({"status", "add", "1\ta"}), wyx::JobFileMissing);
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{});

    WriteBytes(StatusJournal(), "\r\n\tx\tADDED\r\n");
    EXPECT_EQ(journal.DeleteJob(""), wyx::JobOk);
    EXPECT_EQ(journal.CommitJob("  "), wyx::JobOk);
    wxString line = "5\ta.pdf";
    ASSERT_EQ(journal.AddJob(line), wyx::JobOk);
    EXPECT_EQ(line.utf8_string(), "5\ta.pdf\tADDED") << "the caller's line is tagged";
    EXPECT_EQ(ReadBytes(StatusJournal()), "\r\n\tx\tADDED\r\n5\ta.pdf\tADDED\r\n");
}

TEST_F(JournalFormat, AJournalWithAMarkIsDecodedAndRewrittenAsUtf8WithoutMark)
{
    const std::wstring text = L"\uFEFF1\tC:\\caf\u00e9\u20ac\t\U0001F5A8\tADDED\r\n2\tb\n";
    const std::string first = "1\tC:\\caf\xC3\xA9\xE2\x82\xAC\t\xF0\x9F\x96\xA8\tADDED";
    for (const char* encoding : {"UTF-8", "UTF-16LE", "UTF-16BE", "UTF-32LE", "UTF-32BE"})
    {
        const wxCSConv form(encoding);
        std::string bytes(form.FromWChar(nullptr, 0, text.data(), text.size()), '\0');
        form.FromWChar(&bytes[0], bytes.size(), text.data(), text.size());
        SCOPED_TRACE(::testing::PrintToString(bytes));
        WriteBytes(StatusJournal(), bytes);
        EXPECT_EQ(ReadLines(StatusJournal()), (Lines{first, "2\tb"}));
        ASSERT_EQ(RunTool({"status", "add", "3\tc"}), 0);
        EXPECT_EQ(ReadBytes(StatusJournal()), first + "\r\n2\tb\n3\tc\tADDED\r\n");
    }
}

std::string Bytes(std::initializer_list<unsigned char> values)
{
    return std::string(values.begin(), values.end());
}

TEST_F(JournalFormat, BytesAreReadWithoutHarmAndNeverRewrittenWhenUndecodable)
{
    // The bytes; the lines as ReadJobs gives them, in UTF-8, each followed by '|'; whether a writing
    // operation may replace the file.
    for (const auto& [bytes, expected, rewritable] : std::vector<std::tuple<std::string, std::string, bool>>{
             // Each line in its own encoding: UTF-8 where valid, else single bytes.
             {kMixed,
              "1\tZ\xC3\xBCrich\tADDED|2\tM\xC3\xBCnchen\tADDED|3\t\xE6\x9D\xB1\xE4\xBA\xAC\tADDED|"
              "4\tx\xC3\xBF\tMODIFIED|",
              true},
             {"1\tab\xE2\x82", "1\tab\xC3\xA2\xC2\x82|", true},
             // An encoded surrogate is no UTF-8.
             {"\xED\xA0\x80", "\xC3\xAD\xC2\xA0\xC2\x80|", true},
             // Runs of ASCII are taken eight bytes at a time; what follows must still decode.
             {"0123456789abcdef\xF0\x9F\x96\xA8\tK\xC3\xB6ln 012345678\xE2\x82\xAC\r\nx",
              "0123456789abcdef\xF0\x9F\x96\xA8\tK\xC3\xB6ln 012345678\xE2\x82\xAC|x|", true},
             {"\xFF", "\xC3\xBF|", true},
             {"\xEF\xBB\xBF", "", true},
             {"a\n\rb\r\r\nc\r", "a||b||c|", true},
             // A mark written twice must not survive as a mark of the rewrite.
             {Bytes({0xFF, 0xFE, 0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0}), "1\ta|", true},
             {Bytes({0xEF, 0xBB, 0xBF, 0xEF, 0xBB, 0xBF, '1', '\t', 'a'}), "1\ta|", true},
             {std::string("1\ta\0b\r\n", 7), std::string("1\ta\0b|", 6), true},
             {Bytes({0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0, '\n', 0, 'b'}), "1\ta|\xEF\xBF\xBD|", false},
             {Bytes({0xFE, 0xFF, 0, '1', 0xD8, 0x01, 0, 'x', 0, '\n'}), "1\xEF\xBF\xBDx|", false},
             {Bytes({0xFF, 0xFE, 0, 0, 'a', 0, 0, 0, 0, 0, 0x11, 0, '\n', 0, 0, 0}), "a\xEF\xBF\xBD|", false},
             {Bytes({0, 0, 0xFE, 0xFF, 0, 0, 0, 'a', 0, 0}), "a\xEF\xBF\xBD|", false},
             // Kept as they came, these bytes would begin the rewrite with a UTF-16 mark.
             {"\xEF\xBB\xBF\xFF\xFE\t1\r\n", "\xC3\xBF\xC3\xBE\t1|", true}})
    {
        SCOPED_TRACE(::testing::PrintToString(bytes));
        WriteBytes(StatusJournal(), bytes);
        const auto joined = [this]
        {
            std::string lines;
            for (const std::string& line : ReadLines(StatusJournal()))
                lines += line + "|";
            return lines;
        };
        EXPECT_EQ(joined(), expected);
        // A rewrite is exact UTF-8 without a mark; what could not be decoded is never written back.
        EXPECT_EQ(Journal(StatusJournal()).DeleteJob("no such key"),
                  rewritable ? wyx::JobOk : wyx::JobFileMissing);
        EXPECT_EQ(joined(), expected);
        const std::string after = ReadBytes(StatusJournal());
        EXPECT_TRUE(rewritable ? wyx::DecodeJournal(after.data(), after.size()).exact : after == bytes)
            << after;
        EXPECT_EQ(Journal(StatusJournal()).ClearJobs(), wyx::JobOk);
        EXPECT_EQ(ReadBytes(StatusJournal()), "");
    }
}

// --- what one read may hold: a journal too large is not read, and its caller keeps what it had

constexpr off_t kBytes = static_cast<off_t>(wyx::kMaxJournalBytes);
constexpr off_t kLine = static_cast<off_t>(wyx::kMaxJournalLineLength);
constexpr off_t kLines = static_cast<off_t>(wyx::kMaxJournalLines);

TEST_F(JournalFormat, BoundsAreKeptByEveryRead)
{
    // The journal's size; from one line feed to the next, the line feed included; whether it may be read.
    for (const auto& [size, spacing, readable] : std::vector<std::tuple<off_t, off_t, bool>>{
             // Lines of half a mebibyte, so that only the journal's size counts.
             {kBytes, kLine / 2, true},
             {kBytes + 1, kLine / 2, false},
             {2 * (kLine + 1), kLine + 1, true},
             {2 * (kLine + 2), kLine + 2, false},
             {kLines, 1, true},
             {kLines + 1, 1, false}})
    {
        SCOPED_TRACE(std::to_string(size) + " bytes, a line feed every " + std::to_string(spacing));
        // Sparse, with a line feed every `spacing` bytes: it costs the disk next to nothing.
        WriteBytes(StatusJournal(), spacing == 1 ? std::string(size, '\n') : ""); // one write, not a million
        fs::resize_file(StatusJournal(), size);
        std::fstream file(StatusJournal(), std::ios::in | std::ios::out | std::ios::binary);
        for (off_t at = spacing - 1; spacing > 1 && at < size; at += spacing)
            file.seekp(at) << '\n';
        ASSERT_TRUE(file.flush().good());

        wyx::JobsFileReadWriter journal = Journal(StatusJournal());
        wxArrayString lines;
        lines.Add("held before");
        EXPECT_EQ(journal.ReadJobs(lines), readable ? wyx::JobOk : wyx::JobFileMissing);
        EXPECT_EQ(static_cast<off_t>(lines.size()), readable ? size / spacing : 1);
        if (readable)
            continue;
        EXPECT_EQ(wxJoin(lines, '|'), "held before");
        // An edit cannot read it either and leaves it as it is; a clear empties it.
        wxString line = "1\ta";
        EXPECT_EQ(journal.AddJob(line), wyx::JobFileMissing);
        if (size > kBytes) // a line too many costs a second; every reader shares that check
        {
            EXPECT_EQ(journal.ReadJobsHoldingLock(lines), wyx::JobFileMissing);
            EXPECT_EQ(journal.DeleteJob("1"), wyx::JobFileMissing);
        }
        EXPECT_EQ(static_cast<off_t>(fs::file_size(StatusJournal())), size);
        EXPECT_EQ(journal.ClearJobs(), wyx::JobOk);
        EXPECT_EQ(fs::file_size(StatusJournal()), 0u);
    }
}

} // namespace
} // namespace journaltest
