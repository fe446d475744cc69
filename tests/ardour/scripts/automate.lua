-- SPDX-License-Identifier: GPL-3.0-or-later
-- Gives the lists of the session NAME in FOLDER automation, and saves it. POINTS is a list of "what:sample:value": of all
-- tracks for "gain", "pan", "mute", "trim" and "send", else of "bus" or "vca".
local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
local function automate(controls)
  for what, sample, value in string.gmatch(os.getenv("POINTS"), "(%a+):(%d+):([%d.]+)") do
    local control = controls[what]
    if control and not control:isnil() then
      control:alist():add(Temporal.timepos_t(tonumber(sample)), tonumber(value), false, false)
      control:set_automation_state(ARDOUR.AutoState.Play)
    end
  end
end
for track in session:get_tracks():iter() do
  local send = track:nth_send(0)
  automate({
    gain = track:gain_control(),
    pan = track:pan_azimuth_control(),
    mute = track:mute_control(),
    trim = track:trim_control(),
    send = not send:isnil() and send:to_send():gain_control() or nil,
  })
end
for _, name in ipairs{"Bus", "Bus 1"} do
  local bus = session:route_by_name(name)
  if not bus:isnil() then
    automate({bus = bus:gain_control()})
  end
end
for vca in session:vca_manager():vcas():iter() do
  automate({vca = vca:gain_control()})
end
assert(session:save_state("") == 0, "not saved")
