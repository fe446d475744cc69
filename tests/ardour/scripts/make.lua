-- SPDX-License-Identifier: GPL-3.0-or-later
-- Makes an empty session NAME in FOLDER with TRACKS mono tracks, at 48,000 samples a second.
local session = create_session(os.getenv("FOLDER"), os.getenv("NAME"), 48000)
assert(session, "no session")
session:new_audio_track(1, 2, nil, tonumber(os.getenv("TRACKS")), "Dia",
                        ARDOUR.PresentationInfo.max_order, ARDOUR.TrackMode.Normal, true)
-- Ports are connected by another thread.
os.execute("sleep 1")
assert(session:save_state("") == 0, "not saved")
