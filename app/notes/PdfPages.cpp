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
    const cairo_status_t drawing = m_wrong != CAIRO_STATUS_SUCCESS ? m_wrong : drawn;
    const cairo_status_t wrong = drawing != CAIRO_STATUS_SUCCESS ? drawing : finished;
    if (wrong != CAIRO_STATUS_SUCCESS)
        throw Failure{"PDF", cairo_status_to_string(wrong), "write the notes in another form"};
    m_sink(m_written);
}

PdfPages::Font& PdfPages::fontFor(const PdfFont& font)
{
    for (Font& known : m_fonts) {
        if (known.font == font)
            return known;
    }
    cairo_font_face_t* const face = cairo_toy_font_face_create(
        font.family.data(), CAIRO_FONT_SLANT_NORMAL, font.isBold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
    cairo_font_options_t* const options = cairo_font_options_create();
    cairo_surface_get_font_options(m_surface.get(), options);
    cairo_matrix_t size;
    cairo_matrix_t unchanged;
    cairo_matrix_init_scale(&size, font.size, font.size);
    cairo_matrix_init_identity(&unchanged);
    m_fonts.push_back({font, {}, {}});
    m_fonts.back().scaled.reset(cairo_scaled_font_create(face, &size, &unchanged, options));
    m_fonts.back().widths.fill(-1.0);
    cairo_font_options_destroy(options);
    cairo_font_face_destroy(face);
    return m_fonts.back();
}

double PdfPages::widthOf(const std::string& utf8, Font& font)
{
    const auto measured = [&font](const char* text) {
        cairo_text_extents_t extents;
        cairo_scaled_font_text_extents(font.scaled.get(), text, &extents);
        return extents.x_advance;
    };
    double width = 0;
    for (const char letter : utf8) {
        const auto code = static_cast<unsigned char>(letter);
        if (code >= font.widths.size())
            return measured(utf8.c_str());
        double& known = font.widths[code];
        if (known < 0)
            known = measured(std::string(1, letter).c_str());
        width += known;
    }
    return width;
}

PdfPages::Texts& PdfPages::textsFor(cairo_scaled_font_t* font, const PdfColour& colour)
{
    for (Texts& texts : m_texts) {
        if (texts.font == font && texts.colour == colour)
            return texts;
    }
    return m_texts.emplace_back(Texts{font, colour, {}, {}, {}});
}

double PdfPages::widthOf(const std::string& utf8, const PdfFont& font)
{
    return widthOf(utf8, fontFor(font));
}

void PdfPages::text(double x, double y, const std::string& utf8, const PdfFont& font, const PdfColour& colour)
{
    cairo_scaled_font_t* const scaled = fontFor(font).scaled.get();
    cairo_glyph_t* glyphs = nullptr;
    int glyphCount = 0;
    cairo_text_cluster_t* clusters = nullptr;
    int clusterCount = 0;
    cairo_text_cluster_flags_t flags{};
    const cairo_status_t status =
        cairo_scaled_font_text_to_glyphs(scaled, x, y, utf8.c_str(), static_cast<int>(utf8.size()), &glyphs,
                                         &glyphCount, &clusters, &clusterCount, &flags);
    if (status == CAIRO_STATUS_SUCCESS) {
        Texts& texts = textsFor(scaled, colour);
        texts.utf8 += utf8;
        texts.glyphs.insert(texts.glyphs.end(), glyphs, glyphs + glyphCount);
        texts.clusters.insert(texts.clusters.end(), clusters, clusters + clusterCount);
    } else if (m_wrong == CAIRO_STATUS_SUCCESS) {
        m_wrong = status;
    }
    cairo_glyph_free(glyphs);
    cairo_text_cluster_free(clusters);
}

void PdfPages::endPage()
{
    cairo_t* const context = m_context.get();
    for (const Texts& texts : m_texts) {
        cairo_set_scaled_font(context, texts.font);
        cairo_set_source_rgba(context, texts.colour.red, texts.colour.green, texts.colour.blue, texts.colour.alpha);
        cairo_show_text_glyphs(context, texts.utf8.data(), static_cast<int>(texts.utf8.size()), texts.glyphs.data(),
                               static_cast<int>(texts.glyphs.size()), texts.clusters.data(),
                               static_cast<int>(texts.clusters.size()), cairo_text_cluster_flags_t{});
    }
    m_texts.clear();
    cairo_show_page(context);
}

void PdfPages::textToRight(double right, double y, const std::string& utf8, const PdfFont& font,
                           const PdfColour& colour)
{
    text(right - widthOf(utf8, fontFor(font)), y, utf8, font, colour);
}

std::string PdfPages::fitting(const std::string& utf8, const PdfFont& font, double width)
{
    Font& measuring = fontFor(font);
    if (widthOf(utf8, measuring) <= width)
        return utf8;
    std::string cut = utf8;
    while (!cut.empty() && widthOf(cut + "…", measuring) > width) {
        while (!cut.empty() && (static_cast<unsigned char>(cut.back()) & 0xc0U) == 0x80U)
            cut.pop_back();
        if (!cut.empty())
            cut.pop_back();
    }
    return cut + "…";
}

std::vector<std::string> PdfPages::wrapped(const std::string& utf8, const PdfFont& font, double width)
{
    Font& measuring = fontFor(font);
    std::vector<std::string> lines;
    for (std::size_t start = 0; start <= utf8.size();) {
        const std::size_t end = std::min(utf8.find(' ', start), utf8.size());
        const std::string word = utf8.substr(start, end - start);
        if (lines.empty() || widthOf(lines.back() + " " + word, measuring) > width)
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
