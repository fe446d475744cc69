-- SPDX-License-Identifier: GPL-3.0-or-later
-- Makes an empty session NAME in FOLDER with TRACKS mono tracks, at RATE samples a second. With WITHBUS set, each track sends
-- to a bus and obeys a VCA, and the tempo changes twice.
local session = create_session(os.getenv("FOLDER"), os.getenv("NAME"), tonumber(os.getenv("RATE")))
assert(session, "no session")
session:new_audio_track(1, 2, nil, tonumber(os.getenv("TRACKS")), "Dia",
                        ARDOUR.PresentationInfo.max_order, ARDOUR.TrackMode.Normal, true)
if os.getenv("WITHBUS") then
  session:new_audio_route(2, 2, nil, 1, "Bus", ARDOUR.PresentationInfo.Flag.AudioBus,
                          ARDOUR.PresentationInfo.max_order)
  local bus = session:route_by_name("Bus 1") or session:route_by_name("Bus")
  session:vca_manager():create_vca(1, "VCA")
  for track in session:get_tracks():iter() do
    assert(track:add_aux_send(bus, track:amp()) == 0, "no send")
    track:to_slavable():assign(session:vca_manager():vca_by_number(1))
  end
  local map = Temporal.TempoMap.write_copy()
  map:set_tempo(Temporal.Tempo(100, 100, 4), Temporal.timepos_t(96000))
  map:set_tempo(Temporal.Tempo(180, 180, 4), Temporal.timepos_t(240000))
  Temporal.TempoMap.update(map)
end
-- Ports are connected by another thread.
os.execute("sleep 1")
assert(session:save_state("") == 0, "not saved")
