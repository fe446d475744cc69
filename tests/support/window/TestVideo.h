// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"
#include "gui/look/Text.h"
#include "gui/picture/VideoProviderBase.h"
#include "gui/services/VideoTrackHandlerBase.h"
#include "util/ListenerSet.h"
#include "util/Result.h"

#include <juce_graphics/juce_graphics.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Two video tracks, of which each can be missing.
class TestTracks : public gui::VideoTrackHandlerBase {
public:
    struct Track {
        bool isAvailable = true;
        std::wstring name;
        std::int32_t mode = Mode::None;
    };

    bool isAvailable(std::size_t channel) override { return track(channel).isAvailable; }
    std::wstring getName(std::size_t channel) override { return track(channel).name; }
    std::int32_t getMode(std::size_t channel) override { return track(channel).mode; }
    void setMode(std::size_t channel, std::int32_t mode) override
    {
        if (failure != util::Result::Ok)
            throw failure;
        calls.push_back(std::to_string(channel) + ":" + std::to_string(mode));
        track(channel).mode = mode;
        tell();
    }
    void addListener(Listener* listener) override { m_listeners.add(listener); }
    void removeListener(Listener* listener) override { m_listeners.remove(listener); }
    std::size_t channelCount() const override { return tracks.size(); }

    void tell()
    {
        m_listeners.forEach([](Listener& listener) { listener.tracksChanged(); });
    }

    std::array<Track, 2> tracks = {Track{true, L"VIDEO old", Mode::Old}, Track{true, L"VIDEO new", Mode::New}};
    std::vector<std::string> calls; ///< of setMode
    util::Result::Type failure = util::Result::Ok;

private:
    Track& track(std::size_t channel)
    {
        if (channel >= tracks.size())
            throw util::Result::InvalidArgument;
        return tracks[channel];
    }

    util::ListenerSet<Listener> m_listeners;
};

/// Draws test pictures: colour bars with the side and the time of the frame. They come when a test says so.
class TestVideo : public gui::VideoProviderBase {
public:
    struct Request {
        int width = 0;
        int height = 0;
        bool lastFrame = false;
        double time = 0.0;
    };

    gui::VideoTrackHandlerBase& getTrackHandler() override { return tracks; }

    /// The last request of a side.
    const Request& request(std::size_t side) const { return m_requests.at(side); }
    void deliver()
    {
        for (const std::size_t side : {OldSide, NewSide})
            deliverImage(picture(side), side);
    }

    TestTracks tracks;
    int requestCount = 0;
    util::Result::Type failure = util::Result::Ok; ///< thrown at each request, when it isn't Ok

protected:
    void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) override
    {
        if (failure != util::Result::Ok)
            throw failure;
        m_requests.at(side) = {width, height, lastFrame, time};
        ++requestCount;
    }

private:
    juce::Image picture(std::size_t side) const
    {
        const std::array bars = {0xffc0c0c0U, 0xffc0c000U, 0xff00c0c0U, 0xff00c000U,
                                 0xffc000c0U, 0xffc00000U, 0xff0000c0U};
        const Request& asked = request(side);
        const juce::Image image(juce::Image::ARGB, asked.width, asked.height, true);
        juce::Graphics graphics(image);
        const float width = static_cast<float>(asked.width) / static_cast<float>(bars.size());
        const auto height = static_cast<float>(asked.height);
        for (std::size_t bar = 0; bar < bars.size(); ++bar) {
            graphics.setColour(juce::Colour(bars[side == OldSide ? bar : bars.size() - 1 - bar]));
            graphics.fillRect(width * static_cast<float>(bar), 0.0F, width, height * 0.7F);
        }
        graphics.setColour(juce::Colours::black);
        graphics.fillRect(0.0F, height * 0.7F, static_cast<float>(asked.width), height);
        const juce::String text = (side == OldSide ? "old " : "new ") + core::Timecode(asked.time).toString();
        graphics.setColour(juce::Colours::white);
        graphics.setFont(juce::Font(gui::FontFamily, height * 0.2F, juce::Font::plain));
        graphics.drawText(text, image.getBounds().removeFromBottom(asked.height * 3 / 10),
                          juce::Justification::centred);
        return image;
    }

    std::array<Request, 2> m_requests;
};

} // namespace cadrel::tests
