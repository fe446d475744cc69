-- SPDX-License-Identifier: GPL-3.0-or-later
-- Tells what the session NAME in FOLDER has: its regions, its locations, and its automation at each of SAMPLES.
local function tell(...)
  print(table.concat({...}, "\t"))
end

local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
for track in session:get_tracks():iter() do
  for region in track:to_track():playlist():region_list():iter() do
    tell("region", track:name(), region:name(), region:position():samples(), region:length():samples(),
         region:start():samples())
  end
  local lists = {
    gain = track:gain_control():alist(),
    pan = track:pan_azimuth_control():alist(),
    mute = track:mute_control():alist(),
  }
  for what, list in pairs(lists) do
    for sample in string.gmatch(os.getenv("SAMPLES"), "%d+") do
      tell("value", track:name(), what, sample,
           string.format("%.17g", list:eval(Temporal.timepos_t(tonumber(sample)))))
    end
  end
end
for location in session:locations():list():iter() do
  tell("location", location:name(), location:start():samples(), location:_end():samples())
end
