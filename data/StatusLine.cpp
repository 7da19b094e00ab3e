#include "data/StatusLine.h"

#include <array>

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

    const wxString action = piece(Action);
    if (!action.IsSameAs("ADDED", false) && !action.IsSameAs("MODIFIED", false))
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
