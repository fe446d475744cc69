-- SPDX-License-Identifier: GPL-3.0-or-later
-- Gives each track of the session NAME in FOLDER automation, and saves it: POINTS is a list of "what:sample:value".
local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
for track in session:get_tracks():iter() do
  local controls = {
    gain = track:gain_control(),
    pan = track:pan_azimuth_control(),
    mute = track:mute_control(),
  }
  for what, sample, value in string.gmatch(os.getenv("POINTS"), "(%a+):(%d+):([%d.]+)") do
    controls[what]:alist():add(Temporal.timepos_t(tonumber(sample)), tonumber(value), false, false)
    controls[what]:set_automation_state(ARDOUR.AutoState.Play)
  end
end
assert(session:save_state("") == 0, "not saved")
