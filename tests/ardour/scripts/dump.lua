-- SPDX-License-Identifier: GPL-3.0-or-later
-- Tells what the session NAME in FOLDER has: its regions, its locations, and its automation at each of SAMPLES.
local function tell(...)
  print(table.concat({...}, "\t"))
end

local function tellLists(name, controls)
  for what, control in pairs(controls) do
    if control and not control:isnil() then
      for sample in string.gmatch(os.getenv("SAMPLES"), "%d+") do
        tell("value", name, what, sample,
             string.format("%.17g", control:alist():eval(Temporal.timepos_t(tonumber(sample)))))
      end
    end
  end
end

local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
for track in session:get_tracks():iter() do
  for region in track:to_track():playlist():region_list():iter() do
    tell("region", track:name(), region:name(), region:position():samples(), region:length():samples(),
         region:start():samples())
  end
end
for route in session:get_routes():iter() do
  local send = route:nth_send(0)
  tellLists(route:name(), {
    gain = route:gain_control(),
    pan = route:pan_azimuth_control(),
    mute = route:mute_control(),
    trim = route:trim_control(),
    send = not send:isnil() and send:to_send() and not send:to_send():isnil() and send:to_send():gain_control() or nil,
  })
end
for vca in session:vca_manager():vcas():iter() do
  tellLists(vca:name(), {gain = vca:gain_control()})
end
for location in session:locations():list():iter() do
  tell("location", location:name(), location:start():samples(), location:_end():samples())
end
