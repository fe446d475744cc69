// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/PdfPages.h"

#include "app/console/Failure.h"

#include <algorithm>
#include <cairo-pdf.h>
#include <cstdio>

namespace cadrel::app {

namespace {

bool isAscii(const std::string& text)
{
    return std::all_of(text.begin(), text.end(), [](char letter) { return static_cast<unsigned char>(letter) < 0x80; });
}

} // namespace

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

void PdfPages::describe(const std::string& title, const std::string& subject)
{
    cairo_pdf_surface_set_metadata(m_surface.get(), CAIRO_PDF_METADATA_TITLE, title.c_str());
    cairo_pdf_surface_set_metadata(m_surface.get(), CAIRO_PDF_METADATA_SUBJECT, subject.c_str());
    cairo_pdf_surface_set_metadata(m_surface.get(), CAIRO_PDF_METADATA_CREATE_DATE, "");
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
    m_fonts.push_back({font, {}, {}, {}});
    m_fonts.back().scaled.reset(cairo_scaled_font_create(face, &size, &unchanged, options));
    cairo_font_options_destroy(options);
    cairo_font_face_destroy(face);
    findLetters(m_fonts.back());
    return m_fonts.back();
}

void PdfPages::findLetters(Font& font)
{
    for (std::size_t code = 1; code < font.letters.size(); ++code) {
        const char letter = static_cast<char>(code);
        cairo_glyph_t* glyph = nullptr;
        int count = 0;
        const cairo_status_t status = cairo_scaled_font_text_to_glyphs(font.scaled.get(), 0, 0, &letter, 1, &glyph,
                                                                       &count, nullptr, nullptr, nullptr);
        if (status == CAIRO_STATUS_SUCCESS && count == 1) {
            cairo_text_extents_t extents;
            cairo_scaled_font_glyph_extents(font.scaled.get(), glyph, 1, &extents);
            font.letters[code] = {glyph->index, extents.x_advance};
        } else if (status != CAIRO_STATUS_SUCCESS && m_wrong == CAIRO_STATUS_SUCCESS) {
            m_wrong = status;
        }
        cairo_glyph_free(glyph);
    }
}

std::vector<cairo_glyph_t>& PdfPages::glyphsFor(cairo_scaled_font_t* font, const PdfColour& colour)
{
    for (Glyphs& glyphs : m_glyphs) {
        if (glyphs.font == font && glyphs.colour == colour)
            return glyphs.glyphs;
    }
    return m_glyphs.emplace_back(Glyphs{font, colour, {}}).glyphs;
}

std::unique_ptr<PangoLayout, PdfPages::Delete> PdfPages::makeLayout(const PdfFont& font)
{
    if (!m_fontMap)
        m_fontMap.reset(pango_cairo_font_map_new_for_font_type(CAIRO_FONT_TYPE_FT));
    PangoContext* const context = pango_font_map_create_context(m_fontMap.get());
    pango_cairo_update_context(m_context.get(), context);
    pango_context_set_round_glyph_positions(context, FALSE);
    // A name that is written from right to left stands within a line that isn't.
    pango_context_set_base_dir(context, PANGO_DIRECTION_LTR);
    std::unique_ptr<PangoLayout, Delete> layout(pango_layout_new(context));
    g_object_unref(context);
    PangoFontDescription* const description = pango_font_description_new();
    pango_font_description_set_family_static(description, font.family.data());
    pango_font_description_set_weight(description, font.isBold ? PANGO_WEIGHT_BOLD : PANGO_WEIGHT_NORMAL);
    pango_font_description_set_absolute_size(description, font.size * PANGO_SCALE);
    pango_layout_set_font_description(layout.get(), description);
    pango_font_description_free(description);
    pango_layout_set_single_paragraph_mode(layout.get(), TRUE);
    pango_layout_set_auto_dir(layout.get(), FALSE);
    return layout;
}

PangoLayout* PdfPages::layoutOf(const std::string& utf8, Font& font)
{
    if (!font.layout)
        font.layout = makeLayout(font.font);
    PangoLayout* const layout = font.layout.get();
    const auto lay = [layout](const std::string& text) {
        pango_layout_set_text(layout, text.data(), static_cast<int>(text.size()));
    };
    lay(utf8);
    if (pango_layout_get_unknown_glyphs_count(layout) > 0)
        lay(withNumbers(utf8, layout));
    return layout;
}

bool PdfPages::isInFonts(const std::string& letter, PangoLayout* layout)
{
    const auto [known, isNew] = m_isInFonts.try_emplace(letter, false);
    if (isNew) {
        pango_layout_set_text(layout, letter.data(), static_cast<int>(letter.size()));
        known->second = pango_layout_get_unknown_glyphs_count(layout) == 0;
    }
    return known->second;
}

std::string PdfPages::withNumbers(const std::string& utf8, PangoLayout* layout)
{
    std::string text;
    for (const char* at = utf8.c_str(); *at != '\0';) {
        const char* const next = g_utf8_next_char(at);
        const std::string letter(at, next);
        if (isInFonts(letter, layout)) {
            text += letter;
        } else {
            std::array<char, 16> number{};
            std::snprintf(number.data(), number.size(), "[U+%04X]", static_cast<unsigned>(g_utf8_get_char(at)));
            text += number.data();
        }
        at = next;
    }
    return text;
}

double PdfPages::widthOf(const std::string& utf8, Font& font)
{
    if (!isAscii(utf8)) {
        int width = 0;
        pango_layout_get_size(layoutOf(utf8, font), &width, nullptr);
        return static_cast<double>(width) / PANGO_SCALE;
    }
    double width = 0;
    for (const char letter : utf8)
        width += font.letters[static_cast<unsigned char>(letter)].advance;
    return width;
}

double PdfPages::widthOf(const std::string& utf8, const PdfFont& font)
{
    return widthOf(utf8, fontFor(font));
}

void PdfPages::text(double x, double y, const std::string& utf8, const PdfFont& font, const PdfColour& colour)
{
    Font& drawn = fontFor(font);
    if (!isAscii(utf8)) {
        PangoLayout* const layout = layoutOf(utf8, drawn);
        cairo_set_source_rgba(m_context.get(), colour.red, colour.green, colour.blue, colour.alpha);
        cairo_move_to(m_context.get(), x, y);
        pango_cairo_show_layout_line(m_context.get(), pango_layout_get_line_readonly(layout, 0));
        return;
    }
    std::vector<cairo_glyph_t>& glyphs = glyphsFor(drawn.scaled.get(), colour);
    for (const char letter : utf8) {
        const auto& [glyph, advance] = drawn.letters[static_cast<unsigned char>(letter)];
        glyphs.push_back({glyph, x, y});
        x += advance;
    }
}

void PdfPages::endPage()
{
    cairo_t* const context = m_context.get();
    for (const Glyphs& glyphs : m_glyphs) {
        cairo_set_scaled_font(context, glyphs.font);
        cairo_set_source_rgba(context, glyphs.colour.red, glyphs.colour.green, glyphs.colour.blue, glyphs.colour.alpha);
        cairo_show_glyphs(context, glyphs.glyphs.data(), static_cast<int>(glyphs.glyphs.size()));
    }
    m_glyphs.clear();
    for (const Rules& rules : m_rules) {
        cairo_set_source_rgba(context, rules.colour.red, rules.colour.green, rules.colour.blue, rules.colour.alpha);
        for (const cairo_rectangle_t& box : rules.boxes)
            cairo_rectangle(context, box.x, box.y, box.width, box.height);
        cairo_fill(context);
    }
    m_rules.clear();
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
    const double blank = widthOf(" ", measuring);
    std::vector<std::string> lines;
    double used = 0;
    for (std::size_t start = 0; start <= utf8.size();) {
        const std::size_t end = std::min(utf8.find(' ', start), utf8.size());
        const std::string word = utf8.substr(start, end - start);
        const double wordWidth = widthOf(word, measuring);
        if (lines.empty() || used + blank + wordWidth > width) {
            lines.push_back(wordWidth > width ? fitting(word, font, width) : word);
            used = std::min(wordWidth, width);
        } else {
            lines.back().append(" ").append(word);
            used += blank + wordWidth;
        }
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

void PdfPages::rule(double x, double y, double width, double height, const PdfColour& colour)
{
    const auto known =
        std::find_if(m_rules.begin(), m_rules.end(), [&colour](const Rules& rules) { return rules.colour == colour; });
    Rules& rules = known != m_rules.end() ? *known : m_rules.emplace_back(Rules{colour, {}});
    rules.boxes.push_back({x, y, width, height});
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
    // Closed by being filled. Every number of a film with thousands of bands takes time to write.
    cairo_curve_to(context, bottomRight, middle, topRight, middle, topRight, top);
    cairo_fill(context);
}

} // namespace cadrel::app
