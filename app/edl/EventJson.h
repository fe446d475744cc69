// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <nlohmann/json.hpp>
#include <span>
#include <string_view>

namespace cadrel::app {

/// Events as JSON for other programs: `{"schema": 1, "events": [...]}`, and further keys after it.
/// docs/common.schema.json describes an event. Bytes that are no UTF-8 become U+FFFD.
class EventJson {
public:
    using Events = std::span<const std::shared_ptr<core::EventBase>>;
    using Sink = std::function<void(std::string_view)>;

    /// The further keys of an event, by its place in the list.
    using KeysOf = std::function<nlohmann::ordered_json(std::size_t)>;

    /// Gives the document to `sink` piece by piece, so that a million events need the memory of one. `keysOf` may be empty.
    static void write(Events events, const nlohmann::ordered_json& furtherKeys, const Sink& sink,
                      const KeysOf& keysOf = {});
};

} // namespace cadrel::app
