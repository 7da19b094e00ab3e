// Draws every image the program embeds, at the pixel sizes it uses, and the
// window icon file, and the program's icon for the menus at every size of the
// icon theme and as SVG. Shapes are laid out on a 16-unit grid and scaled, so
// the larger icons are drawn, not enlarged.
#include <wx/app.h>
#include <wx/brush.h>
#include <wx/ffile.h>
#include <wx/filename.h>
#include <wx/graphics.h>
#include <wx/image.h>
#include <wx/init.h>
#include <wx/mstream.h>

#include <cmath>
#include <cstdio>
#include <functional>
#include <memory>
#include <vector>

namespace
{
const wxColour kBlue(0x2F, 0x6F, 0xB0);
const wxColour kSlate(0x4A, 0x58, 0x68);
const wxColour kMagenta(0xFF, 0x00, 0xFF);
constexpr double kPi = 3.14159265358979323846;

using Painter = std::function<void(wxGraphicsContext&)>;

// A transparent square image painted with antialiasing; the painter works in
// 16 units whatever the pixel size.
wxImage PaintRgba(int size, const Painter& paint)
{
    wxImage image(size, size);
    image.InitAlpha();
    std::fill_n(image.GetAlpha(), size * size, 0);
    std::fill_n(image.GetData(), size * size * 3, 0);
    {
        std::unique_ptr<wxGraphicsContext> gc(wxGraphicsContext::Create(image));
        gc->SetAntialiasMode(wxANTIALIAS_DEFAULT);
        gc->Scale(size / 16.0, size / 16.0);
        paint(*gc);
    } // the context writes its pixels back into the image when it goes
    return image;
}

wxGraphicsPen Pen(wxGraphicsContext& gc, const wxColour& colour, double width)
{
    wxGraphicsPenInfo info(colour);
    info.Width(width).Cap(wxCAP_ROUND).Join(wxJOIN_ROUND);
    return gc.CreatePen(info);
}

void BusyWheel(wxGraphicsContext& gc, int frame)
{
    gc.SetPen(Pen(gc, wxColour(0x4A, 0x58, 0x68, 0x40), 2.0));
    gc.StrokePath(
        [&]
        {
            wxGraphicsPath track = gc.CreatePath();
            track.AddCircle(8, 8, 5.5);
            return track;
        }());
    const double start = -kPi / 2 + frame * (2 * kPi / 12);
    wxGraphicsPath arc = gc.CreatePath();
    arc.AddArc(8, 8, 5.5, start, start + kPi * 0.6, true);
    gc.SetPen(Pen(gc, kBlue, 2.0));
    gc.StrokePath(arc);
}

void WarningTriangle(wxGraphicsContext& gc)
{
    wxGraphicsPath triangle = gc.CreatePath();
    triangle.MoveToPoint(8, 1.6);
    triangle.AddLineToPoint(15, 14.2);
    triangle.AddLineToPoint(1, 14.2);
    triangle.CloseSubpath();
    gc.SetPen(Pen(gc, wxColour(0xC9, 0x8A, 0x12), 1.2));
    gc.SetBrush(gc.CreateBrush(wxBrush(wxColour(0xF2, 0xB5, 0x2C))));
    gc.DrawPath(triangle);
    gc.SetPen(Pen(gc, wxColour(0x3A, 0x2A, 0x05), 1.7));
    gc.StrokeLine(8, 6.2, 8, 9.6);
    gc.SetPen(wxNullPen);
    gc.SetBrush(gc.CreateBrush(wxBrush(wxColour(0x3A, 0x2A, 0x05))));
    gc.DrawEllipse(8 - 0.95, 12.0 - 0.95, 1.9, 1.9);
}

void ClearAll(wxGraphicsContext& gc)
{
    gc.SetPen(wxNullPen);
    gc.SetBrush(gc.CreateBrush(wxBrush(wxColour(0xC8, 0x49, 0x3C))));
    gc.DrawEllipse(1.5, 1.5, 13, 13);
    gc.SetPen(Pen(gc, *wxWHITE, 1.7));
    gc.StrokeLine(5.5, 5.5, 10.5, 10.5);
    gc.StrokeLine(10.5, 5.5, 5.5, 10.5);
}

// The hot-folder icon and the folder tab are kept as shapes on the 16-unit
// grid, so that the same drawing becomes both the PNGs and the scalable SVG.
struct Shape
{
    enum Kind
    {
        Polygon,     // points: x0 y0 x1 y1 ...
        RoundedRect, // x y width height radius
        Circle,      // x y diameter (of the bounding square)
        Line,        // x0 y0 x1 y1
    };
    Kind kind;
    std::vector<double> points;
    wxColour stroke;
    double strokeWidth;
    wxColour fill; // not ok: no fill
};

std::vector<Shape> FolderShapes()
{
    return {
        {Shape::Polygon,
         {1.5, 13.5, 1.5, 3.2, 6.0, 3.2, 7.4, 4.6, 14.5, 4.6, 14.5, 13.5},
         wxColour(0xB9, 0x7A, 0x1C),
         0.8,
         wxColour(0xE3, 0xA0, 0x3A)},
        {Shape::RoundedRect,
         {1.5, 6.2, 13, 7.3, 0.8},
         wxColour(0xB9, 0x7A, 0x1C),
         0.8,
         wxColour(0xF6, 0xC4, 0x5E)},
    };
}

std::vector<Shape> HotFolderShapes()
{
    std::vector<Shape> shapes = FolderShapes();
    // The badge: files dropped here are sent on.
    shapes.push_back({Shape::Circle, {8.6, 8.6, 7}, *wxWHITE, 0.9, kBlue});
    for (const std::vector<double>& line :
         {std::vector<double>{10.4, 12.1, 13.6, 12.1}, {12.1, 10.5, 13.7, 12.1}, {12.1, 13.7, 13.7, 12.1}})
        shapes.push_back({Shape::Line, line, *wxWHITE, 1.2, wxColour()});
    return shapes;
}

void PaintShapes(wxGraphicsContext& gc, const std::vector<Shape>& shapes)
{
    for (const Shape& shape : shapes)
    {
        const std::vector<double>& p = shape.points;
        gc.SetPen(Pen(gc, shape.stroke, shape.strokeWidth));
        if (shape.fill.IsOk())
            gc.SetBrush(gc.CreateBrush(wxBrush(shape.fill)));
        switch (shape.kind)
        {
        case Shape::Polygon:
        {
            wxGraphicsPath path = gc.CreatePath();
            path.MoveToPoint(p[0], p[1]);
            for (std::size_t i = 2; i + 1 < p.size(); i += 2)
                path.AddLineToPoint(p[i], p[i + 1]);
            path.CloseSubpath();
            gc.DrawPath(path);
            break;
        }
        case Shape::RoundedRect:
            gc.DrawRoundedRectangle(p[0], p[1], p[2], p[3], p[4]);
            break;
        case Shape::Circle:
            gc.DrawEllipse(p[0], p[1], p[2], p[2]);
            break;
        case Shape::Line:
            gc.StrokeLine(p[0], p[1], p[2], p[3]);
            break;
        }
    }
}

void Folder(wxGraphicsContext& gc)
{
    PaintShapes(gc, FolderShapes());
}

void HotFolderIcon(wxGraphicsContext& gc)
{
    PaintShapes(gc, HotFolderShapes());
}

// The same shapes as an SVG document on a 16-unit view box.
wxString SvgOf(const std::vector<Shape>& shapes)
{
    const auto number = [](double value) { return wxString::FromCDouble(value, 2); };
    wxString svg = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                   "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"256\" height=\"256\" "
                   "viewBox=\"0 0 16 16\">\n";
    for (const Shape& shape : shapes)
    {
        const std::vector<double>& p = shape.points;
        const wxString paint =
            wxString::Format(" fill=\"%s\" stroke=\"%s\" stroke-width=\"%s\" stroke-linecap=\"round\" "
                             "stroke-linejoin=\"round\"/>\n",
                             shape.fill.IsOk() ? shape.fill.GetAsString(wxC2S_HTML_SYNTAX) : wxString("none"),
                             shape.stroke.GetAsString(wxC2S_HTML_SYNTAX), number(shape.strokeWidth));
        switch (shape.kind)
        {
        case Shape::Polygon:
        {
            wxString points;
            for (std::size_t i = 0; i + 1 < p.size(); i += 2)
                points += (i ? " " : "") + number(p[i]) + "," + number(p[i + 1]);
            svg += "  <polygon points=\"" + points + "\"" + paint;
            break;
        }
        case Shape::RoundedRect:
            svg += wxString::Format("  <rect x=\"%s\" y=\"%s\" width=\"%s\" height=\"%s\" rx=\"%s\"",
                                    number(p[0]), number(p[1]), number(p[2]), number(p[3]), number(p[4])) +
                   paint;
            break;
        case Shape::Circle:
            svg += wxString::Format("  <circle cx=\"%s\" cy=\"%s\" r=\"%s\"", number(p[0] + p[2] / 2),
                                    number(p[1] + p[2] / 2), number(p[2] / 2)) +
                   paint;
            break;
        case Shape::Line:
            svg += wxString::Format("  <line x1=\"%s\" y1=\"%s\" x2=\"%s\" y2=\"%s\"", number(p[0]),
                                    number(p[1]), number(p[2]), number(p[3])) +
                   paint;
            break;
        }
    }
    return svg + "</svg>\n";
}

bool SaveText(const wxString& text, const wxString& path)
{
    wxFFile file(path, "wb");
    const wxScopedCharBuffer bytes = text.utf8_str();
    const bool ok =
        file.IsOpened() && file.Write(bytes.data(), bytes.length()) == bytes.length() && file.Close();
    if (!ok)
        std::fprintf(stderr, "cannot write %s\n", static_cast<const char*>(path.utf8_str()));
    return ok;
}

void StatusTab(wxGraphicsContext& gc)
{
    gc.SetPen(Pen(gc, kBlue, 1.5));
    gc.SetBrush(gc.CreateBrush(wxBrush(*wxWHITE)));
    gc.DrawEllipse(1.75, 1.75, 12.5, 12.5);
    gc.SetPen(Pen(gc, kSlate, 1.4));
    gc.StrokeLine(8, 8, 8, 4.4);
    gc.StrokeLine(8, 8, 10.8, 9.6);
}

void LogTab(wxGraphicsContext& gc)
{
    wxGraphicsPath page = gc.CreatePath();
    page.MoveToPoint(3, 1.5);
    page.AddLineToPoint(10, 1.5);
    page.AddLineToPoint(13, 4.5);
    page.AddLineToPoint(13, 14.5);
    page.AddLineToPoint(3, 14.5);
    page.CloseSubpath();
    gc.SetPen(Pen(gc, kSlate, 1.0));
    gc.SetBrush(gc.CreateBrush(wxBrush(*wxWHITE)));
    gc.DrawPath(page);
    gc.SetPen(Pen(gc, kBlue, 1.2));
    for (double y : {6.0, 8.5, 11.0})
        gc.StrokeLine(5.3, y, 10.7, y);
}

// Sort marks are masked on magenta, so they are drawn pixel by pixel: a blended
// edge would leave a pink fringe once the mask cuts the magenta away.
wxImage SortMark(bool pointingUp)
{
    wxImage image(16, 16);
    image.SetRGB(wxRect(0, 0, 16, 16), kMagenta.Red(), kMagenta.Green(), kMagenta.Blue());
    for (int step = 0; step < 4; ++step)
    {
        const int y = pointingUp ? 6 + step : 9 - step;
        image.SetRGB(wxRect(7 - step, y, 2 + 2 * step, 1), 0x5B, 0x6B, 0x7C);
    }
    return image;
}

// Opaque strip behind the list header: a soft top-to-bottom fade.
wxImage HeaderStrip()
{
    wxImage image(1, 23);
    for (int y = 0; y < 23; ++y)
    {
        const double t = y / 22.0;
        image.SetRGB(0, y, static_cast<unsigned char>(0xF6 - t * (0xF6 - 0xE3)),
                     static_cast<unsigned char>(0xF8 - t * (0xF8 - 0xE8)),
                     static_cast<unsigned char>(0xFA - t * (0xFA - 0xEE)));
    }
    return image;
}

std::vector<unsigned char> PngBytes(const wxImage& image)
{
    wxMemoryOutputStream out;
    image.SaveFile(out, wxBITMAP_TYPE_PNG);
    std::vector<unsigned char> bytes(out.GetSize());
    out.CopyTo(bytes.data(), bytes.size());
    return bytes;
}

bool Save(const wxImage& image, const wxString& path)
{
    if (!image.SaveFile(path, wxBITMAP_TYPE_PNG))
    {
        std::fprintf(stderr, "cannot write %s\n", static_cast<const char*>(path.utf8_str()));
        return false;
    }
    return true;
}

void PutLe(std::vector<unsigned char>& out, unsigned value, int bytes)
{
    for (int i = 0; i < bytes; ++i)
        out.push_back(static_cast<unsigned char>(value >> (8 * i)));
}

// An icon file whose entries are PNG images: a directory of 16-byte entries
// after the 6-byte header, then the PNG data of each.
bool SaveIco(const std::vector<wxImage>& images, const wxString& path)
{
    std::vector<std::vector<unsigned char>> pngs;
    for (const wxImage& image : images)
        pngs.push_back(PngBytes(image));
    std::vector<unsigned char> file;
    PutLe(file, 0, 2);
    PutLe(file, 1, 2);
    PutLe(file, static_cast<unsigned>(images.size()), 2);
    unsigned offset = static_cast<unsigned>(6 + 16 * images.size());
    for (size_t i = 0; i < images.size(); ++i)
    {
        PutLe(file, static_cast<unsigned>(images[i].GetWidth()) & 0xFF, 1);
        PutLe(file, static_cast<unsigned>(images[i].GetHeight()) & 0xFF, 1);
        PutLe(file, 0, 1); // no palette
        PutLe(file, 0, 1);
        PutLe(file, 1, 2);  // planes
        PutLe(file, 32, 2); // bits per pixel
        PutLe(file, static_cast<unsigned>(pngs[i].size()), 4);
        PutLe(file, offset, 4);
        offset += static_cast<unsigned>(pngs[i].size());
    }
    for (const auto& png : pngs)
        file.insert(file.end(), png.begin(), png.end());
    wxFFile out(path, "wb");
    return out.IsOpened() && out.Write(file.data(), file.size()) == file.size() && out.Close();
}
} // namespace

int main(int argc, char** argv)
{
    wxInitializer toolkit(argc, argv);
    if (!toolkit.IsOk() || argc != 2)
    {
        std::fprintf(stderr, "usage: wyx-imagegen <resources folder> (needs a display)\n");
        return 2;
    }
    wxInitAllImageHandlers();
    const wxString resources = wxString::FromUTF8(argv[1]);
    const wxString images = resources + "/images/";
    wxFileName::Mkdir(images, wxS_DIR_DEFAULT, wxPATH_MKDIR_FULL);

    bool ok = true;
    for (int frame = 0; frame < 12; ++frame)
        ok &= Save(PaintRgba(16, [frame](wxGraphicsContext& gc) { BusyWheel(gc, frame); }),
                   images + wxString::Format("busy_%02d.png", frame));
    ok &= Save(SortMark(true), images + "sort_ascending.png");
    ok &= Save(SortMark(false), images + "sort_descending.png");
    ok &= Save(HeaderStrip(), images + "header_strip.png");
    ok &= Save(PaintRgba(16, WarningTriangle), images + "warning.png");
    ok &= Save(PaintRgba(16, ClearAll), images + "clear_all.png");
    ok &= Save(PaintRgba(16, Folder), images + "tab_folder.png");
    ok &= Save(PaintRgba(16, StatusTab), images + "tab_status.png");
    ok &= Save(PaintRgba(16, LogTab), images + "tab_log.png");

    // The window icon file holds the small sizes; the menus' icon theme takes
    // every size and the SVG.
    std::vector<wxImage> icon;
    for (int size : {16, 32, 48, 64, 128, 256})
    {
        const wxImage image = PaintRgba(size, HotFolderIcon);
        ok &= Save(image, images + wxString::Format("wyx_folder_%d.png", size));
        if (size <= 48)
            icon.push_back(image);
    }
    ok &= SaveIco(icon, resources + "/wyx_folder.ico");
    ok &= SaveText(SvgOf(HotFolderShapes()), images + "wyx_folder.svg");
    return ok ? 0 : 1;
}
