#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_menus.py PROGRAM MAKE_SAMPLE_HIVE TRANSLATIONS: starts the program in a real window under each locale that has
a translation, reads its menus over the accessibility bus and compares them with the translation's source."""
import os
import pathlib
import subprocess
import sys
import tempfile

import translation_files

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parent.parent / "gui"))
from desktop import Program, children, name, role, until  # noqa: E402

TITLES = ["&File", "&Edit", "&View"]
# Every entry below the titles, in the order of the window, the "New" menu's own inside it.
ENTRIES = ["Exit", "&New", "Key", "String Value", "Binary Value", "DWORD (32-bit) Value", "QWORD (64-bit) Value",
           "Multi-String Value", "Expandable String Value", "Delete", "Rename", "Find...", "Find next", "Refresh"]
DEFAULT_REGION = {"de": "de_DE", "es": "es_ES", "fr": "fr_FR", "it": "it_IT", "ja": "ja_JP", "ko": "ko_KR",
                  "nl": "nl_NL", "pl": "pl_PL", "ru": "ru_RU", "tr": "tr_TR", "uk": "uk_UA"}


def texts_below(thing):
    texts = []
    for child in children(thing):
        if name(child) and role(child) not in ("popup menu", "separator"):
            texts.append(name(child))
        texts += texts_below(child)
    return texts


def wanted_texts(path):
    by_source = {(m.source, m.comment): m.translation for m in translation_files.read(path)
                 if m.context == "MainWindow"}

    def shown(source, comment):
        return by_source[source, comment].replace("&", "")

    titles = [shown(source, "menu title") for source in TITLES]
    entries = [shown(source, "menu title" if "&" in source else "menu item") for source in ENTRIES]
    return titles, entries


def check(program, hive, path, log):
    locale = path.stem.removeprefix("tallowfen_")
    titles, entries = wanted_texts(path)
    environment = {**os.environ, "LC_ALL": DEFAULT_REGION.get(locale, locale) + ".UTF-8"}
    environment.pop("LANGUAGE", None)
    running = Program([program, "Sample/SYSTEM", hive], log, environment)
    try:
        bar = running.find(None, kind="menu bar")
        until(lambda: [name(child) for child in children(bar)] == titles, f"the titles {titles} under {locale}")
        below = [text for title in children(bar) for text in texts_below(title)]
        assert below == entries, f"under {locale} the menus hold {below}, wanted {entries}"
    finally:
        running.end()


def main():
    program, make_sample_hive, translations = sys.argv[1:]
    files = sorted(pathlib.Path(translations).glob("*.ts"))
    with tempfile.TemporaryDirectory(prefix="tallowfen-menus-") as scratch:
        hive = os.path.join(scratch, "SYSTEM")
        subprocess.run([make_sample_hive, hive], check=True)
        for path in files:
            check(program, hive, path, os.path.join(scratch, "log"))
    print(f"the menus in {len(files)} languages")


if __name__ == "__main__":
    main()
