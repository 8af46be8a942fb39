# SPDX-FileCopyrightText: 2026 The tallowfen developers
# SPDX-License-Identifier: MIT
"""Reads translation sources (.ts files)."""
import xml.etree.ElementTree as ElementTree
from collections import namedtuple

# comment is None where a text has none; state is "unfinished", "vanished", "obsolete" or None.
Message = namedtuple("Message", "context source comment translation state")


def read(path):
    messages = []
    for context in ElementTree.parse(path).getroot().iter("context"):
        for message in context.iter("message"):
            translation = message.find("translation")
            messages.append(Message(context.findtext("name"), message.findtext("source"), message.findtext("comment"),
                                    translation.text or "", translation.get("type")))
    return messages
