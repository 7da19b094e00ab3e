// The journal as the producer command writes it and the reader sees it: lines,
// keys, encodings, line ends and the bounds of one read.
#include <fcntl.h>
#include <unistd.h>

#include <memory>

#include <wx/strconv.h>

#include "JournalTestSupport.h"
#include "data/JournalText.h"

namespace journaltest
{
namespace
{

template <typename Case> std::string CaseName(const ::testing::TestParamInfo<Case>& info)
{
    return info.param.name;
}

using JournalFormat = JournalTest;

// --- what each operation of the command leaves, byte for byte -----------------

// UTF-8 lines around two that are not (a Latin-1 line from an old producer and
// a stray byte), with CR LF and LF ends: an edit keeps every line it is not about.
const std::string kZurich = "1\tZ\xC3\xBCrich\tADDED\r\n", kMunich = "2\tM\xFCnchen\tADDED\r\n";
const std::string kTokyo = "3\t\xE6\x9D\xB1\xE4\xBA\xAC\tADDED\n", kStray = "4\tx\xFF\tMODIFIED\r\n";
const std::string kMixed = kZurich + kMunich + kTokyo + kStray;

struct EditCase
{
    const char* name;
    std::string before;
    Arguments arguments; // after the journal's name
    std::string after;
};

class JournalEdit : public JournalTest, public ::testing::WithParamInterface<EditCase>
{
};

TEST_P(JournalEdit, LeavesEveryOtherLineByteForByte)
{
    WriteBytes(StatusJournal(), GetParam().before);
    Arguments arguments{"status"};
    arguments.insert(arguments.end(), GetParam().arguments.begin(), GetParam().arguments.end());
    ASSERT_EQ(RunTool(arguments).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), GetParam().after);
    EXPECT_TRUE(fs::is_regular_file(StatusJournal())) << "an empty journal is still a journal";
}

INSTANTIATE_TEST_SUITE_P(
    Operations, JournalEdit,
    ::testing::Values(
        EditCase{"Add", kMixed, {"add", "5\tK\xC3\xB6ln"}, kMixed + "5\tK\xC3\xB6ln\tADDED\r\n"},
        EditCase{"ModifyAUtf8Line",
                 kMixed,
                 {"modify", "3\tKyoto"},
                 kZurich + kMunich + "3\tKyoto\tMODIFIED\n" + kStray},
        EditCase{"ModifyTheLatin1Line",
                 kMixed,
                 {"modify", "2\tM\xC3\xBC"},
                 kZurich + "2\tM\xC3\xBC\tMODIFIED\r\n" + kTokyo + kStray},
        EditCase{"DeleteEveryLineOfTheKey", kMixed + kZurich, {"delete", "1"}, kMunich + kTokyo + kStray},
        EditCase{"DeleteTheStrayByte", kMixed, {"delete", "4"}, kZurich + kMunich + kTokyo},
        EditCase{"RemoveEveryLineOfTheKey", kMixed + kTokyo, {"remove", "3"}, kZurich + kMunich + kStray},
        EditCase{
            "Commit", kMixed, {"commit", "1"}, "1\tZ\xC3\xBCrich\tCOMMIT\r\n" + kMunich + kTokyo + kStray},
        EditCase{"CommitOfNoLine", kMixed, {"commit", "9"}, kMixed}, EditCase{"Clear", kMixed, {"clear"}, ""},
        EditCase{"CommitSkipsDelete",
                 "4\ta\tADDED\r\n4\tDELETE\r\n",
                 {"commit", "4"},
                 "4\ta\tCOMMIT\r\n4\tDELETE\r\n"},
        EditCase{"CommitOfALineOfOneField", "7\r\n", {"commit", "7"}, "7\tCOMMIT\r\n"},
        EditCase{"ModifyOfAnUnknownKey", "1\ta\r\n", {"modify", "9\tz"}, "1\ta\r\n"},
        EditCase{
            "AddEndsTheLastLine", "1\ta\r\n2\n3\r4", {"add", "5\te"}, "1\ta\r\n2\n3\r4\r\n5\te\tADDED\r\n"},
        EditCase{"RewriteKeepsNoFinalLineBreak", "1\ta\n2\tb\r\n3\tc", {"delete", "2"}, "1\ta\n3\tc"},
        EditCase{"AddOfAnEmptyLine", "1\ta", {"add", ""}, "1\ta"},
        // Kept as they came, the first bytes would make the rewrite a UTF-16 file.
        EditCase{"NoUtf16MarkAtTheStart",
                 "1\r\n\xFF\xFE\tb\r\n3\t\xFF\r\n",
                 {"delete", "1"},
                 "\xC3\xBF\xC3\xBE\tb\r\n3\t\xFF\r\n"}),
    CaseName<EditCase>);

TEST_F(JournalFormat, KeysMatchForDeleteCommitAndModifyWhenEqualButForTrailingBlanks)
{
    for (const auto& [storedKey, given, m] : {std::tuple<std::string, std::string, bool>{"42", "42", true},
                                              {"42", "42 ", true},
                                              {"42   ", "42", true},
                                              {"42", "042", false},
                                              {"042", "42", false},
                                              {"JobA", "joba", false},
                                              {"42", "4", false},
                                              {"4", "42", false},
                                              {" 42", "42", false}})
    {
        const std::string stored = storedKey + "\ta\tADDED", other = "x\tb\tADDED", modified = given + "\tz";
        for (const auto& [operation, argument, expected] :
             {std::tuple<const char*, std::string, Lines>{"delete", given,
                                                          m ? Lines{other} : Lines{stored, other}},
              {"commit", given, {m ? storedKey + "\ta\tCOMMIT" : stored, other}},
              {"modify", modified, {m ? modified + "\tMODIFIED" : stored, other}}})
        {
            SCOPED_TRACE(std::string(operation) + " '" + given + "' of '" + storedKey + "'");
            WriteBytes(StatusJournal(), stored + "\r\n" + other + "\r\n");
            ASSERT_EQ(RunTool({"status", operation, argument}).status, 0);
            EXPECT_EQ(ReadLines(StatusJournal()), expected);
        }
    }
}

// Only the log journal is trimmed, by 3,000 lines once it holds 10,000.
TEST_F(JournalFormat, AppendTrimsOnlyAFullLogJournal)
{
    for (const auto& [journal, before, after, firstKept] :
         {std::tuple<std::string, std::size_t, std::size_t, std::size_t>{"log", 10000, 7001, 3001},
          {"log", 9999, 10000, 1},
          {"log", 12000, 9001, 3001},
          {"status", 10000, 10001, 1}})
    {
        SCOPED_TRACE(journal + " " + std::to_string(before));
        const std::string path = journal == "log" ? LogJournal() : StatusJournal();
        std::string text;
        for (std::size_t i = 1; i <= before; ++i)
            text += std::to_string(i) + "\tjob.pdf\tADDED\r\n";
        WriteBytes(path, text);
        ASSERT_EQ(RunTool({journal, "add", "new\tn.pdf"}).status, 0);
        const Lines lines = ReadLines(path);
        ASSERT_EQ(lines.size(), after);
        EXPECT_EQ(lines.front(), std::to_string(firstKept) + "\tjob.pdf\tADDED");
        EXPECT_EQ(lines[after - 2], std::to_string(before) + "\tjob.pdf\tADDED");
        EXPECT_EQ(lines.back(), "new\tn.pdf\tADDED");
    }
}

// --- the command's own rules ----------------------------------------------------------

TEST_F(JournalFormat, WrongUsageIsRefusedWithStatus2AndChangesNothing)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n");
    for (const Arguments& arguments : {Arguments{},
                                       {"status"},
                                       {"journal", "read"},
                                       {"status", "rename", "1"},
                                       {"status", "read", "1"},
                                       {"status", "add"},
                                       {"status", "add", "1\ta", "extra"},
                                       {"status", "add", "1\ta\n2\tb"},
                                       {"status", "modify", "1\ta\rb"},
                                       {"status", "delete", ""},
                                       {"status", "add", "1\t\xff"},
                                       {"status", "clear", "now"}})
    {
        SCOPED_TRACE(::testing::PrintToString(arguments));
        const ToolRun run = RunTool(arguments);
        EXPECT_EQ(run.status, 2);
        EXPECT_EQ(run.out, "");
    }
    EXPECT_EQ(ReadBytes(StatusJournal()), "1\ta\tADDED\r\n");
}

TEST_F(JournalFormat, ReadPrintsTheLinesAsStoredAndReportsOutputItCannotWrite)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n\r\n2\tb\tADDED\n\n3\tc");
    const ToolRun run = RunTool({"status", "read"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "1\ta\tADDED\n\n2\tb\tADDED\n\n3\tc\n");
    EXPECT_EQ(ReadLines(StatusJournal()), (Lines{"1\ta\tADDED", "", "2\tb\tADDED", "", "3\tc"}));
    // A journal may also be named by its path.
    WriteBytes(Root() + "/elsewhere.txt", "2\tb\r\n");
    EXPECT_EQ(RunTool({Root() + "/elsewhere.txt", "read"}).out, "2\tb\n");
    for (const Arguments& arguments : {Arguments{"status", "read"}, Arguments{"--help"}})
        EXPECT_EQ(RunTool(arguments, "exec > /dev/full;").status, 4) << arguments.front();
}

TEST_F(JournalFormat, AddTagsTheCallersLineAndAnEmptyKeyMatchesNothing)
{
    WriteBytes(StatusJournal(), "\r\n\tx\tADDED\r\n");
    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    EXPECT_EQ(journal.DeleteJob(""), wyx::JobOk);
    EXPECT_EQ(journal.CommitJob("  "), wyx::JobOk);
    wxString line = "5\ta.pdf";
    ASSERT_EQ(journal.AddJob(line), wyx::JobOk);
    EXPECT_EQ(Utf8(line), "5\ta.pdf\tADDED");
    EXPECT_EQ(ReadBytes(StatusJournal()), "\r\n\tx\tADDED\r\n5\ta.pdf\tADDED\r\n");
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

TEST_F(JournalFormat, NoOperationCreatesAJournalAndWithoutPathNothingIsDone)
{
    for (int kind : {0, 1, 4000, 4002, -4001})
        EXPECT_EQ(std::unique_ptr<wyx::IJobReadWriter>(CreateJobReadWriter(kind)), nullptr) << kind;
    std::unique_ptr<wyx::IJobReadWriter> pathless(CreateJobReadWriter(kJobsFileReadWriterKind));
    ASSERT_NE(pathless, nullptr);
    EXPECT_EQ(static_cast<wyx::JobsFileReadWriter&>(*pathless).GetPath(), wxString());
    for (const auto& [name, operation] : kOperations)
        EXPECT_EQ(operation(*pathless), wyx::JobOk) << name;
    EXPECT_FALSE(fs::exists(Root() + "/dev/shm"));

    for (const auto& [name, operation] : kOperations)
    {
        wyx::JobsFileReadWriter journal = Journal(StatusJournal());
        EXPECT_EQ(operation(journal), wyx::JobFileMissing) << name;
    }
    EXPECT_EQ(RunTool({"status", "add", "1\ta"}).status, wyx::JobFileMissing);
    EXPECT_EQ(FolderEntries(DataDirectory()), Lines{});
    ASSERT_TRUE(fs::create_directory(StatusJournal()));
    for (const auto& [name, operation] : kOperations)
    {
        wyx::JobsFileReadWriter journal = Journal(StatusJournal());
        EXPECT_EQ(operation(journal), wyx::JobFileMissing) << "folder: " << name;
    }
}

// --- encodings ---------------------------------------------------------------------------

TEST_F(JournalFormat, AJournalWithAMarkIsDecodedAndRewrittenAsUtf8WithoutMark)
{
    const std::wstring text = L"\uFEFF1\tC:\\caf\u00e9\u20ac\t\U0001F5A8\tADDED\r\n2\tb\n";
    const std::string first = "1\tC:\\caf\xC3\xA9\xE2\x82\xAC\t\xF0\x9F\x96\xA8\tADDED";
    const wxMBConvUTF16LE utf16le;
    const wxMBConvUTF16BE utf16be;
    const wxMBConvUTF32LE utf32le;
    const wxMBConvUTF32BE utf32be;
    for (const wxMBConv* form :
         std::initializer_list<const wxMBConv*>{&wxConvUTF8, &utf16le, &utf16be, &utf32le, &utf32be})
    {
        std::string bytes(form->FromWChar(nullptr, 0, text.data(), text.size()), '\0');
        form->FromWChar(&bytes[0], bytes.size(), text.data(), text.size());
        SCOPED_TRACE(::testing::PrintToString(bytes));
        WriteBytes(StatusJournal(), bytes);
        EXPECT_EQ(ReadLines(StatusJournal()), (Lines{first, "2\tb"}));
        ASSERT_EQ(RunTool({"status", "add", "3\tc"}).status, 0);
        EXPECT_EQ(ReadBytes(StatusJournal()), first + "\r\n2\tb\n3\tc\tADDED\r\n");
    }
}

struct BytesCase
{
    std::string bytes;
    std::string lines; // as ReadJobs gives them, in UTF-8, each followed by '|'
    bool rewritable;   // whether a writing operation may replace the file
};

class JournalBytes : public JournalTest, public ::testing::WithParamInterface<BytesCase>
{
};

TEST_P(JournalBytes, AreReadWithoutHarmAndNeverRewrittenWhenUndecodable)
{
    const BytesCase& c = GetParam();
    WriteBytes(StatusJournal(), c.bytes);
    auto joined = [this]
    {
        std::string lines;
        for (const std::string& line : ReadLines(StatusJournal()))
            lines += line + "|";
        return lines;
    };
    EXPECT_EQ(joined(), c.lines);
    // A rewrite is exact UTF-8 without a mark; what could not be decoded is never written back.
    EXPECT_EQ(Journal(StatusJournal()).DeleteJob("no such key"),
              c.rewritable ? wyx::JobOk : wyx::JobFileMissing);
    EXPECT_EQ(joined(), c.lines);
    const std::string after = ReadBytes(StatusJournal());
    if (c.rewritable)
        EXPECT_TRUE(wyx::DecodeJournal(after.data(), after.size()).exact) << after;
    else
        EXPECT_EQ(after, c.bytes);
    EXPECT_EQ(Journal(StatusJournal()).ClearJobs(), wyx::JobOk);
    EXPECT_EQ(ReadBytes(StatusJournal()), "");
}

std::string Bytes(std::initializer_list<unsigned char> values)
{
    return std::string(values.begin(), values.end());
}

INSTANTIATE_TEST_SUITE_P(
    Inputs, JournalBytes,
    ::testing::Values(
        // Each line in its own encoding: UTF-8 where valid, else single bytes.
        BytesCase{kMixed,
                  "1\tZ\xC3\xBCrich\tADDED|2\tM\xC3\xBCnchen\tADDED|3\t\xE6\x9D\xB1\xE4\xBA\xAC\tADDED|"
                  "4\tx\xC3\xBF\tMODIFIED|",
                  true},
        BytesCase{"1\tab\xE2\x82", "1\tab\xC3\xA2\xC2\x82|", true},
        // An overlong "/", an encoded surrogate and a value beyond U+10FFFF are no UTF-8.
        BytesCase{"1\t\xC0\xAF\r\n", "1\t\xC3\x80\xC2\xAF|", true},
        BytesCase{"\xED\xA0\x80", "\xC3\xAD\xC2\xA0\xC2\x80|", true},
        BytesCase{"\xF4\x90\x80\x80", "\xC3\xB4\xC2\x90\xC2\x80\xC2\x80|", true},
        // Runs of ASCII are taken eight bytes at a time; what follows must still decode.
        BytesCase{"0123456789abcdef\xF0\x9F\x96\xA8\tK\xC3\xB6ln 012345678\xE2\x82\xAC\r\nx",
                  "0123456789abcdef\xF0\x9F\x96\xA8\tK\xC3\xB6ln 012345678\xE2\x82\xAC|x|", true},
        BytesCase{"\xFF", "\xC3\xBF|", true}, BytesCase{"\xEF\xBB", "\xC3\xAF\xC2\xBB|", true},
        BytesCase{"\xEF\xBB\xBF", "", true}, BytesCase{"", "", true},
        // A mark written twice must not survive as a mark of the rewrite.
        BytesCase{Bytes({0xFF, 0xFE, 0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0}), "1\ta|", true},
        BytesCase{"\xEF\xBB\xBF\xEF\xBB\xBF"
                  "1\ta",
                  "1\ta|", true},
        BytesCase{std::string("1\ta\0b\r\n", 7), std::string("1\ta\0b|", 6), true},
        BytesCase{Bytes({0xFF, 0xFE, '1', 0, '\t', 0, 'a', 0, '\n', 0, 'b'}), "1\ta|\xEF\xBF\xBD|", false},
        BytesCase{Bytes({0xFE, 0xFF, 0, '1', 0xD8, 0x01, 0, 'x', 0, '\n'}), "1\xEF\xBF\xBDx|", false},
        BytesCase{Bytes({0xFF, 0xFE, 0, 0, 'a', 0, 0, 0, 0, 0, 0x11, 0, '\n', 0, 0, 0}), "a\xEF\xBF\xBD|",
                  false},
        BytesCase{Bytes({0, 0, 0xFE, 0xFF, 0, 0, 0, 'a', 0, 0}), "a\xEF\xBF\xBD|", false},
        // Kept as they came, these bytes would begin the rewrite with a UTF-16 mark.
        BytesCase{"\xEF\xBB\xBF\xFF\xFE\t1\r\n", "\xC3\xBF\xC3\xBE\t1|", true},
        BytesCase{"\xEF\xBB\xBF"
                  "1\t\xFF\r\n",
                  "1\t\xC3\xBF|", true}));

TEST(JournalLineEnds, SplitAtCrLfLfOrCrAndComeBackUnchanged)
{
    // Lines each followed by '|'; ends N: none, C: CR LF, L: LF, R: CR.
    for (const auto& [text, expectedLines, expectedEnds] :
         {std::tuple<std::string, std::string, std::string>{"", "", ""},
          {"a", "a|", "N"},
          {"a\r\n", "a|", "C"},
          {"\n", "|", "L"},
          {"a\n\rb", "a||b|", "LRN"},
          {"a\r\r\n", "a||", "RC"},
          {"a\rb\nc\r\nd", "a|b|c|d|", "RLCN"},
          {"\r\n\r\n", "||", "CC"},
          {"a\rb\rc\r\nd\re", "a|b|c|d|e|", "RRCRN"}})
    {
        const wyx::DecodedJournal journal = wyx::DecodeJournal(text.data(), text.size());
        std::string lines, ends;
        for (const wyx::JournalLine& line : journal.lines)
        {
            lines += JournalTest::Utf8(line.text) + "|";
            ends += "NCLR"[static_cast<int>(line.end)];
        }
        EXPECT_EQ(lines, expectedLines) << text;
        EXPECT_EQ(ends, expectedEnds) << text;
        EXPECT_EQ(wyx::EncodeJournal(journal.lines), text);
    }
}

// --- what one read may hold: a journal too large is not read, and its caller keeps what it had

constexpr off_t kBytes = static_cast<off_t>(wyx::kMaxJournalBytes);
constexpr off_t kLine = static_cast<off_t>(wyx::kMaxJournalLineLength);
constexpr off_t kLines = static_cast<off_t>(wyx::kMaxJournalLines);

struct BoundCase
{
    const char* name;
    off_t size;
    off_t spacing; // from one line feed to the next, the line feed included
    bool readable;
};

class JournalBounds : public JournalTest, public ::testing::WithParamInterface<BoundCase>
{
};

TEST_P(JournalBounds, AreKeptByEveryRead)
{
    // Sparse, with a line feed every `spacing` bytes: it costs the disk next to nothing.
    const int fd = ::open(StatusJournal().c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0644);
    bool written = fd >= 0 && ::ftruncate(fd, GetParam().size) == 0;
    const std::string lineFeeds(GetParam().spacing == 1 ? GetParam().size : 0,
                                '\n'); // one write, not a million
    if (!lineFeeds.empty())
        written = written && ::pwrite(fd, lineFeeds.data(), lineFeeds.size(), 0) == GetParam().size;
    for (off_t at = GetParam().spacing - 1; written && lineFeeds.empty() && at < GetParam().size;
         at += GetParam().spacing)
        written = ::pwrite(fd, "\n", 1, at) == 1;
    ::close(fd);
    ASSERT_TRUE(written);

    wyx::JobsFileReadWriter journal = Journal(StatusJournal());
    wxArrayString lines;
    lines.Add("held before");
    if (GetParam().readable)
    {
        EXPECT_EQ(journal.ReadJobs(lines), wyx::JobOk);
        EXPECT_EQ(static_cast<off_t>(lines.size()), GetParam().size / GetParam().spacing);
        return;
    }
    EXPECT_EQ(journal.ReadJobs(lines), wyx::JobFileMissing);
    EXPECT_EQ(Utf8Lines(lines), Lines{"held before"});
    // An edit cannot read it either and leaves it as it is; a clear empties it.
    wxString line = "1\ta";
    EXPECT_EQ(journal.AddJob(line), wyx::JobFileMissing);
    if (GetParam().size > kBytes) // a line too many costs a second; every reader shares that check
    {
        EXPECT_EQ(journal.ReadJobsHoldingLock(lines), wyx::JobFileMissing);
        EXPECT_EQ(journal.DeleteJob("1"), wyx::JobFileMissing);
    }
    EXPECT_EQ(static_cast<off_t>(fs::file_size(StatusJournal())), GetParam().size);
    EXPECT_EQ(journal.ClearJobs(), wyx::JobOk);
    EXPECT_EQ(fs::file_size(StatusJournal()), 0u);
}

INSTANTIATE_TEST_SUITE_P(Journals, JournalBounds,
                         ::testing::Values(
                             // Lines of half a mebibyte, so that only the journal's size counts.
                             BoundCase{"LargestJournal", kBytes, kLine / 2, true},
                             BoundCase{"JournalOneByteTooLarge", kBytes + 1, kLine / 2, false},
                             BoundCase{"LongestLine", 2 * (kLine + 1), kLine + 1, true},
                             BoundCase{"LineOneByteTooLong", 2 * (kLine + 2), kLine + 2, false},
                             BoundCase{"MostLines", kLines, 1, true},
                             BoundCase{"OneLineTooMany", kLines + 1, 1, false}),
                         CaseName<BoundCase>);

} // namespace
} // namespace journaltest
