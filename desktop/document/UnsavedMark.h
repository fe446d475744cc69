// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/ContentPrint.h"

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>

namespace standin {
class Project;
}

namespace desktop {

/// Knows whether a project would be stored with other bytes than it is. Where the playhead stands is no work: it doesn't count.
///
/// To write these bytes for each question would take too long. The undo list tells where it stands, the project counts the
/// changes that no undo takes back, and what else is stored stands in the project's own values, which are few. As long as
/// these three are as they were when the project was stored, its bytes are, too: so the mark goes when the user undoes back to
/// that. When they differ, the mark is set at once, and bytes are compared when there is time.
class UnsavedMark {
public:
    using Clock = std::chrono::steady_clock;

    /// Of a project that is stored as it stands. It outlives this.
    explicit UnsavedMark(standin::Project& project);
    /// Of a project that is stored with other bytes than it has.
    UnsavedMark(standin::Project& project, const ContentPrint& stored);

    /// Costs nothing. It may be set for bytes that are the same until `settle` has compared them, and settings of a module may
    /// be missing in it until `look`.
    bool isSet() const;
    /// Lets the modules store what they have, and looks again. It compares bytes only if that takes little time compared with
    /// how long nothing has changed. Not while a transaction is open.
    void look(Clock::time_point now);
    /// Looks only where the project stands; no module is asked, and no bytes are compared.
    void lookWithoutModules();
    /// As `look`, and exact.
    void settle();

    /// The bytes with which the project would be stored now; what they tell counts for the mark. Throws ProjectFileError.
    std::string takeText();
    /// The same with what the modules have stored the last time; they aren't asked.
    std::string takeTextAsItIs();
    /// These bytes of the project have just been stored.
    void wasStored(const ContentPrint& print);
    /// The same number as long as the project's bytes are known to be the same.
    std::uint64_t version() const { return m_version; }

private:
    /// What tells that the bytes are the same.
    struct Position {
        std::uint64_t undo = 0;
        std::uint64_t unrecorded = 0;
        std::uint64_t head = 0; ///< the hash of the project's own values

        friend bool operator==(const Position&, const Position&) = default;
    };

    void announce();
    std::uint64_t headOf() const;
    Position positionNow() const;
    /// Goes on to where the project is now.
    void advance();
    void compare();
    std::string textHere();
    /// The text with the playhead where it was when the project was stored.
    std::string textWithStoredPlayhead();

    standin::Project& m_project;
    ContentPrint m_stored;
    double m_storedPlayhead;            ///< in seconds of the project
    std::optional<Position> m_storedAt; ///< nothing where no position is known to have the stored bytes
    Position m_at;                      ///< where it was when it was last looked at
    bool m_isSet = false;               ///< there
    bool m_isExact = true;              ///< its bytes have been compared
    bool m_canAnnounce = true;          ///< no module has failed to store
    std::uint64_t m_version = 0;
    std::optional<Clock::time_point> m_since; ///< when it was first seen there
    Clock::duration m_cost{};                 ///< of the bytes, the last time
};

} // namespace desktop
