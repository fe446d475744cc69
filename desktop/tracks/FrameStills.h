// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/Stills.h"
#include "standin/project/MediaClip.h"
#include "velmark/Counted.h"

#include <chrono>
#include <compare>
#include <cstddef>
#include <deque>
#include <list>
#include <map>
#include <memory>
#include <utility>

namespace Velmark {
class IHostContext;
} // namespace Velmark

namespace cadrel::host {
class ImageProviderThread;
} // namespace cadrel::host

namespace desktop {

/// Stills out of the videos of a host, drawn by its thumbnail factory on a thread of their own, one at a time. What was asked for
/// last comes first. They are kept as long as there is room for them. Where the host says in a picture why there is none, it is asked
/// again every now and then, as long as that is seen.
class FrameStills : public Stills {
public:
    /// How many bytes of pictures are kept. At least the last one is.
    static constexpr std::size_t Capacity = std::size_t{96} << 20U;

    explicit FrameStills(Velmark::IHostContext* context, std::size_t capacity = Capacity,
                         std::chrono::milliseconds retryInterval = std::chrono::seconds(5));
    /// Waits for the picture that is being drawn, for two seconds at the most.
    ~FrameStills() override;

    juce::Image still(standin::MediaClip& clip, std::uint32_t frame, int height) override;
    void startAsking() override;
    bool poll() override;

    std::size_t keptCount() const { return m_kept.size(); }
    std::size_t wantedCount() const { return m_wanted.size(); }

private:
    struct Key {
        standin::MediaClip* clip = nullptr;
        std::uint32_t frame = 0;
        int height = 0;

        auto operator<=>(const Key&) const = default;
    };
    struct Wanted {
        Key key;
        Velmark::Counted<standin::MediaClip> clip;
    };
    struct Kept {
        Velmark::Counted<standin::MediaClip> clip;
        juce::Image image; ///< null where there is none
        std::list<Key>::iterator use;
        std::size_t asking; ///< when it was asked for last
    };

    static std::size_t bytesOf(const juce::Image& image);
    /// Whether an image shows no picture of the video; those that say why there is none fill all that was asked for.
    static bool isPictureless(const Key& key, const juce::Image& image);
    /// True when there is more to be seen than before.
    bool take(juce::Image image);
    void keep(const Wanted& wanted, juce::Image image);
    void forget(std::map<Key, Kept>::iterator kept);
    void forgetPictureless(const standin::MediaClip* clip);
    /// Wants one of each clip that has no picture, if it is time.
    void wantAgain();
    void startNext();

    std::unique_ptr<cadrel::host::ImageProviderThread> m_thread;
    std::size_t m_capacity;
    std::size_t m_bytes = 0;
    std::map<Key, Kept> m_kept;
    std::list<Key> m_uses;       ///< of what is kept; the last used comes first
    std::deque<Wanted> m_wanted; ///< the first comes next
    Wanted m_atWork;             ///< without a clip while the thread has nothing to do
    std::chrono::milliseconds m_retryInterval;
    std::chrono::steady_clock::time_point m_nextRetry;
    std::size_t m_asking = 0; ///< how often asking was started
};

} // namespace desktop
