// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

class IFilePath;
class IMediaClip;
class IProjectNode;

/// The clips of a project. It has no identifier. Dependents can be added to it.
class IMediaPool : public FUnknown {
public:
    /// How many items answer to the type word.
    virtual int32 count(const char* type) = 0;
    /// Of those. Borrowed; null at an index that isn't there. The name of the item is the node's, all else is asked of
    /// its IMediaClip.
    virtual IProjectNode* itemAt(int32 index, const char* type) = 0;
    /// Brings a file into the pool, unless it is there already. The item belongs to the pool: borrowed, and null when the
    /// file can't be used.
    virtual FUnknown* import(IFilePath* path) = 0;
};

/// A piece of media: a file of sound or of picture.
class IMediaClip : public FUnknown {
public:
    static constexpr InterfaceId<IMediaClip> iid{"803c3fed57a648e8b81fce638cc87ad3"};

    /// Its length in frames of the project.
    virtual uint32 getFrameCount() = 0;
    /// Borrowed.
    virtual IFilePath* getFile() = 0;
};

/// The path of a file, UTF-16. Its class identifier is its interface's.
class IFilePath : public FUnknown {
public:
    static constexpr InterfaceId<IFilePath> iid{"0af38ea140f24b14965bf97ca4ff94d1"};

    /// The units that the buffer of getPath holds: 1024 and the zero.
    static constexpr int32 Capacity = 1025;

    /// `flags` is 0. Nonzero for a path that is longer than getPath can give.
    virtual int32 setPath(const char16_t* path, int32 flags) = 0;
    /// Writes the path and a zero into a buffer of Capacity units.
    virtual int32 getPath(char16_t* buffer) = 0;
};

/// Makes objects that are known by the name of their class.
class IObjectFactory : public FUnknown {
public:
    static constexpr InterfaceId<IObjectFactory> iid{"7ea3dda10790497797a48588c1b71185"};

    /// The class of the thumbnail factory: createObject(ThumbnailClass, ThumbnailType).
    static constexpr const char* ThumbnailClass = "VideoThumbnailFactory";
    static constexpr const char* ThumbnailType = "Video";

    /// Counted, but the reference goes back through releaseObject; null for what it can't make.
    virtual FUnknown* createObject(const char* className, const char* typeName) = 0;
    /// Drops the reference that createObject gave. Those that were added are released as ever.
    virtual int32 releaseObject(FUnknown* object) = 0;
};

/// A picture out of a clip. Used from the one thread that asks for pictures, as the factory is.
class IThumbnailImage : public FUnknown {
public:
    /// Width and height in pixels.
    virtual int32 getSize(int32 size[2]) = 0;
    /// Writes the part of the picture that lies in `rect` (left, top, right, bottom) to `pixels`: four bytes each, blue,
    /// green, red, alpha, rows from top to bottom, `stride` bytes from one to the next. `reserved` is 0.
    virtual int32 read(void* pixels, int32 stride, const int32 rect[4], int32 reserved) = 0;
};

/// Draws frames of a clip. The only interface that is used from a thread other than the main one, and with it what it reads
/// of the clip; for each such thread a factory is made, on the main thread.
class IThumbnailFactory : public FUnknown {
public:
    static constexpr InterfaceId<IThumbnailFactory> iid{"03ad35cd681a4f14bca22c095b030b36"};

    /// Which clip is asked for next, and the width and height wanted. The pictures may come out at another size.
    virtual int32 setSource(IMediaClip* clip, const int32 size[2]) = 0;
    /// Frames count from 0. Counted; null when there is no such frame.
    virtual IThumbnailImage* getImage(uint32 frame) = 0;
};

} // namespace Velmark
