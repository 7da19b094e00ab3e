#include "views/ViewRules.h"

#include "data/StatusLine.h"

#include <wx/datetime.h>
#include <wx/intl.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <numeric>

namespace viewrules
{

wxString TrimmedRight(const wxString& text)
{
    wxString trimmed(text);
    trimmed.Trim(true);
    return trimmed;
}

bool SameFilterText(const wxString& a, const wxString& b)
{
    return TrimmedRight(a).CmpNoCase(TrimmedRight(b)) == 0;
}

wxString LastPathComponent(const wxString& path)
{
    size_t end = path.length();
    while (end > 1 && path[end - 1] == wxS('/'))
        --end;
    const size_t slash = path.rfind(wxS('/'), end - (end > 0 ? 1 : 0));
    const size_t start = (slash == wxString::npos || end == 0) ? 0 : slash + 1;
    return path.substr(start, end - start);
}

wxString FileTitle(const wxString& path)
{
    wxString name = LastPathComponent(path);
    const size_t dot = name.rfind(wxS('.'));
    if (dot != wxString::npos && dot > 0)
        name.erase(dot);
    return name;
}

wxString FormatSize(const wxString& bytes)
{
    if (bytes.CmpNoCase(wxS("N/A")) == 0 || bytes.empty())
        return bytes;
    const std::string narrow = bytes.ToStdString();
    char* end = nullptr;
    double value = std::strtod(narrow.c_str(), &end);
    if (end == narrow.c_str() || !std::isfinite(value))
        value = 0;
    value /= 1024;
    const char* unit = wxTRANSLATE("KB");
    if (value > 1024)
    {
        value /= 1024;
        unit = wxTRANSLATE("MB");
        if (value > 1024)
        {
            value /= 1024;
            unit = wxTRANSLATE("GB");
        }
    }
    return wxString::Format(wxS("%0.2f"), value) + wxGetTranslation(unit);
}

wxArrayString MergeFilterEntries(const wxArrayString& entries, const wxArrayString& names,
                                 const wxString& fixedEntry)
{
    wxArrayString merged(entries);
    for (const wxString& name : names)
    {
        const wxString trimmed = TrimmedRight(name);
        const bool present =
            std::any_of(merged.begin(), merged.end(),
                        [&](const wxString& entry) { return TrimmedRight(entry).CmpNoCase(trimmed) == 0; });
        if (!present)
            merged.Add(trimmed);
    }
    wxArrayString trimmedNames;
    for (const wxString& name : names)
        trimmedNames.Add(TrimmedRight(name));
    const wxString fixed = TrimmedRight(fixedEntry);
    wxArrayString kept;
    for (const wxString& entry : merged)
    {
        const wxString trimmed = TrimmedRight(entry);
        if (trimmed == fixed || trimmedNames.Index(trimmed, true) != wxNOT_FOUND)
            kept.Add(entry);
    }
    return kept;
}

wxString CountFooter(long count)
{
    return wxString::Format(wxS("%ld "), count) + wxGetTranslation("Items") + wxS(" ");
}

wxString SelectionFooter(const wxString& templateText, long selected, long count)
{
    wxString text(templateText);
    text.Replace(wxS("[WYX3Value1]"), wxString::Format(wxS("%ld"), selected), false);
    text.Replace(wxS("[WYX3Value2]"), wxString::Format(wxS("%ld"), count), false);
    return text;
}

wxString JournalNotice(const JournalWatch::Report& report, const JournalNoticeTexts& texts)
{
    const wxString time = wxDateTime(static_cast<time_t>(report.since)).Format(wxS("%H:%M"));
    switch (report.state)
    {
    case JournalWatch::State::Busy:
        return wxString::Format(texts.busySince, time);
    case JournalWatch::State::Unreadable:
        return texts.unreadable;
    case JournalWatch::State::Readable:
        break;
    }
    return report.recovered ? wxString::Format(texts.readableAgainSince, time) : wxString();
}

std::uint64_t SortNumber(const wxString& text)
{
    return LeadingDecimal(text.wc_str(), text.length());
}

void SortKeys::AppendFolded(const wxString& text, std::string& to)
{
    const wchar_t* characters = text.wc_str();
    const std::size_t length = text.length();
    for (std::size_t i = 0; i < length; ++i)
    {
        const wchar_t c = characters[i];
        // Most paths are ASCII: fold those without asking the locale.
        if (c < 0x80)
        {
            to.push_back(static_cast<char>(c >= L'A' && c <= L'Z' ? c + (L'a' - L'A') : c));
            continue;
        }
        const auto code = std::min<std::uint32_t>(static_cast<std::uint32_t>(wxTolower(c)), 0x10FFFF);
        if (code < 0x800)
        {
            to.push_back(static_cast<char>(0xC0 | code >> 6));
        }
        else
        {
            if (code < 0x10000)
            {
                to.push_back(static_cast<char>(0xE0 | code >> 12));
            }
            else
            {
                to.push_back(static_cast<char>(0xF0 | code >> 18));
                to.push_back(static_cast<char>(0x80 | (code >> 12 & 0x3F)));
            }
            to.push_back(static_cast<char>(0x80 | (code >> 6 & 0x3F)));
        }
        to.push_back(static_cast<char>(0x80 | (code & 0x3F)));
    }
}

int SortKeys::CompareTexts(std::size_t a, std::size_t b) const
{
    const auto& [startA, lengthA] = spans[a];
    const auto& [startB, lengthB] = spans[b];
    const int common =
        std::memcmp(folded.data() + startA, folded.data() + startB, std::min(lengthA, lengthB));
    if (common != 0)
        return common;
    return lengthA < lengthB ? -1 : lengthA > lengthB ? 1 : 0;
}

std::vector<std::size_t> SortKeys::Order(bool descending) const
{
    const std::size_t count = kind == SortKind::Text ? spans.size() : numbers.size();
    std::vector<std::size_t> order(count);
    std::iota(order.begin(), order.end(), std::size_t{0});
    auto sort = [&](auto before) { std::stable_sort(order.begin(), order.end(), before); };
    if (kind == SortKind::Text)
    {
        if (descending)
            sort([this](std::size_t a, std::size_t b) { return CompareTexts(a, b) > 0; });
        else
            sort([this](std::size_t a, std::size_t b) { return CompareTexts(a, b) < 0; });
    }
    else
    {
        if (descending)
            sort([this](std::size_t a, std::size_t b) { return numbers[a] > numbers[b]; });
        else
            sort([this](std::size_t a, std::size_t b) { return numbers[a] < numbers[b]; });
    }
    return order;
}

void ApplyOrder(std::vector<JobRecord>& records, const std::vector<std::size_t>& order)
{
    // Follow each cycle of the permutation, swapping texts in place.
    std::vector<bool> placed(order.size(), false);
    for (std::size_t start = 0; start < order.size(); ++start)
    {
        if (placed[start])
            continue;
        std::size_t at = start;
        while (order[at] != start)
        {
            for (std::size_t field = 0; field < records[at].size(); ++field)
                records[at][field].swap(records[order[at]][field]);
            placed[at] = true;
            at = order[at];
        }
        placed[at] = true;
    }
}

ColumnSortState::ColumnSortState(int sortableColumns, int initialColumn, bool initialDescending)
    : nextDescending(static_cast<std::size_t>(std::max(0, sortableColumns)), true), column(initialColumn),
      descending(initialDescending)
{
}

bool ColumnSortState::Click(int clicked)
{
    if (clicked < 1 || clicked > static_cast<int>(nextDescending.size()))
        return false;
    column = clicked;
    descending = nextDescending[clicked - 1];
    nextDescending[clicked - 1] = !descending;
    return true;
}

const wxString kCharWidthSample = wxS("abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ");

int ScaleColumnWidth(int referenceWidth, double averageCharWidth)
{
    constexpr double kReferenceCharWidth = 6.5;
    const double scale = std::max(1.0, averageCharWidth / kReferenceCharWidth);
    return static_cast<int>(std::lround(referenceWidth * scale));
}

} // namespace viewrules
