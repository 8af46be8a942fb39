#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_debian.py CMAKE SOURCE: builds the Debian package with the documented commands, has lintian read it, installs
it into a scratch root, runs the program from there, and removes it again without a trace."""
import os
import pathlib
import subprocess
import sys
import tempfile

import installed_files as installed


def run(*command, **options):
    return subprocess.run([str(word) for word in command], check=True, text=True, **options)


def build_package(cmake, source):
    output = {"stdout": subprocess.DEVNULL, "cwd": source}
    run(cmake, "--preset", "deb", **output)
    for old in (source / "build/deb").glob("*.deb"):
        old.unlink()
    run(cmake, "--build", "--preset", "deb", "--target", "package", **output)
    packages = list((source / "build/deb").glob("*.deb"))
    installed.expect(len(packages) == 1, f"one package was asked for, these were made: {packages}")
    return packages[0]


def packages_of_group(source, group):
    lines = (line.split() for line in (source / "tools/packages.txt").read_text().splitlines())
    return {words[1] for words in lines if words[:1] == [group]}


def recommended(package):
    field = run("dpkg-deb", "--field", package, "Recommends", stdout=subprocess.PIPE).stdout
    return {name.strip() for name in field.split(",")}


def dpkg(root, *words):
    # Only this package goes into the scratch root, so that its dependencies cannot be met there.
    run("dpkg", f"--root={root}", "--force-not-root", "--force-depends", "--log=/dev/null", *words,
        stdout=subprocess.DEVNULL, stderr=subprocess.STDOUT,
        env={**os.environ, "PATH": os.environ["PATH"] + ":/usr/sbin:/sbin"})


def main():
    cmake, source = sys.argv[1], pathlib.Path(sys.argv[2])
    package = build_package(cmake, source)
    run("lintian", "--allow-root", "--fail-on", "error,warning", package)
    # What is installed here to run the program is what a user of the package gets.
    installed.expect_same(recommended(package), packages_of_group(source, "run"))
    with tempfile.TemporaryDirectory(prefix="tallowfen-root-") as scratch:
        root = pathlib.Path(scratch)
        for name in ("var/lib/dpkg/info", "var/lib/dpkg/updates", "var/lib/dpkg/triggers"):
            (root / name).mkdir(parents=True)
        for name in ("var/lib/dpkg/status", "var/lib/dpkg/available"):
            (root / name).touch()
        dpkg(root, "--install", package)
        wanted = installed.common_files() | {"share/doc/tallowfen/copyright", "share/doc/tallowfen/changelog.gz"}
        wanted |= {"share/tallowfen/" + name for name in installed.share_files(source)}
        installed.expect_same(installed.present(root / "usr"), wanted)
        installed.check_contents(root / "usr", root / "usr/share/tallowfen", "/usr/share/tallowfen/")

        ended = subprocess.run([root / "usr/bin/tallowfen"], text=True, capture_output=True)
        installed.expect(ended.returncode == 1 and "usage: tallowfen [NAME FILE ...]\n" in ended.stderr,
                         f"the installed program did not run: {ended}")
        dpkg(root, "--purge", "tallowfen")
        installed.expect(not (root / "usr").exists() or not installed.present(root / "usr"), "files were left behind")
    print(f"{package.name}: {len(wanted)} files, checked, installed, run, removed")


if __name__ == "__main__":
    main()
