#!/usr/bin/env python3
"""Plays a recording into a file system in memory that is too small for it, then into the same one made wide.

Every row is either stored or told as failed, the file stays sound, and what is played once there is room is stored
whole. Needs the right to mount (root, or user namespaces), so it is no part of the test command.

    tests/faults/small_tmpfs.py [folder of the programs]     # build/release/bin
"""

import contextlib
import json
import os
import pathlib
import sqlite3
import subprocess
import sys
import tempfile

TREE = pathlib.Path(__file__).resolve().parents[2]
RECORDING = TREE / "resources/recordings/ice.jsonl"
SIZES_KB = [4, 64, 128, 300, 1024, 4096, 4160, 4224, 4300, 4400, 4500]  # SQLite folds its journal back at 4 MB
ENOUGH_KB = 65536


def play(tool: pathlib.Path, documents: pathlib.Path) -> dict:
    run = subprocess.run(
        [tool, "replay", "--chipset", "ice15", "--documents", documents, "--rebase-time", RECORDING],
        capture_output=True, text=True, check=False)
    if run.returncode not in (0, 1):
        sys.exit(f"quorl-tool ended with {run.returncode}: {run.stderr}")
    return json.loads(run.stdout)


def stored(documents: pathlib.Path) -> int:
    with contextlib.closing(sqlite3.connect(documents / "metricPartV11.sqlite")) as database:
        (verdict,) = database.execute("PRAGMA integrity_check").fetchone()
        if verdict != "ok":
            sys.exit(f"the database is damaged: {verdict}")
        if not database.execute("SELECT 1 FROM sqlite_master WHERE name = 'Metric'").fetchone():
            return 0
        return database.execute("SELECT count(*) FROM Metric").fetchone()[0]


def mount(folder: pathlib.Path, size_kb: int, *options: str) -> None:
    subprocess.run(["mount", "-t", "tmpfs", "-o", ",".join([f"size={size_kb}k", *options]), "tmpfs", folder], check=True)


def fill(tool: pathlib.Path, folder: pathlib.Path, size_kb: int, rows: int) -> None:
    mount(folder, size_kb)
    documents = folder / "documents"
    documents.mkdir(mode=0o700)
    full = play(tool, documents)
    kept, lost = full["rowsInserted"], full["insertsFailed"]
    if kept + lost != rows:
        sys.exit(f"{size_kb} KB: of {rows} rows {kept} are told as stored and {lost} as failed")
    mount(folder, ENOUGH_KB, "remount")
    if stored(documents) != kept:
        sys.exit(f"{size_kb} KB: {kept} rows are told as stored, {stored(documents)} are there")
    wide = play(tool, documents)
    if wide["insertsFailed"] or stored(documents) != kept + rows:
        sys.exit(f"{size_kb} KB: with room again {stored(documents)} rows are there, not {kept} and {rows}")
    print(f"{size_kb:6} KB: {kept:5} rows stored, {lost:5} told as failed; {rows} more with room again")
    subprocess.run(["umount", folder], check=True)


def main() -> None:
    if "--mounting" not in sys.argv:
        rights = [] if os.geteuid() == 0 else ["--map-root-user"]
        os.execvp("unshare", ["unshare", "--mount", *rights, sys.executable, __file__, *sys.argv[1:], "--mounting"])
    folders = [argument for argument in sys.argv[1:] if argument != "--mounting"]
    tool = pathlib.Path(folders[0] if folders else TREE / "build/release/bin").resolve() / "quorl-tool"
    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)
        mount(folder, ENOUGH_KB)
        rows = play(tool, folder / "documents")["rowsInserted"]
        subprocess.run(["umount", folder], check=True)
        for size_kb in SIZES_KB:
            fill(tool, folder, size_kb, rows)


if __name__ == "__main__":
    main()
