// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"

namespace standin {

/// An object that remembers what has happened to it, as Velmark::ChangeFlag bits. Marks are collected until they are shown
/// to those who are told of them.
class MarkedObject : public Velmark::Implements<MarkedObject, Velmark::FObject> {
public:
    static constexpr const char* ClassName = "MarkedObject";

    bool isMarked() const { return m_marks != 0; }
    void addMarks(Velmark::uint32 flags) { m_marks = static_cast<Velmark::uint8>(m_marks | flags); }
    void clearMarks() { m_marks = 0; }

    /// What has been shown since the last hideMarks.
    Velmark::uint8 shownMarks() const { return m_shownMarks; }
    void showMarks() { m_shownMarks = static_cast<Velmark::uint8>(m_shownMarks | m_marks); }
    void hideMarks() { m_shownMarks = 0; }

private:
    Velmark::uint8 m_marks = 0;
    Velmark::uint8 m_shownMarks = 0;
};

} // namespace standin
