# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""Find, find next and a search that is cancelled."""
import fnmatch
import os

from desktop import State, has, text_of, until
from session import TITLE, Session, equal, make_sample, run, step

KEYS = "Find keys"
VALUES = "Find values"
SUBSTRING = "Find substring"
WHOLE = "Find whole string"
WILDCARDS = "Use wildcards"


def matcher(term, kind):
    term = term.lower()
    if kind == WHOLE:
        return lambda text: text.lower() == term
    if kind == WILDCARDS:
        return lambda text: fnmatch.fnmatchcase(text.lower(), term)
    return lambda text: term in text.lower()


def expected_hits(session, term, boxes, kind):
    """(path, value or None) in the order of the search: a key, its values by name, its subkeys."""
    matches = matcher(term, kind)
    hits = []
    tree = [(session.root[:1], None), (session.root, None)]
    tree += [(session.root + list(path), values) for path, values in session.state.items() if path]
    for path, values in tree:
        if KEYS in boxes and matches(path[-1]):
            hits.append((path, None))
        if VALUES in boxes and values is not None:
            for value in ["(Default)"] + sorted((each for each in values if each), key=str.lower):
                if matches(value):
                    hits.append((path, value))
    return hits


def ask(session, term, boxes, kind, picture=None):
    """Fills the open find dialog and accepts it."""
    program = session.program
    dialog = program.dialog("Find")
    program.keys("ctrl+a")
    program.type(term)
    until(lambda: text_of(program.fields(dialog)[0]) == term, "the term")
    for text in (KEYS, VALUES):
        box = program.button(dialog, text)
        if has(box, State.CHECKED) != (text in boxes):
            program.click(box)
            until(lambda: has(box, State.CHECKED) == (text in boxes), f"the box {text!r}")
    radio = program.button(dialog, kind)
    program.click(radio)
    until(lambda: has(radio, State.CHECKED), f"{kind!r}")
    if picture:
        session.picture(picture, dialog)
    program.click(program.button(dialog, "OK"))


def selected_value(session):
    for row, texts in enumerate(session.rows()):
        if has(session.program.table_cell(session.table, row), State.SELECTED):
            return texts[0]
    return None


def search_through(session, term, boxes, kind):
    """Every hit in turn, then the message that there are no more."""
    program = session.program
    hits = expected_hits(session, term, boxes, kind)
    step(f"{term!r}, {kind}, {' and '.join(boxes)}: {len(hits)} hits")
    program.pick("Edit", "Find...")
    ask(session, term, boxes, kind, picture=f"dialog-find-{len(boxes)}")
    for path, value in hits:
        until(lambda: session.status() == "\\".join(path), f"the hit {path} in the status bar")
        until(lambda: program.selected_path(session.tree) == path, f"the hit {path} in the tree")
        if value is not None:
            until(lambda: selected_value(session) == value, f"the hit {value!r} of {path} in the table")
        program.alone(TITLE)
        program.keys("F3")
    session.message(TITLE, "Finished searching.", "OK", "finished-searching")

    # Then the dialog comes again, with what was asked.
    program.keys("F3")
    dialog = program.dialog("Find")
    equal(text_of(program.fields(dialog)[0]), term, "the term that is kept")
    for text in (KEYS, VALUES):
        equal(has(program.button(dialog, text), State.CHECKED), text in boxes, text)
    equal(has(program.button(dialog, kind), State.CHECKED), True, kind)
    program.click(program.button(dialog, "Cancel"))
    program.gone(dialog)


def finding(scratch):
    """Searches of three kinds, each hit in its order"""
    with Session(make_sample(os.path.join(scratch, "SYSTEM"))) as session:
        program = session.program
        program.pick("Edit", "Find next")
        dialog = program.dialog("Find")
        equal(
            [has(program.button(dialog, each), State.CHECKED) for each in (KEYS, VALUES, SUBSTRING, WHOLE, WILDCARDS)],
            [True, False, True, False, False],
            "the dialog before any search",
        )
        program.keys("Escape")
        program.gone(dialog)
        search_through(session, "Computername", [KEYS, VALUES], WHOLE)
        search_through(session, "*e?v*", [KEYS], WILDCARDS)
        search_through(session, "START", [VALUES], SUBSTRING)
        search_through(session, "is nowhere", [KEYS, VALUES], SUBSTRING)
        session.unchanged("searching")


def cancelling(scratch):
    """A long search, cancelled by its button and by Escape"""
    with Session(make_sample(os.path.join(scratch, "SYSTEM"), extra_keys=160000)) as session:
        program = session.program
        session.open_key(["Select"])
        before = (program.tree_rows(session.tree), session.rows(), session.status())
        for way in ("Cancel", "Escape"):
            program.keys("ctrl+f")
            ask(session, "is nowhere", [KEYS, VALUES], SUBSTRING)
            searching = program.dialog("Searching...")
            equal(program.labels(searching), ["Searching..."], "its text")
            if way == "Cancel":
                session.picture("dialog-searching", searching)
                program.click(program.button(searching, "Cancel"))
            else:
                program.keys("Escape")
            program.gone(searching)
            program.alone(TITLE)
            equal((program.tree_rows(session.tree), session.rows(), session.status()), before, "tree and table")
            program.keys("F3")
            dialog = program.dialog("Find")
            program.keys("Escape")
            program.gone(dialog)
        session.unchanged("cancelled searches")


run(finding, cancelling)
