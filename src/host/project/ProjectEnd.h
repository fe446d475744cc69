// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/Project.h"
#include "velmark/ProjectNode.h"

#include <functional>
#include <optional>

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

/// The end of a project, which is put off while a preview needs room past it. The project keeps in an attribute what it was
/// before and what was made of it, also when it is closed meanwhile. An end that the user sets since then stays.
///
/// The host tells the later of the set end and the end of the content alone. Where that is the content's, the end counts as
/// never set, and follows the content again afterwards. Where it is that of a preview, the end stays as it is: what was set
/// can't be told, and the preview has its room already.
///
/// All times are seconds from the time origin. What the host refuses is thrown as HostFailure.h tells.
class ProjectEnd {
public:
    /// Neither is owned. `contentEnd` is asked for the end of the last event of any track.
    ProjectEnd(Velmark::IHostContext* context, Velmark::IProjectDocument* document, std::function<double()> contentEnd)
        : m_hostContext(context), m_document(document), m_contentEnd(std::move(contentEnd))
    {
    }

    /// Never draws it in. `isPreviewWritten` tells whether a preview is part of the content.
    void putOffTo(double end, bool isPreviewWritten);
    /// Does nothing where it wasn't put off.
    void putBack();

private:
    struct PutOff {
        double from;
        double to;
    };

    Velmark::Counted<Velmark::IProjectNode> root() const;
    std::optional<PutOff> putOff() const;
    void keep(const PutOff& putOff) const;
    void forget() const;
    /// Whether the set end is still what was made of it.
    bool isStillAt(double end) const;

    Velmark::IHostContext* m_hostContext;
    Velmark::IProjectDocument* m_document;
    std::function<double()> m_contentEnd;
};

} // namespace cadrel::host
