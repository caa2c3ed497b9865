#!/usr/bin/env python3
"""Checks the arrows between the folders of src/: who may include whom, where Qt may stand, and that no two files
include each other in a circle. Prints one line for each breach and ends with 1 when there is any."""

import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
SRC = ROOT / "src"

# What a folder may include of the project, itself aside. Folders that are not named may include everything in src/
# but hosts/.
ALLOWED = {
    "base": set(),
    "platform": {"base"},
    "messages": {"base"},
}
LEAVES = {"shell/LogCategories.h", "shell/NotificationNames.h", "shell/AnalyticsNames.h"}
INCLUDE = re.compile(r'^\s*#\s*include\s+(["<])([^">]+)[">]')


def sources(folder):
    return sorted(p for p in folder.rglob("*") if p.suffix in (".h", ".cpp"))


def includes(path):
    for number, line in enumerate(path.read_text(encoding="utf-8").splitlines(), 1):
        match = INCLUDE.match(line)
        if match:
            yield number, match.group(1) == '"', match.group(2)


def may_use_qt(relative):
    return "view" in relative.parts[:-1] or relative.parts[:2] == ("hosts", "desktop")


def check_file(path, breaches):
    relative = path.relative_to(SRC)
    name = relative.as_posix()
    layer = relative.parts[0]
    for number, is_own, target in includes(path):
        where = f"src/{name}:{number}"
        if re.match(r"Q[A-Z]|Qt", target) and not may_use_qt(relative):
            breaches.append(f"{where}: Qt outside a view/ folder and hosts/desktop/")
        if not is_own:
            continue
        if name in LEAVES:
            breaches.append(f"{where}: a leaf header of names includes something")
        first = target.split("/")[0]
        if first == "hosts" and layer != "hosts":
            breaches.append(f"{where}: only executables and tests include hosts/")
        if layer in ALLOWED and "/" in target and first != layer and first not in ALLOWED[layer]:
            breaches.append(f"{where}: {layer}/ may not include {first}/")


def own_includes(path):
    for _, is_own, target in includes(path):
        found = SRC / target
        if is_own and found.exists():
            yield found


def check_circles(breaches):
    """A .cpp and its header are one unit. Where two objects know each other by design, one side has to know the
    other's abstract face, in a file of its own."""
    graph = {}
    for path in sources(SRC):
        unit = path.with_suffix("")
        graph.setdefault(unit, set()).update(t.with_suffix("") for t in own_includes(path))
    state = {}

    def visit(unit, trail):
        state[unit] = "open"
        for target in sorted(graph.get(unit, set()) - {unit}):
            if state.get(target) == "open":
                circle = trail[trail.index(target) :] + [target]
                breaches.append("include circle: " + " -> ".join(u.relative_to(SRC).as_posix() for u in circle))
            elif target not in state:
                visit(target, trail + [target])
        state[unit] = "done"

    for unit in sorted(graph):
        if unit not in state:
            visit(unit, [unit])


def main():
    breaches = []
    for path in sources(SRC):
        check_file(path, breaches)
    check_circles(breaches)
    for breach in breaches:
        print(breach)
    print(f"layers: {len(breaches)} breaches in {len(sources(SRC))} files")
    return 1 if breaches else 0


if __name__ == "__main__":
    sys.exit(main())
