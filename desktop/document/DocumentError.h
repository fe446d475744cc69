// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <stdexcept>

namespace desktop {

/// What went wrong with a document, for the user: `what()` is one line that names the file.
class DocumentError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

} // namespace desktop
