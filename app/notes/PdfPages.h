// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"

#include <array>
#include <cairo.h>
#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::app {

struct PdfColour {
    double red;
    double green;
    double blue;
    double alpha = 1.0;

    bool operator==(const PdfColour&) const = default;
};

struct PdfFont {
    std::string_view family; ///< of a literal, which ends in 0
    double size;             ///< in points
    bool isBold = false;

    bool operator==(const PdfFont&) const = default;
};

/// Draws the pages of a PDF. Lengths are in points, from the upper left corner.
class PdfPages {
public:
    /// What is drawn goes to the sink, which outlives the pages. Throws what the sink throws, but only from `finish`.
    PdfPages(double width, double height, const NotesSink& sink);

    double width() const { return m_width; }
    double height() const { return m_height; }
    void endPage();
    /// Throws Failure when something couldn't be drawn.
    void finish();

    /// `y` is that of the base line.
    void text(double x, double y, const std::string& utf8, const PdfFont& font, const PdfColour& colour);
    void textToRight(double right, double y, const std::string& utf8, const PdfFont& font, const PdfColour& colour);
    double widthOf(const std::string& utf8, const PdfFont& font);
    /// The text as it fits into the width, with an ellipsis where it is cut.
    std::string fitting(const std::string& utf8, const PdfFont& font, double width);
    /// The text in lines that fit into the width, broken at blanks; a word that is wider ends with an ellipsis.
    std::vector<std::string> wrapped(const std::string& utf8, const PdfFont& font, double width);
    void box(double x, double y, double width, double height, const PdfColour& colour);
    /// A band with curved sides from a stretch above to one below.
    void band(double topLeft, double topRight, double top, double bottomLeft, double bottomRight, double bottom,
              const PdfColour& colour);

private:
    struct Delete {
        void operator()(cairo_surface_t* surface) const { cairo_surface_destroy(surface); }
        void operator()(cairo_t* context) const { cairo_destroy(context); }
        void operator()(cairo_scaled_font_t* font) const { cairo_scaled_font_destroy(font); }
    };
    /// A font with the widths of its letters, as far as they have been asked for; below 0 for the others.
    struct Font {
        PdfFont font;
        std::unique_ptr<cairo_scaled_font_t, Delete> scaled;
        std::array<double, 128> widths;
    };
    /// All text of a page in one font and colour. It is drawn at once, since each call costs more than its letters.
    struct Texts {
        cairo_scaled_font_t* font;
        PdfColour colour;
        std::string utf8;
        std::vector<cairo_glyph_t> glyphs;
        std::vector<cairo_text_cluster_t> clusters;
    };

    static cairo_status_t write(void* pages, const unsigned char* bytes, unsigned int count);
    Font& fontFor(const PdfFont& font);
    static double widthOf(const std::string& utf8, Font& font);
    Texts& textsFor(cairo_scaled_font_t* font, const PdfColour& colour);

    double m_width;
    double m_height;
    const NotesSink& m_sink;
    std::string m_written;
    std::unique_ptr<cairo_surface_t, Delete> m_surface;
    std::unique_ptr<cairo_t, Delete> m_context;
    std::deque<Font> m_fonts;
    std::vector<Texts> m_texts;                    ///< of the page in hand
    cairo_status_t m_wrong = CAIRO_STATUS_SUCCESS; ///< what has failed first
};

} // namespace cadrel::app
