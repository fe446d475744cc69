-- SPDX-License-Identifier: GPL-3.0-or-later
-- Draws fades and gain envelopes in the session NAME in FOLDER, and saves it. DRAWN is a list of "region:in:shape:samples",
-- "region:out:shape:samples" and "region:envelope:sample:gain". Samples below 1 are a share of the region.
local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
-- Sound files are read by another thread.
os.execute("sleep 1")
local regions = {}
for track in session:get_tracks():iter() do
  for region in track:to_track():playlist():region_list():iter() do
    regions[region:name()] = region:to_audioregion()
  end
end
local function samplesOf(region, text)
  local samples = tonumber(text)
  return samples < 1 and math.floor(samples * region:length():samples()) or samples
end
local begun = {}
for name, what, first, second in string.gmatch(os.getenv("DRAWN"), "([^:;]+):(%a+):([^:;]+):([^:;]+);") do
  local region = assert(regions[name], "no region " .. name)
  if what == "envelope" then
    if not begun[name] then
      region:envelope():clear_list()
      region:set_envelope_active(true)
      begun[name] = true
    end
    region:envelope():add(Temporal.timepos_t(samplesOf(region, first)), tonumber(second), false, false)
  elseif what == "in" then
    region:set_fade_in_shape(ARDOUR.FadeShape[first])
    region:set_fade_in_length(samplesOf(region, second))
  else
    region:set_fade_out_shape(ARDOUR.FadeShape[first])
    region:set_fade_out_length(samplesOf(region, second))
  end
end
assert(session:save_state("") == 0, "not saved")
