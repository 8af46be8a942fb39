# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""What is damaged, met while browsing: told once, by name, and the rest of the hive goes on."""
import os

from desktop import State, has, until
from session import TITLE, Session, equal, make_sample, run

SERVICES = ["ControlSet001", "Services"]
KEY_RECORD = 76  # bytes before the name
VALUE_COUNT, VALUE_LIST = 36, 40  # fields of it
NOWHERE = (0x7FFFFFF0).to_bytes(4, "little")
MANY = 400
SOME = 150  # more than the program keeps handles
FIRST_NUMBER = 1000000
UNREADABLE = "(cannot be read)"  # what is read out for a name that is none


def record_of(content, key):
    """Where the record of the first key with this name begins."""
    at = content.index(key) - KEY_RECORD
    equal(content[at : at + 2], b"nk", "the signature of the record to damage")
    return at


def field_of(content, key, field):
    """Where a field of the first key with this name lies in the file."""
    return record_of(content, key) + field


def cell(content, key, field):
    """Where the record lies that a field of this key leads to."""
    at = field_of(content, key, field)
    return 4096 + int.from_bytes(content[at : at + 4], "little") + 4


def damaged_sample(scratch):
    """usbhub, the last of the services, is no key any more; the value list of Themes leads nowhere; Beep claims more
    values than its list can hold; the data of the first value of Tcpip leads nowhere."""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    with open(path, "r+b") as file:
        content = file.read()

        def put(at, data):
            file.seek(at)
            file.write(data)

        put(record_of(content, b"usbhub"), b"xx")
        put(field_of(content, b"Themes", VALUE_LIST), NOWHERE)
        put(field_of(content, b"Beep", VALUE_COUNT), b"\xff\xff\xff\x7f")
        put(value_records(content, b"Tcpip")[0] + 4, (100).to_bytes(4, "little") + NOWHERE)
    return path


def value_records(content, key):
    """Where the records of a key's values begin, in the order of its list."""
    at = field_of(content, key, VALUE_COUNT)
    count = int.from_bytes(content[at : at + 4], "little")
    values = cell(content, key, VALUE_LIST)
    records = [4096 + int.from_bytes(content[at : at + 4], "little") + 4 for at in range(values, values + 4 * count, 4)]
    for at in records:
        equal(content[at : at + 2], b"vk", "the signature of a value")
    return records


def sample_with(damage, scratch):
    """What begins at the places that damage names is no record any more."""
    path = make_sample(os.path.join(scratch, "SYSTEM"))
    with open(path, "r+b") as file:
        for at in damage(file.read()):
            file.seek(at)
            file.write(b"xx")
    return path


def half_damaged_sample(scratch):
    """Every second key of a large group is no key any more."""
    path = make_sample(os.path.join(scratch, "SYSTEM"), extra_keys=MANY)
    with open(path, "r+b") as file:
        content = file.read()
        for number in range(0, MANY, 2):
            file.seek(record_of(content, b"Key %d" % (FIRST_NUMBER + number)))
            file.write(b"xx")
    return path


def browsing(scratch):
    """One box for one cause; its neighbours are read and changed as ever"""
    with Session(damaged_sample(scratch)) as session:
        program = session.program
        session.open_key(SERVICES)
        program.keys("Right")
        last = "\\".join(session.root + SERVICES) + "\\#11"  # its name cannot be read: its place stands for it
        session.message(TITLE, f'The key "{last}" cannot be read: ROpenSubKey failed', "OK", "damaged-key")
        until(lambda: has(program.tree_cell(session.tree, session.root + SERVICES), State.EXPANDED), "the branch")
        session.picture("damaged-branch", session.main)

        session.click_key(SERVICES + ["Themes"])
        equal(session.names(), ["(Default)"], "a key whose values lead nowhere")
        session.click_key(SERVICES + ["Beep"])
        equal(len(session.names()) < 20, True, f"a key that claims too many values shows {len(session.names())}")
        session.click_key(SERVICES + ["Tcpip"])
        unreadable = [each for each, (_, data) in session.state[tuple(SERVICES + ["Tcpip"])].items() if data is None]
        equal([session.row(each)[2] for each in unreadable], [""], "the data that cannot be read")
        program.double_click(session.value_cell("Start"))
        dialog = program.dialog("Edit DWORD (32-bit) Value")
        program.keys("ctrl+a", "4", "Return")
        program.gone(dialog)
        session.value_set("an edit beside the damage", SERVICES + ["Tcpip"], "Start", 4, b"\x04\0\0\0")

        # Painted again and again, it is not told again.
        session.click_key(SERVICES)
        program.keys("Left")
        until(lambda: not has(program.tree_cell(session.tree, session.root + SERVICES), State.EXPANDED), "it to close")
        program.keys("Right")
        session.click_key(SERVICES + ["Themes"])
        equal(program.open_titles(), [TITLE], "windows after opening the branch again")
        session.leave()
        session.unchanged("browsing")


def painting(scratch):
    """Many damaged rows share a box, and scrolling over them brings no other"""
    with Session(half_damaged_sample(scratch)) as session:
        program = session.program
        group = ["Many", f"Group {FIRST_NUMBER}"]
        session.open_key(group)
        program.keys("Right")
        box = program.dialog(TITLE)
        lines = program.labels(box)[0].splitlines()
        path = "\\".join(session.root + group)
        equal(lines[0], f'The key "{path}\\#0" cannot be read: ROpenSubKey failed', "the first line")
        equal(lines[10:], [f"More keys cannot be read: {MANY // 2 - 10}"], "what stands behind ten lines")
        session.picture("damaged-rows", box)
        program.click(program.button(box, "OK"))
        program.gone(box)

        # Turned over with the wheel, each of them comes into sight; the keys go through them too.
        for key in (f"Key {FIRST_NUMBER + MANY - 1}", f"Key {FIRST_NUMBER + 1}"):
            session.click_key(group + [key])
            equal(program.open_titles(), [TITLE], f"windows on the way to {key}")
        for key, end in (("End", "Setup"), ("Home", session.root[0])):
            program.keys(key)
            until(lambda: program.selected_path(session.tree)[-1:] == [end], f"the row {end!r}")
            equal(program.open_titles(), [TITLE], f"windows after {key}")
        session.click_key(group + [f"Key {FIRST_NUMBER + 3}"])
        equal(session.names(), ["(Default)", "Number"], "the values of a sound key among them")
        session.unchanged("scrolling")


def searching(scratch):
    """A search that meets a damaged key names it once and goes on behind it"""
    with Session(damaged_sample(scratch)) as session:
        program = session.program
        program.keys("ctrl+f")
        dialog = program.dialog("Find")
        program.keys("ctrl+a")
        program.type("is nowhere")
        program.click(program.button(dialog, "Find values"))
        program.click(program.button(dialog, "OK"))
        damaged = "\\".join(session.root + SERVICES) + "\\#11"
        session.message(
            TITLE,
            f'The search could not go on: The key "{damaged}" cannot be read: ROpenSubKey failed',
            "OK",
            "damaged-search",
        )
        program.alone(TITLE)
        program.keys("F3")
        session.message(TITLE, "Finished searching.", "OK")

        # The branch with the damaged key opens without telling it again.
        session.open_key(SERVICES + ["Themes"])
        equal(program.open_titles(), [TITLE], "windows after opening the branch")
        session.unchanged("searching")


def losing(scratch):
    """A key that cannot be read any more while its values are shown: the table is emptied, and Refresh asks again"""
    path = make_sample(os.path.join(scratch, "SYSTEM"), extra_keys=SOME)
    with open(path, "rb") as file:
        content = file.read()
    signature = record_of(content, b"Setup")

    def put(data):
        with open(path, "r+b") as file:
            file.seek(signature)
            file.write(data)

    with Session(path) as session:
        program = session.program
        group = ["Many", f"Group {FIRST_NUMBER}"]
        session.open_key(group)
        program.keys("Right")
        session.cell(group + [f"Key {FIRST_NUMBER}"])
        program.keys("End")
        session.selected(["Setup"])
        names = session.names()
        program.click(session.value_cell("SetupType"))
        # The tree's own row for the key is out of sight.
        program.scroll_to(session.tree, session.cell(group))
        put(b"xx")
        # More names are asked for than handles are kept, as by turning the wheel.
        session.cell(group + [f"Key {FIRST_NUMBER + SOME - 1}"])
        program.keys("Down")
        box = program.dialog(TITLE)
        line = "The key \"{}\" cannot be read: ROpenSubKey failed".format("\\".join(session.root + ["Setup"]))
        equal(program.labels(box)[0], line, "what the box says")
        # The window gets the keyboard back, and its table with it.
        program.click(program.button(box, "OK"))
        program.gone(box)
        until(lambda: session.rows() == [], "an empty table")
        equal(program.open_titles(), [TITLE], "windows after the table was emptied")
        session.picture("lost-key", session.main)
        put(b"nk")
        # So that the editor goes to the file for it once more.
        session.cell(group + [f"Key {FIRST_NUMBER + SOME - 1}"])
        program.keys("F5")
        until(lambda: session.names() == names, "the values after Refresh")
        session.leave()
        session.unchanged("a key that was lost for a while")


def values(scratch):
    """Values that are no values any more: told once however often they are painted, passed by a search, and whoever
    asks for one is answered"""
    path = sample_with(lambda content: value_records(content, b"Value Types")[1::2], scratch)
    with Session(path) as session:
        program = session.program
        key = ["ControlSet001", "Control", "Value Types"]
        sound = [name for name in session.state[tuple(key)] if name]
        session.open_key(key)
        told = 'The key "{}" cannot be read: index'.format("\\".join(session.root + key))
        session.message(TITLE, told, "OK", "damaged-values")
        program.alone(TITLE)
        names = session.names()
        equal(names, ["(Default)"] + [UNREADABLE] * (len(names) - 1 - len(sound)) + sorted(sound), "the names")
        equal(session.rows()[1], [UNREADABLE] * 3, "a value that cannot be read")

        def focused(*cell):
            until(lambda: has(program.table_cell(session.table, *cell), State.FOCUSED), f"the cell {cell}")

        # The whole table comes into sight, with the wheel and with the keyboard.
        program.click(session.value_cell(names[-1]))
        last = len(names) - 1
        for presses, cell in (["ctrl+Home"], (0, 0)), (["ctrl+End"], (last, 2)), (["ctrl+Home", "Down"], (1, 0)):
            program.keys(*presses)
            focused(*cell)
            equal(program.open_titles(), [TITLE], f"windows after {presses}")
        session.picture("damaged-value-table", session.main)

        for presses in (["F2"], ["F2"], ["Return"], ["Right", "ctrl+c"]):
            program.keys(*presses)
            session.message(TITLE, told, "key Return")
        program.keys("Left")
        focused(1, 0)
        program.pick("Edit", "Rename")
        session.message(TITLE, told, "OK")
        program.keys("Delete")
        session.message("Confirm Value Removal", "Are you sure you want to delete this value?", "Yes")
        session.message(TITLE, "The value could not be deleted.", "OK")
        program.alone(TITLE)

        program.keys("ctrl+f")
        dialog = program.dialog("Find")
        program.keys("ctrl+a")
        program.type("qword")
        program.click(program.button(dialog, "Find values"))
        program.click(program.button(dialog, "OK"))
        focused(names.index("QWORD"), 0)
        program.alone(TITLE)
        program.keys("F3")
        session.message(TITLE, "Finished searching.", "OK")
        session.unchanged("asking for what cannot be read")


def asking(scratch):
    """A key that is no key any more, among others: told once when all is opened, passed by what is typed, and each
    gesture on it is answered"""
    with Session(sample_with(lambda content: [record_of(content, b"Dhcp")], scratch)) as session:
        program = session.program
        told = 'The key "{}\\#2" cannot be read: ROpenSubKey failed'.format("\\".join(session.root + SERVICES))
        session.open_key(SERVICES)
        program.keys("asterisk")
        session.message(TITLE, told, "OK", "damaged-key-opened")
        program.alone(TITLE)
        session.cell(SERVICES + ["Tcpip", "Parameters", "Interfaces"])  # all the same
        program.type("d")
        session.selected(SERVICES + ["disk"])

        session.click_key(SERVICES + [UNREADABLE])
        equal(session.rows(), [], "values of a key that cannot be read")
        for press in ("F2", "F2"):
            program.keys(press)
            session.message(TITLE, told, "key Return")
        program.pick("Edit", "Rename")
        session.message(TITLE, told, "OK")
        program.keys("Delete")
        session.message("Confirm Key Removal", "Are you sure you want to delete this key and its subkeys?", "Yes")
        session.message(TITLE, "The key could not be deleted.", "OK")
        program.alone(TITLE)
        program.keys("asterisk", "Up")
        session.selected(SERVICES + ["cdrom"])
        equal(program.open_titles(), [TITLE], "windows after opening it")
        session.unchanged("asking for what cannot be read")


run(browsing, painting, searching, losing, values, asking)
