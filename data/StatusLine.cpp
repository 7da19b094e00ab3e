#include "data/StatusLine.h"

#include <array>
#include <cwchar>

#include "data/DosTime.h"

namespace
{

constexpr size_t kStatusPieces = 9;

enum Piece : size_t
{
    Key = 0,
    HotFolderPath,
    FilePath,
    Server,
    DosTime,
    Status,
    Size,
    Format,
    Action
};

// Piece boundaries into the line; stops as soon as a tenth piece shows up,
// since such a line is skipped anyway.
size_t SplitPieces(const wchar_t* line, size_t length,
                   std::array<std::pair<size_t, size_t>, kStatusPieces>& pieces)
{
    size_t count = 0;
    size_t i = 0;
    while (i < length)
    {
        while (i < length && line[i] == L'\t')
            ++i;
        if (i == length)
            break;
        const size_t start = i;
        const wchar_t* const tab = std::wmemchr(line + i, L'\t', length - i);
        i = tab != nullptr ? static_cast<size_t>(tab - line) : length;
        if (count == kStatusPieces)
            return kStatusPieces + 1;
        pieces[count++] = {start, i - start};
    }
    return count;
}

} // namespace

std::uint64_t LeadingDecimal(const wchar_t* text, size_t length)
{
    std::uint64_t value = 0;
    for (size_t i = 0; i < length && text[i] >= L'0' && text[i] <= L'9'; ++i)
    {
        const unsigned digit = static_cast<unsigned>(text[i] - L'0');
        if (value > (UINT64_MAX - digit) / 10)
            return UINT64_MAX;
        value = value * 10 + digit;
    }
    return value;
}

bool ParseStatusLine(const wxString& line, JobRecord& record, std::uint64_t* startTime)
{
    // Split in place over the characters: copies are made only of the pieces kept.
    const wchar_t* const text = line.wc_str();
    std::array<std::pair<size_t, size_t>, kStatusPieces> pieces;
    if (SplitPieces(text, line.length(), pieces) != kStatusPieces)
        return false;
    const wchar_t* action = text + pieces[Action].first;
    const size_t actionLength = pieces[Action].second;
    auto isAction = [&](const wchar_t* tag)
    {
        if (std::wcslen(tag) != actionLength)
            return false;
        // ASCII folding: a Turkish locale must not turn "modified" into "MODİFİED".
        for (size_t i = 0; i < actionLength; ++i)
        {
            const wchar_t c = action[i] >= L'a' && action[i] <= L'z' ? action[i] - (L'a' - L'A') : action[i];
            if (c != tag[i])
                return false;
        }
        return true;
    };
    if (!isAction(L"ADDED") && !isAction(L"MODIFIED"))
        return false;

    // Assigned in place: each field is one allocation at most (wxString has no move).
    auto take = [&](size_t field, Piece from)
    { record[field].assign(text + pieces[from].first, pieces[from].second); };
    take(StatusField::Key, Key);
    take(StatusField::FilePath, FilePath);
    take(StatusField::HotFolderPath, HotFolderPath);
    take(StatusField::Server, Server);
    take(StatusField::Size, Size);
    take(StatusField::Format, Format);
    wxString time = FormatDosTime(text + pieces[DosTime].first, pieces[DosTime].second);
    record[StatusField::TimeText].swap(time);
    take(StatusField::Status, Status);
    if (startTime)
        *startTime = LeadingDecimal(text + pieces[DosTime].first, pieces[DosTime].second);
    return true;
}
