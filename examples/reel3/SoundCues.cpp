// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/reel3/SoundCues.h"

namespace reel3 {

namespace {

const std::vector<Cue> HardEffects = {
    {"03:00:06:02", "14:10", "weir roar, close", "weir roar close 01", "00:18"},
    {"03:00:26:20", "06:09", "water over sill", "water sheet over stone", "03:02"},
    {"03:00:38:11", "02:06", "gangway creaks", "wood creak long", "00:10"},
    {"03:00:44:00.50", "01:14.25", "gate latch", "latch iron 02", "00:03"},
    {"03:00:49:18", "02:20", "lock house door", "door lock house", "00:06"},
    {"03:01:12:22", "03:03", "kettle lid", "kettle lid rattle", "01:00"},
    {"03:01:41:20", "01:20", "match", "match strike 03", "00:02"},
    {"03:01:44:14", "07:00", "lamp hisses up", "paraffin lamp hiss", "00:00"},
    {"03:02:24:18", "02:02", "chair scrapes", "chair on stone 04", "00:12"},
    {"03:02:34:10", "01:22", "cup down", "cup on table 05", "00:01"},
    {"03:03:00:22", "04:06", "key on table", "iron key drop", "00:00"},
    {"03:03:48:02", "03:10", "door to stair", "door stair open", "00:04"},
    {"03:04:03:23", "04:20", "handle, tried twice", "door handle slow", "00:07"},
    {"03:04:15:09", "02:14", "door shuts below", "door shut muffled", "00:02"},
    {"03:05:36:23", "03:12", "moorhen flushed", "moorhen flush 01", "00:15"},
    {"03:06:10:02", "04:08", "plank bridge", "plank knock series", "02:00"},
    {"03:06:41:14", "03:04", "office door, bell", "shop door bell", "00:09"},
    {"03:07:51:22", "04:00", "stamp, three times", "desk stamp series", "01:04"},
    {"03:08:12:20", "01:08", "drawer", "drawer wood shut", "00:00"},
    {"03:08:36:10", "02:16", "ledger shut", "heavy book shut 02", "00:05"},
    {"03:09:13:22", "02:02", "wall clock strikes", "wall clock strike one", "00:01"},
    {"03:09:20:20", "03:06", "office door, out", "shop door bell", "05:12"},
    {"03:09:34:12", "09:20", "derrick chain", "chain over sheave", "04:00"},
    {"03:09:54:19", "01:03", "lantern shutter", "lantern shutter click", "00:02"},
    {"03:10:14:19", "01:03", "lantern shutter", "lantern shutter click", "00:02"},
    {"03:10:17:16", "05:14", "mooring rope off", "rope off bollard", "00:20"},
    {"03:10:55:14", "01:00", "tiller knocks", "tiller knock 01", "00:00"},
    {"03:11:02:22", "01:20", "boat hook on deck", "boat hook drop", "00:11"},
    {"03:11:15:00", "01:02", "grip on tiller", "tiller grip creak", "00:06"},
    {"03:11:25:01", "00:20", "grip on tiller", "tiller grip creak", "02:06"},
    {"03:11:30:03", "03:08", "rope snaps", "rope snap and whip", "00:04"},
    {"03:11:37:09.25", "01:01.50", "propeller wash", "propeller wash close", "03:00"},
    {"03:11:47:12", "00:20", "grip on tiller", "tiller grip creak", "04:12"},
    {"03:11:48:10", "02:18", "rope snaps again", "rope snap and whip", "05:01"},
    {"03:12:13:20", "09:12", "hull plate groans", "hull groan low", "01:16"},
    {"03:12:28:20", "01:06", "pipe bursts", "pipe burst steam", "00:02"},
    {"03:12:39:10", "06:14", "under water, hands", "plunge underwater", "00:09"},
    {"03:12:49:09", "06:06", "under water, face", "plunge underwater", "09:00"},
    {"03:12:55:16", "02:10", "she surfaces", "surface gasp water", "00:03"},
    {"03:13:41:10", "07:10", "gate goes", "timber gate breaks", "00:13"},
    {"03:14:39:16", "01:12", "photograph lifted", "photo off wall", "00:02"},
    {"03:15:03:20", "02:22", "door, gently", "door lock house", "08:08"},
    {"03:15:14:00", "03:00", "lantern on sill", "lantern set down", "00:06"},
};

const std::vector<Group> WinchGroups = {
    {"03:13:12:07",
     "02:18",
     "winch ratchet",
     {
         {"00:00", "00:20", "ratchet 1", "winch ratchet series", "00:10"},
         {"00:22", "00:19", "ratchet 2", "winch ratchet series", "02:01"},
         {"01:18", "01:00", "ratchet 3, strained", "winch ratchet series", "06:15"},
     },
     {}},
    {"03:13:31:22",
     "02:14",
     "ratchet slips",
     {
         {"00:00", "01:06", "pawl jumps", "winch ratchet series", "11:03"},
         {"01:02", "01:12", "drum spins", "winch drum free", "00:00"},
     },
     {}},
};

const std::vector<Cue> BoatEffects = {
    {"03:00:14:08", "09:00", "gate machinery, far", "gate machinery far", "10:00"},
    {"03:04:16:03", "11:22", "gulls pass over", "gulls flock pass", "02:12"},
    {"03:06:34:00", "09:10", "steam launch passes", "steam launch pass by", "06:00"},
    {"03:09:21:10", "14:00", "barge idles", "barge diesel idle", "12:00"},
    {"03:09:57:19", "07:08", "barge idles, from crates", "barge diesel idle", "41:06"},
    {"03:10:17:20", "22:14", "barge casts off", "barge cast off", "00:00"},
    {"03:10:45:20", "06:10", "launch, far", "launch engine onboard", "08:00"},
    {"03:10:52:08", "06:20", "launch, on board", "launch engine onboard", "31:14"},
    {"03:10:59:14", "03:14", "barge passes camera", "barge pursuit passes", "00:18"},
    {"03:11:04:12", "02:00", "launch, on board", "launch engine onboard", "52:02"},
    {"03:11:10:20", "04:22", "launch, hard over", "launch hard over", "01:00"},
    {"03:11:19:08", "02:08", "barge passes camera", "barge pursuit passes", "14:20"},
    {"03:11:21:17", "03:20", "launch, on board", "launch engine onboard", "68:10"},
    {"03:11:28:06", "04:20", "launch, on board", "launch engine onboard", "75:00"},
    {"03:11:33:02.50", "02:01", "barge passes camera", "barge pursuit passes", "22:09"},
    {"03:11:35:06", "02:22", "launch, throttle", "launch hard over", "12:05"},
    {"03:11:42:22", "05:22", "launch, boat to boat", "launch engine onboard", "90:16"},
    {"03:11:50:20", "04:00", "0350 wake over bow", "bow wave rush", "11:04"},
    {"03:11:54:22", "04:02", "launch slows", "launch slows and stops", "00:00"},
    {"03:11:59:04", "06:02", "launch, far", "launch slows and stops", "05:10"},
    {"03:13:07:20", "04:18", "0410 gate shakes", "timber gate strain", "00:16"},
    {"03:13:34:11", "04:12", "0440 wall slides", "stone wall collapse", "01:01"},
};

const std::vector<Group> ShotGroups = {
    {"03:11:06:12",
     "03:16",
     "0310 barge rams",
     {
         {"00:00", "01:10", "bow rush", "bow wave rush", "02:00"},
         {"01:02", "01:20", "hull hit", "hull impact wood 01", "00:03"},
         {"01:22", "01:18", "splinters", "splinters on deck", "00:00"},
     },
     {}},
    {"03:11:15:20",
     "03:10",
     "0320 boom swings",
     {
         {"00:00", "02:04", "boom whoosh", "boom swing whoosh", "00:08"},
         {"01:16", "01:18", "boom hits mast", "hull impact wood 01", "04:12"},
     },
     {}},
    {"03:11:25:15",
     "02:14",
     "0330 buoy",
     {
         {"00:00", "01:06", "buoy bell", "buoy bell struck", "00:00"},
         {"00:14", "02:00", "buoy scrapes hull", "steel scrape hull", "01:09"},
     },
     {}},
    {"03:11:38:04",
     "04:16",
     "0340 under the bridge",
     {
         {"00:00", "01:20", "arch comes on", "bridge whoosh", "00:02"},
         {"01:04", "03:12", "arch echo", "engine under arch", "03:00"},
     },
     {}},
    {"03:13:18:14",
     "06:10",
     "0420 wave front",
     {
         {"00:00", "04:02", "wave comes", "wave front roar", "05:00"},
         {"03:12", "02:22", "wave breaks on wall", "wave break stone", "00:10"},
     },
     {}},
    {"03:13:28:12",
     "05:22",
     "sluice bursts",
     {
         {"00:00", "01:04", "boards crack", "timber crack series", "02:22"},
         {"00:20", "03:16", "burst", "sluice burst main", "00:00"},
     },
     {{"02:06",
       "03:16",
       "debris",
       {
           {"00:00", "02:00", "planks", "splinters on deck", "07:00"},
           {"01:10", "02:06", "iron over stone", "steel scrape hull", "08:18"},
       },
       {}}}},
    {"03:13:41:12",
     "09:00",
     "0450 flood",
     {
         {"00:00", "07:12", "flood", "wave front roar", "24:00"},
         {"05:00", "04:00", "flood recedes", "flood tail", "00:12"},
     },
     {}},
};

const std::vector<Cue> WaterEffects = {
    {"03:00:04:20", "27:10", "river, wide", "river wide slow", "05:00"},
    {"03:04:26:08", "14:16", "river behind reeds", "river lap reeds", "00:00"},
    {"03:05:08:06", "14:20", "river behind reeds", "river lap reeds", "22:00"},
    {"03:06:22:10", "12:20", "river, long lens", "river wide slow", "48:00"},
    {"03:09:35:02", "22:00", "water under quay", "quay lap night", "03:12"},
    {"03:10:29:08", "15:16", "water under quay", "quay lap night", "61:00"},
    {"03:10:46:20", "18:22", "bow wave", "bow wave steady", "10:00"},
    {"03:11:11:06", "26:14", "bow wave", "bow wave steady", "44:06"},
    {"03:11:42:10", "21:00", "bow wave", "bow wave steady", "90:00"},
    {"03:12:05:02", "33:18", "hold fills", "hold water rising", "00:00"},
    {"03:12:46:03", "03:04", "hold fills", "hold water rising", "41:04"},
    {"03:12:58:06", "05:08", "hold fills", "hold water rising", "58:00"},
    {"03:13:03:16", "36:06", "flood water, bed", "torrent bed", "06:00"},
};

const std::vector<Cue> Feet = {
    {"03:00:40:18", "08:20", "Maren, gangway", "feet R3 take 01", "04:00"},
    {"03:01:06:02", "02:04", "Maren, flags", "feet R3 take 01", "21:10"},
    {"03:01:56:10", "04:22", "Tobias, flags", "feet R3 take 01", "30:00"},
    {"03:03:10:01", "05:20", "both, flags", "feet R3 take 01", "44:02"},
    {"03:03:42:00", "06:18", "Tobias to stair", "feet R3 take 01", "58:20"},
    {"03:04:27:12", "13:04", "Maren and Pip, gravel", "feet R3 take 02", "02:00"},
    {"03:04:41:00", "15:18", "Maren and Pip, path", "feet R3 take 02", "20:00"},
    {"03:04:57:02.75", "06:10", "Maren, path", "feet R3 take 02", "38:12"},
    {"03:05:03:20", "05:22", "Pip, path", "feet R3 take 02", "47:00"},
    {"03:05:10:02", "09:06", "Maren, path", "feet R3 take 02", "55:08"},
    {"03:05:19:10", "03:11", "reeds, close", "feet R3 take 02", "66:00"},
    {"03:05:23:02", "14:00", "Maren and Pip, path", "feet R3 take 02", "71:14"},
    {"03:05:44:22", "12:12", "Maren, path, stops", "feet R3 take 02", "88:00"},
    {"03:06:11:00", "11:22", "both, plank and path", "feet R3 take 02", "104:06"},
    {"03:06:43:00", "12:16", "Maren, office boards", "feet R3 take 03", "00:12"},
    {"03:07:29:16", "07:20", "clerk, boards", "feet R3 take 03", "15:00"},
    {"03:08:37:08", "03:22", "Dreyl rises", "feet R3 take 03", "26:18"},
    {"03:09:14:06", "08:20", "Maren out, boards", "feet R3 take 03", "33:00"},
    {"03:09:35:08", "08:00", "Maren, crates, soft", "feet R3 take 03", "45:00"},
    {"03:10:06:10", "08:00", "men, quay", "feet R3 take 03", "55:12"},
    {"03:10:39:18", "06:10", "Maren runs, quay", "feet R3 take 03", "66:20"},
    {"03:11:03:00", "01:18", "men, deck", "feet R3 take 04", "00:10"},
    {"03:11:23:02", "02:04", "men, deck", "feet R3 take 04", "03:00"},
    {"03:11:45:20", "02:00", "men, deck", "feet R3 take 04", "06:08"},
    {"03:12:04:06", "09:20", "Maren wades", "feet R3 take 04", "10:00"},
    {"03:12:22:09", "07:12", "Maren wades, deep", "feet R3 take 04", "24:14"},
    {"03:13:02:10", "05:20", "Tobias, wet stone", "feet R3 take 04", "36:00"},
    {"03:14:17:20", "09:02", "Tobias in door", "feet R3 take 04", "47:06"},
};

const std::vector<Group> StairGroups = {
    {"03:03:50:14",
     "18:00",
     "stair, up and listening",
     {
         {"00:00", "07:12", "Tobias, stair", "feet R3 take 01", "70:00"},
         {"07:18", "05:20", "Tobias, landing", "feet R3 take 01", "80:04"},
         {"17:01", "00:23", "one step back", "feet R3 take 01", "92:10"},
     },
     {}},
};

const std::vector<Cue> Props = {
    {"03:00:41:06", "08:00", "coat, oilskin", "cloth R3 take 01", "01:00"},
    {"03:01:07:00", "06:22", "cup and spoon", "props R3 take 01", "00:08"},
    {"03:01:25:10", "10:10", "bread knife", "props R3 take 01", "09:00"},
    {"03:02:07:11", "13:08", "table, hands", "props R3 take 01", "24:12"},
    {"03:02:50:06", "10:20", "sleeve, key", "props R3 take 01", "41:00"},
    {"03:03:25:14", "16:06", "chair, cup", "props R3 take 01", "55:20"},
    {"03:04:04:14", "03:22", "hand on handle", "props R3 take 01", "75:00"},
    {"03:04:40:06", "16:06", "basket", "props R3 take 02", "00:00"},
    {"03:05:45:08", "12:08", "basket, coat", "props R3 take 02", "20:10"},
    {"03:06:56:02", "06:22", "letter", "props R3 take 02", "36:00"},
    {"03:07:15:14", "08:18", "pen, ink", "props R3 take 02", "45:05"},
    {"03:07:43:12", "08:10", "letter", "props R3 take 02", "58:00"},
    {"03:08:06:14", "06:16", "gloves", "props R3 take 02", "78:06"},
    {"03:08:23:00", "04:10", "cuff on desk", "props R3 take 02", "87:00"},
    {"03:08:55:19", "07:08", "spectacles", "props R3 take 02", "94:14"},
    {"03:09:43:18", "10:20", "tarpaulin", "props R3 take 03", "00:00"},
    {"03:10:55:16", "02:10", "tiller, hands", "props R3 take 03", "14:00"},
    {"03:11:11:02", "04:06", "oars shipped", "props R3 take 03", "18:20"},
    {"03:11:33:05", "04:08", "rope gathered", "props R3 take 03", "25:00"},
    {"03:12:29:05", "10:00", "chain on ankle", "props R3 take 03", "33:10"},
    {"03:14:07:10", "10:14", "bowl, spoon", "props R3 take 04", "00:00"},
    {"03:14:40:12", "05:02", "frame, glass", "props R3 take 04", "13:00"},
    {"03:15:13:02", "09:00", "lantern, matches", "props R3 take 04", "20:06"},
};

const std::vector<Group> LedgerGroups = {
    {"03:07:55:10",
     "04:14",
     "ledger",
     {
         {"00:00", "01:20", "pages", "props R3 take 02", "68:00"},
         {"02:00", "01:00", "finger down the column", "props R3 take 02", "70:12"},
         {"03:04", "01:10", "page back", "props R3 take 02", "72:20"},
     },
     {}},
};

// Over whole scenes, in turns on two tracks, so that they can be drawn over one another.
const std::vector<Cue> FirstAtmospheres = {
    {"03:00:03:14", "48:12", "weir at dawn", "atmo weir dawn", "12:00"},
    {"03:00:52:20", "176:12", "river through wall", "atmo river through wall", "00:00"},
    {"03:03:49:16", "28:10", "stair well", "atmo stair well", "20:00"},
    {"03:04:18:12", "65:14", "birds, towpath", "atmo birds reeds", "30:00"},
    {"03:05:30:06", "70:02", "birds, towpath, fewer", "atmo birds reeds", "140:00"},
    {"03:06:40:22", "163:10", "office, clock", "atmo office clock", "04:00"},
    {"03:09:24:18", "80:06", "quay creaks", "atmo quay creaks", "00:00"},
    {"03:10:45:12", "78:10", "open river, wind", "atmo river open wind", "15:00"},
    {"03:12:04:08", "57:14", "hold, drips", "atmo hold drips", "08:00"},
    {"03:13:02:00", "48:10", "weir in storm", "atmo weir storm", "30:00"},
    {"03:13:51:04", "99:08", "birds after rain", "atmo birds after rain", "05:12"},
};

const std::vector<Cue> SecondAtmospheres = {
    {"03:00:49:14", "182:04", "kitchen, range", "atmo kitchen range", "10:00"},
    {"03:04:15:10", "148:02", "towpath, wind in reeds", "atmo towpath wind", "02:00"},
    {"03:06:44:04", "156:18", "harbour behind window", "atmo harbour behind glass", "00:00"},
    {"03:09:21:16", "86:04", "quay at night", "atmo quay night", "25:00"},
    {"03:10:50:02", "73:09", "launch, boards rattle", "atmo launch boards", "00:00"},
    {"03:12:03:14", "60:10", "hull, from inside", "atmo hull inside", "06:00"},
    {"03:13:04:12", "45:10", "torrent, far bank", "atmo torrent far", "00:00"},
    {"03:13:50:02", "100:00", "kitchen, morning", "atmo kitchen morning", "07:00"},
};

const std::vector<Cue> FirstMusic = {
    {"03:01:21:17", "96:19", "3M1 The key", "LW 3M1 v3 full", "00:00"},
    {"03:06:12:10", "42:20", "3M2 Going in", "LW 3M2 v2 full", "00:00"},
    {"03:10:27:02", "71:15", "3M3 The river, to the bridge", "LW 3M3 v5 full", "00:00"},
    {"03:11:38:17", "31:10", "3M3 The river, from the bridge", "LW 3M3 v5 full", "74:02"},
    {"03:14:40:08", "52:12", "3M4 Sill", "LW 3M4 v2 full", "00:00"},
};

const std::vector<Cue> SecondMusic = {
    {"03:01:47:05", "71:07", "3M1 The key, strings", "LW 3M1 v3 strings", "25:12"},
    {"03:09:27:08", "51:10", "accordion on the barge", "LW source accordion", "18:00"},
    {"03:10:46:14", "83:13", "3M3 The river, drums", "LW 3M3 v5 drums", "19:12"},
    {"03:15:05:01", "28:00", "3M4 Sill, choir", "LW 3M4 v2 choir", "24:17"},
};

} // namespace

const std::vector<CueTrack>& cueTracks()
{
    static const std::vector<CueTrack> tracks = {
        {"FX 1", "Effects", HardEffects, WinchGroups},
        {"FX 2", "Effects", BoatEffects, ShotGroups},
        {"FX 3", "Effects", WaterEffects, {}},
        {"Feet", "Foley", Feet, StairGroups},
        {"Props", "Foley", Props, LedgerGroups},
        {"ATM 1", "Atmospheres", FirstAtmospheres, {}},
        {"ATM 2", "Atmospheres", SecondAtmospheres, {}},
        {"MX 1", "Music", FirstMusic, {}},
        {"MX 2", "Music", SecondMusic, {}},
    };
    return tracks;
}

const std::vector<Cue>& dialogueCues()
{
    static const std::vector<Cue> cues = {
        {"03:01:45:00", "07:08", "room tone 42", "room tone 42", "03:00"},
        {"03:02:43:07", "06:12", "Tobias: I never had it", "ADR Tobias 42 take 4", "02:06"},
        {"03:05:19:08", "03:04", "room tone 44", "room tone 44", "01:00"},
        {"03:07:55:18", "04:04", "room tone 45", "room tone 45", "10:00"},
        {"03:08:07:12", "05:10", "Maren: it is not in this one", "ADR Maren 45 take 2", "01:18"},
        {"03:09:03:20", "04:06", "room tone 45", "room tone 45", "22:00"},
        {"03:11:13:12", "01:22", "Pip: left, left!", "ADR Pip 47 take 6", "00:12"},
        {"03:12:45:20", "03:22", "Maren: breathe with me", "ADR Maren 48 take 3", "04:00"},
        {"03:14:40:04", "08:20", "room tone 50", "room tone 50", "00:12"},
    };
    return cues;
}

} // namespace reel3
