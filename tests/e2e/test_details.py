# SPDX-License-Identifier: GPL-3.0-or-later
"""The details of a document: its facts side by side or below its picture, its name changed in place, its tags."""
import os
import subprocess
import unittest

from gi.repository import GdkPixbuf

from harness import wait_for
from items_window import ItemsWindow
from test_bad_changes import mounted
from test_share_sheet import install_application


class Details(ItemsWindow):
    def prepare(self, app):
        os.setxattr(app.drive / "Report.txt", "user.xdg.tags", b"Work")

    def setUp(self):
        super().setUp()
        self.open()

    def open(self):
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

    def test_what_is_typed_stays_when_a_keyboard_on_the_screen_comes_and_goes(self):
        def resized(height):
            self.app.resize(360, height)
            wait_for(f"the window to be {height} high", lambda: 0 <= height - self.app.find("Vaelo Drive", "frame")[5] <= 20)
        self.edit()
        resized(340)  # as a phone's shell does it
        name = wait_for("the name above the keyboard",
                        lambda: next((row for row in [self.app.find("Name", "text")] if row and row[3] + row[5] < 340), None))
        self.assertLess(name[2], 20, "below the picture as before, and not beside it")
        self.app.key("ctrl+a")
        self.app.type("Second.txt")
        self.app.key("Return")
        self.app.wait("OK", "push button")  # it takes the keyboard, and with it that on the screen
        resized(720)
        self.app.key("Return")
        self.app.wait_gone("OK")
        self.app.key("Home")
        self.app.type("Other ")
        self.app.key("Return")
        self.ended()
        self.on_disk("Other Second.txt")


class Wide(Details):
    size = (1280, 800)

    def test_the_facts_are_beside_the_picture(self):
        picture = self.row("Thumbnail", "image")
        facts = self.row("Kind", "label")
        self.assertGreater(facts[2], picture[2] + picture[4])


class Sizes(ItemsWindow):
    """Phones and tablets, both upright and across."""
    screen = (1280, 1280)

    def prepare(self, app):
        install_application(app, "org.example.Writer", "Writer", "text/plain;")
        (app.base / "data" / "applications" / "mimeapps.list").write_text(
            "[Default Applications]\ntext/plain=org.example.Writer.desktop\n")

    def test_each_has_its_layout_and_its_place_for_the_button(self):
        app = self.app
        for width, height, across, below in ((360, 720, False, False), (720, 400, True, False), (800, 1280, False, True),
                                             (1280, 800, True, True)):
            with self.subTest(f"{width} x {height}"):
                app.resize(width, height)
                edges = 20  # and the shadow
                wait_for("the window", lambda: all(0 <= asked - is_now <= edges for asked, is_now in
                                                   zip((width, height), app.find("Vaelo Drive", "frame")[4:6])))
                self.menu("Report.txt", "i")
                facts = app.wait("Modified", "label")
                picture = app.wait("Thumbnail", "image")
                button = app.wait("Open in “Writer”")
                if across:
                    self.assertGreater(facts[2], picture[2] + picture[4], "beside the picture")
                else:
                    self.assertGreater(facts[3], picture[3] + picture[5], "below the picture")
                if below:
                    self.assertGreater(button[3], facts[3] + facts[5], "below the facts")
                else:
                    self.assertLess(button[3] + button[5], 60, "in the bar")
                app.key("Escape")
                app.wait_gone("Modified")


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


    def test_a_disk_that_refuses_is_told(self):
        mounted(self, self.drive, "--bind", str(self.drive))
        subprocess.run(["mount", "-o", "remount,bind,ro", str(self.drive)], check=True)
        self.edit()
        self.app.type("ed")
        self.app.key("Return")
        self.app.wait("“Report.txt” is on a disk that can only be read.")
        self.app.key("Return")
        self.app.wait_gone("OK")
        self.app.click("Cancel", "push button")
        self.ended()
        self.on_disk("Report.txt")

    def test_a_document_that_goes_meanwhile_is_told_or_takes_the_screen_with_it(self):
        self.edit()
        self.app.type("ed")
        (self.drive / "Report.txt").unlink()
        self.app.wait("Second.txt", "list item")
        self.app.wait_gone("Kind")
        self.on_disk("Reported.txt", False)
        self.assertIsNone(self.app.find("OK", "push button"))


class NotRenameable(Details):
    def prepare(self, app):
        super().prepare(app)
        os.setxattr(app.drive / "Report.txt", "user.vaelo.share", b"participant")

    def test_a_press_on_the_name_changes_nothing(self):
        before = self.app.accessibility.focused()
        self.app.click("Name", "text")
        self.app.wait_log("ShouldBeginEditing: 0")
        wait_for(lambda: f"the name not to have the keyboard; it is at {self.app.accessibility.focused()}, and was at {before}",
                 lambda: ("text", "Name") not in self.app.accessibility.focused())
        self.assertIsNone(self.app.find("Rename File"))
        self.app.key("Tab", "Tab", "Tab", "Tab")  # past the name, which is there to be read
        wait_for("the keyboard beyond the name", lambda: any(name == "Share" for _, name in self.app.accessibility.focused()))


class TagsOfTheDetails(Details):
    def prepare(self, app):
        super().prepare(app)
        values = app.data / "mirror" / ".vaelo" / "values"
        values.parent.mkdir()
        values.write_text("{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': "
                          "<[{'n': <'Work'>, 'l': <uint64 6>}]>}>}")

    def test_the_dot_before_a_tag_has_its_colour(self):
        row = self.app.wait("Work", "label")
        picture = GdkPixbuf.Pixbuf.new_from_file(str(self.app.screenshot()))
        frame = self.app.find("Vaelo Drive", "frame")
        left, top = (picture.get_width() - frame[4]) // 2, (picture.get_height() - frame[5]) // 2
        pixels, stride, channels = picture.get_pixels(), picture.get_rowstride(), picture.get_n_channels()

        def colour(x, y):
            at = (top + y) * stride + (left + x) * channels
            return tuple(pixels[at:at + 3])
        before = [colour(x, row[3] + row[5] // 2) for x in range(row[2] - 15, row[2])]
        self.assertTrue([c for c in before if c[0] > 180 and c[1] < 80 and c[2] < 80], f"red in {before}")

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
