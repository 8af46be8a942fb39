# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""A user with a mouse on a made hive: every gesture, and the file after each."""
import os

from desktop import Failure, State, has, name, place, text_of, until, xdotool
from session import NEW_VALUE_KINDS, TITLE, Session, equal, list_data, make_sample, run, step, text_data

CONTROL = ["ControlSet001", "Control"]
TYPES = CONTROL + ["Value Types"]
MADE = CONTROL + ["Made by hand"]
DELETE_KEY = ("Confirm Key Removal", "Are you sure you want to delete this key and its subkeys?")
DELETE_VALUE = ("Confirm Value Removal", "Are you sure you want to delete this value?")

MARKUP = "Some <b>text</b>"
SCRIPTS = "Gr\u00fc\u00dfe \u041f\u0440\u0438\u0432\u0435\u0442 \u65e5\u672c\u8a9e \U0001f5c2"

# What each kind of new value holds before it is edited, how it is edited, and what it holds then.
KINDS = (
    # menu text, type, empty data, dialog, typed text, stored data, shown
    ("String Value", 1, text_data(""), "Edit String", MARKUP, text_data(MARKUP), MARKUP),
    ("Binary Value", 3, b"", "Edit Binary Value", "0A0b", b"\x0a\x0b", "0a 0b"),
    ("DWORD (32-bit) Value", 4, bytes(4), "Edit DWORD (32-bit) Value", "DEADBEEF", b"\xef\xbe\xad\xde", "0xdeadbeef (3735928559)"),
    ("QWORD (64-bit) Value", 11, bytes(8), "Edit QWORD (64-bit) Value", "ff", b"\xff" + bytes(7), "0x00000000000000ff (255)"),
    ("Multi-String Value", 7, bytes(4), "Edit Multi-String", "one\ntwo", list_data(["one", "two"]), "one two"),
    ("Expandable String Value", 2, text_data(""), "Edit String", "%TEMP%", text_data("%TEMP%"), "%TEMP%"),
)


def look_around(session):
    """The window as it opens, its menus, the tree, the table of every type"""
    program = session.program
    equal(name(session.main), TITLE, "the title")
    equal([row.name for row in program.tree_rows(session.tree)], ["Top"], "the tree at first")
    equal(session.rows(), [], "the table at first")
    equal(program.menu_states("File"), {"Exit": True}, "the file menu")
    greyed = program.menu_states("Edit")
    equal((greyed["Delete"], greyed["Rename"], greyed["Find..."]), (False, False, True), "the edit menu at first")
    equal(set(program.menu_states("Edit", "New").values()), {False}, "the menu of new things at first")
    shortcuts = {item.text: item.shortcut for item in program.menu_items("Edit") if item}
    equal((shortcuts["Delete"], shortcuts["Find..."], shortcuts["Find next"]), ("Del", "Ctrl+F", "F3"), "shortcuts")

    session.open_key(TYPES)
    equal(session.status(), "\\".join(session.root + TYPES), "the status bar")
    equal(program.headers(session.table)[:3], ["Name", "Type", "Data"], "the table's headers")
    stored = session.state[tuple(TYPES)]
    default, *others = session.names()
    equal(default, "(Default)", "the first row")
    equal(others, sorted((each for each in stored if each), key=str.lower), "the names in the table")
    # The bus tells what the model holds: text as it stands, numbers in decimal, bytes and lists not at all. What the
    # table draws for them is in the pictures, and tested without a display.
    for value, kind, data in (
        ("(Default)", "REG_SZ", "the default value"),
        ("Nothing", "REG_NONE", "(zero-length binary value)"),
        ("Nothing with bytes", "REG_NONE", None),
        ("Text, markup", "REG_SZ", '<b>not bold</b> & "quoted"'),
        ("Text, many scripts", "REG_SZ", SCRIPTS),
        ("Expandable", "REG_EXPAND_SZ", "%SystemRoot%\\system32"),
        ("Binary", "REG_BINARY", None),
        ("DWORD", "REG_DWORD", "0x0000002a (42)"),
        ("DWORD, largest", "REG_DWORD", "0xffffffff (4294967295)"),
        ("DWORD, big-endian", "REG_DWORD_BIG_ENDIAN", "0x00000100 (256)"),
        ("Link", "REG_LINK", "\\Link"),
        ("List", "REG_MULTI_SZ", None),
        ("QWORD", "REG_QWORD", "0x1122334455667788 (1234605616436508552)"),
        ("Type 1234567", "", None),
    ):
        session.shows(value, kind, data)
    session.picture("main-window", session.main)
    session.unchanged("looking around")


def action_states(session):
    """Which actions are there at which depth"""
    program = session.program
    for depth, path in enumerate((["Top"], ["Top", "HIVE"], ["Top", "HIVE", "ControlSet001"], session.root + CONTROL)):
        program.click(program.tree_cell(session.tree, path))
        until(lambda: session.status() == "\\".join(path), f"{path} in the status bar")
        states = program.menu_states("Edit")
        new = program.menu_states("Edit", "New")
        equal(
            (new["Key"], new["String Value"], states["Delete"], states["Rename"]),
            (depth >= 2, depth >= 2, depth >= 3, depth >= 3),
            f"key, value, delete and rename at depth {depth}",
        )


def make_key(session):
    """A new key from the tree's context menu, named at once"""
    program = session.program
    session.click_key(CONTROL)
    program.right_click(session.cell(CONTROL))
    program.context_menu()
    session.picture("keys-context-menu")
    equal(program.pick_context("New", "Key"), [["New", "Delete", "Rename"], ["Key"]], "its menus")
    equal(text_of(program.editor()), "New Key #1", "the proposed name")
    session.key_made("a new key", CONTROL + ["New Key #1"])
    session.fill_editor(MADE[-1])
    session.key_renamed("naming the new key", CONTROL + ["New Key #1"], MADE[-1])
    session.selected(MADE)
    equal(session.rows(), [["(Default)", "REG_SZ", "(value not set)"]], "the new key's table")

    step("a name that a sibling has is refused")
    program.right_click(session.cell(MADE))
    program.pick_context("Rename")
    session.fill_editor("LSA")
    session.message(TITLE, "The specified key name already exists.", "OK", "key-exists")
    session.unchanged("a refused rename")
    session.selected(MADE)


def press_while_naming(session):
    """A press on another key ends the naming of one, which moves the rows, and is about the key that was pressed"""
    program = session.program
    siblings = program.child_names(session.tree, session.root + CONTROL)
    pressed = CONTROL + [siblings[siblings.index(MADE[-1]) + 1]]
    last = CONTROL + ["zz last"]
    for gesture in (
        ("click", 1),
        ("click", 3),
        ("mousedown", 1, "mousemove_relative", 1, 1, "mouseup", 1),
        ("click", "--repeat", 2, "--delay", 40, 1),
    ):
        session.click_key(MADE)
        where = place(session.cell(pressed))
        program.keys("F2")
        editor = program.editor()
        program.keys("ctrl+a")
        program.type(last[-1])
        until(lambda: text_of(editor) == last[-1], "the name in the editor")
        xdotool("mousemove", where[0] + 10, where[1] + where[3] // 2, *gesture)
        session.key_renamed("a press elsewhere", MADE, last[-1])
        session.selected(pressed)
        session.click_key(last)
        program.keys("F2")
        session.fill_editor(MADE[-1])
        session.key_renamed("the name of before", last, MADE[-1])
        session.selected(MADE)


def name_out_of_sight(session):
    """A key that was scrolled away, and one in a closed branch, come back before they are named"""
    program = session.program
    window = xdotool("search", "--onlyvisible", "--name", f"^{TITLE}$").split()[-1]
    xdotool("windowsize", "--sync", window, 640, 240)
    until(lambda: place(session.main)[2:] == (640, 240), "the lower window")
    for hide in (scroll_away, close_branch):
        session.click_key(MADE)
        hide(session)
        program.keys("F2")
        editor = program.editor()
        until(lambda: begins_in(place(editor), place(session.tree)), f"the editor in sight after {hide.__name__}")
        equal(text_of(editor), MADE[-1], "the name in the editor")
        program.keys("Escape")
        session.unchanged(hide.__name__)
        session.selected(MADE)
    xdotool("windowsize", "--sync", window, 640, 480)
    until(lambda: place(session.main)[2:] == (640, 480), "the window as it was")


def begins_in(inner, outer):
    """In sight with its first letters; an editor may be as wide as its column."""
    return outer[0] <= inner[0] < outer[0] + outer[2] - 50 and outer[1] <= inner[1] <= outer[1] + outer[3] - inner[3]


def scroll_away(session):
    x, y, width, height = place(session.tree)
    xdotool("mousemove", x + width // 2, y + height // 2)
    for _ in range(100):
        top = place(session.cell(MADE))[1]
        if top + 20 < y:
            return
        xdotool("click", 5)
        until(lambda: place(session.cell(MADE))[1] < top, "the tree to scroll")
    raise Failure("the key stays in sight")


def close_branch(session):
    x, y, _, height = place(session.program.scroll_to(session.tree, session.cell(CONTROL)))
    session.program.click((x - 10, y + height // 2))
    until(lambda: not has(session.cell(CONTROL), State.EXPANDED), "the branch to close")


def make_values(session):
    """A value of each kind, made by menu and by context menu, named and edited"""
    program = session.program
    session.click_key(MADE)
    for i, (kind, number, empty, *_rest) in enumerate(KINDS):
        if i % 2:
            program.pick("Edit", "New", kind)
        else:
            program.right_click(session.empty_place())
            seen = program.pick_context("New", kind)
            equal(seen, [["New"], ["Key", None, *NEW_VALUE_KINDS]], "the menu of new things")
        equal(text_of(program.editor()), "New Value #1", "the proposed name")
        session.value_set(f"a new {kind}", MADE, "New Value #1", number, empty)
        session.fill_editor(f"My {kind}")
        session.value_renamed(f"naming a {kind}", MADE, "New Value #1", f"My {kind}")


def edit_values(session):
    """Each value edited in its dialog, by Ok and by Cancel"""
    program = session.program
    session.click_key(MADE)
    for kind, number, _, title, typed, stored, shown in KINDS:
        value = f"My {kind}"
        open_dialog(session, value, title)
        dialog = program.dialog(title)
        fields = program.fields(dialog)
        equal(text_of(fields[0]), value, "the name in the dialog")
        program.keys("ctrl+a")
        type_lines(program, typed)
        until(lambda: text_of(fields[1]) == typed, f"{typed!r} in the field")
        session.picture("dialog-" + kind.split()[0].lower(), dialog)
        program.click(program.button(dialog, "OK"))
        program.gone(dialog)
        session.value_set(f"editing a {kind}", MADE, value, number, stored)
        session.shows(value, session.row(value)[1], shown)

        open_dialog(session, value, title)
        dialog = program.dialog(title)
        program.keys("ctrl+a", "1")
        program.click(program.button(dialog, "Cancel"))
        program.gone(dialog)
        session.unchanged(f"cancelling the editor of a {kind}")


def type_lines(program, text):
    for i, line in enumerate(text.split("\n")):
        if i:
            program.keys("Return")
        program.type(line)


def open_dialog(session, value, title):
    session.program.double_click(session.value_cell(value))
    return session.program.dialog(title)


def number_bases(session):
    """The number editor's bases, and what its fields refuse"""
    program = session.program
    value = "My DWORD (32-bit) Value"
    dialog = open_dialog(session, value, "Edit DWORD (32-bit) Value")
    field = program.fields(dialog)[1]
    if place(program.fields(dialog)[0])[1] > place(field)[1]:
        raise AssertionError("the name does not stand above the data")
    program.click(program.button(dialog, "Decimal"))
    until(lambda: text_of(field) == "3735928559", "the decimal text")
    program.click(program.button(dialog, "Hexadecimal"))
    until(lambda: text_of(field) == "deadbeef", "the hexadecimal text")
    program.click(program.button(dialog, "Decimal"))
    until(lambda: text_of(field) == "3735928559", "the decimal text again")
    program.double_click(field)
    program.keys("ctrl+a")
    program.type("4294967296")  # the last digit would pass 32 bits
    until(lambda: text_of(field) == "429496729", "the digits that fit")
    program.type("5")
    program.click(program.button(dialog, "OK"))
    program.gone(dialog)
    session.value_set("a decimal number", MADE, value, 4, b"\xff\xff\xff\xff")


def value_menu(session):
    """The context menu of a value: edit, rename, delete with No and with Yes"""
    program = session.program
    value = "My String Value"
    program.right_click(session.value_cell(value))
    equal(program.context_items(), ["Edit", "Delete", "Rename"], "the value's menu")
    session.picture("values-context-menu")
    program.pick_context("Edit")
    dialog = program.dialog("Edit String")
    program.keys("Escape")
    program.gone(dialog)
    session.unchanged("Escape in the editor")

    program.right_click(session.value_cell(value))
    program.pick_context("Rename")
    session.fill_editor("Renamed")
    session.value_renamed("a rename", MADE, value, "Renamed")
    session.click_key(CONTROL)
    session.click_key(MADE)
    equal([name_ for name_ in session.names()][-1], "Renamed", "the last name after sorting")

    program.right_click(session.value_cell("Renamed"))
    program.pick_context("Rename")
    session.fill_editor("my binary value")
    session.message(TITLE, "The specified value name already exists.", "OK", "value-exists")
    session.unchanged("a refused rename")

    for answer in ("No", "Yes"):
        program.right_click(session.value_cell("Renamed"))
        program.pick_context("Delete")
        session.message(*DELETE_VALUE, answer, "confirm-value-removal")
        if answer == "No":
            session.unchanged("No")
        else:
            session.value_gone("Yes", MADE, "Renamed")
    until(lambda: "Renamed" not in session.names(), "the deleted value to leave the table")


def default_value(session):
    """The default value that is not set becomes one by editing it, and goes again"""
    program = session.program
    session.click_key(MADE)
    dialog = open_dialog(session, "(Default)", "Edit String")
    equal(text_of(program.fields(dialog)[1]), "", "the text of a value that is not set")
    program.type("now set")
    program.keys("Return")
    program.gone(dialog)
    session.value_set("setting the default value", MADE, "", 1, text_data("now set"))
    session.shows("(Default)", "REG_SZ", "now set")
    program.click(session.value_cell("(Default)"))
    until(lambda: program.menu_states("Edit")["Delete"], "Delete to be there")
    equal(program.menu_states("Edit")["Rename"], False, "Rename on the default value")
    program.pick("Edit", "Delete")
    session.message(*DELETE_VALUE, "Yes")
    session.value_gone("deleting the default value", MADE, "")
    session.shows("(Default)", "REG_SZ", "(value not set)")


def odd_value(session):
    """A type without a name cannot be edited, one without text opens nothing from its other columns"""
    program = session.program
    session.click_key(TYPES)
    program.double_click(session.program.scroll_to(session.table, session.value_cell("DWORD")))
    dialog = program.dialog("Edit DWORD (32-bit) Value")
    equal(text_of(program.fields(dialog)[1]), "2a", "the number")
    program.keys("Return")
    program.gone(dialog)
    session.unchanged("Ok alone")
    row = program.row_of(session.table, "DWORD")
    program.double_click(program.table_cell(session.table, row, 1))
    # A click that is answered says that no dialog has opened before it.
    program.click(session.value_cell("Link"))
    until(lambda: has(session.value_cell("Link"), State.SELECTED), "the next row to be selected")
    equal(program.open_titles(), [TITLE], "windows after a double click on the type")
    for value, title in (
        ("Text, many scripts", "Edit String"),
        ("Text, markup", "Edit String"),
        ("List", "Edit Multi-String"),
        ("Binary, in segments", "Edit Binary Value"),
        ("Resource list", "Edit Binary Value"),
    ):
        program.double_click(session.value_cell(value))
        dialog = program.dialog(title)
        program.click(program.button(dialog, "OK"))
        program.gone(dialog)
        session.unchanged(f"Ok alone on {value!r}")


def delete_keys(session):
    """A key with a subtree deleted: No, then Yes"""
    program = session.program
    session.click_key(MADE)
    for answer in ("No", "Yes"):
        program.right_click(session.cell(MADE))
        program.pick_context("Delete")
        session.message(*DELETE_KEY, answer, "confirm-key-removal")
        if answer == "No":
            session.unchanged("No")
            session.selected(MADE)
    session.key_gone("Yes", MADE)
    until(lambda: program.tree_cell(session.tree, session.root + MADE) is None, "the key to leave the tree")

    deep = ["ControlSet002", "Services"]
    session.open_key(deep)
    program.pick("Edit", "Delete")
    session.message(*DELETE_KEY, "Yes")
    session.key_gone("deleting a subtree", deep)


def refresh_and_resize(session):
    """Refresh keeps the table, resizing keeps the splitter between menu bar and status bar"""
    program = session.program
    session.click_key(TYPES)
    before = session.rows()
    program.pick("View", "Refresh")
    equal(session.rows(), before, "the table after a refresh")
    window = xdotool("search", "--onlyvisible", "--name", f"^{TITLE}$").split()[-1]
    for width, height in ((900, 600), (420, 300), (640, 480)):
        xdotool("windowsize", "--sync", window, width, height)
        until(lambda: place(session.main)[2:] == (width, height), f"the window at {width} by {height}")

        def splitter_fits():
            x, y, _, _ = place(session.main)
            bar = place(program.find(None, kind="menu bar"))
            foot = place(program.find(None, kind="status bar"))
            seen = place(program.find("splitter"))
            return seen == (x, y + bar[3], width, height - bar[3] - foot[3])

        until(splitter_fits, "the splitter between the bars")
    session.unchanged("resizing")


def whole_session(scratch):
    """The session with a mouse"""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    with Session(path) as session:
        for scene in (
            look_around,
            action_states,
            make_key,
            press_while_naming,
            name_out_of_sight,
            make_values,
            edit_values,
            number_bases,
            value_menu,
            default_value,
            odd_value,
            delete_keys,
            refresh_and_resize,
        ):
            step(scene.__doc__)
            scene(session)
        session.leave()
        session.unchanged("the end")


run(whole_session)
