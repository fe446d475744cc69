// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <set>

namespace standin {

class VideoSupport;

/// Makes thumbnail factories, and nothing else.
class ObjectFactory : public Velmark::Implements<ObjectFactory, Velmark::FObject, Velmark::IObjectFactory> {
public:
    static constexpr const char* ClassName = "ObjectFactory";

    /// What makes the factories of videos outlives this; with null their pictures tell only what frames they are.
    explicit ObjectFactory(VideoSupport* videos) : m_videos(videos) {}

    Velmark::FUnknown* createObject(const char* className, const char* typeName) override;
    /// Refuses what it hasn't made, and what was given back already.
    Velmark::int32 releaseObject(Velmark::FUnknown* object) override;

private:
    VideoSupport* m_videos;
    std::set<Velmark::FUnknown*> m_givenOut; ///< by their FUnknown, which is the same whichever interface was asked
};

} // namespace standin
