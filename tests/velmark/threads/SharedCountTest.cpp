// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/Counted.h"
#include "velmark/Implements.h"

#include <gtest/gtest.h>

#include <array>
#include <cstddef>
#include <thread>
#include <vector>

using namespace Velmark;

namespace {

constexpr std::size_t Threads = 8;
constexpr int Rounds = 20000;

/// What came to an end with a Board.
struct Ending {
    int times = 0;
    int sum = 0;
};

/// Each thread has a field of its own, without any lock; the last reference reads them all.
class Board : public Implements<Board, FObject> {
public:
    static constexpr const char* ClassName = "Board";

    explicit Board(Ending& ending) : m_ending(ending) {}
    ~Board() override
    {
        ++m_ending.times;
        for (const int field : m_fields)
            m_ending.sum += field;
    }

    void write(std::size_t place, int value) { m_fields[place] = value; }

private:
    Ending& m_ending;
    std::array<int, Threads> m_fields{};
};

} // namespace

TEST(SharedCount, EndsOnceWhateverTheOrderOfTheThreads)
{
    Ending ending;
    auto board = makeCounted<Board>(ending);

    std::vector<std::thread> threads;
    for (std::size_t place = 0; place < Threads; ++place) {
        threads.emplace_back([own = board, place]() mutable {
            for (int round = 0; round < Rounds; ++round) {
                const auto second = Counted<FObject>::share(own.get());
                const auto third = query<IDependent>(second);
                ASSERT_TRUE(third);
            }
            own->write(place, 1);
            own.reset();
        });
    }
    board.reset();
    for (std::thread& thread : threads)
        thread.join();

    EXPECT_EQ(ending.times, 1);
    EXPECT_EQ(ending.sum, 8) << "The last release has to see what every thread wrote before its own.";
}

TEST(SharedCount, CountsEveryReferenceOfEveryThread)
{
    Ending ending;
    const auto board = makeCounted<Board>(ending);

    std::vector<std::thread> threads;
    for (std::size_t thread = 0; thread < Threads; ++thread) {
        threads.emplace_back([&board] {
            for (int round = 0; round < Rounds; ++round)
                board->addRef();
        });
    }
    for (std::thread& thread : threads)
        thread.join();

    EXPECT_EQ(board->refCount(), 160001);
    for (int reference = 0; reference < 160000; ++reference)
        board->release();
    EXPECT_EQ(board->refCount(), 1);
}
