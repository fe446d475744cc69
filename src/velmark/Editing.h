// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

class IEditStep;
class IProjectDocument;

/// A list of any objects, each with a reference of the list's own. Its class identifier is its interface's.
class IObjectList : public FUnknown {
public:
    static constexpr InterfaceId<IObjectList> iid{"8e8562d867f54576817561cfc2b134e3"};

    /// At the end; `reserved` is 0.
    virtual int32 add(FUnknown* object, int32 reserved) = 0;
    virtual int32 count() = 0;
    /// Borrowed; null at an index that isn't there.
    virtual FUnknown* at(int32 index) = 0;
};

/// Edits of whole stretches. Its object answers to IEditTransaction too, which has to be open.
///
/// All times are seconds from the time origin. A range includes its start but not its end. Edges that differ by no more
/// than 1/384000 s are the same instant.
class IEditService : public FUnknown {
public:
    static constexpr InterfaceId<IEditService> iid{"287cb9de71e54e36bde1c43bc6ed78cc"};

    /// Writes what lies in the range on the given tracks over the range of the same length at `destination`, on the same
    /// tracks. Source and destination may overlap: the source is read first, then the destination is cleared, then
    /// written. `reserved` is 0.
    ///
    ///     source        ..|-- A --|---- B ----|..     clips and range markers are cut at the edges,
    ///                        start        end         and their source offsets follow
    ///     destination   .X|-- A|---- B --|Y.......    what stood here is cleared
    ///
    /// Attributes travel with the pieces; so do automation points, with a point at either edge of the destination where
    /// the curve would change outside of it. A point marker at `end` isn't copied. What would be below time 0 is
    /// dropped.
    virtual int32 copyRange(IProjectDocument* project, IObjectList* tracks, int32 reserved, double start, double end,
                            double destination) = 0;
    /// Joins pieces that copyRange has split off one event and that are next to each other again, with equal attributes
    /// and a continuous source. Cuts that the user made stay. 0 when something was joined, ResultFalse when there was
    /// nothing to join, and 2 or above for a failure. `reserved` is 0.0.
    virtual int32 closeRange(IProjectDocument* project, IObjectList* tracks, double start, double end,
                             double reserved) = 0;
};

/// Edits that are one entry of the project's undo list. It is asked of the IEditService by `queryInterface`, and one alone
/// can be open at a time. All edits but the setters of nodes need it open.
class IEditTransaction : public FUnknown {
public:
    static constexpr InterfaceId<IEditTransaction> iid{"7199c83a68c940bf9f142dcdff1a1cb3"};

    /// Opens it; nonzero when one is open already. `flag` is true.
    virtual int32 begin(bool flag) = 0;
    /// Closes it. What was edited becomes the entry `name` (UTF-16) of the project's undo list; a commit without edits
    /// makes no entry. It calls the edit hooks first, whose own edits still become part of the entry, and then the
    /// dependents of the project.
    virtual int32 commit(IProjectDocument* project, const char16_t* name) = 0;
    /// `parent` is a container or a node. The project holds a reference to the child while it is inserted.
    virtual int32 insert(FUnknown* parent, FUnknown* child) = 0;
    /// `parent` is any container around the child, of which the root is always one. The undo list keeps a removed child
    /// alive.
    virtual int32 remove(FUnknown* parent, FUnknown* child) = 0;
    /// `parent` as in remove().
    virtual int32 move(FUnknown* parent, FUnknown* newParent, FUnknown* child) = 0;
    /// The content of the range on every track but rulers, as an object that only `paste` understands; counted.
    /// `reserved` is 0.
    virtual int32 copyAll(IProjectDocument* project, FUnknown** clipboard, double start, double end,
                          int32 reserved) = 0;
    /// Writes it at `destination` over what is there, as copyRange does. `reserved` is 0.
    virtual int32 paste(IProjectDocument* project, FUnknown* clipboard, int32 reserved, double destination) = 0;
    /// Empties the range on every track but rulers. What hangs over its edges is cut; automation points in it go, with a
    /// point at an edge where the curve would change outside. Of a curve that has one value outside and no point there,
    /// one point with that value stays where it stands. `reserved` is 0.
    virtual int32 deleteRange(IProjectDocument* project, int32 reserved, double start, double end) = 0;
    /// Puts a step of the module's own in its place among the edits. The transaction takes a reference; execute() isn't
    /// called.
    virtual int32 addStep(IEditStep* step) = 0;
};

} // namespace Velmark
