#pragma once

#include <wx/colour.h>
#include <wx/defs.h>
#include <wx/font.h>
#include <wx/string.h>

#include <algorithm>
#include <vector>

// Cell image indices beside the image-list positions (0 and above).
enum ProfilesKelvoCellImage
{
    kCellImageNone = -1,
    kCellImageStatusCircle = -2,
    kCellImageStatusSquare = -3
};

// Column format beside wxLIST_FORMAT_LEFT/RIGHT/CENTRE: the cell text is a
// percentage drawn as a progress bar.
constexpr int kColumnFormatProgress = 3;

// One column as the header and the rows see it.
struct ProfilesKelvoListColumn
{
    wxString text;
    int width = 0;
    int format = 0;
    int image = kCellImageNone;
};

// The look a cell may carry of its own; invalid members mean "not set".
struct ProfilesKelvoListCellAttr
{
    wxColour textColour;
    wxColour backgroundColour;
    wxFont font;

    bool IsEmpty() const { return !textColour.IsOk() && !backgroundColour.IsOk() && !font.IsOk(); }
};

struct ProfilesKelvoListCell
{
    wxString text;
    int image = kCellImageNone;
    ProfilesKelvoListCellAttr attr;
};

// One row: its cells by column, and the item data of the row.
class ProfilesKelvoListLineData
{
public:
    explicit ProfilesKelvoListLineData(size_t columns = 0) : m_cells(columns) {}
    // Declared noexcept so that a growing list moves its rows instead of
    // copying every cell text (wxColour and wxFont only share their data).
    ProfilesKelvoListLineData(ProfilesKelvoListLineData&&) noexcept = default;
    ProfilesKelvoListLineData& operator=(ProfilesKelvoListLineData&&) noexcept = default;
    ProfilesKelvoListLineData(const ProfilesKelvoListLineData&) = default;
    ProfilesKelvoListLineData& operator=(const ProfilesKelvoListLineData&) = default;

    size_t GetCellCount() const { return m_cells.size(); }
    void SetCellCount(size_t columns) { m_cells.resize(columns); }
    void InsertCell(size_t column) { m_cells.insert(m_cells.begin() + std::min(column, m_cells.size()), {}); }

    // Cells beyond the row's own are empty; Cell() grows the row on demand.
    const ProfilesKelvoListCell& GetCell(size_t column) const
    {
        static const ProfilesKelvoListCell empty;
        return column < m_cells.size() ? m_cells[column] : empty;
    }
    ProfilesKelvoListCell& Cell(size_t column)
    {
        if (column >= m_cells.size())
            m_cells.resize(column + 1);
        return m_cells[column];
    }

    wxUIntPtr GetData() const { return m_data; }
    void SetData(wxUIntPtr data) { m_data = data; }

    // The row's own attribute, applied to every cell that has none.
    const ProfilesKelvoListCellAttr& GetAttr() const { return m_attr; }
    ProfilesKelvoListCellAttr& Attr() { return m_attr; }

private:
    std::vector<ProfilesKelvoListCell> m_cells;
    ProfilesKelvoListCellAttr m_attr;
    wxUIntPtr m_data = 0;
};
