// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/AttributeList.h"

#include <optional>
#include <string>
#include <string_view>

namespace standin {

/// Bytes as text, four characters for three of them, padded with "=" (RFC 4648, section 4).
std::string toBase64(const Bytes& bytes);
/// Nothing for a text that toBase64 doesn't give for any bytes.
std::optional<Bytes> fromBase64(std::string_view text);

} // namespace standin
