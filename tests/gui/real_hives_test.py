# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""The gestures that change a file, on scratch copies of real hives."""
from session import Session, equal, real_hive, run, step, text_data

# A hive with "lh" leaves, an older one with "lf" leaves, and one with keys named in UTF-16.
HIVES = ("system-xp", "software-nt4", "ntuser-7")
LARGEST_TABLE = 40


def simple(text):
    """A name that the window shows as it stands and that leads to one key."""
    return text.isascii() and text.isprintable() and text.strip() == text and text


def choose_key(state):
    """The first key, two or three below the root, with values, plain names on its way and few neighbours."""
    for path, values in state.items():
        if len(path) not in (2, 3) or not 2 <= len(values) <= LARGEST_TABLE or not all(map(simple, path)):
            continue
        levels = [below(state, path[:depth]) for depth in range(len(path) + 1)]
        if sum(map(len, levels)) < 120 and len({each.lower() for each in levels[-1]}) == len(levels[-1]):
            return list(path)
    raise AssertionError("no key to try the gestures on")


def below(state, path):
    return [each[-1] for each in state if len(each) == len(path) + 1 and each[: len(path)] == tuple(path)]


def gestures(session):
    program = session.program
    key = choose_key(session.state)
    step(f"a key with {len(session.state[tuple(key)])} values")
    session.open_key(key)
    equal(session.status(), "\\".join(session.root + key), "the status bar")
    for depth in range(len(key)):
        shown = program.child_names(session.tree, session.root + key[:depth])
        equal(shown, below(session.state, key[:depth]), f"the keys at depth {depth}")
    stored = session.state[tuple(key)]
    equal(session.names()[1:], sorted((each for each in stored if each), key=str.lower), "the names in the table")

    made = key + ["tallowfen made this"]
    program.right_click(session.cell(key))
    program.pick_context("New", "Key")
    program.editor()
    session.key_made("a new key", key + ["New Key #1"])
    session.fill_editor(made[-1])
    session.key_renamed("naming it", key + ["New Key #1"], made[-1])
    session.selected(made)

    program.right_click(session.empty_place())
    program.pick_context("New", "String Value")
    program.editor()
    session.value_set("a new value", made, "New Value #1", 1, text_data(""))
    session.fill_editor("Name")
    session.value_renamed("naming it", made, "New Value #1", "Name")
    program.double_click(session.value_cell("Name"))
    dialog = program.dialog("Edit String")
    program.type("data")
    program.keys("Return")
    program.gone(dialog)
    session.value_set("editing it", made, "Name", 1, text_data("data"))

    program.click(session.value_cell("Name"))
    program.keys("Delete")
    session.message("Confirm Value Removal", "Are you sure you want to delete this value?", "Yes")
    session.value_gone("deleting the value", made, "Name")
    session.click_key(made)
    program.keys("Delete")
    session.message("Confirm Key Removal", "Are you sure you want to delete this key and its subkeys?", "Yes")
    session.key_gone("deleting the key", made)

    text = next((each for each, (kind, data) in stored.items() if each and kind == 1 and data), None)
    if text is not None:
        session.click_key(key)
        program.double_click(session.value_cell(text))
        dialog = program.dialog("Edit String")
        program.keys("ctrl+a")
        program.type("another text, longer than the one that stood here before it")
        program.keys("Return")
        program.gone(dialog)
        wanted = text_data("another text, longer than the one that stood here before it")
        session.value_set("editing a value that was there", key, text, 1, wanted)

    program.keys("ctrl+f")
    dialog = program.dialog("Find")
    program.type(key[-1])
    program.keys("Return")
    found = [list(each) for each in session.state if each and key[-1].lower() in each[-1].lower()]
    session.selected(found[0])
    session.unchanged("finding")


def real_hives(scratch):
    """Real hives"""
    left_out = 0
    for hive in HIVES:
        path = real_hive(scratch, hive)
        if path is None:
            left_out += 1
            continue
        step(hive)
        with Session(path) as session:
            gestures(session)
            session.leave()
            session.unchanged("the end")
    if left_out:
        print(f"{left_out} of {len(HIVES)} real hives left out; the made hive's tests prove the same")


run(real_hives)
