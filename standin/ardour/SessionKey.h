// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace standin {

/// The attributes by which nodes of a project are known as objects of the session that they were read from.
namespace SessionKey {

inline constexpr const char* Route = "Form:Route";
inline constexpr const char* Region = "Form:Region";
inline constexpr const char* Location = "Form:Location";
/// Of the video and its track.
inline constexpr const char* Video = "Form:Video";
/// Of the track of the user's own markers.
inline constexpr const char* Markers = "Form:Markers";

} // namespace SessionKey

} // namespace standin
