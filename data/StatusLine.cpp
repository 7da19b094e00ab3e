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
size_t SplitPieces(const wxString& line, std::array<std::pair<size_t, size_t>, kStatusPieces>& pieces)
{
    size_t count = 0;
    const size_t length = line.length();
    size_t i = 0;
    while (i < length)
    {
        while (i < length && line[i] == L'\t')
            ++i;
        if (i == length)
            break;
        const size_t start = i;
        while (i < length && line[i] != L'\t')
            ++i;
        if (count == kStatusPieces)
            return kStatusPieces + 1;
        pieces[count++] = {start, i - start};
    }
    return count;
}

} // namespace

bool ParseStatusLine(const wxString& line, JobRecord& record)
{
    std::array<std::pair<size_t, size_t>, kStatusPieces> pieces;
    if (SplitPieces(line, pieces) != kStatusPieces)
        return false;
    auto piece = [&](Piece p) { return line.substr(pieces[p].first, pieces[p].second); };

    // Compared in place: a narrow literal or a copy would cost an allocation per line.
    const wchar_t* action = line.wc_str() + pieces[Action].first;
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

    record[StatusField::Key] = piece(Key);
    record[StatusField::FilePath] = piece(FilePath);
    record[StatusField::HotFolderPath] = piece(HotFolderPath);
    record[StatusField::Server] = piece(Server);
    record[StatusField::Size] = piece(Size);
    record[StatusField::Format] = piece(Format);
    record[StatusField::TimeText] = FormatDosTime(piece(DosTime));
    record[StatusField::Status] = piece(Status);
    return true;
}
