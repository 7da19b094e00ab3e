#pragma once

#include "data/JobRecord.h"
#include "data/JournalWatch.h"

#include <wx/arrstr.h>
#include <wx/string.h>

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

// The rules both tab pages apply to records, free of windows so that they are
// tested, fuzzed and measured without a display.
namespace viewrules
{

// The text without trailing white space.
wxString TrimmedRight(const wxString& text);
// Filter texts match when equal after trailing white space is removed, ignoring case.
bool SameFilterText(const wxString& a, const wxString& b);

// "/srv/in/a.b.pdf" gives "a.b.pdf"; a path ending in a separator names its last folder.
wxString LastPathComponent(const wxString& path);
// The last component without its extension ("a.b.pdf" gives "a.b"; ".rc" stays ".rc").
wxString FileTitle(const wxString& path);

// A byte count as the Size column shows it: "N/A" in any case unchanged, empty
// stays empty, else KB, MB or GB with two decimals and the translated unit.
wxString FormatSize(const wxString& bytes);

// The entries a filter box holds after the data source named `names`: every
// name not yet there (ignoring case) is added at the end; every entry that
// is not a name (respecting case) is removed, except `fixedEntry`. Entries
// and names are compared without trailing white space; order is kept.
wxArrayString MergeFilterEntries(const wxArrayString& entries, const wxArrayString& names,
                                 const wxString& fixedEntry);

// "12 Items " (the count, a space, the translated "Items", a space).
wxString CountFooter(long count);
// The selection footer from its template: the first "[WYX3Value1]" becomes the
// selected count, the first "[WYX3Value2]" the row count, in whatever order
// a translation puts them.
wxString SelectionFooter(const wxString& templateText, long selected, long count);

// What a footer adds when its journal could not be read at the latest polls,
// or has just become readable again: empty while all is well. The texts hold
// one "%s" for the time.
struct JournalNoticeTexts
{
    wxString busySince;
    wxString unreadable;
    wxString readableAgainSince;
};
wxString JournalNotice(const JournalWatch::Report& report, const JournalNoticeTexts& texts);

// How a sort column compares: its text ignoring case, or its text read as an
// unsigned decimal number (0 when it does not read as one).
enum class SortKind
{
    Text,
    Number
};

// The decimal reading of a sort field: leading digits only, 0 without any.
std::uint64_t SortNumber(const wxString& text);

// Sort keys computed once per record, so a sort of n records folds and reads
// n texts, not n log n. Folded texts share one buffer. Ties keep the records'
// own order, so rows that compare equal do not change places between updates.
class SortKeys
{
public:
    // `value(i)` gives the field of record i.
    template <typename Value> SortKeys(std::size_t count, SortKind kind, Value value) : kind(kind)
    {
        if (kind == SortKind::Text)
        {
            std::size_t length = 0;
            for (std::size_t i = 0; i < count; ++i)
                length += value(i).length();
            folded.reserve(length + length / 8);
            spans.reserve(count);
            for (std::size_t i = 0; i < count; ++i)
            {
                const std::size_t start = folded.size();
                AppendFolded(value(i), folded);
                spans.emplace_back(start, folded.size() - start);
            }
        }
        else
        {
            numbers.reserve(count);
            for (std::size_t i = 0; i < count; ++i)
                numbers.push_back(SortNumber(value(i)));
        }
    }
    // Numbers already read, such as times the records do not carry as text.
    explicit SortKeys(std::vector<std::uint64_t> values) : kind(SortKind::Number), numbers(std::move(values))
    {
    }

    // The record positions in sort order.
    std::vector<std::size_t> Order(bool descending) const;

    // The text lower-cased character by character, as the case-insensitive
    // comparison of the toolkit folds it, in UTF-8: its bytes order as the
    // characters do, and most paths take a quarter of the room to compare.
    static void AppendFolded(const wxString& text, std::string& to);

private:
    int CompareTexts(std::size_t a, std::size_t b) const;

    SortKind kind;
    std::string folded;
    std::vector<std::pair<std::size_t, std::size_t>> spans;
    std::vector<std::uint64_t> numbers;
};

// Rearranges `records` into `order` without copying a text (wxString has no move).
void ApplyOrder(std::vector<JobRecord>& records, const std::vector<std::size_t>& order);

// Which column is sorted and which way, and the direction each column's next
// click sorts. Columns are counted from 1 (column 0 is never sorted); the
// first click on a column sorts descending, each later click on it flips.
class ColumnSortState
{
public:
    ColumnSortState(int sortableColumns, int initialColumn, bool initialDescending);

    // False (nothing changes) for a column that cannot be sorted.
    bool Click(int column);

    int Column() const { return column; }
    bool Descending() const { return descending; }

private:
    std::vector<bool> nextDescending;
    int column;
    bool descending;
};

// Column and box widths are given in pixels at the original platform's
// default font (Segoe UI 9 pt at 96 dpi, whose letters average about 6.5
// pixels). Scale by how much wider this font's average letter is; never narrower.
int ScaleColumnWidth(int referenceWidth, double averageCharWidth);
// The average letter width is measured over this text in the GUI font.
extern const wxString kCharWidthSample;

} // namespace viewrules
