#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""Draws the bitmaps that are kept beside their SVG sources: the two .ico files of the values table, the folder
of the key tree, and the program's own icon in the sizes of the hicolor theme. Run it by hand after a change to a drawing; it needs rsvg-convert."""

import pathlib
import struct
import subprocess

HERE = pathlib.Path(__file__).resolve().parent
PROGRAM_ICON = HERE.parent.parent / "packaging" / "icons" / "org.tallowfen.tallowfen.svg"
ICO_SIZES = (16, 24, 32, 48, 64)
THEME_SIZES = (16, 22, 24, 32, 48, 64, 128, 256)


def png(source, size):
    command = ["rsvg-convert", "--width", str(size), "--height", str(size), str(source)]
    return subprocess.run(command, check=True, stdout=subprocess.PIPE).stdout


def ico(pictures):
    """An .ico file of PNG pictures: a head of 6 bytes, 16 bytes for each picture, then the pictures themselves."""
    head = struct.pack("<HHH", 0, 1, len(pictures))
    position = len(head) + 16 * len(pictures)
    entries = b""
    for size, data in pictures:
        entries += struct.pack("<BBBBHHII", size, size, 0, 0, 1, 32, len(data), position)
        position += len(data)
    return head + entries + b"".join(data for _, data in pictures)


def main():
    for name in ("type_string", "type_binary"):
        pictures = [(size, png(HERE / f"{name}.svg", size)) for size in ICO_SIZES]
        (HERE / f"{name}.ico").write_bytes(ico(pictures))
    (HERE / "folder.png").write_bytes(png(HERE / "folder.svg", 48))
    for size in THEME_SIZES:
        (PROGRAM_ICON.parent / f"{size}x{size}.png").write_bytes(png(PROGRAM_ICON, size))


if __name__ == "__main__":
    main()
