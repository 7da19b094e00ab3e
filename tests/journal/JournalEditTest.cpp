// An edit changes the lines it is about and no byte of any other, whatever
// mixture of encodings the journal holds.
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "JournalTestSupport.h"

namespace journaltest
{
namespace
{

// UTF-8 lines around two that are not: a Latin-1 line from an old producer
// and one stray byte. Every line but the last ends in CR LF, one in LF.
const std::string kZurich = "1\t/srv/in/Z\xC3\xBCrich\t/srv/in/Z\xC3\xBCrich/a.pdf\tPRN\tADDED\r\n";
const std::string kMunich = "2\t/srv/in/M\xFCnchen\t/srv/in/M\xFCnchen/b.pdf\tPRN\tADDED\r\n";
const std::string kTokyo =
    "3\t/srv/in/\xE6\x9D\xB1\xE4\xBA\xAC\t/srv/in/\xE6\x9D\xB1\xE4\xBA\xAC/c.pdf\tPRN\tADDED\n";
const std::string kStray = "4\t/srv/in/x\xFF\t/srv/in/x\xFF/d.pdf\tPRN\tMODIFIED\r\n";
const std::string kJournal = kZurich + kMunich + kTokyo + kStray;

struct EditCase
{
    const char* name;
    std::vector<std::string> arguments; // wyx-journal's, after the journal
    std::string after;
};

class JournalEdit : public JournalTest, public ::testing::WithParamInterface<EditCase>
{
};

TEST_P(JournalEdit, LeavesEveryOtherLineByteForByte)
{
    WriteBytes(StatusJournal(), kJournal);
    std::vector<std::string> arguments{"status"};
    arguments.insert(arguments.end(), GetParam().arguments.begin(), GetParam().arguments.end());

    ASSERT_EQ(RunTool(arguments).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), GetParam().after);
}

INSTANTIATE_TEST_SUITE_P(
    Operations, JournalEdit,
    ::testing::Values(EditCase{"Add",
                               {"add", "5\t/srv/in/K\xC3\xB6ln\tPRN"},
                               kJournal + "5\t/srv/in/K\xC3\xB6ln\tPRN\tADDED\r\n"},
                      EditCase{"ModifyAUtf8Line",
                               {"modify", "3\t/srv/in/Kyoto\tPRN"},
                               kZurich + kMunich + "3\t/srv/in/Kyoto\tPRN\tMODIFIED\n" + kStray},
                      EditCase{"ModifyTheLatin1Line",
                               {"modify", "2\t/srv/in/M\xC3\xBCnchen\tPRN"},
                               kZurich + "2\t/srv/in/M\xC3\xBCnchen\tPRN\tMODIFIED\r\n" + kTokyo + kStray},
                      EditCase{"Delete", {"delete", "1"}, kMunich + kTokyo + kStray},
                      // Once the line with the stray byte is gone, the rest is as it was.
                      EditCase{"DeleteTheStrayByte", {"delete", "4"}, kZurich + kMunich + kTokyo},
                      EditCase{"Remove", {"remove", "3"}, kZurich + kMunich + kStray},
                      EditCase{"Commit",
                               {"commit", "1"},
                               "1\t/srv/in/Z\xC3\xBCrich\t/srv/in/Z\xC3\xBCrich/a.pdf\tPRN\tCOMMIT\r\n" +
                                   kMunich + kTokyo + kStray},
                      EditCase{"CommitOfNoLine", {"commit", "9"}, kJournal},
                      EditCase{"Clear", {"clear"}, ""}),
    [](const ::testing::TestParamInfo<EditCase>& info) { return std::string(info.param.name); });

TEST_F(JournalEdit, ALineThatWouldStartTheFileWithAUtf16MarkGoesAsUtf8)
{
    WriteBytes(StatusJournal(), "1\ta\tADDED\r\n\xFF\xFE\tb\tADDED\r\n3\t\xFF\tADDED\r\n");
    ASSERT_EQ(RunTool({"status", "delete", "1"}).status, 0);
    EXPECT_EQ(ReadBytes(StatusJournal()), "\xC3\xBF\xC3\xBE\tb\tADDED\r\n3\t\xFF\tADDED\r\n");
}

TEST_F(JournalEdit, EachLineReadsInItsOwnEncoding)
{
    WriteBytes(StatusJournal(), kJournal);
    EXPECT_EQ(ReadLines(StatusJournal()),
              (std::vector<std::string>{
                  kZurich.substr(0, kZurich.size() - 2),
                  "2\t/srv/in/M\xC3\xBCnchen\t/srv/in/M\xC3\xBCnchen/b.pdf\tPRN\tADDED",
                  kTokyo.substr(0, kTokyo.size() - 1),
                  "4\t/srv/in/x\xC3\xBF\t/srv/in/x\xC3\xBF/d.pdf\tPRN\tMODIFIED",
              }));
}

} // namespace
} // namespace journaltest
