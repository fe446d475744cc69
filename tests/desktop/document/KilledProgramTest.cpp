// SPDX-License-Identifier: GPL-3.0-or-later

// A program that is killed while the user works: the file is whole, and so is what it has kept of the unsaved work.

#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/ChildProcess.h"
#include "tests/support/standin/RandomProject.h"

#include <algorithm>
#include <cstring>
#include <random>
#include <set>
#include <sys/mman.h>

namespace desktop::tests {

namespace fs = std::filesystem;

using cadrel::tests::ChildProcess;
using standin::tests::SeededChance;

namespace {

/// What a process leaves for the one that looks on, however it ends: the states that the project had.
class StateLog {
public:
    static constexpr std::size_t Most = 1000;

    StateLog()
        : m_log(static_cast<Log*>(
              ::mmap(nullptr, sizeof(Log), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0)))
    {
        if (m_log == MAP_FAILED)
            throw std::runtime_error("no memory that is shared");
        std::memset(static_cast<void*>(m_log), 0, sizeof(Log));
    }
    StateLog(const StateLog&) = delete;
    StateLog& operator=(const StateLog&) = delete;
    ~StateLog() { ::munmap(m_log, sizeof(Log)); }

    void add(std::string_view bytes) const
    {
        m_log->hashes[m_log->count] = ContentPrint::of(bytes).hash;
        ++m_log->count;
    }
    bool has(std::string_view bytes) const
    {
        const std::uint64_t* const first = m_log->hashes;
        const std::uint64_t* const end = first + m_log->count;
        return std::find(first, end, ContentPrint::of(bytes).hash) != end;
    }

private:
    struct Log {
        std::size_t count;
        std::uint64_t hashes[Most];
    };

    Log* m_log;
};

} // namespace

class KilledProgramTest : public DocumentTest {
protected:
    static constexpr int Edits = 12;

    /// Works on the project: edits, undoes, lets the program idle, and saves now and then.
    int work(const StateLog& states, unsigned seed)
    {
        SeededChance chance(seed);
        OpenDocument& document = documents.open(file);
        for (int step = 0; step < Edits; ++step) {
            if (chance.oneIn(5))
                document.goToUndoPosition(document.undoPosition() / 2);
            else
                renameTrack(document, std::u16string(1 + chance.below(2000), u'x').c_str());
            module->models[&document.project()] = std::to_string(chance.below(5));
            states.add(bytesOf(document));
            idle();
            if (chance.oneIn(4))
                documents.save(document);
        }
        return 0;
    }

    /// Looks at what is left, and goes on with it.
    void expectWhole(const StateLog& states, const std::string& before)
    {
        const std::string stored = contentOf(file);
        EXPECT_TRUE(stored == before || states.has(stored));
        const Opening opening = documents.look(file);
        EXPECT_FALSE(opening.openElsewhere);
        const fs::path autosave = Autosave::pathFor(file);
        if (!fs::exists(autosave)) {
            EXPECT_FALSE(opening.unsavedWork);
            documents.close(documents.open(file));
            return;
        }
        const auto kept = Autosave::read(file);
        ASSERT_TRUE(kept);
        EXPECT_TRUE(states.has(kept->content));
        EXPECT_EQ(opening.unsavedWork.has_value(), kept->content != stored);
        OpenDocument& document = documents.open(file, Work::Recover);
        EXPECT_EQ(document.settleUnsaved(), kept->content != stored);
        EXPECT_EQ(bytesOf(document), kept->content);
        EXPECT_TRUE(documents.save(document).isSaved());
        EXPECT_EQ(contentOf(file), kept->content);
        documents.close(document);
        EXPECT_FALSE(fs::exists(autosave));
        ++recovered;
    }

    fs::path file = fs::canonical(writeProject("reel3.stage"));
    int recovered = 0;
};

TEST_F(KilledProgramTest, LeavesTheFileAndTheUnsavedWorkWholeAtFiftyRandomMoments)
{
    std::mt19937 random(20);
    const std::string first = contentOf(file);
    int killed = 0;
    for (int trial = 0; killed < 50 && trial < 200; ++trial) {
        writeFile(file, first);
        const StateLog states;
        const auto seed = static_cast<unsigned>(random());
        const auto step = static_cast<int>(1 + random() % 700);
        const ChildProcess::Progress progress =
            ChildProcess::runUnlessKilledAt(step, [&] { return work(states, seed); });
        killed += progress.status ? 0 : 1;
        SCOPED_TRACE(testing::Message() << "seed " << seed << ", killed at " << step);
        expectWhole(states, first);
    }
    EXPECT_EQ(killed, 50);
    EXPECT_GE(recovered, 20);
}

} // namespace desktop::tests
