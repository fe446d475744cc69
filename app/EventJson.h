#pragma once

#include "core/EventBase.h"

#include <functional>
#include <memory>
#include <nlohmann/json.hpp>
#include <span>
#include <string_view>

namespace cadrel::app {

/// Events as JSON for other programs: `{"events": [...]}`, and further keys behind it.
///
/// The words for an event are those of its EDL: "kind" is "plain" or "healed", "transition" is "cut", "dissolve" or
/// "wipe", "duration" its length in frames, "flaws" are the numbers of EventFlaw. Bytes that are no UTF-8 become
/// U+FFFD.
class EventJson {
public:
    using Events = std::span<const std::shared_ptr<core::EventBase>>;
    using Sink = std::function<void(std::string_view)>;

    /// Gives the document to `sink` piece by piece, so that a million events need the memory of one.
    static void write(Events events, const nlohmann::ordered_json& furtherKeys, const Sink& sink);
};

} // namespace cadrel::app
