#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_install.py CMAKE BUILD PREFIX SHARE SOURCE: installs the build into a scratch directory and compares the tree
with what a desktop looks for, file by file."""
import os
import pathlib
import subprocess
import sys
import tempfile

import installed_files as installed


def below(top, absolute):
    return top / str(absolute).lstrip("/")


def main():
    cmake, build, prefix, share_dir, source = sys.argv[1:]
    source = pathlib.Path(source)
    with tempfile.TemporaryDirectory(prefix="tallowfen-install-") as scratch:
        top = pathlib.Path(scratch)
        subprocess.run([cmake, "--install", build], check=True, stdout=subprocess.DEVNULL,
                       env={**os.environ, "DESTDIR": scratch})
        prefix_here, share_here = below(top, prefix), below(top, share_dir)
        wanted = {str((prefix_here / name).relative_to(top)) for name in installed.common_files() |
                  {"share/doc/tallowfen/LICENSE", "share/doc/tallowfen/CHANGELOG.md"}}
        wanted |= {str((share_here / name).relative_to(top)) for name in installed.share_files(source)}
        installed.expect_same(installed.present(top), wanted)
        installed.check_contents(prefix_here, share_here, share_dir)
        print(f"{len(wanted)} files, each where it belongs")


if __name__ == "__main__":
    main()
