#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_load_order.py PROGRAM SHARE: which translation the program loads in which locale, read from the line it writes
at start: the share directory and the name of the locale that was loaded."""
import os
import subprocess
import sys

# LC_ALL, the locale that the program must say.
CASES = [
    ("de_DE.UTF-8", "de_DE"),
    ("de_AT.UTF-8", "de_AT"),  # served by the file for "de"
    ("pt_BR.UTF-8", "pt_BR"),
    ("pt_PT.UTF-8", "en_US"),  # the file for Brazil does not serve Portugal
    ("zh_TW.UTF-8", "zh_TW"),
    ("sv_SE.UTF-8", "en_US"),  # no file: the fallback
    ("en_GB.UTF-8", "en_US"),
    ("C", "en_US"),
]


def main():
    program, share = sys.argv[1:]
    failures = 0
    for locale, wanted in CASES:
        environment = {**os.environ, "LC_ALL": locale, "QT_LOGGING_TO_CONSOLE": "1", "QT_QPA_PLATFORM": "offscreen"}
        environment.pop("LANGUAGE", None)
        ended = subprocess.run([program], env=environment, text=True, capture_output=True)
        lines = ended.stderr.splitlines()
        if ended.returncode != 1 or share + wanted not in lines:
            failures += 1
            print(f"{locale}: wanted the line {share + wanted!r}, status 1; got status {ended.returncode}, {lines}")
    if failures:
        sys.exit(1)
    print(f"{len(CASES)} locales")


if __name__ == "__main__":
    main()
