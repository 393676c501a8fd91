# SPDX-License-Identifier: GPL-3.0-or-later
"""The keys: their list in the application, and where the keyboard is after what was done with it."""
import re
import unittest

from harness import ROOT, App, wait_for
from items_window import ItemsWindow


class ListOfShortcuts(ItemsWindow):
    def shown(self):
        """{what is done: its keys in words}."""
        return {name: keys for role, name, keys, _ in self.app.accessibility.controls() if role == "list item" and keys}

    def test_it_names_every_key_that_the_manual_does(self):
        app = self.app
        app.key("ctrl+question")
        app.wait("Keyboard Shortcuts")
        shown = wait_for("the keys", self.shown)
        self.assertEqual(shown["Folder Above"], "Alt+Up")
        self.assertEqual(shown["Refresh"], "F5, Ctrl+R")
        self.assertEqual(shown["Keyboard Shortcuts"], "Ctrl+?")
        listed = {key for keys in shown.values() for key in keys.split(", ")}
        manual = (ROOT / "README.md").read_text().partition("## Use it")[2].partition("## ")[0]
        named = re.findall(r"\b(?:(?:Ctrl|Alt|Shift)\+\S+?|F\d+|Escape|Delete|Enter|Tab|Menu)(?=[\s,;|.])", manual)
        self.assertIn("Ctrl+?", named)
        self.assertEqual({key.replace("Enter", "Return") for key in named} - listed, set())
        app.key("Escape")
        app.wait_gone("Folder Above")

    def test_the_main_menu_leads_to_it(self):
        app = self.app
        app.key("F10")
        app.wait("Keyboard Shortcuts", "menu item")
        app.key("k")
        wait_for("the first row", lambda: ("list item", "Main Menu") in app.accessibility.focused())


class WaysUp(ItemsWindow):
    def prepare(self, app):
        (app.drive / "Plans" / "Garden.txt").write_text("beds")

    def test_alt_up_goes_to_the_folder_above(self):
        app = self.app
        app.click("Plans", "list item")
        app.wait("Garden.txt")
        app.key("alt+Up")
        app.wait_gone("Garden.txt")
        wait_for("the keyboard at the folder", lambda: any(name.startswith("Plans") for _, name in app.accessibility.focused()))
        app.key("alt+Up")
        self.assertTrue(app.running())


if __name__ == "__main__":
    unittest.main()
