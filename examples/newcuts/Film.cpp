// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/newcuts/Film.h"

#include "examples/newcuts/CutText.h"

#include <array>
#include <cstdio>
#include <random>
#include <string>
#include <vector>

namespace cadrel::examples {

namespace {

constexpr int Reels = 20;
/// How many changes the new cut makes in each reel; the editor is at the middle of the film.
constexpr std::array<int, Reels> Changes{2, 0, 4, 9, 6, 1, 12, 16, 11, 0, 7, 14, 9, 3, 5, 0, 8, 4, 2, 1};

/// Always the same numbers.
class Chance {
public:
    int from(int first, int last)
    {
        return first + static_cast<int>(m_numbers() % static_cast<unsigned>(last - first + 1));
    }

private:
    std::mt19937 m_numbers{20};
};

/// A place of the camera in a scene, which the shots come back to.
struct Setup {
    std::string roll;
    std::string name;
    int next; ///< the source frame that hasn't been used yet
};

class FilmMaker {
public:
    CutText makeReel(int reel)
    {
        CutText cut(reel * 3600 * FramesPerSecond);
        const int scenes = m_chance.from(4, 6);
        for (int scene = 0; scene < scenes; ++scene)
            addScene(cut.shots());
        return cut;
    }

    /// What an editor does to a reel in a week.
    void recut(CutText& cut, int changes)
    {
        for (int change = 0; change < changes; ++change) {
            const auto count = cut.shots().size();
            const auto shot = static_cast<std::size_t>(m_chance.from(6, static_cast<int>(count) - 12));
            const int kind = m_chance.from(0, 11);
            if (kind < 4)
                cut.trimTail(shot, m_chance.from(2, cut.shots()[shot].length / 2));
            else if (kind < 7)
                cut.trimHead(shot, m_chance.from(2, cut.shots()[shot].length / 2));
            else if (kind < 9)
                cut.lift(shot, static_cast<std::size_t>(m_chance.from(1, 4)));
            else if (kind < 11)
                cut.insert(shot, {newShot(change)});
            else
                cut.move(shot, static_cast<std::size_t>(m_chance.from(1, 5)), shot - 5);
        }
    }

    static std::string nameOf(int reel, int version)
    {
        std::array<char, 48> name{};
        std::snprintf(name.data(), name.size(), "film_v%02d_r%02d", version, reel);
        return name.data();
    }

private:
    void addScene(std::vector<Shot>& shots)
    {
        ++m_scene;
        std::vector<Setup> setups;
        const int count = m_chance.from(2, 5);
        for (int setup = 0; setup < count; ++setup)
            setups.push_back(newSetup(setup));
        const int wanted = m_chance.from(10, 24);
        for (int shot = 0; shot < wanted; ++shot) {
            Setup& setup = setups[static_cast<std::size_t>(m_chance.from(0, count - 1))];
            const int length = m_chance.from(18, 11 * FramesPerSecond);
            shots.push_back(shotOf(setup.roll, setup.name, setup.next, length));
            setup.next += length + m_chance.from(0, 2 * FramesPerSecond);
        }
    }

    Setup newSetup(int setup)
    {
        ++m_clips;
        std::array<char, 48> roll{};
        std::snprintf(roll.data(), roll.size(), "%c%03dC%03d", m_clips % 3 == 0 ? 'B' : 'A', 1 + m_clips / 12,
                      1 + m_clips % 12);
        return {roll.data(),
                std::to_string(m_scene) + std::string(1, static_cast<char>('A' + setup)) + "-" +
                    std::to_string(m_chance.from(1, 6)),
                ((7 + m_clips % 12) * 60 + m_chance.from(0, 50)) * 60 * FramesPerSecond};
    }

    Shot newShot(int change)
    {
        ++m_clips;
        return shotOf(std::string("P").append(std::to_string(100 + m_clips)),
                      "PICKUP " + std::to_string(m_clips) + "-1", (19 * 60 + change) * 60 * FramesPerSecond,
                      m_chance.from(30, 6 * FramesPerSecond));
    }

    Chance m_chance;
    int m_scene = 0;
    int m_clips = 0;
};

void moveTo(CutText& target, std::size_t place, CutText& source, std::size_t first, std::size_t count)
{
    std::vector<Shot> shots;
    for (std::size_t shot = first; shot < first + count; ++shot)
        shots.push_back(source.shots().at(shot));
    source.lift(first, count);
    target.insert(place, shots);
}

} // namespace

void makeFilm(const std::filesystem::path& folder)
{
    FilmMaker maker;
    std::vector<CutText> reels;
    for (int reel = 1; reel <= Reels; ++reel)
        reels.push_back(maker.makeReel(reel));
    const auto fileOf = [&folder](int reel, int version) {
        return folder / (FilmMaker::nameOf(reel, version) + ".edl");
    };
    for (int reel = 1; reel <= Reels; ++reel)
        reels[static_cast<std::size_t>(reel - 1)].write(fileOf(reel, 3));
    for (int reel = 1; reel <= Reels; ++reel)
        maker.recut(reels[static_cast<std::size_t>(reel - 1)], Changes[static_cast<std::size_t>(reel - 1)]);
    // Five shots go from the head of reel 9 to the tail of reel 8, and three from the tail of reel 12 to the head of reel 13.
    moveTo(reels[7], reels[7].shots().size(), reels[8], 0, 5);
    moveTo(reels[12], 0, reels[11], reels[11].shots().size() - 3, 3);
    for (int reel = 1; reel <= Reels; ++reel)
        reels[static_cast<std::size_t>(reel - 1)].write(fileOf(reel, 4));
}

} // namespace cadrel::examples
