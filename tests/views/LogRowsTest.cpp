#include "views/LogRows.h"

#include <gtest/gtest.h>

#include <deque>
#include <string>
#include <vector>

namespace
{

using logrows::LogFilter;

JobRecord Record(const wxString& key, const wxString& folder, const wxString& file, const wxString& status,
                 const wxString& dosTime = wxS("1"))
{
    JobRecord record;
    record[LogField::Key] = key;
    record[LogField::FilePath] = file;
    record[LogField::HotFolderPath] = folder;
    record[LogField::Server] = wxS("PRN-01");
    record[LogField::TimeText] = wxS("15.03.2021 14:05:30");
    record[LogField::Status] = status;
    record[LogField::Detail] = wxS("detail");
    record[LogField::DosTime] = dosTime;
    return record;
}

wxString Marked(const wxString& text)
{
    return wxS("T:") + text;
}

// --- cells ------------------------------------------------------------------

struct CellCase
{
    const char* name;
    const char* folder;
    const char* file;
    const char* status;
    const char* title;
    const char* folderName;
    const char* shownStatus;
    bool warning;
};

class LogCells : public ::testing::TestWithParam<CellCase>
{
};

TEST_P(LogCells, RecordAndItsRowCopyGiveTheSameCells)
{
    const CellCase& c = GetParam();
    logrows::StatusTexts statuses(&Marked);
    JobRecord record = Record(wxS("1"), c.folder, c.file, c.status);

    logrows::LogRowCells cells;
    logrows::FillCells(record, statuses, cells);
    EXPECT_EQ(c.warning, cells.warning);
    const std::vector<wxString> expected{
        wxString(), c.title, c.folderName, wxS("PRN-01"), wxS("15.03.2021 14:05:30"), Marked(c.shownStatus)};
    EXPECT_EQ(expected, std::vector<wxString>(cells.texts.begin(), cells.texts.end()));

    logrows::MakeRowCopy(record);
    logrows::LogRowCells again;
    logrows::FillCells(record, statuses, again);
    EXPECT_EQ(cells.texts, again.texts);
    EXPECT_EQ(cells.warning, again.warning);
}

INSTANTIATE_TEST_SUITE_P(
    Rows, LogCells,
    ::testing::Values(CellCase{"Success", "/srv/in/Proofs", "/srv/in/Proofs/a.b.pdf",
                               "Transferred Successfully", "a.b", "Proofs", "Transferred Successfully",
                               false},
                      CellCase{"SuccessWithTrailingBlanks", "/srv/in/Proofs", "/srv/in/Proofs/a.pdf",
                               "Transferred Successfully  \t", "a", "Proofs", "Transferred Successfully",
                               false},
                      CellCase{"SuccessInOtherCaseFailed", "/srv/in/Proofs", "/srv/in/Proofs/a.pdf",
                               "transferred successfully", "a", "Proofs", "transferred successfully", true},
                      CellCase{"Failure", "/srv/in/Proofs/", "/srv/in/Proofs/report", "Conversion failed ",
                               "report", "Proofs", "Conversion failed", true},
                      CellCase{"LeadingBlankIsNotSuccess", "/In", "/In/.rc", " Transferred Successfully",
                               ".rc", "In", " Transferred Successfully", true}),
    [](const ::testing::TestParamInfo<CellCase>& info) { return std::string(info.param.name); });

TEST(LogStatusTexts, EachDistinctStatusIsTranslatedOnce)
{
    int calls = 0;
    logrows::StatusTexts statuses(
        [&](const wxString& text)
        {
            ++calls;
            return Marked(text);
        });
    for (int i = 0; i < 3; ++i)
    {
        EXPECT_EQ(wxS("T:Failed"), statuses.Translated(wxS("Failed ")));
        EXPECT_EQ(wxS("T:Transferred Successfully"), statuses.Translated(wxS("Transferred Successfully")));
    }
    EXPECT_EQ(2, calls);
}

// --- filters ----------------------------------------------------------------

struct FilterCase
{
    const char* name;
    bool errorsOnly;
    bool byFolder;
    const char* filterFolder;
    const char* recordFolder;
    const char* status;
    bool shown;
};

class LogFilters : public ::testing::TestWithParam<FilterCase>
{
};

TEST_P(LogFilters, ListOnlyWhatBothFiltersLetThrough)
{
    const FilterCase& c = GetParam();
    const LogFilter filter{c.errorsOnly, c.byFolder, c.filterFolder};
    EXPECT_EQ(c.shown, filter.Shows(Record(wxS("1"), c.recordFolder, wxS("/x/a.pdf"), c.status)));
}

INSTANTIATE_TEST_SUITE_P(
    Rows, LogFilters,
    ::testing::Values(
        FilterCase{"CompleteLogShowsSuccess", false, false, "", "/hf/In", "Transferred Successfully", true},
        FilterCase{"ErrorLogHidesSuccess", true, false, "", "/hf/In", "Transferred Successfully", false},
        FilterCase{"ErrorLogHidesTrimmedSuccess", true, false, "", "/hf/In", "Transferred Successfully   ",
                   false},
        FilterCase{"ErrorLogShowsOtherCase", true, false, "", "/hf/In", "TRANSFERRED SUCCESSFULLY", true},
        FilterCase{"ErrorLogShowsFailure", true, false, "", "/hf/In", "Failed", true},
        FilterCase{"FolderNameIgnoresCaseAndTrailingBlanks", false, true, "in ", "/hf/IN", "Failed", true},
        FilterCase{"FolderTrailingSeparator", false, true, "In", "/hf/In/", "Failed", true},
        FilterCase{"OtherFolderHidden", false, true, "In", "/hf/Out", "Failed", false},
        FilterCase{"FolderMatchesOnlyTheLastComponent", false, true, "hf", "/hf/In", "Failed", false},
        FilterCase{"BothFilters", true, true, "In", "/hf/In", "Transferred Successfully", false}),
    [](const ::testing::TestParamInfo<FilterCase>& info) { return std::string(info.param.name); });

// --- acknowledgement --------------------------------------------------------

struct AcknowledgeCase
{
    const char* name;
    bool byFolder;
    const char* filterFolder;
    std::vector<const char*> recordFolders;
    std::vector<const char*> acknowledged;
};

class LogAcknowledgement : public ::testing::TestWithParam<AcknowledgeCase>
{
};

TEST_P(LogAcknowledgement, FoldersInFirstSeenOrderOrTheChosenOne)
{
    const AcknowledgeCase& c = GetParam();
    const LogFilter filter{true, c.byFolder, c.filterFolder};
    logrows::FoldersToAcknowledge folders(filter);
    for (const char* folder : c.recordFolders)
        folders.Note(Record(wxS("1"), folder, wxS("/x/a.pdf"), wxS("Transferred Successfully")));
    const std::vector<wxString> expected(c.acknowledged.begin(), c.acknowledged.end());
    EXPECT_EQ(expected, folders.Folders());
}

INSTANTIATE_TEST_SUITE_P(
    Rows, LogAcknowledgement,
    ::testing::Values(
        AcknowledgeCase{"None", false, "", {}, {}},
        AcknowledgeCase{"EveryFolderOnceEvenAllSuccessful",
                        false,
                        "",
                        {"/hf/B", "/hf/A", "/hf/B", "/hf/A", "/hf/C"},
                        {"/hf/B", "/hf/A", "/hf/C"}},
        AcknowledgeCase{"DistinctRespectsCase", false, "", {"/hf/a", "/hf/A"}, {"/hf/a", "/hf/A"}},
        AcknowledgeCase{
            "ChosenFolderOnlyItsFirstPath", true, "a ", {"/hf/B", "/x/A", "/y/a", "/x/A"}, {"/x/A"}},
        AcknowledgeCase{"ChosenFolderNotInTheLog", true, "Z", {"/hf/B"}, {}}),
    [](const ::testing::TestParamInfo<AcknowledgeCase>& info) { return std::string(info.param.name); });

// --- sorting ----------------------------------------------------------------

struct SortCase
{
    const char* name;
    int column;
    bool descending;
    std::vector<const char*> keys;
};

class LogSorting : public ::testing::TestWithParam<SortCase>
{
};

TEST_P(LogSorting, ColumnsSortByTheirField)
{
    const SortCase& c = GetParam();
    std::deque<JobRecord> rows;
    rows.push_back(Record(wxS("a"), wxS("/hf/beta"), wxS("Zeta.pdf"), wxS("ok"), wxS("9")));
    rows.push_back(Record(wxS("b"), wxS("/hf/Alpha"), wxS("alpha.pdf"), wxS("Failed"), wxS("10")));
    rows.push_back(Record(wxS("c"), wxS("/hf/gamma"), wxS("Mid.pdf"), wxS("broken"), wxS("x")));
    rows[1][LogField::Server] = wxS("prn-02");
    logrows::Reorder(rows, logrows::SortOrder(rows, c.column, c.descending));
    std::vector<wxString> keys;
    for (const JobRecord& row : rows)
        keys.push_back(row[LogField::Key]);
    EXPECT_EQ(std::vector<wxString>(c.keys.begin(), c.keys.end()), keys);
}

INSTANTIATE_TEST_SUITE_P(
    Rows, LogSorting,
    ::testing::Values(SortCase{"FileNameDescending", 1, true, {"a", "c", "b"}},
                      SortCase{"FileNameAscendingIgnoresCase", 1, false, {"b", "c", "a"}},
                      SortCase{"HotFolderPath", 2, false, {"b", "a", "c"}},
                      SortCase{"ServerTiesKeepOrder", 3, true, {"b", "a", "c"}},
                      SortCase{"StartTimeNewestFirstByNumber", 4, true, {"b", "a", "c"}},
                      SortCase{"StartTimeOldestFirst", 4, false, {"c", "a", "b"}},
                      SortCase{"Status", 5, false, {"c", "b", "a"}},
                      SortCase{"WarningColumnLeavesTheOrder", 0, true, {"a", "b", "c"}}),
    [](const ::testing::TestParamInfo<SortCase>& info) { return std::string(info.param.name); });

} // namespace
