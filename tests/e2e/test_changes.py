# SPDX-License-Identifier: GPL-3.0-or-later
"""Names and moves, their refusals and how they are taken back, in a real window; each seen on the disk."""
import os
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

    def test_a_hidden_extension_is_neither_shown_nor_lost(self):
        app = self.app
        os.setxattr(self.drive / "Report.txt", "user.vaelo.hidden-extension", b"true")
        app.key("F5")
        wait_for("the row without its extension", lambda: app.find("Report,", "list item"))
        self.menu("Report,", "r")
        app.wait("Enter a new name for this item.")
        # The caret stands at the end of all that is shown.
        app.key(*["BackSpace"] * len("Report"))
        app.type("Summary")
        app.key("Return")
        self.on_disk("Summary.txt")
        self.assertEqual(os.getxattr(self.drive / "Summary.txt", "user.vaelo.hidden-extension"), b"true")
        app.wait("Summary,", "list item")

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

    def test_done_and_return_work_for_a_valid_name_alone(self):
        app = self.app
        app.click("Select", "push button")
        app.click("New Folder", "push button")
        app.wait("Enter a name for this folder.")

        def done():
            return app.find("Create", "push button")[6]
        self.assertFalse(done())
        app.key("Return")
        app.type(".hidden")
        app.wait("Choose a different name.")
        self.assertFalse(done())
        app.key("Return")
        app.key("ctrl+a")
        app.type("  Letters ")
        wait_for("Create to be enabled", done)
        self.assertNotIn("textFieldShouldReturn", app.log())
        app.key("Return")
        self.on_disk("Letters")
        app.wait_log("textFieldShouldReturn")

    def test_a_rename_is_taken_back(self):
        self.rename("Report.txt", "Summary.txt")
        self.on_disk("Summary.txt")
        self.app.wait("Renamed to “Summary.txt”")
        self.click_message("Undo")
        self.on_disk("Report.txt")
        self.on_disk("Summary.txt", False)
        self.app.wait("Report.txt", "list item")
        # Of an item without its extension the message says what the list says.
        os.setxattr(self.drive / "Report.txt", "user.vaelo.hidden-extension", b"true")
        self.app.wait("Report, ", "list item")
        self.rename("Report,", "Letter")
        self.on_disk("Letter.txt")
        self.app.wait("Renamed to “Letter”")

    def test_undo_does_not_replace_what_came_meanwhile(self):
        self.rename("Report.txt", "Summary.txt")
        self.on_disk("Summary.txt")
        (self.drive / "Report.txt").write_text("another")
        self.click_message("Undo")
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
        self.click_message("Undo")
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


class Selection(ItemsWindow):
    """What is selected stays so while other programs change the folder."""

    def prepare(self, app):
        for name in ("b", "d", "f"):
            (app.drive / "Plans" / name).write_text(name)

    def follow(self, folder, first, second, others):
        app = self.app
        self.choose(first, second)
        app.wait_title("2 Items Selected")
        for name in others:
            (folder / name).write_text(name)
            app.wait(name, "list item")
        app.wait_title("2 Items Selected")
        (folder / first).unlink()
        app.wait_title("1 Item Selected")
        app.click("Delete", "push button")
        app.wait(f"\"{second}\" will be permanently deleted")
        self.delete_for_good()
        wait_for("it to go", lambda: not (folder / second).exists())
        self.assertTrue(all((folder / name).exists() for name in others))

    def test_at_the_drives_root(self):
        self.follow(self.drive, "Report.txt", "Third.txt", ["A first.txt", "Sixth.txt", "Zz last.txt"])

    def test_in_a_folder(self):
        self.app.click("Plans", "list item")
        self.app.wait_title("Plans")
        self.app.wait("f,", "list item")
        self.follow(self.drive / "Plans", "b", "f", ["a new", "c new", "g new"])


class Keys(ItemsWindow):
    """The row under the keyboard's focus, which letters find."""

    def focus(self, item):
        """A press would open it."""
        self.app.type(item[:3].lower())

    def test_f2_renames(self):
        app = self.app
        self.focus("Report.txt")
        app.key("F2")
        app.wait("Enter a new name for this item.")
        app.key("ctrl+a")
        app.type("Summary")
        app.key("Return")
        self.on_disk("Summary.txt")

    def test_delete_asks_and_deletes(self):
        app = self.app
        self.focus("Third.txt")
        app.key("Delete")
        app.wait("\"Third.txt\" will be permanently deleted")
        self.delete_for_good()
        self.on_disk("Third.txt", False)
        self.on_disk("Second.txt")

    def test_alt_return_shows_the_details(self):
        self.focus("Report.txt")
        self.app.key("alt+Return")
        self.app.wait("plain text document")

    def test_control_m_moves_one_or_what_is_selected(self):
        app = self.app
        self.focus("Report.txt")
        app.key("ctrl+m")
        app.wait("The item is in this folder already.")
        app.key("Escape")
        app.wait_gone("The item is in this folder already.")
        self.choose("Second.txt", "Third.txt")
        app.key("ctrl+m")
        app.wait("The items are in this folder already.")

    def test_while_selecting_delete_means_what_is_selected(self):
        app = self.app
        self.choose("Second.txt", "Third.txt")
        app.wait_title("2 Items Selected")
        app.key("Delete")
        app.wait("2 items will be permanently deleted")
        self.delete_for_good()
        self.on_disk("Third.txt", False)
        self.on_disk("Report.txt")

    def test_shift_selects_up_to_the_press(self):
        app = self.app
        self.choose("Plans")
        x, y = app.place(app.wait("Third.txt", "list item"))
        app.mouse("keydown", "shift", "mousemove", "--sync", str(x), str(y), "click", "1", "keyup", "shift")
        app.wait_title("4 Items Selected")

    def test_control_a_selects_all_and_escape_ends_the_selecting(self):
        app = self.app
        self.focus("Report.txt")
        app.key("ctrl+a")
        app.wait_title("6 Items Selected")
        app.wait_log("================= Pressed SelectAll")
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        app.wait_log("================= Pressed Cancel (end edit)")
        # The focus is in the header bar now.
        app.click("Select", "push button")
        app.wait_title("Select Items")
        app.key("ctrl+a")
        app.wait_title("6 Items Selected")

    def test_the_menu_of_an_item_begins_the_selecting_with_it(self):
        self.menu("Second.txt", "l")
        self.app.wait_title("1 Item Selected")
        self.app.click("Third.txt", "list item")
        self.app.wait_title("2 Items Selected")

    def test_selecting_keeps_the_folder(self):
        app = self.app
        app.click("Plans", "list item")
        app.wait_title("Plans")
        app.click("Select", "push button")
        app.wait_title("Select Items")
        app.key("alt+Left")
        app.click("Cancel", "push button")
        app.wait_title("Plans")
        app.key("alt+Left")
        app.wait_title("Vaelo Drive")

    def test_a_drag_selects_what_it_passes(self):
        app = self.app
        app.click("Select", "push button")
        app.wait_title("Select Items")
        x, y = app.place(app.wait("Third.txt", "list item"))
        _, to_y = app.place(app.wait("Report.txt", "list item"))
        app.mouse("mousemove", "--sync", str(x + 60), str(y + 80), "mousedown", "1")
        for step in range(1, 9):
            app.mouse("mousemove", "--sync", str(x + 60 - 10 * step), str(y + 80 + (to_y - y - 80) * step // 8))
        app.mouse("mouseup", "1")
        app.wait_title("3 Items Selected")


if __name__ == "__main__":
    unittest.main()
