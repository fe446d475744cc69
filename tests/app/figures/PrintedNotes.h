// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace cadrel::tests {

/// All that the forms of notes have to print, word by word and number by number, told from their JSON alone. Words have one blank
/// between them. Names are of one byte a letter.
class PrintedNotes {
public:
    enum class Form { Text, Page, Paper };

    explicit PrintedNotes(const nlohmann::json& notes);

    /// From the names of the cuts on, without the settings: what stands before them and what stands after them.
    std::string headBeforeSettings(Form form) const;
    std::string headAfterSettings(Form form) const;
    /// From the largest changes to the end.
    std::string body(Form form) const;
    /// The rows of the CSV, below its titles.
    std::vector<std::string> table() const;
    /// "old.edl to new.edl".
    std::string cuts() const;
    /// The words of a step for the picture of the page, by its number.
    std::string action(int step) const;

private:
    struct Words {
        std::string what;
        std::string shot;
        std::string more;
    };

    struct SoundLine {
        std::string what;
        std::string time;
        std::string name;
        std::string more;
    };

    Words wordsOf(const nlohmann::json& change) const;
    std::string formerVersion(const nlohmann::json& change) const;
    std::string materialOf(const nlohmann::json& change) const;
    std::string actionOf(const nlohmann::json& row, std::size_t reel) const;
    std::string placeOf(const nlohmann::json& row, std::size_t reel) const;
    bool isFromAnotherReel(const nlohmann::json& kept, std::size_t reel) const;
    std::string rowOf(const nlohmann::json& row, std::size_t reel, int offset, Form form) const;
    std::string changeOf(const nlohmann::json& change, Form form) const;
    std::string largest(Form form) const;
    std::string shotsOf(const nlohmann::json& step) const;
    std::string reelList(Form form) const;
    std::string moverOf(std::size_t reel) const;
    std::string wholeReel(const nlohmann::json& step) const;
    std::string reelHeading(std::size_t reel, Form form) const;
    std::string remarks() const;
    std::string soundOf(const nlohmann::json& sound, Form form) const;
    std::string soundSummary(const nlohmann::json& sound, bool namesTracks) const;
    std::string soundTotals(Form form) const;
    std::string soundCells(const nlohmann::json& sound) const;
    std::string trackName(int number) const;
    std::vector<SoundLine> soundLines(const nlohmann::json& sound) const;
    std::string cutName(const char* side) const;
    std::string cutLine(const char* side) const;
    std::string tableRow(const nlohmann::json& step, std::size_t reel) const;
    const nlohmann::json& stepOf(int number) const { return *m_steps.at(number).row; }
    int framesOf(std::size_t reel, const char* side) const;
    std::string startOf(std::size_t reel) const;

    struct Step {
        const nlohmann::json* row;
        std::size_t reel;
    };

    const nlohmann::json& m_notes;
    std::map<int, Step> m_steps;
};

} // namespace cadrel::tests
