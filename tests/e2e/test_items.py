# SPDX-License-Identifier: GPL-3.0-or-later
"""What people do with items: create, rename, move, delete, look at the details; each seen on the disk."""
import unittest

from harness import wait_for
from items_window import ItemsWindow


class Items(ItemsWindow):
    def test_a_folder_is_made(self):
        app = self.app
        app.click("Select", "push button")
        app.click("New Folder", "push button")
        app.wait("Enter a name for this folder.")
        app.type("Letters")
        self.press("Create")
        self.on_disk("Letters")
        app.wait("Letters", "list item")

    def test_a_name_that_is_taken_keeps_the_prompt(self):
        app = self.app
        app.click("Select", "push button")
        app.click("New Folder", "push button")
        app.wait("Enter a name for this folder.")
        app.type("Plans")
        app.key("Return")
        app.wait("Name is already taken")
        app.key("Escape")
        app.wait_gone("Enter a name for this folder.")

    def test_renaming_keeps_the_extension(self):
        app = self.app
        self.menu("Report.txt", "r")
        app.wait("Enter a new name for this item.")
        # The caret stands before the extension.
        app.key(*["BackSpace"] * len("Report"))
        app.type("Summary")
        app.key("Return")
        self.on_disk("Summary.txt")
        self.assertEqual((self.drive / "Summary.txt").read_text(), "Report.txt")
        app.wait("Summary.txt", "list item")

    def test_items_move_through_the_picker(self):
        app = self.app
        self.choose("Second.txt", "Third.txt")
        app.wait_title("2 Items Selected")
        app.click("Move", "push button")
        app.wait("Move 2 items to")
        app.wait("The items are in this folder already.")
        app.key("Down", "Down", "Return")
        wait_for("the way into the folder", lambda: not app.find("The items are in this folder already."))
        self.press("Move")
        self.on_disk("Plans/Second.txt")
        self.on_disk("Plans/Third.txt")
        self.on_disk("Second.txt", False)

    def test_deleting_asks_first(self):
        app = self.app
        self.menu("Report.txt", "d")
        app.wait("\"Report.txt\" will be permanently deleted")
        self.answer("Return")
        app.wait_gone("\"Report.txt\" will be permanently deleted")
        self.on_disk("Report.txt")
        self.choose("Report.txt", "Second.txt")
        app.click("Delete", "push button")
        self.delete_for_good()
        self.on_disk("Report.txt", False)
        self.on_disk("Second.txt", False)
        self.on_disk("Third.txt")
        app.wait_title("Vaelo Drive")

    def test_special_folders_stay(self):
        self.menu("Documents", "d")
        self.app.wait("This can’t be done with this item.")
        self.on_disk("Documents")

    def test_the_menu_opens_what_a_tap_opens(self):
        # No other application opens pictures.
        (self.drive / "Photo.png").write_bytes(b"no picture")
        (self.drive / "Link.png").symlink_to(self.drive / "Photo.png")
        self.app.wait("Photo.png", "list item")
        for item, shown in (("Photo.png", "Photo.png"), ("Link.png", "Photo.png"), ("Plans", "Plans")):
            self.menu(item, "o")
            self.app.wait_title(shown)
            self.app.key("alt+Left")
            self.app.wait_title("Vaelo Drive")

    def test_keys_mean_the_item_whose_menu_it_was(self):
        app = self.app
        app.click("Second.txt", "list item", button=3)
        app.wait("Rename…", "menu item")
        app.key("Escape")
        app.wait_gone("Rename…")
        app.key("F2")
        app.wait("Enter a new name for this item.")
        app.key("ctrl+a")
        app.type("Renamed")
        app.key("Return")
        self.on_disk("Renamed.txt")
        self.on_disk("Second.txt", there=False)

    def test_a_folder_does_not_take_the_name_of_a_file(self):
        app = self.app
        self.menu("Plans", "r")
        app.wait("Enter a new name for this item.")
        app.key("ctrl+a")
        app.type("Report.txt")
        app.key("Return")
        app.wait("This can’t be done with this item.")
        self.on_disk("Plans")

    def test_the_details_show_facts(self):
        self.menu("Report.txt", "i")
        self.app.wait_log("Using PreviewDetailsViewController")
        self.app.wait("plain text document")


if __name__ == "__main__":
    unittest.main()
