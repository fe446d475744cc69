// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/PreviewEventsStep.h"

#include "host/border/HostFailure.h"

#include <utility>

namespace cadrel::host {

Velmark::int32 PreviewEventsStep::swap()
{
    return resultOf([this] {
        const auto list = m_list.lock();
        if (!list)
            throw util::Result::NotAvailable;
        // The step has changed sides before those are told who may throw.
        Events present = list->release();
        list->append(std::exchange(m_other, std::move(present)));
    });
}

} // namespace cadrel::host
