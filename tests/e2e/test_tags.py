# SPDX-License-Identifier: GPL-3.0-or-later
"""Tags from the item's menu, as other programs read and write them; thumbnails that the desktop's thumbnailers make."""
import os
import subprocess
import unittest

from harness import App, wait_for

PICTURE = """
import gi, sys
gi.require_version("GdkPixbuf", "2.0")
from gi.repository import GdkPixbuf
picture = GdkPixbuf.Pixbuf.new(GdkPixbuf.Colorspace.RGB, False, 8, 400, 200)
picture.fill(0x3366ccff)
picture.savev(sys.argv[1], "png", [], [])
"""


class Tags(unittest.TestCase):
    def setUp(self):
        def prepare(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            (app.drive / "Report.txt").write_text("words")
            os.setxattr(app.drive / "Report.txt", "user.xdg.tags", b"Work,Own")
            subprocess.run(["/usr/bin/python3", "-c", PICTURE, str(app.drive / "Photo.png")], check=True)
            values = app.data / "mirror" / ".vaelo" / "values"
            values.parent.mkdir()
            values.write_text("{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': "
                              "<[{'n': <'Red'>, 'l': <uint64 6>}, {'n': <'Work'>, 'l': <uint64 4>}]>}>}")
        self.app = App(prepare=prepare)
        self.addCleanup(self.app.close)
        self.app.wait("Report.txt", "list item")
        self.values = self.app.data / "mirror" / ".vaelo" / "values"

    def open_tags(self):
        self.app.click("Report.txt", "list item", button=3)
        self.app.wait("Tags…", "menu item")
        self.app.key("t")
        self.app.wait("New tag")

    def tags(self):
        try:
            return os.getxattr(self.app.drive / "Report.txt", "user.xdg.tags").decode()
        except OSError:
            return ""

    def test_known_tags_are_put_on_and_taken_off(self):
        self.open_tags()
        wait_for("the item's tags and then the others",
                 lambda: [row[1] for row in self.app.accessibility.showing() if row[0] == "check box"] == ["Work", "Own", "Red"])
        self.app.key("space")  # the first is in focus
        wait_for("Work to be off", lambda: self.tags() == "Own")
        self.app.key("Tab", "Tab", "space")
        wait_for("Red to be on", lambda: self.tags() == "Own,Red")

    def test_a_new_tag_is_the_users_from_then_on(self):
        app = self.app
        self.open_tags()
        app.wait("Red", "check box")
        app.key("Tab", "Tab", "Tab")
        app.type("To do, now")
        app.key("Return")
        app.wait("A tag’s name is text without commas")
        self.assertEqual(self.tags(), "Work,Own")
        app.key("ctrl+a")
        app.type("To do")
        app.key("Return")
        wait_for("the new tag", lambda: self.tags() == "Work,Own,To do")
        app.wait("To do", "check box")
        wait_for("the new tag above the others", lambda: [row[1] for row in sorted(
            (row for row in app.accessibility.showing() if row[0] == "check box"), key=lambda row: row[3])][0] == "To do")
        wait_for("room for all of them above the field", lambda: app.find("New tag")[3] >= max(
            row[3] + row[5] for row in app.accessibility.showing() if row[0] == "check box"))
        self.assertIn("'To do'", self.values.read_text())
        self.assertIn("'Red'", self.values.read_text())

    def test_a_new_tag_has_the_chosen_colour(self):
        app = self.app
        self.open_tags()
        app.wait("Red", "check box")
        app.key("Tab", "Tab", "Tab")
        app.type("Garden")
        app.key("Tab", "Tab", "Tab", "space", "shift+Tab", "shift+Tab", "shift+Tab", "Return")  # no colour, gray, green
        wait_for("the new tag", lambda: self.tags() == "Work,Own,Garden")
        self.assertRegex(self.values.read_text(), r"'n': <'Garden'>, 'l': <uint64 2>|'l': <uint64 2>, 'n': <'Garden'>")

    def test_what_leads_to_a_document_has_its_tags(self):
        app = self.app
        (app.base / "Letter.txt").write_text("words")
        (app.drive / "Letter.vaelobookmark").write_text(f"[Bookmark]\nURL=file://{app.base}/Letter.txt\n")
        (app.drive / "Link.txt").symlink_to("Photo.png")
        for name, target in (("Letter", app.base / "Letter.txt"), ("Link.txt", app.drive / "Photo.png")):
            with self.subTest(name):
                app.click(name, "list item", button=3)
                app.wait("Tags…", "menu item")
                app.key("i")
                wait_for("the facts", lambda: app.find("Kind", "label"))
                app.key("ctrl+t")
                app.wait("Red", "check box")
                app.key("space")
                wait_for("the tag", lambda: "user.xdg.tags" in os.listxattr(target))
                app.wait("Tags", "label")
                app.key("Escape")
                app.wait_gone("New tag")
                app.key("Escape")
                app.wait_gone("Kind")

    def test_the_menus_of_an_item_go_with_its_list(self):
        app = self.app
        account = app.data / "account.ini"

        def sign(signed_in):
            new = account.with_suffix(".new")
            new.write_text(f"[Account]\nName=x\nToken=ab\nSignedIn={signed_in}\n")
            new.rename(account)
        self.open_tags()
        sign("false")
        app.wait("Vaelo Drive is not available")
        sign("true")
        app.click("Photo.png", "list item", button=3)
        app.wait("Tags…", "menu item")
        sign("false")
        app.wait("Vaelo Drive is not available")
        sign("true")
        app.wait("Report.txt", "list item")
        for complaint in ("still has children left", "GTK_IS_ACCESSIBLE"):
            self.assertNotIn(complaint, app.log())

    def test_names_begin_behind_their_dots_however_they_are_written(self):
        os.setxattr(self.app.drive / "Report.txt", "user.xdg.tags", "Work,مهم".encode())
        self.open_tags()
        begins = {name: self.app.wait(name, "label")[2] for name in ("Work", "مهم", "Red")}
        self.assertEqual(len(set(begins.values())), 1, begins)

    def test_what_another_program_adds_is_offered(self):
        new = self.values.with_suffix(".new")
        new.write_text("{'RoverTagDict': <{'RoverTagDictVersion': <uint64 2>, 'RoverTags': <[{'n': <'Garden'>, 'l': <uint64 2>}]>}>}")
        new.rename(self.values)
        os.setxattr(self.app.drive / "Report.txt", "user.xdg.tags", b"Own")

        def is_offered():
            # The menu shows what was known when it opened.
            self.open_tags()
            if self.app.find("Garden", "check box"):
                return True
            self.app.key("Escape")
            self.app.wait_gone("New tag")
            return False
        wait_for("Garden among the tags", is_offered)
        self.assertIsNone(self.app.find("Red", "check box"))

    def test_the_menu_of_the_details_leads_to_the_first_tag(self):
        app = self.app
        app.key("F10")
        app.wait("Refresh", "menu item")
        self.assertIsNone(app.find("Tags…", "menu item"), "there is no item that it could mean")
        app.key("Escape")
        app.wait_gone("Refresh")
        app.click("Photo.png", "list item", button=3)
        app.wait("Info", "menu item")
        app.key("i")
        wait_for("the facts", lambda: app.find("Kind", "label"))
        app.key("F10")
        app.wait("Tags…", "menu item")
        app.key("t")
        app.wait("New tag")
        app.wait("Red", "check box")
        app.key("space")
        wait_for("the tag", lambda: "user.xdg.tags" in os.listxattr(app.drive / "Photo.png"))

    def test_a_missing_thumbnail_is_made(self):
        cache = self.app.base / "cache" / "thumbnails" / "normal"
        wait_for("the thumbnail", lambda: cache.is_dir() and list(cache.glob("*.png")))
        self.assertFalse(list((self.app.base / "cache" / "thumbnails").glob("fail/*/*.png")))


if __name__ == "__main__":
    unittest.main()
