// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"

#include <array>
#include <cairo.h>
#include <deque>
#include <map>
#include <memory>
#include <pango/pangocairo.h>
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

/// Draws the pages of a PDF. Lengths are in points, from the upper left corner. Texts are UTF-8 of any script; a letter that
/// no font of the machine has stands as its number: "[U+4E2D]".
class PdfPages {
public:
    /// What is drawn goes to the sink, which outlives the pages. Throws what the sink throws, but only from `finish`.
    PdfPages(double width, double height, const NotesSink& sink);

    double width() const { return m_width; }
    double height() const { return m_height; }
    /// What programs show of the file. It tells no time, so that the same notes are the same file.
    void describe(const std::string& title, const std::string& subject);
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
    /// A box that nothing overlaps. All of one colour are drawn with the text.
    void rule(double x, double y, double width, double height, const PdfColour& colour);
    /// A band with curved sides from a stretch above to one below.
    void band(double topLeft, double topRight, double top, double bottomLeft, double bottomRight, double bottom,
              const PdfColour& colour);

private:
    struct Delete {
        void operator()(cairo_surface_t* surface) const { cairo_surface_destroy(surface); }
        void operator()(cairo_t* context) const { cairo_destroy(context); }
        void operator()(cairo_scaled_font_t* font) const { cairo_scaled_font_destroy(font); }
        void operator()(PangoFontMap* fonts) const { g_object_unref(fonts); }
        void operator()(PangoLayout* layout) const { g_object_unref(layout); }
    };
    /// A letter of ASCII.
    struct Letter {
        unsigned long glyph;
        double advance;
    };
    struct Font {
        PdfFont font;
        std::unique_ptr<cairo_scaled_font_t, Delete> scaled;
        std::array<Letter, 128> letters;
        std::unique_ptr<PangoLayout, Delete> layout; ///< for what isn't ASCII; null until it is needed
    };
    /// All ASCII of a page in one font and colour. It is drawn at once, since each call costs more than its letters.
    struct Glyphs {
        cairo_scaled_font_t* font;
        PdfColour colour;
        std::vector<cairo_glyph_t> glyphs;
    };

    struct Rules {
        PdfColour colour;
        std::vector<cairo_rectangle_t> boxes;
    };

    static cairo_status_t write(void* pages, const unsigned char* bytes, unsigned int count);
    Font& fontFor(const PdfFont& font);
    void findLetters(Font& font);
    double widthOf(const std::string& utf8, Font& font);
    std::vector<cairo_glyph_t>& glyphsFor(cairo_scaled_font_t* font, const PdfColour& colour);
    /// The text laid out in the font and those that stand in for it, until the next one is.
    PangoLayout* layoutOf(const std::string& utf8, Font& font);
    std::unique_ptr<PangoLayout, Delete> makeLayout(const PdfFont& font);
    std::string withNumbers(const std::string& utf8, PangoLayout* layout);
    bool isInFonts(const std::string& letter, PangoLayout* layout);

    double m_width;
    double m_height;
    const NotesSink& m_sink;
    std::string m_written;
    std::unique_ptr<cairo_surface_t, Delete> m_surface;
    std::unique_ptr<cairo_t, Delete> m_context;
    std::unique_ptr<PangoFontMap, Delete> m_fontMap; ///< null until it is needed
    std::deque<Font> m_fonts;
    std::vector<Glyphs> m_glyphs;                  ///< of the page in hand
    std::vector<Rules> m_rules;                    ///< likewise
    std::map<std::string, bool> m_isInFonts;       ///< of letters that have been looked for
    cairo_status_t m_wrong = CAIRO_STATUS_SUCCESS; ///< what has failed first
};

} // namespace cadrel::app
