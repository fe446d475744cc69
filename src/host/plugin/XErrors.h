// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::host {

/// Keeps X errors on connections of this module from ending the host: while it lives, they are passed over, and all other
/// errors go on to the handler that was there before. The window that a host puts us into may go before ours does, after
/// which the server refuses what is asked of ours.
///
/// There is one at a time. If somebody installs another handler and leaves it there, this one can't be taken out again. The
/// module then stays in memory, and the next object installs its handler over the other one.
class XErrors {
public:
    XErrors();
    XErrors(const XErrors&) = delete;
    XErrors& operator=(const XErrors&) = delete;
    ~XErrors();
};

} // namespace cadrel::host
