# SPDX-License-Identifier: GPL-3.0-or-later
"""Names and moves, their refusals and how they are taken back, in a real window; each seen on the disk."""
import unittest

from harness import wait_for
from items_window import ItemsWindow, content


class Names(ItemsWindow):
    def prepare(self, app):
        (app.drive / "Plain").write_text("no extension")

    def rename(self, item, typed):
        self.menu(item, "r")
        self.app.wait("Enter a new name for this item.")
        self.enter(typed)

    def enter(self, text):
        self.app.key("ctrl+a")
        self.app.type(text)
        self.app.key("Return")

    def test_an_extension_that_is_typed_stands_beside_the_old_one_only_when_it_differs(self):
        self.rename("Report.txt", "Summary.txt")
        self.on_disk("Summary.txt")
        self.rename("Summary.txt", "Other.md")
        self.on_disk("Other.md.txt")
        self.assertEqual((self.drive / "Other.md.txt").read_text(), "Report.txt")

    def test_a_name_without_extension_takes_one(self):
        self.rename("Plain", "Notes.txt")
        self.on_disk("Notes.txt")

    def test_names_that_are_refused_keep_the_prompt_and_the_item(self):
        app = self.app
        before = content(self.drive)
        self.rename("Report.txt", "Second.txt")
        app.wait("Name is already taken")
        app.key("ctrl+a")
        app.type("a/b")
        app.wait("Character not allowed in filename")
        self.enter("x" * 254)
        app.wait("The name is too long by 3 characters.")
        app.key("Escape")
        app.wait_gone("Enter a new name for this item.")
        self.assertEqual(content(self.drive), before)

    def test_a_rename_is_taken_back(self):
        self.rename("Report.txt", "Summary.txt")
        self.on_disk("Summary.txt")
        self.app.wait("Renamed to “Summary.txt”")
        self.app.click("Undo", "push button")
        self.on_disk("Report.txt")
        self.on_disk("Summary.txt", False)
        self.app.wait("Report.txt", "list item")

    def test_undo_does_not_replace_what_came_meanwhile(self):
        self.rename("Report.txt", "Summary.txt")
        self.on_disk("Summary.txt")
        (self.drive / "Report.txt").write_text("another")
        self.app.click("Undo", "push button")
        self.app.wait("An item named “Report.txt” already exists.")
        self.assertEqual((self.drive / "Report.txt").read_text(), "another")
        self.assertEqual((self.drive / "Summary.txt").read_text(), "Report.txt")


class Moves(ItemsWindow):
    def prepare(self, app):
        library = app.data / "mirror" / "org~example~Notes"
        (library / "Documents").mkdir(parents=True)
        (library / ".vaelo-container").write_text("[Container]\nName=Notes\nFolderLevels=None\n")
        (library / "Documents" / "Note.txt").write_text("note")

    def test_items_moved_through_the_picker_are_taken_back(self):
        app = self.app
        before = content(self.drive)
        self.choose("Second.txt", "Third.txt")
        app.click("Move", "push button")
        app.wait("The items are in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        self.press("Move")
        self.on_disk("Plans/Third.txt")
        app.wait("Moved 2 items")
        app.click("Undo", "push button")
        self.on_disk("Third.txt")
        wait_for("everything to be as it was", lambda: content(self.drive) == before)

    def test_a_move_of_which_one_fails_says_so_and_moves_the_other(self):
        app = self.app
        (self.drive / "Plans" / "Second.txt").write_text("there already")
        self.choose("Second.txt", "Third.txt")
        app.click("Move", "push button")
        app.wait("The items are in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        self.press("Move")
        app.wait("An item named “Second.txt” already exists in the new location.")
        self.on_disk("Plans/Third.txt")
        self.assertEqual((self.drive / "Plans" / "Second.txt").read_text(), "there already")
        self.assertEqual((self.drive / "Second.txt").read_text(), "Second.txt")


class MovesIntoANewFolder(ItemsWindow):
    """Without any folder there is nowhere else to move to."""

    def prepare(self, app):
        for folder in ("Desktop", "Documents", "Plans"):
            (app.drive / folder).rmdir()

    def test_the_folder_is_made_and_what_fails_is_told_and_stays(self):
        app = self.app
        self.choose("Report.txt", "Second.txt")
        app.click("Move", "push button")
        app.wait("Move 2 Items")
        app.wait("Enter a name for this folder.")
        (self.drive / "Second.txt").rename(self.drive.parent / "taken away")
        app.type("Letters")
        app.key("Return")
        app.wait("The file “Second.txt” doesn’t exist any more.")
        self.assertEqual((self.drive / "Letters" / "Report.txt").read_text(), "Report.txt")
        self.assertEqual((self.drive.parent / "taken away").read_text(), "Second.txt")
        app.key("Return")
        app.wait("Name is already taken")
        app.key("Escape")
        app.wait_gone("Enter a name for this folder.")
        self.on_disk("Third.txt")


if __name__ == "__main__":
    unittest.main()
