#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""check_translations.py LUPDATE SOURCES TRANSLATIONS: every text in the program's sources has a finished translation
in every file, placeholders and accelerators are kept, and no two titles of one menu share an accelerator."""
import pathlib
import re
import subprocess
import sys
import tempfile

import translation_files

WANTED = set("de en_US es fr it ja ko nl pl pt_BR ru tr uk zh_CN zh_TW".split())
# Titles that stand in one menu, each list a menu; only titles with an accelerator in the sources need to be here.
MENUS = [["&File", "&Edit", "&View"], ["&New"]]


def key(message):
    return message.context, message.source, message.comment


def placeholders(text):
    return sorted(re.findall(r"%(?:L?\d+|n)", text))


def accelerators(text):
    return re.findall(r"&(.)", text.replace("&&", ""))


def problems_of_message(message):
    if message.state is not None:
        yield f"is {message.state}"
    if not message.translation.strip():
        yield "has no translation"
        return
    if placeholders(message.source) != placeholders(message.translation):
        yield f"changes a placeholder: {message.translation!r}"
    if len(accelerators(message.source)) != len(accelerators(message.translation)):
        yield f"loses, gains or doubles an accelerator: {message.translation!r}"
    if message.source.endswith("...") != message.translation.endswith("..."):
        yield f"loses or gains the dots at its end: {message.translation!r}"


def problems_of_menus(messages):
    titles = {m.source: m.translation for m in messages if m.context == "MainWindow" and m.comment == "menu title"}
    for menu in MENUS:
        used = {}
        for source in menu:
            letter = "".join(accelerators(titles.get(source, ""))).casefold()
            if letter in used:
                yield f"{source!r} and {used[letter]!r} share the accelerator {letter!r}"
            used[letter] = source
    listed = {source for menu in MENUS for source in menu}
    for message in messages:
        if accelerators(message.source) and message.source not in listed:
            yield f"{message.source!r} has an accelerator and stands in no menu of this test"


def problems_of_default_name(messages):
    # The table puts the row of this name first, and two classes give it.
    names = {m.translation for m in messages if m.source == "(Default)"}
    if len(names) > 1:
        yield f"the default value has more than one name: {sorted(names)}"


def problems_of_file(name, messages, sources):
    """What is wrong with one file, as lines; sources are the keys that the program's sources give."""
    found = [f"{name}: {text}" for text in [*problems_of_menus(messages), *problems_of_default_name(messages)]]
    for message in messages:
        found += [f"{name}: {key(message)} {text}" for text in problems_of_message(message)]
        if name == "tallowfen_en_US.ts" and message.translation != message.source:
            found.append(f"{name}: {key(message)} is not left as it is")
    keys = [key(message) for message in messages]
    found += [f"{name}: {k} stands there twice" for k in sorted(set(keys), key=str) if keys.count(k) > 1]
    found += [f"{name}: {k} is missing" for k in sorted(sources - set(keys), key=str)]
    found += [f"{name}: {k} is in no source" for k in sorted(set(keys) - sources, key=str)]
    return found


def texts_in(lupdate, sources):
    with tempfile.TemporaryDirectory() as scratch:
        template = pathlib.Path(scratch) / "template.ts"
        subprocess.run([lupdate, "-silent", sources, "-ts", template], check=True)
        return {key(message) for message in translation_files.read(template)}


def main():
    lupdate, sources, translations = sys.argv[1:]
    texts = texts_in(lupdate, sources)
    if len(texts) < 60:
        sys.exit(f"only {len(texts)} texts were found in {sources}")
    files = sorted(pathlib.Path(translations).glob("*.ts"))
    names = {path.stem.removeprefix("tallowfen_") for path in files}
    problems = [f"no file for {name}" for name in sorted(WANTED - names)]
    for path in files:
        problems += problems_of_file(path.name, translation_files.read(path), texts)
    if problems:
        sys.exit("\n".join(problems))
    print(f"{len(texts)} texts in {len(files)} languages")


if __name__ == "__main__":
    main()
