#!/usr/bin/env python3
"""Writes appdata/Pintrel/zones.txt, the zone list of the localization tool,
from the State Plane zones of appdata/zones.ini: one line per SPCS code,
"CODE name", the NAD 83 name first. Run from the repository root."""
import re

NOTE = """# Zones of the localization tool (Local.EXE): the SPCS code in the first
# four characters, then the zone. The tool finds the zone in zones.ini by its
# code: in "State Plane 1927" for the datum year 1927, else in
# "State Plane 1983". Made by scripts/make-tool-zones.py from zones.ini.
"""

names = {}
with open("appdata/zones.ini", encoding="utf-8", errors="replace") as f:
    for line in f:
        if not line.startswith("["):
            continue
        system, _, zone = line.strip()[1:-1].partition("~")
        match = re.match(r"(.*) (\d{4})$", zone.strip())
        if system.strip().startswith("State Plane") and match:
            names.setdefault(match.group(2), {})[system.strip()[-4:]] = match.group(1)

lines = []
for code in sorted(names):
    by_year = names[code]
    nad83, nad27 = by_year.get("1983"), by_year.get("1927")
    if nad83 and nad27:
        text = nad83 if nad83 == nad27 else f"{nad83} (NAD 27: {nad27})"
    else:
        text = f"{nad83} (NAD 83 only)" if nad83 else f"{nad27} (NAD 27 only)"
    lines.append(f"{code} {text}")

with open("appdata/Pintrel/zones.txt", "w", newline="\r\n") as f:
    f.write(NOTE + "\n".join(lines) + "\n")
