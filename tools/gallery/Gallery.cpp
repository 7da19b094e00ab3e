// wyx-gallery: the themed list controls with sample rows. Shows a virtual job
// table (CustomListCtrl) above a plain list with status marks, progress cells,
// shortened text, sort marks, alternate rows and selections.
#include "components/Utility/CustomListCtrl.h"
#include "components/Utility/profilescustomlistctrl.h"
#include "platform/themer/Themer.h"
#include "platform/ui/BitmapFromMemory.h"
#include "resources/EmbeddedImages.h"

#include <wx/app.h>
#include <wx/frame.h>
#include <wx/image.h>
#include <wx/imaglist.h>
#include <wx/panel.h>
#include <wx/sizer.h>
#include <wx/stattext.h>

#include <memory>
#include <vector>

namespace
{
namespace images = wyx::images;

wxBitmap Decode(const images::EmbeddedImage& image)
{
    return CUGetBitmapFromMemory(image.data, image.length);
}

std::unique_ptr<wxImageList> BusyWheel()
{
    auto list = std::make_unique<wxImageList>(16, 16, true, 5);
    for (const images::EmbeddedImage& frame : images::busyWheel)
        list->Add(wxBitmap(Decode(frame).ConvertToImage()));
    return list;
}

std::unique_ptr<wxImageList> SortMarks()
{
    auto list = std::make_unique<wxImageList>(16, 16, true, 1);
    for (const images::EmbeddedImage& mark : images::sortMarks)
        list->Add(Decode(mark), wxColour(255, 0, 255));
    return list;
}

std::unique_ptr<wxImageList> Warning()
{
    auto list = std::make_unique<wxImageList>(16, 16, true, 1);
    list->Add(wxBitmap(Decode(images::warning).ConvertToImage()));
    return list;
}

headerStyle ListHeaderStyle()
{
    Themer* themer = Themer::GetThemeService();
    headerStyle style;
    style.backgroundColour = themer->GetTheme("Default").backgroundColour;
    style.bitmap = Decode(images::headerStrip);
    style.textColour = themer->GetTheme("ListControl").foregroundColour;
    return style;
}

void SetSortMark(ProfilesKelvoProfilesListCtrl* list, int column, int image)
{
    wxListItem mark;
    mark.SetImage(image);
    list->SetColumn(column, mark);
}

class GalleryFrame : public wxFrame
{
public:
    GalleryFrame()
        : wxFrame(nullptr, wxID_ANY, wxS("WyxProgress control gallery"), wxPoint(0, 0), wxSize(1000, 720)),
          m_busy(BusyWheel()), m_sortMarks(SortMarks()), m_warning(Warning())
    {
        Themer* themer = Themer::GetThemeService();
        auto* panel = new wxPanel(this);
        panel->SetBackgroundColour(themer->GetTheme("Default").backgroundColour);
        auto* sizer = new wxBoxSizer(wxVERTICAL);
        sizer->Add(Caption(panel, wxS("Status: virtual CustomListCtrl")), 0, wxLEFT | wxTOP, 8);
        sizer->Add(MakeJobTable(panel), 1, wxEXPAND | wxALL, 6);
        sizer->Add(Caption(panel, wxS("Log: ProfilesKelvoProfilesListCtrl")), 0, wxLEFT, 8);
        sizer->Add(MakeLogList(panel), 1, wxEXPAND | wxALL, 6);
        panel->SetSizer(sizer);
    }

    void FocusJobTable() { m_jobTable->GetMainWindow()->SetFocus(); }

private:
    static wxStaticText* Caption(wxWindow* parent, const wxString& text)
    {
        auto* caption = new wxStaticText(parent, wxID_ANY, text);
        caption->SetFont(caption->GetFont().Bold());
        caption->SetForegroundColour(Themer::GetThemeService()->GetTheme("ListControl").foregroundColour);
        return caption;
    }

    wxWindow* MakeJobTable(wxWindow* parent)
    {
        const headerStyle style = ListHeaderStyle();
        m_jobTable =
            new CustomListCtrl(&style, parent, wxID_ANY, wxDefaultPosition, wxDefaultSize,
                               wxLC_SINGLE_SEL | wxLC_VIRTUAL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES);
        m_jobTable->SetAlternateRowColour(
            Themer::GetThemeService()->GetTheme("ListControl").alternateRowColour);
        m_jobTable->SetImageList(m_busy.get(), wxIMAGE_LIST_SMALL);
        m_jobTable->SetImageList(m_sortMarks.get(), kHeaderImageList);
        const struct
        {
            const char* heading;
            int width;
        } columns[] = {{"No.", 40},     {"File Name", 120}, {"Format", 65}, {"Hot Folder", 120},
                       {"Server", 130}, {"Size", 65},       {"Time", 100},  {"Status", 145}};
        for (const auto& column : columns)
            m_jobTable->InsertColumn(m_jobTable->GetColumnCount(), column.heading, wxLIST_FORMAT_LEFT,
                                     column.width);
        SetSortMark(m_jobTable, 1, 0);

        const std::vector<JobRecord> rows = {
            {"1", "Annual report 2026 final", "Print A4", "srv-paris-01", "2.31MB", "PDF", "09:12:44",
             "Converting file type"},
            {"2", "Brochure", "Print A3", "srv-paris-01", "845.20KB", "PDF", "09:13:02",
             "Transferring to server"},
            {"3", "Catalogue spring", "Proofs", "srv-lyon-02", "12.75MB", "TIFF", "09:13:40", "Saving..."},
            {"4", "Delivery note 4471", "Print A4", "srv-lyon-02", "96.00KB", "PS", "09:14:05", "Waiting"},
            {"5", "Envelope C5 window", "Envelopes", "srv-paris-01", "18.50KB", "PDF", "09:14:31",
             "Transferring to server"},
            {"6", "Flyer", "Print A5", "srv-nantes-03", "1.02MB", "JPEG", "09:15:00", "Waiting"},
        };
        m_jobTable->SetRecords(rows);
        m_jobTable->SetStatusImage(3);
        m_jobTable->SetItemCount(static_cast<long>(rows.size()));
        m_jobTable->SetItemState(1, wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED,
                                 wxLIST_STATE_SELECTED | wxLIST_STATE_FOCUSED);
        return m_jobTable;
    }

    wxWindow* MakeLogList(wxWindow* parent)
    {
        const headerStyle style = ListHeaderStyle();
        auto* list =
            new ProfilesKelvoProfilesListCtrl(&style, parent, 6008, wxDefaultPosition, wxDefaultSize,
                                              wxLC_SINGLE_SEL | wxLC_REPORT | wxLC_HRULES | wxLC_VRULES);
        list->SetAlternateRowColour(Themer::GetThemeService()->GetTheme("ListControl").alternateRowColour);
        list->SetImageList(m_warning.get(), wxIMAGE_LIST_SMALL);
        list->SetImageList(m_sortMarks.get(), kHeaderImageList);
        list->InsertColumn(0, wxS(" "), wxLIST_FORMAT_LEFT, 25);
        list->InsertColumn(1, wxS("File Name"), wxLIST_FORMAT_LEFT, 160);
        list->InsertColumn(2, wxS("Hot Folder"), wxLIST_FORMAT_LEFT, 120);
        list->InsertColumn(3, wxS("Server"), wxLIST_FORMAT_LEFT, 110);
        list->InsertColumn(4, wxS("Progress"), kColumnFormatProgress, 110);
        list->InsertColumn(5, wxS("Start Time"), wxLIST_FORMAT_LEFT, 125);
        list->InsertColumn(6, wxS("Status"), wxLIST_FORMAT_LEFT, 200);
        SetSortMark(list, 5, 1);

        const wxColour green(0x2E, 0x9E, 0x4F);
        const wxColour red(0xD6, 0x3B, 0x3B);
        const wxColour amber(0xE8, 0xA3, 0x17);
        const struct
        {
            bool failed;
            const char* file;
            const char* folder;
            const char* server;
            const char* done;
            const char* time;
            int mark;
            const char* status;
            wxColour colour;
        } rows[] = {
            {false, "Annual report 2026 final version with appendices", "Print A4", "srv-paris-01", "100",
             "06/12/2026 09:02", kCellImageStatusCircle, "Transferred Successfully", green},
            {true, "Brochure", "Print A3", "srv-paris-01", "35", "06/12/2026 08:57", kCellImageStatusCircle,
             "Server not reachable", red},
            {false, "Catalogue spring", "Proofs", "srv-lyon-02", "100", "06/12/2026 08:51",
             kCellImageStatusCircle, "Transferred Successfully", green},
            {true, "Delivery note 4471", "Print A4", "srv-lyon-02", "0", "06/12/2026 08:44",
             kCellImageStatusSquare,
             "Unsupported file format: the converter could not read the page description", amber},
            {false, "Envelope C5 window", "Envelopes", "srv-paris-01", "100", "06/12/2026 08:40",
             kCellImageStatusCircle, "Transferred Successfully", green},
            {true, "Flyer", "Print A5", "srv-nantes-03", "72", "06/12/2026 08:31", kCellImageStatusSquare,
             "Disk full on server", amber},
            {false, "Greeting cards", "Print A5", "srv-nantes-03", "100", "06/12/2026 08:22",
             kCellImageStatusCircle, "Transferred Successfully", green},
        };
        long item = 0;
        for (const auto& row : rows)
        {
            list->InsertItem(item, wxString(), row.failed ? 0 : kCellImageNone);
            list->SetItem(item, 1, row.file);
            list->SetItem(item, 2, row.folder);
            list->SetItem(item, 3, row.server);
            list->SetItem(item, 4, row.done);
            list->SetItem(item, 5, row.time);
            list->SetItem(item, 6, row.status, row.mark);
            list->SetItemTextColour(item, row.colour);
            list->SetItemData(item, item);
            ++item;
        }
        list->SetItemState(3, wxLIST_STATE_SELECTED, wxLIST_STATE_SELECTED);
        return list;
    }

    std::unique_ptr<wxImageList> m_busy;
    std::unique_ptr<wxImageList> m_sortMarks;
    std::unique_ptr<wxImageList> m_warning;
    CustomListCtrl* m_jobTable = nullptr;
};

} // namespace

class GalleryApp : public wxApp
{
public:
    bool OnInit() override
    {
        wxInitAllImageHandlers();
        auto* frame = new GalleryFrame;
        frame->Show();
        frame->FocusJobTable();
        return true;
    }
};

wxIMPLEMENT_APP(GalleryApp);
