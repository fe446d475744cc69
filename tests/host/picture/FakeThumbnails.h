// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/support/host/AlteredContext.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <juce_core/juce_core.h>

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <functional>
#include <mutex>
#include <thread>
#include <utility>
#include <vector>

namespace cadrel::host::tests {

class FakeClip : public Velmark::Implements<FakeClip, Velmark::FObject, Velmark::IMediaClip> {
public:
    static constexpr const char* ClassName = "FakeClip";

    Velmark::uint32 getFrameCount() override { return 100; }
    Velmark::IFilePath* getFile() override { return nullptr; }
};

/// How the pictures of a host come out, and what it has done for them. A case sets the answers while no picture is drawn.
struct Thumbnails {
    struct Call {
        Velmark::IMediaClip* clip = nullptr;
        Velmark::int32 wanted[2] = {};
        Velmark::uint32 frame = 0;
    };

    Velmark::int32 size[2] = {8, 4};
    Velmark::int32 setSourceAnswer = Velmark::ResultOk;
    Velmark::int32 getSizeAnswer = Velmark::ResultOk;
    Velmark::int32 readAnswer = Velmark::ResultOk;
    bool hasImage = true;
    /// Called when a picture is to be drawn, on the thread that draws.
    std::function<void()> whenDrawing = [] {};

    void add(const Call& call)
    {
        const std::lock_guard lock(m_mutex);
        m_calls.push_back(call);
    }
    std::vector<Call> calls()
    {
        const std::lock_guard lock(m_mutex);
        return m_calls;
    }

    std::atomic<int> factoriesAlive = 0;
    std::atomic<int> imagesAlive = 0;

private:
    std::mutex m_mutex;
    std::vector<Call> m_calls;
};

/// A picture of which every pixel tells the frame, the row and the column: blue 10 times the column, green 10 times the row,
/// red the frame.
class FakeImage : public Velmark::Implements<FakeImage, Velmark::FObject, Velmark::IThumbnailImage> {
public:
    static constexpr const char* ClassName = "FakeImage";

    FakeImage(Thumbnails& thumbnails, Velmark::uint32 frame) : m_thumbnails(thumbnails), m_frame(frame)
    {
        ++m_thumbnails.imagesAlive;
    }
    ~FakeImage() override { --m_thumbnails.imagesAlive; }

    Velmark::int32 getSize(Velmark::int32 size[2]) override
    {
        std::copy_n(m_thumbnails.size, 2, size);
        return m_thumbnails.getSizeAnswer;
    }
    Velmark::int32 read(void* pixels, Velmark::int32 stride, const Velmark::int32 rect[4], Velmark::int32) override
    {
        auto* row = static_cast<Velmark::uint8*>(pixels);
        for (Velmark::int32 y = rect[1]; y < rect[3]; ++y, row += stride) {
            Velmark::uint8* pixel = row;
            for (Velmark::int32 x = rect[0]; x < rect[2]; ++x) {
                *pixel++ = static_cast<Velmark::uint8>(10 * x);
                *pixel++ = static_cast<Velmark::uint8>(10 * y);
                *pixel++ = static_cast<Velmark::uint8>(m_frame);
                *pixel++ = 255;
            }
        }
        return m_thumbnails.readAnswer;
    }

private:
    Thumbnails& m_thumbnails;
    Velmark::uint32 m_frame;
};

class FakeThumbnailFactory
    : public Velmark::Implements<FakeThumbnailFactory, Velmark::FObject, Velmark::IThumbnailFactory> {
public:
    static constexpr const char* ClassName = "FakeThumbnailFactory";

    explicit FakeThumbnailFactory(Thumbnails& thumbnails) : m_thumbnails(thumbnails) { ++m_thumbnails.factoriesAlive; }
    ~FakeThumbnailFactory() override { --m_thumbnails.factoriesAlive; }

    Velmark::int32 setSource(Velmark::IMediaClip* clip, const Velmark::int32 size[2]) override
    {
        m_call = {clip, {size[0], size[1]}, 0};
        return m_thumbnails.setSourceAnswer;
    }
    Velmark::IThumbnailImage* getImage(Velmark::uint32 frame) override
    {
        m_call.frame = frame;
        m_thumbnails.add(m_call);
        m_thumbnails.whenDrawing();
        return m_thumbnails.hasImage ? new FakeImage(m_thumbnails, frame) : nullptr;
    }

private:
    Thumbnails& m_thumbnails;
    Thumbnails::Call m_call;
};

/// Makes such factories, or other objects, or none.
class FakeObjectFactory : public Velmark::Implements<FakeObjectFactory, Velmark::FObject, Velmark::IObjectFactory> {
public:
    static constexpr const char* ClassName = "FakeObjectFactory";

    explicit FakeObjectFactory(Thumbnails& thumbnails)
        : create([&thumbnails](const char*, const char*) { return new FakeThumbnailFactory(thumbnails); })
    {
    }

    std::function<Velmark::FObject*(const char* className, const char* typeName)> create;
    int givenBack = 0;

    Velmark::FUnknown* createObject(const char* className, const char* typeName) override
    {
        return create(className, typeName);
    }
    Velmark::int32 releaseObject(Velmark::FUnknown* object) override
    {
        ++givenBack;
        object->release();
        return Velmark::ResultOk;
    }
};

/// A host that has nothing but thumbnails.
struct ThumbnailHost {
    ThumbnailHost() { context.replace(Velmark::IObjectFactory::iid, objectFactory); }

    Thumbnails thumbnails;
    Velmark::Counted<FakeObjectFactory> objectFactory = Velmark::makeCounted<FakeObjectFactory>(thumbnails);
    Velmark::Counted<FakeClip> clip = Velmark::makeCounted<FakeClip>();
    AlteredContext context{nullptr};
};

/// Holds the thread that draws a picture until it is let go.
class Gate {
public:
    /// For Thumbnails::whenDrawing.
    std::function<void()> door()
    {
        return [this] {
            m_entered.signal();
            m_open.wait(-1);
        };
    }
    void waitUntilEntered() { m_entered.wait(-1); }
    /// For one picture.
    void open() { m_open.signal(); }

private:
    juce::WaitableEvent m_entered;
    juce::WaitableEvent m_open;
};

} // namespace cadrel::host::tests
