#!/usr/bin/env python3
# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""That the check of the translations sees each fault it is there for."""
import unittest

from check_translations import key, problems_of_file
from translation_files import Message

MENU = [Message("MainWindow", "&" + title, "menu title", "&" + title, None)
        for title in ("File", "Edit", "View", "New")]


def text(source, translation, state=None):
    return Message("KeysView", source, None, translation, state)


def problems(messages, sources=None):
    messages = MENU + messages
    wanted = {key(message) for message in messages} if sources is None else sources
    return problems_of_file("tallowfen_xx.ts", messages, wanted)


class Faults(unittest.TestCase):
    def expect_one(self, found, part):
        self.assertEqual(len(found), 1, found)
        self.assertIn(part, found[0])

    def test_sound_file(self):
        self.assertEqual(problems([text("%1 of %2", "%2, davon %1"), text("Wait...", "Bitte...")]), [])

    def test_unfinished(self):
        self.expect_one(problems([text("Key", "Taste", "unfinished")]), "unfinished")

    def test_empty(self):
        self.expect_one(problems([text("Key", " ")]), "no translation")

    def test_lost_placeholder(self):
        self.expect_one(problems([text("Read %1", "Lies")]), "placeholder")

    def test_doubled_placeholder(self):
        self.expect_one(problems([text("Read %1", "Lies %1 %1")]), "placeholder")

    def test_lost_dots(self):
        self.expect_one(problems([text("Find...", "Suchen")]), "dots")

    def test_lost_accelerator(self):
        menu = [MENU[0]._replace(translation="Datei")] + MENU[1:]
        found = problems_of_file("tallowfen_xx.ts", menu, {key(m) for m in menu})
        self.expect_one(found, "accelerator")

    def test_accelerator_twice_in_one_menu(self):
        menu = [MENU[0]._replace(translation="&Edition")] + MENU[1:]
        found = problems_of_file("tallowfen_xx.ts", menu, {key(m) for m in menu})
        self.expect_one(found, "share the accelerator 'e'")

    def test_accelerator_in_an_unknown_menu(self):
        self.expect_one(problems([text("&Other", "&Anders")]), "no menu of this test")

    def test_two_names_of_the_default_value(self):
        twice = [Message(context, "(Default)", None, translation, None)
                 for context, translation in (("ValuesModel", "(Standard)"), ("ValuesProxyModel", "(Vorgabe)"))]
        self.expect_one(problems(twice), "more than one name")

    def test_new_text_in_the_sources(self):
        sources = {key(m) for m in MENU} | {("KeysView", "Fresh", None)}
        self.expect_one(problems([], sources), "is missing")

    def test_text_that_is_gone_from_the_sources(self):
        self.expect_one(problems([text("Old", "Alt")], {key(m) for m in MENU}), "is in no source")

    def test_text_twice(self):
        self.expect_one(problems([text("Key", "A"), text("Key", "B")]), "twice")

    def test_changed_english(self):
        messages = MENU + [text("Key", "Kay")]
        found = problems_of_file("tallowfen_en_US.ts", messages, {key(m) for m in messages})
        self.expect_one(found, "not left as it is")


if __name__ == "__main__":
    unittest.main()
