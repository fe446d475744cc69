// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/AutomationPoint.h"
#include "standin/project/Container.h"

#include <optional>
#include <string_view>

namespace standin {

/// An automation curve of a track. Points at one time keep the order in which they were inserted: the value arrives at
/// the first and goes on from the last.
class Envelope : public Velmark::Implements<Envelope, Container, Velmark::IEnvelopeTrack> {
public:
    static constexpr const char* ClassName = "Envelope";

    /// What can be automated. The numbers are those of the project file and never change.
    struct Curve {
        enum Number : Velmark::int32 { Volume = 1, Pan = 2, Mute = 3, Send = 4, Filter = 5, Equalizer = 6 };

        /// "volume" and so on; empty for a number without a name.
        static std::string_view nameOf(Velmark::int32 number);
    };

    /// `track` is a Track.
    Envelope(Node& track, Velmark::int32 number);

    Velmark::int32 curveNumber() override;
    Velmark::int32 number() const { return m_number; }
    Velmark::IProjectNode* getParent() override;
    ProjectLink* link() const override;
    Node* track() override;
    bool accepts(const Node& child) const override;

    AutomationPoint* firstPoint() const { return static_cast<AutomationPoint*>(firstChild()); }
    AutomationPoint* pointBehind(const AutomationPoint& point) const;
    /// What the curve comes to and goes on from at a time, in seconds of the project; they differ where several points
    /// stand. Nothing for a curve without points.
    std::optional<double> valueBefore(double time) const;
    std::optional<double> valueBehind(double time) const;

private:
    friend class Track;

    Node* m_track; ///< null when the track has gone
    Velmark::int32 m_number;
};

} // namespace standin
