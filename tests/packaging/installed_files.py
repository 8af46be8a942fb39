# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""What an installed tallowfen consists of, and a look at whether the files are what their places say."""
import gzip
import pathlib
import re
import struct

ICON_SIZES = (16, 22, 24, 32, 48, 64, 128, 256)
APP = "org.tallowfen.tallowfen"


class Failure(AssertionError):
    """What a test says when the tree is not as it must be."""


def expect(condition, text):
    if not condition:
        raise Failure(text)


def locales(source):
    return sorted(path.stem.removeprefix("tallowfen_") for path in (source / "share/translations").glob("*.ts"))


def common_files():
    """Paths below the prefix, the same for every way to install."""
    files = {"bin/tallowfen", f"share/applications/{APP}.desktop", f"share/metainfo/{APP}.metainfo.xml",
             f"share/mime/packages/{APP}.xml", "share/man/man1/tallowfen.1.gz",
             f"share/icons/hicolor/scalable/apps/{APP}.svg"}
    return files | {f"share/icons/hicolor/{n}x{n}/apps/{APP}.png" for n in ICON_SIZES}


def share_files(source):
    """Names in the share directory."""
    return {"type_string.ico", "type_binary.ico", "folder.png"} | {f"tallowfen_{name}.qm" for name in locales(source)}


def present(top):
    return {str(path.relative_to(top)) for path in top.rglob("*") if not path.is_dir()}


def expect_same(found, wanted):
    expect(found == wanted, f"missing: {sorted(wanted - found)}; unexpected: {sorted(found - wanted)}")


def png_size(path):
    head = path.read_bytes()[:24]
    expect(head[:8] == b"\x89PNG\r\n\x1a\n", f"{path} is no PNG")
    return struct.unpack(">II", head[16:24])


def check_contents(prefix, share, share_dir):
    for n in ICON_SIZES:
        path = prefix / f"share/icons/hicolor/{n}x{n}/apps/{APP}.png"
        expect(png_size(path) == (n, n), f"{path} is of another size")
    entry = (prefix / f"share/applications/{APP}.desktop").read_text(encoding="utf-8")
    expect(re.search(r"^Icon=(.*)$", entry, re.M).group(1) == APP, "the menu entry names another icon")
    expect(re.search(r"^TryExec=(.*)$", entry, re.M).group(1) == "tallowfen", "the menu entry names another program")
    manual = gzip.decompress((prefix / "share/man/man1/tallowfen.1.gz").read_bytes()).decode()
    expect(f".I {share_dir}\n" in manual, "the manual names another share directory")
    expect("@" not in manual, "the manual has a placeholder left")
    program = (prefix / "bin/tallowfen").read_bytes()
    expect(share_dir.encode() in program or share_dir.encode("utf-16-le") in program,
           "the program looks for its files in another directory")
    for path in share.glob("*.qm"):
        expect(path.read_bytes().startswith(b"\x3c\xb8\x64\x18"), f"{path} is no compiled translation")
    for path in share.glob("*.ico"):
        reserved, kind, count = struct.unpack("<HHH", path.read_bytes()[:6])
        expect((reserved, kind) == (0, 1) and count >= 3, f"{path} is no icon of several sizes")
