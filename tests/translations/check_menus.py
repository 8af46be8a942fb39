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
import time
import warnings

import translation_files

warnings.filterwarnings("ignore", category=DeprecationWarning)
import gi  # noqa: E402

gi.require_version("Atspi", "2.0")
from gi.repository import Atspi, GLib  # noqa: E402

TITLES = ["&File", "&Edit", "&View"]
# Every entry below the titles, in the order of the window, the "New" menu's own inside it.
ENTRIES = ["Exit", "&New", "Key", "String Value", "Binary Value", "DWORD (32-bit) Value", "QWORD (64-bit) Value",
           "Multi-String Value", "Expandable String Value", "Delete", "Rename", "Find...", "Find next", "Refresh"]
DEFAULT_REGION = {"de": "de_DE", "es": "es_ES", "fr": "fr_FR", "it": "it_IT", "ja": "ja_JP", "ko": "ko_KR",
                  "nl": "nl_NL", "pl": "pl_PL", "ru": "ru_RU", "tr": "tr_TR", "uk": "uk_UA"}


def until(condition, what, timeout=20):
    end = time.monotonic() + timeout
    while time.monotonic() < end:
        try:
            value = condition()
        except GLib.Error:
            value = None
        if value:
            return value
        time.sleep(0.02)
    raise AssertionError(f"waited {timeout} s for {what}")


def children(thing):
    return [thing.get_child_at_index(i) for i in range(thing.get_child_count())]


def find(thing, role):
    if thing.get_role_name() == role:
        return thing
    for child in children(thing):
        found = child and find(child, role)
        if found:
            return found
    return None


def menu_bar(process):
    for program in children(Atspi.get_desktop(0)):
        if program and program.get_process_id() == process:
            return find(program, "menu bar")
    return None


def texts_below(thing):
    texts = []
    for child in children(thing):
        name = child.get_name()
        if name and child.get_role_name() != "popup menu" and child.get_role_name() != "separator":
            texts.append(name)
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


def check(program, hive, path):
    locale = path.stem.removeprefix("tallowfen_")
    titles, entries = wanted_texts(path)
    environment = {**os.environ, "LC_ALL": DEFAULT_REGION.get(locale, locale) + ".UTF-8"}
    environment.pop("LANGUAGE", None)
    with subprocess.Popen([program, "Sample/SYSTEM", hive], env=environment, stderr=subprocess.DEVNULL) as process:
        try:
            bar = until(lambda: menu_bar(process.pid), f"the menu bar under {locale}")
            until(lambda: [child.get_name() for child in children(bar)] == titles,
                  f"the titles {titles} under {locale}; there are {[c.get_name() for c in children(bar)]}")
            below = [text for title in children(bar) for text in texts_below(title)]
            assert below == entries, f"under {locale} the menus hold {below}, wanted {entries}"
        finally:
            process.terminate()


def main():
    program, make_sample_hive, translations = sys.argv[1:]
    Atspi.init()
    Atspi.set_timeout(10000, 15000)
    files = sorted(pathlib.Path(translations).glob("*.ts"))
    with tempfile.TemporaryDirectory(prefix="tallowfen-menus-") as scratch:
        hive = os.path.join(scratch, "SYSTEM")
        subprocess.run([make_sample_hive, hive], check=True)
        for path in files:
            check(program, hive, path)
    print(f"the menus in {len(files)} languages")


if __name__ == "__main__":
    main()
