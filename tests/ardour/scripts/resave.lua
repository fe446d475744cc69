-- SPDX-License-Identifier: GPL-3.0-or-later
-- Opens the session NAME in FOLDER and saves it.
local session = load_session(os.getenv("FOLDER"), os.getenv("NAME"))
assert(session, "not loaded")
os.execute("sleep 1")
assert(session:save_state("") == 0, "not saved")
