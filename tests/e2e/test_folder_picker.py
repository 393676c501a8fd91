# SPDX-License-Identifier: GPL-3.0-or-later
"""The picker of folders: its way through the drive and the libraries, new folders, and the way out."""
import unittest

from harness import wait_for
from items_window import ItemsWindow, content


class FolderPicker(ItemsWindow):
    def prepare(self, app):
        for name, levels in (("Notes", "None"), ("Trips", "Any")):
            library = app.data / "mirror" / f"org~example~{name}"
            (library / "Documents").mkdir(parents=True)
            (library / ".vaelo-container").write_text(f"[Container]\nName={name}\nFolderLevels={levels}\n")

    def open_picker(self):
        app = self.app
        self.choose("Second.txt")
        app.click("Move", "push button")
        app.wait("The item is in this folder already.")

    def walk(self, row):
        """Into the folder in that row, from the first one."""
        self.app.key(*["Down"] * row, "Return")
        wait_for("the way into the folder", lambda: not self.app.find("The item is in this folder already."))

    def new_folder_can_be_made(self):
        return bool(self.app.find("New Folder", "push button")[6])

    def test_a_folder_made_in_another_library_takes_the_item(self):
        self.open_picker()
        self.walk(4)
        wait_for("the library that takes folders", self.new_folder_can_be_made)
        self.press("New Folder")
        self.app.wait("Enter a name for this folder.")
        self.app.type("Rome")
        self.app.key("Return")
        made = self.drive.parent / "org~example~Trips" / "Documents" / "Rome"
        wait_for("the folder", made.is_dir)
        self.app.wait("Rome", "label")
        wait_for("the folder to show", self.new_folder_can_be_made)
        self.press("Move")
        wait_for("the item", (made / "Second.txt").exists)
        self.on_disk("Second.txt", False)

    def test_what_was_moved_from_its_preview_and_is_gone_is_told(self):
        app = self.app
        app.link(f"vaelodriveapp://{self.drive}/Second.txt?mode=preview")
        app.wait_title("Second.txt")
        app.click("Move", "push button")
        app.wait("The item is in this folder already.")
        (self.drive / "Second.txt").unlink()
        app.wait_log("Accommodate deletion")
        wait_for("the preview to go", lambda: not app.find("Share", "push button"))
        self.walk(1)
        wait_for("the way to move", lambda: [row for row in app.accessibility.showing() if row[1] == "Move" and row[6]])
        self.press("Move")
        app.wait("“Second.txt” is no longer there.")
        self.press("Cancel")
        app.wait_gone("Move “Second.txt” to")

    def test_a_name_that_cannot_be_is_told_and_the_prompt_stays(self):
        self.open_picker()
        self.press("New Folder")
        self.app.wait("Enter a name for this folder.")
        self.app.type("a/b")
        self.app.wait("Character not allowed in filename")
        self.app.key("ctrl+a")
        self.app.type("Plans")
        self.app.wait_gone("Character not allowed in filename")
        self.app.key("Return")
        self.app.wait("Name is already taken")
        self.app.key("Escape")
        self.app.wait_gone("Enter a name for this folder.")
        self.press("Cancel")
        self.app.wait_gone("Move “Second.txt” to")
        self.on_disk("Second.txt")

    def test_a_library_without_folders_takes_the_item_but_no_folder(self):
        before = content(self.drive.parent)
        self.open_picker()
        self.assertTrue(self.new_folder_can_be_made())
        self.walk(3)
        wait_for("what the library takes", lambda: not self.new_folder_can_be_made())
        self.press("Back")
        self.app.wait("The item is in this folder already.")
        self.press("Cancel")
        self.app.wait_gone("Move “Second.txt” to")
        self.assertEqual(content(self.drive.parent), before)


if __name__ == "__main__":
    unittest.main()
