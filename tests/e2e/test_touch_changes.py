# SPDX-License-Identifier: GPL-3.0-or-later
"""Fingers that change the tree: a folder is made, an item renamed, items moved; each seen on the disk."""
import unittest

from harness import wait_for
from test_touch_rows import Rows


class Changes(Rows):
    def tap_in_dialog(self, name, role="push button"):
        """In the dialog in front, whose places are told within its own window."""
        app = self.app

        def found():
            return [row for row in app.accessibility.showing() if row[0] == role and row[1].startswith(name)]
        row = wait_for(f"“{name}” in the dialog", found)[-1]
        geometry = dict(line.split("=") for line in
                        app.desktop.tool("xdotool", "getwindowfocus", "getwindowgeometry", "--shell").splitlines()
                        if "=" in line)
        self.screen.tap(int(geometry["X"]) + row[2] + row[4] // 2, int(geometry["Y"]) + row[3] + row[5] // 2)

    def on_disk(self, path, there=True):
        wait_for(f"{path} {'to be' if there else 'to go'}", lambda: (self.drive / path).exists() == there)

    def test_a_folder_is_made(self):
        app = self.app
        app.tap("Select", "push button")
        app.tap("New Folder", "push button")
        app.wait("Enter a name for this folder.")
        app.type("Letters")
        self.tap_in_dialog("Create")
        self.on_disk("Letters")
        app.wait("Letters,", "list item")

    def test_an_item_is_renamed(self):
        app = self.app
        self.hold("Note 2.txt")
        app.wait("Rename…", "menu item")
        app.key("r")
        app.wait("Enter a new name for this item.")
        app.type("b")
        self.tap_in_dialog("Done")
        self.on_disk("Note 2b.txt")
        self.assertEqual((self.drive / "Note 2b.txt").read_text(), "2")
        self.on_disk("Note 2.txt", False)

    def test_items_move_through_the_picker(self):
        app = self.app
        app.tap("Select", "push button")
        app.wait_title("Select Items")
        app.tap("Note 2.txt", "list item")
        app.tap("Note 5.txt", "list item")
        app.wait_title("2 Items Selected")
        app.tap("Move", "push button")
        app.wait("The items are in this folder already.")
        self.tap_in_dialog("Plans", "list item")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        self.tap_in_dialog("Move")
        self.on_disk("Plans/Note 5.txt")
        self.assertEqual((self.drive / "Plans" / "Note 2.txt").read_text(), "2")
        self.on_disk("Note 2.txt", False)


if __name__ == "__main__":
    unittest.main()
