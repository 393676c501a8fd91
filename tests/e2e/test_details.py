# SPDX-License-Identifier: GPL-3.0-or-later
"""The details of a document: its facts side by side or below its picture, its name changed in place, its tags."""
import os
import unittest

from harness import wait_for
from items_window import ItemsWindow


class Details(ItemsWindow):
    def prepare(self, app):
        os.setxattr(app.drive / "Report.txt", "user.xdg.tags", b"Work")

    def setUp(self):
        super().setUp()
        self.menu("Report.txt", "i")
        self.app.wait_log("Using PreviewDetailsViewController")
        self.app.wait("Kind", "label")

    def row(self, name, role):
        return wait_for(name, lambda: self.app.find(name, role))

    def edit(self, *keys):
        self.app.click("Name", "text")
        self.app.wait_title("Rename File")
        if keys:
            self.app.key(*keys)

    def ended(self):
        wait_for("the editing to end", lambda: not self.app.find("Rename File"))


class Upright(Details):
    size = (360, 720)

    def test_the_facts_are_below_the_picture_and_the_buttons_below_them(self):
        picture = self.row("Thumbnail", "image")
        facts = self.row("Kind", "label")
        share = self.row("Share", "push button")
        self.assertGreater(facts[3], picture[3] + picture[5])
        self.assertGreater(share[3], facts[3])


    def test_the_title_of_renaming_stands_whole(self):
        def width():
            return next(row for row in self.app.accessibility.showing() if row[:2] == ("label", "Rename File") and row[3] < 46)[4]
        self.edit()
        narrow = width()
        self.app.resize(800, 640)
        wait_for("the wide window", lambda: self.app.find("Vaelo Drive", "frame")[4] > 700)
        self.assertEqual(narrow, width(), "cut where it is narrow")


class Wide(Details):
    size = (1280, 800)

    def test_the_facts_are_beside_the_picture(self):
        picture = self.row("Thumbnail", "image")
        facts = self.row("Kind", "label")
        self.assertGreater(facts[2], picture[2] + picture[4])


class Renaming(Details):
    def test_what_is_typed_is_the_new_name(self):
        self.edit()
        self.app.type("ed")  # before the extension
        self.app.key("Return")
        self.ended()
        self.on_disk("Reported.txt")
        self.on_disk("Report.txt", False)

    def test_cancel_gives_the_old_name_back(self):
        self.edit("ctrl+a")
        self.app.type("Other")
        self.app.click("Cancel", "push button")
        self.ended()
        self.on_disk("Report.txt")
        self.assertEqual(sorted(path.name for path in self.drive.glob("*.txt")), ["Report.txt", "Second.txt", "Third.txt"])

    def test_escape_cancels_too(self):
        self.edit("ctrl+a")
        self.app.type("Other")
        self.app.key("Escape")
        self.ended()
        self.on_disk("Report.txt")
        self.assertTrue(self.app.find("Kind", "label"))

    def test_a_press_beside_ends_it(self):
        self.edit()
        self.app.type("ed")
        self.app.click("Kind", "label")
        self.ended()
        self.on_disk("Reported.txt")

    def test_an_empty_name_changes_nothing(self):
        self.edit("ctrl+a", "BackSpace")
        self.app.click("Kind", "label")
        self.ended()
        self.assertTrue(self.app.find("Name", "text"))
        self.on_disk("Report.txt")

    def test_a_name_that_is_taken_is_told_and_stays_to_be_mended(self):
        self.edit("ctrl+a")
        self.app.type("Second.txt")
        self.app.key("Return")
        self.app.wait("OK", "push button")
        self.app.key("Return")
        self.app.wait_gone("OK")
        self.app.wait("Rename File")
        self.on_disk("Report.txt")
        self.assertEqual((self.drive / "Second.txt").read_text(), "Second.txt")


class TagsOfTheDetails(Details):
    def test_a_press_on_the_row_of_tags_shows_their_menu(self):
        self.app.click("Work", "label")
        self.app.wait("New tag")
        self.app.wait("Work", "check box")
        self.app.key("space")
        wait_for("the tag to be off", lambda: "user.xdg.tags" not in os.listxattr(self.drive / "Report.txt"))
        wait_for("no row of tags", lambda: not self.app.find("Tags", "label"))
        self.app.key("space")
        self.app.wait("Work", "label")

    def test_so_does_a_key(self):
        self.app.key("ctrl+t")
        self.app.wait("New tag")

    def test_the_menu_goes_with_the_document(self):
        self.app.click("Work", "label")
        self.app.wait("New tag")
        (self.drive / "Report.txt").unlink()
        self.app.wait("Second.txt", "list item")
        self.app.wait_gone("Kind")
        self.app.click("Main Menu")
        self.app.wait("Accounts…", "menu item")


if __name__ == "__main__":
    unittest.main()
