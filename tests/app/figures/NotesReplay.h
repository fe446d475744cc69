// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/app/figures/EdlFrames.h"

#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Frames that follow each other in both cuts.
struct KeptRun {
    int inOld = 0; ///< the first of them
    int inNew = 0;
    int length = 0;

    bool operator==(const KeptRun&) const = default;
};

/// Carries out the steps of notes on the frames of the old cut, as a person would with scissors, and looks at every figure on
/// the way. What doesn't fit stands in `faults`, a line each.
class NotesReplay {
public:
    NotesReplay(const nlohmann::json& notes, const EdlFrames& oldCut, const EdlFrames& newCut);

    const std::vector<std::string>& faults() const { return m_faults; }

    /// The times of each row as the forms show them: place, what to do, change of length, offset.
    const std::vector<std::vector<std::string>>& rows() const { return m_rows; }
    /// What the forms say of each change: "tail -24 frames", "lifted 00:00:01:10 at 01:03:18:00".
    const std::vector<std::string>& phrases() const { return m_phrases; }
    /// How many moves between reels, and how many changes that change nothing, there are.
    std::size_t movesBetweenReels() const { return m_moveSteps.size(); }
    int unchanged() const { return m_unchanged; }
    /// The numbers of the largest steps.
    std::vector<int> largest() const;

private:
    /// A frame on the table: of the old cut, or one of the new cut that was put in.
    struct Piece {
        int frame;
        bool isNew;
    };
    using Table = std::vector<Piece>;

    void check(bool isRight, const std::string& what, const nlohmann::json& where);
    std::size_t placeIn(const nlohmann::json& place);
    void carryOutRow(const nlohmann::json& row, std::size_t reel);
    void lookAtMoveEnd(const nlohmann::json& row, std::size_t reel);
    void carryOut(const nlohmann::json& step, std::size_t reel);
    void moveReel(const nlohmann::json& step);
    void lookAtTimeline(const nlohmann::json& step);
    void replace(const nlohmann::json& step);
    void move(const nlohmann::json& step);
    void lookAtChanges(const nlohmann::json& step);
    void lookAtChange(const nlohmann::json& change, const nlohmann::json& step);
    void lookAtSource(const nlohmann::json& change);
    void lookAtTrim(const nlohmann::json& change);
    void lookAtShot(const nlohmann::json& shot, const EdlFrames& cut);
    void lookAtResult();
    void lookAtMoves();
    void lookAtTotals();
    void showRow(const nlohmann::json& row, std::size_t reel);

    const nlohmann::json& m_notes;
    const EdlFrames& m_oldCut;
    const EdlFrames& m_newCut;
    std::vector<Table> m_tables; ///< of each pair of reels
    std::vector<int> m_bases;    ///< the timecodes at which they begin by then
    std::vector<int> m_before;   ///< their lengths at first
    std::vector<int> m_removed;  ///< frames of the old cut that the step has deleted
    std::vector<int> m_inserted; ///< frames of the new cut that it has put in
    int m_deletedFrames = 0;
    int m_insertedFrames = 0;
    int m_doubledFrames = 0;
    int m_movedFrames = 0;
    int m_steps = 0;
    std::vector<nlohmann::json> m_moves;     ///< the changes of steps that move
    std::vector<nlohmann::json> m_moveSteps; ///< that move between reels
    int m_moveEnds = 0;                      ///< the rows of their other ends
    int m_unchanged = 0;
    std::map<int, int> m_extents; ///< by the numbers of the steps
    std::vector<std::string> m_faults;
    std::vector<std::vector<std::string>> m_rows;
    std::vector<std::string> m_phrases;
};

} // namespace cadrel::tests
