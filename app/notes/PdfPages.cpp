// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/PdfPages.h"

#include "app/console/Failure.h"

#include <algorithm>
#include <cairo-pdf.h>

namespace cadrel::app {

PdfPages::PdfPages(double width, double height, const NotesSink& sink)
    : m_width(width), m_height(height), m_sink(sink),
      m_surface(cairo_pdf_surface_create_for_stream(&PdfPages::write, this, width, height)),
      m_context(cairo_create(m_surface.get()))
{
}

/// No exception may pass through the library, so what is drawn is kept until the end.
cairo_status_t PdfPages::write(void* pages, const unsigned char* bytes, unsigned int count)
{
    static_cast<PdfPages*>(pages)->m_written.append(reinterpret_cast<const char*>(bytes), count);
    return CAIRO_STATUS_SUCCESS;
}

void PdfPages::finish()
{
    const cairo_status_t drawn = cairo_status(m_context.get());
    m_context.reset();
    cairo_surface_finish(m_surface.get());
    const cairo_status_t finished = cairo_surface_status(m_surface.get());
    const cairo_status_t wrong = drawn != CAIRO_STATUS_SUCCESS ? drawn : finished;
    if (wrong != CAIRO_STATUS_SUCCESS)
        throw Failure{"PDF", cairo_status_to_string(wrong), "write the notes in another form"};
    m_sink(m_written);
}

void PdfPages::set(const PdfFont& font, const PdfColour& colour)
{
    cairo_select_font_face(m_context.get(), font.family, CAIRO_FONT_SLANT_NORMAL,
                           font.isBold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
    cairo_set_font_size(m_context.get(), font.size);
    cairo_set_source_rgba(m_context.get(), colour.red, colour.green, colour.blue, colour.alpha);
}

double PdfPages::widthOf(const std::string& utf8)
{
    cairo_text_extents_t extents;
    cairo_text_extents(m_context.get(), utf8.c_str(), &extents);
    return extents.x_advance;
}

double PdfPages::widthOf(const std::string& utf8, const PdfFont& font)
{
    set(font, {});
    return widthOf(utf8);
}

void PdfPages::text(double x, double y, const std::string& utf8, const PdfFont& font, const PdfColour& colour)
{
    set(font, colour);
    cairo_move_to(m_context.get(), x, y);
    cairo_show_text(m_context.get(), utf8.c_str());
}

void PdfPages::textToRight(double right, double y, const std::string& utf8, const PdfFont& font,
                           const PdfColour& colour)
{
    set(font, colour);
    text(right - widthOf(utf8), y, utf8, font, colour);
}

std::string PdfPages::fitting(const std::string& utf8, const PdfFont& font, double width)
{
    set(font, {});
    if (widthOf(utf8) <= width)
        return utf8;
    std::string cut = utf8;
    while (!cut.empty() && widthOf(cut + "…") > width) {
        while (!cut.empty() && (static_cast<unsigned char>(cut.back()) & 0xc0U) == 0x80U)
            cut.pop_back();
        if (!cut.empty())
            cut.pop_back();
    }
    return cut + "…";
}

std::vector<std::string> PdfPages::wrapped(const std::string& utf8, const PdfFont& font, double width)
{
    set(font, {});
    std::vector<std::string> lines;
    for (std::size_t start = 0; start <= utf8.size();) {
        const std::size_t end = std::min(utf8.find(' ', start), utf8.size());
        const std::string word = utf8.substr(start, end - start);
        if (lines.empty() || widthOf(lines.back() + " " + word) > width)
            lines.push_back(fitting(word, font, width));
        else
            lines.back().append(" ").append(word);
        start = end + 1;
    }
    return lines;
}

void PdfPages::box(double x, double y, double width, double height, const PdfColour& colour)
{
    cairo_set_source_rgba(m_context.get(), colour.red, colour.green, colour.blue, colour.alpha);
    cairo_rectangle(m_context.get(), x, y, width, height);
    cairo_fill(m_context.get());
}

void PdfPages::band(double topLeft, double topRight, double top, double bottomLeft, double bottomRight, double bottom,
                    const PdfColour& colour)
{
    cairo_t* const context = m_context.get();
    const double middle = (top + bottom) / 2;
    cairo_set_source_rgba(context, colour.red, colour.green, colour.blue, colour.alpha);
    cairo_move_to(context, topLeft, top);
    cairo_curve_to(context, topLeft, middle, bottomLeft, middle, bottomLeft, bottom);
    cairo_line_to(context, bottomRight, bottom);
    cairo_curve_to(context, bottomRight, middle, topRight, middle, topRight, top);
    cairo_close_path(context);
    cairo_fill(context);
}

} // namespace cadrel::app
