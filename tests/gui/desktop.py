# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""Looks at a running program over the accessibility bus and acts on it with real X events.

Acting goes through X and not through the bus, because an action asked for over the bus runs inside that call: one that
opens a modal dialog would not answer before the dialog is closed.
"""
import os
import subprocess
import time
import warnings
from collections import namedtuple

warnings.filterwarnings("ignore", category=DeprecationWarning)
import gi  # noqa: E402

gi.require_version("Atspi", "2.0")
from gi.repository import Atspi, GLib  # noqa: E402

Atspi.init()
Atspi.set_timeout(10000, 15000)  # the default of 800 ms is too short for a program that works

State = Atspi.StateType
Row = namedtuple("Row", "name depth expandable expanded selected")
MenuItem = namedtuple("MenuItem", "text enabled shortcut")

POLL = 0.02  # seconds between two looks at a condition
DOUBLE_CLICK = 0.45  # seconds after which a click on the same place is a click of its own


class Failure(AssertionError):
    """What a test says when the window is not as it must be."""


def until(condition, what, timeout=20):
    """The condition's value once it is true; never a fixed pause."""
    end = time.monotonic() + timeout
    problem = None
    while True:
        try:
            value = condition()
            if value:
                return value
        except (Failure, LookupError, GLib.Error, AttributeError, TypeError) as error:
            problem = error
        if time.monotonic() > end:
            raise Failure(f"waited {timeout} s for {what}" + (f" ({problem})" if problem else ""))
        time.sleep(POLL)


def xdotool(*words):
    return subprocess.run(["xdotool", *map(str, words)], check=True, text=True, capture_output=True).stdout.strip()


# The bus answers with an error for an object that is gone; here that reads as an empty one.


def role(thing):
    try:
        return thing.get_role_name()
    except GLib.Error:
        return ""


def name(thing):
    try:
        return thing.get_name() or ""
    except GLib.Error:
        return ""


def has(thing, state):
    try:
        return thing.get_state_set().contains(state)
    except (GLib.Error, AttributeError):
        return False


def children(thing):
    found = []
    try:
        for i in range(thing.get_child_count()):
            child = thing.get_child_at_index(i)
            if child is not None:
                found.append(child)
    except GLib.Error:
        pass
    return found


def descendants(thing):
    """Everything below, but not the cells of tables and trees: there may be thousands."""
    queue = [thing]
    while queue:
        each = queue.pop(0)
        yield each
        if role(each) not in ("tree", "table"):
            queue.extend(children(each))


def place(thing):
    """(x, y, width, height) on the screen."""
    extents = thing.get_component_iface().get_extents(Atspi.CoordType.SCREEN)
    return extents.x, extents.y, extents.width, extents.height


def text_of(field):
    text = field.get_text_iface()
    return Atspi.Text.get_text(text, 0, Atspi.Text.get_character_count(text))


class Program:
    """One run of a program, its windows and what shows in them."""

    def __init__(self, arguments, log, environment=None):
        """environment: instead of the test's own."""
        self.log = log
        with open(log, "wb") as output:
            self.process = subprocess.Popen(
                arguments, stdin=subprocess.DEVNULL, stdout=output, stderr=output, env=environment
            )
        self._last_click = (-99, -99, 0.0)
        self._shown = []
        self._listener = Atspi.EventListener.new(self._note_event)
        # Context menus and in-place editors are in nobody's list of children; they are caught as they show.
        for event in ("object:state-changed:showing", "object:state-changed:focused"):
            self._listener.register(event)
        try:
            self.root = until(self._find_root, "the program on the accessibility bus", 60)
        except BaseException:
            self.end()
            raise
        self.root.set_cache_mask(Atspi.Cache.NONE)  # not every change is announced: a cache would show stale text

    def _find_root(self):
        if self.process.poll() is not None:
            with open(self.log, errors="replace") as log:
                raise SystemExit(f"the program ended at its start with {self.process.returncode}: {log.read()}")
        desktop = Atspi.get_desktop(0)
        desktop.clear_cache()
        for program in children(desktop):
            try:
                if program.get_process_id() == self.process.pid:
                    return program
            except GLib.Error:
                pass
        return None

    def _note_event(self, event, *_):
        if event.detail1 == 1 and event.source is not None:
            self._shown.append(event.source)
            del self._shown[:-60]

    def _shown_lately(self):
        context = GLib.MainContext.default()
        while context.iteration(False):
            pass
        return reversed(self._shown)

    # ---- its life -------------------------------------------------------------------------------------------------

    def end(self):
        """Ends the program whatever state it is in."""
        for event in ("object:state-changed:showing", "object:state-changed:focused"):
            self._listener.deregister(event)
        if self.process.poll() is None:
            self.process.kill()
            self.process.wait()

    def status(self, timeout=20):
        """The exit status, once it has ended by itself."""
        return self.process.wait(timeout)

    def ended(self, wanted=0):
        """Waits until the program has ended by itself with this status; after a sanitizer's report it is another one."""
        status = self.status(60)
        if status != wanted:
            raise Failure(f"the program ended with {status}, not {wanted}: {self.output()[-8000:]}")

    def output(self):
        with open(self.log, errors="replace") as log:
            return log.read()

    # ---- looking --------------------------------------------------------------------------------------------------

    def find(self, what, below=None, kind=None, timeout=20):
        """The widget that shows and has this accessible name and, if asked for, this role."""

        def look():
            for thing in descendants(below or self.root):
                if (what is None or name(thing) == what) and (kind is None or role(thing) == kind) and has(
                    thing, State.SHOWING
                ):
                    return thing
            return None

        return until(look, f"a widget {what or kind!r}", timeout)

    def window(self, title, kinds=("frame", "window"), timeout=20):
        """The open window with this title, once it has the keyboard."""

        def look():
            for thing in children(self.root):
                if role(thing) in kinds and name(thing) == title and has(thing, State.SHOWING):
                    return thing if has(thing, State.ACTIVE) else None
            return None

        return until(look, f"the window {title!r}", timeout)

    def dialog(self, title, timeout=20):
        return self.window(title, ("dialog", "alert"), timeout)

    def open_titles(self):
        return [name(thing) for thing in children(self.root) if has(thing, State.SHOWING)]

    def gone(self, thing, timeout=20):
        """Waits until it is closed and another window of the program has the keyboard: a key that is pressed between
        the two goes nowhere."""
        what = name(thing)
        until(lambda: not has(thing, State.SHOWING), f"{what!r} to close", timeout)
        until(
            lambda: any(has(each, State.ACTIVE) and has(each, State.SHOWING) for each in children(self.root)),
            f"the keyboard to come back from {what!r}",
            timeout,
        )

    def alone(self, title):
        """Waits until this window is the only one and has the keyboard."""
        until(lambda: self.open_titles() == [title], f"nothing but {title!r}")
        self.window(title)

    def labels(self, dialog):
        return [name(thing) for thing in descendants(dialog) if role(thing) == "label" and name(thing)]

    def button(self, dialog, text):
        return until(
            lambda: next(
                (
                    thing
                    for thing in descendants(dialog)
                    if role(thing) in ("push button", "radio button", "check box")
                    and name(thing).replace("&", "") == text
                    and has(thing, State.SHOWING)
                ),
                None,
            ),
            f"the button {text!r}",
        )

    def fields(self, dialog):
        """The text fields of a dialog from top to bottom."""
        fields = [each for each in descendants(dialog) if role(each) in ("text", "entry") and has(each, State.SHOWING)]
        return sorted(fields, key=lambda field: place(field)[1])

    def editor(self):
        """The in-place editor, or the text field, that has the keyboard."""

        def look():
            for thing in self._shown_lately():
                if role(thing) in ("text", "entry") and has(thing, State.FOCUSED):
                    return thing
            for thing in descendants(self.root):
                if role(thing) in ("text", "entry") and has(thing, State.FOCUSED):
                    return thing
            return None

        return until(look, "an editor with the keyboard")

    # ---- the tree -------------------------------------------------------------------------------------------------

    def _tree_cells(self, tree):
        return [cell for cell in children(tree) if role(cell) in ("table cell", "tree item")]

    def tree_rows(self, tree):
        """The rows that are not under a closed branch. The bus gives them flat: the depth is in the left edge."""
        cells = self._tree_cells(tree)
        places = [place(cell) for cell in cells]
        edges = sorted({x for x, _, width, _ in places if width > 0})
        return [
            Row(
                name(cell),
                edges.index(x) if x in edges else -1,
                has(cell, State.EXPANDABLE),
                has(cell, State.EXPANDED),
                has(cell, State.SELECTED),
            )
            for cell, (x, _, _, _) in zip(cells, places)
        ]

    def tree_cell(self, tree, path):
        """The cell at this path of names, None where it is closed or absent."""
        trail = []
        cells = self._tree_cells(tree)
        edges = []  # left edges of the trail: a row belongs below the last row that stands further left
        for cell in cells:
            x = place(cell)[0]
            while edges and edges[-1] >= x:
                edges.pop()
                trail.pop()
            edges.append(x)
            trail.append(name(cell))
            if trail == list(path):
                return cell
        return None

    def selected_path(self, tree):
        """The path of names of the selected row."""
        trail, edges = [], []
        for cell in self._tree_cells(tree):
            x = place(cell)[0]
            while edges and edges[-1] >= x:
                edges.pop()
                trail.pop()
            edges.append(x)
            trail.append(name(cell))
            if has(cell, State.SELECTED):
                return list(trail)
        return []

    def child_names(self, tree, path):
        """The names of the rows right below this open path."""
        rows = self.tree_rows(tree)
        trail = []
        for i, row in enumerate(rows):
            del trail[row.depth :]
            trail.append(row.name)
            if trail == list(path):
                below = []
                for other in rows[i + 1 :]:
                    if other.depth <= row.depth:
                        break
                    if other.depth == row.depth + 1:
                        below.append(other.name)
                return below
        raise Failure(f"no row {path}")

    # ---- the table ------------------------------------------------------------------------------------------------

    def table_rows(self, table):
        grid = table.get_table_iface()
        columns = Atspi.Table.get_n_columns(grid)
        return [
            [name(Atspi.Table.get_accessible_at(grid, row, column)) for column in range(columns)]
            for row in range(Atspi.Table.get_n_rows(grid))
        ]

    def table_cell(self, table, row, column=0):
        return Atspi.Table.get_accessible_at(table.get_table_iface(), row, column)

    def row_of(self, table, value_name):
        """The row that shows this name in its first column."""
        grid = table.get_table_iface()

        def look():
            for row in range(Atspi.Table.get_n_rows(grid)):
                if name(Atspi.Table.get_accessible_at(grid, row, 0)) == value_name:
                    return row + 1
            return None

        return until(look, f"a value {value_name!r}") - 1

    def headers(self, table):
        return [name(cell) for cell in children(table) if role(cell) in ("table column header", "column header")]

    # ---- menus ----------------------------------------------------------------------------------------------------

    @staticmethod
    def _popup(item):
        return next((child for child in children(item) if role(child) in ("popup menu", "menu")), None)

    @staticmethod
    def _item(menu, text):
        for item in children(menu):
            if name(item).replace("&", "") == text:
                return item
        raise LookupError(f"no menu item {text!r} in {[name(item) for item in children(menu)]}")

    @staticmethod
    def _items(menu):
        """The items of a menu; None stands for a separator."""
        items = []
        for item in children(menu):
            if role(item) == "separator":
                items.append(None)
                continue
            action = item.get_action_iface()
            shortcut = ""
            if action is not None and Atspi.Action.get_n_actions(action):
                shortcut = Atspi.Action.get_key_binding(action, 0) or ""
            items.append(MenuItem(name(item).replace("&", ""), has(item, State.ENABLED), shortcut))
        return items

    def menu_items(self, *path):
        """The items of a menu of the menu bar, without opening it."""
        menu = self.find(None, kind="menu bar")
        for text in path:
            menu = self._popup(self._item(menu, text))
        return self._items(menu)

    def menu_states(self, *path):
        return {item.text: item.enabled for item in self.menu_items(*path) if item is not None}

    def pick(self, *path):
        """Picks an item of the menu bar with the mouse."""
        menu = self.find(None, kind="menu bar")
        for i, text in enumerate(path):
            item = self._enabled_item(menu, text)
            until(lambda: has(item, State.SHOWING) and place(item)[2] > 1, f"the menu item {text!r} to show")
            self.click(item)
            if i + 1 < len(path):
                menu = self._popup(item)
                until(lambda: has(menu, State.SHOWING), f"the menu {text!r} to open")

    def menu_open(self, *path, timeout=20):
        """Waits until this menu of the menu bar is open."""
        menu = self.find(None, kind="menu bar")
        for text in path:
            menu = self._popup(self._item(menu, text))
        until(lambda: has(menu, State.SHOWING), f"the menu {path} to open", timeout)

    def menu_by_keys(self, keys, *path):
        """Opens a menu of the menu bar by keys. On a busy machine a press is lost now and then between the server, the
        bus and the toolkit; a person would press again, and so does this, twice at most."""
        for timeout in (5, 5, 20):
            self.keys(keys)
            try:
                return self.menu_open(*path, timeout=timeout)
            except Failure:
                if timeout == 20:
                    raise
                print(f"   {keys} did not open {path}: pressed again", flush=True)

    def context_menu(self):
        """The context menu that is open."""

        def look():
            for thing in self._shown_lately():
                if role(thing) == "popup menu" and has(thing, State.SHOWING):
                    return thing
            return None

        return until(look, "a context menu")

    def context_items(self):
        """The texts of the open context menu; None for a separator."""
        return self._texts(self.context_menu())

    def _texts(self, menu):
        return [item.text if item else None for item in self._items(menu)]

    def pick_context(self, *path):
        """Picks an item of the open context menu with the mouse; gives the texts of each menu on the way.

        An action that stands in the menu bar as well is on the bus only as that item, with that place. So the place
        in a context menu is counted: its first item is always the menu's own, and all are of one height.
        """
        first = menu = self.context_menu()
        height = until(lambda: place(children(menu)[0])[3], "the height of a menu item")
        seen = []
        for i, text in enumerate(path):
            self._enabled_item(menu, text)
            texts = self._texts(menu)
            seen.append(texts)
            self.click(self._point_in_menu(menu, texts, text, height))
            if i + 1 < len(path):
                menu = self._popup(self._item(menu, text))
                until(lambda: has(menu, State.SHOWING) and place(menu)[3] >= height, f"the menu {text!r} to open")
        self.gone(first)
        return seen

    @staticmethod
    def _point_in_menu(menu, texts, text, height):
        x, y, width, whole = place(menu)
        separators = texts.count(None)
        gap = (whole - (len(texts) - separators) * height) // separators if separators else 0
        above = texts[: texts.index(text)]
        y += sum(gap if each is None else height for each in above) + height // 2
        return x + width // 2, y

    def _enabled_item(self, menu, text):
        item = until(lambda: self._item(menu, text), f"the menu item {text!r}")
        if not has(item, State.ENABLED):
            raise Failure(f"the menu item {text!r} is greyed")
        return item

    # ---- acting ---------------------------------------------------------------------------------------------------

    @staticmethod
    def _point(thing):
        x, y, width, height = place(thing)
        if width <= 0 or height <= 0:
            raise Failure(f"{name(thing)!r} has no place on the screen")
        return x + min(width // 2, 24), y + height // 2  # near the left edge: a wide cell's middle may be out of sight

    def click(self, thing, button=1, count=1):
        """Clicks a widget, or a point of the screen."""
        x, y = thing if isinstance(thing, tuple) else self._point(thing)
        last_x, last_y, when = self._last_click
        if abs(last_x - x) <= 6 and abs(last_y - y) <= 6:
            # Not a condition to wait for: the toolkit's double-click time itself must pass.
            time.sleep(max(0.0, when + DOUBLE_CLICK - time.monotonic()))
        xdotool("mousemove", x, y, "click", "--repeat", count, "--delay", 40, button)
        self._last_click = (x, y, time.monotonic())

    def double_click(self, thing):
        self.click(thing, count=2)

    def right_click(self, thing):
        self.click(thing, button=3)

    def scroll_to(self, view, cell):
        """Turns the wheel over the view until the cell's middle lies inside it."""
        for _ in range(400):
            view_x, view_y, view_width, view_height = place(view)
            _, y, _, height = place(cell)
            if view_y <= y and y + height <= view_y + view_height - 2:
                return cell
            up = y < view_y
            xdotool("mousemove", view_x + view_width // 2, view_y + view_height // 2, "click", 4 if up else 5)
            until(lambda: place(cell)[1] != y, f"the view to scroll to {name(cell)!r}", 3)
        raise Failure(f"cannot scroll to {name(cell)!r}")

    def keys(self, *combinations):
        """Presses keys: Return, F2, ctrl+f, shift+Tab, ..."""
        xdotool("key", "--delay", 12, *combinations)

    def type(self, text):
        """Types into what has the keyboard. Text outside ASCII goes in over the bus: xdotool would rewrite the
        keyboard's map for it, and the toolkit then loses letters."""
        if text.isascii():
            if text:
                xdotool("type", "--delay", 5, "--", text)
            return
        field = self.editor()
        caret = Atspi.Text.get_caret_offset(field.get_text_iface())
        Atspi.EditableText.insert_text(field.get_editable_text_iface(), caret, text, len(text.encode()))

    def picture(self, path, window=None):
        """Saves the screen, or the window's part of it."""
        command = ["import", "-window", "root"]
        if window is not None:
            x, y, width, height = place(window)
            command += ["-crop", f"{width}x{height}+{x}+{y}", "+repage"]
        os.makedirs(os.path.dirname(path), exist_ok=True)
        subprocess.run(command + [path], check=True)
