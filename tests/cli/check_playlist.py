#!/usr/bin/env python3
"""Reads an M3U8 playlist strictly and, when a player is given, lets it open every entry.

Usage: check_playlist.py PLAYLIST ENTRIES [MPV]
Strict: UTF-8 throughout, "#EXTM3U" first, a "#PLAYLIST:" name, then pairs of an
"#EXTINF:<seconds>,<artist> - <title>" line and a path relative to the playlist that names an
existing file. With MPV the player must open exactly ENTRIES files and exit cleanly.
"""
import os
import re
import subprocess
import sys


def fail(message):
    sys.exit(f"{sys.argv[1]}: {message}")


def main():
    playlist, expected = sys.argv[1], int(sys.argv[2])
    with open(playlist, "rb") as stream:
        data = stream.read()
    try:
        text = data.decode("utf-8", errors="strict")
    except UnicodeDecodeError as error:
        fail(f"not UTF-8: {error}")
    if not text.endswith("\n"):
        fail("the last line has no line end")
    lines = text[:-1].split("\n")
    if lines[0] != "#EXTM3U" or not lines[1].startswith("#PLAYLIST:") or len(lines[1]) == len("#PLAYLIST:"):
        fail("does not start with #EXTM3U and a #PLAYLIST: name")
    entries = lines[2:]
    if len(entries) % 2 != 0:
        fail("an #EXTINF line without its path")
    folder = os.path.dirname(playlist)
    for info, path in zip(entries[0::2], entries[1::2]):
        if not re.fullmatch(r"#EXTINF:\d+,.+ - .+", info):
            fail(f"not an #EXTINF line with length and artist - title: {info!r}")
        if os.path.isabs(path) or not os.path.isfile(os.path.join(folder, path)):
            fail(f"not a relative path to an existing file: {path!r}")
    if len(entries) // 2 != expected:
        fail(f"{len(entries) // 2} entries, not {expected}")

    if len(sys.argv) > 3:
        run = subprocess.run([sys.argv[3], "--no-config", "--quiet", "--ao=null", "--ao-null-untimed", "--vo=null",
                              "--end=0.05", "--term-playing-msg=PLAYING ${path}", playlist],
                             capture_output=True, text=True, errors="replace", timeout=120)
        opened = [line for line in run.stdout.splitlines() if line.startswith("PLAYING ")]
        if run.returncode != 0 or len(opened) != expected:
            fail(f"mpv opened {len(opened)} of {expected} entries (exit {run.returncode}):\n{run.stdout}{run.stderr}")
    print(f"{os.path.basename(playlist)}: {expected} entries" + (", all opened by mpv" if len(sys.argv) > 3 else ""))


main()
