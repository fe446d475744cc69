// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/notes/NotesText.h"

#include <cairo.h>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::app {

struct PdfColour {
    double red;
    double green;
    double blue;
    double alpha = 1.0;
};

struct PdfFont {
    const char* family;
    double size; ///< in points
    bool isBold = false;
};

/// Draws the pages of a PDF. Lengths are in points, from the upper left corner.
class PdfPages {
public:
    /// What is drawn goes to the sink, which outlives the pages. Throws what the sink throws, but only from `finish`.
    PdfPages(double width, double height, const NotesSink& sink);

    double width() const { return m_width; }
    double height() const { return m_height; }
    void endPage() { cairo_show_page(m_context.get()); }
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
    };

    static cairo_status_t write(void* pages, const unsigned char* bytes, unsigned int count);
    void set(const PdfFont& font, const PdfColour& colour);
    double widthOf(const std::string& utf8);

    double m_width;
    double m_height;
    const NotesSink& m_sink;
    std::string m_written;
    std::unique_ptr<cairo_surface_t, Delete> m_surface;
    std::unique_ptr<cairo_t, Delete> m_context;
};

} // namespace cadrel::app
