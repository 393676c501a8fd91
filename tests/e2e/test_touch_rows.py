# SPDX-License-Identifier: GPL-3.0-or-later
"""Fingers on the rows of a list: swipes that uncover buttons, a long press, and a drag down the check marks."""
import unittest

from PIL import Image

from harness import pause, wait_for
from touch_display import BEGIN, END, TouchApp

LONG_PRESS = 0.8


class Rows(unittest.TestCase):
    environment = {}
    towards_start = -1

    def setUp(self):
        def prepare(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            (app.drive / "Plans").mkdir()
            for i in range(1, 7):
                (app.drive / f"Note {i}.txt").write_text(f"{i}")
        self.app = TouchApp(size=(400, 720), screen=(800, 740), prepare=prepare, **self.environment)
        self.addCleanup(self.app.close)
        self.app.wait("Note 1.txt", "list item")
        self.drive = self.app.drive
        self.screen = self.app.desktop.screen

    def swipe(self, item, length, seconds=0.4):
        """A finger that begins in the middle of the row and moves so far towards the row's start."""
        x, y = self.app.place(self.app.wait(item, "list item"))
        x -= self.towards_start * 100
        self.screen.drag((x, y), (x + self.towards_start * length, y + 3), seconds)

    def uncovered(self):
        return [row[1] for row in self.app.accessibility.showing() if row[0] == "push button" and row[3] > 46 and
                row[1] in ("More", "Share", "Delete")]

    def hold(self, item):
        x, y = self.app.place(self.app.wait(item, "list item"))
        self.screen.touch(BEGIN, x, y)
        pause(LONG_PRESS)
        self.screen.touch(END, x, y)


class Swipes(Rows):
    def test_delete_asks_and_deletes(self):
        app = self.app
        self.swipe("Note 3.txt", 180)
        wait_for("the buttons", lambda: self.uncovered() == ["More", "Share", "Delete"])
        app.tap("Delete", "push button")
        app.wait("\"Note 3.txt\" will be permanently deleted")
        app.tap("Delete from Vaelo Drive", "push button")
        wait_for("the file to go", lambda: not (self.drive / "Note 3.txt").exists())
        app.wait_gone("Note 3.txt")
        self.assertEqual(self.uncovered(), [])

    def test_share_and_more_lead_on(self):
        app = self.app
        self.swipe("Note 2.txt", 180)
        app.tap("More", "push button")
        app.wait("Rename…", "menu item")
        app.key("Escape")
        app.wait_gone("Rename…")
        self.swipe("Note 2.txt", 180)
        app.tap("Share", "push button")
        app.wait_log("Activity (share) action: ")

    def test_a_tap_elsewhere_covers_them_and_opens_nothing(self):
        app = self.app
        self.swipe("Note 1.txt", 180)
        wait_for("the buttons", self.uncovered)
        app.tap("Plans", "list item")
        wait_for("the buttons to go", lambda: not self.uncovered())
        app.wait_title("Vaelo Drive")
        app.tap("Plans", "list item")
        app.wait_title("Plans")

    def test_one_row_at_a_time_and_back_by_a_swipe(self):
        self.swipe("Note 1.txt", 180)
        wait_for("the buttons", self.uncovered)
        self.swipe("Note 2.txt", 180)
        wait_for("one row's buttons", lambda: self.uncovered() == ["More", "Share", "Delete"])
        self.swipe("Note 2.txt", -150)
        wait_for("the buttons to go", lambda: not self.uncovered())
        self.app.wait_title("Vaelo Drive")

    def test_a_short_swipe_turns_back_and_a_flick_goes_on(self):
        self.swipe("Note 1.txt", 60, seconds=0.8)
        wait_for("the buttons to go", lambda: not self.uncovered())
        self.app.wait_title("Vaelo Drive")
        self.swipe("Note 1.txt", 80, seconds=0.12)
        wait_for("the buttons", lambda: self.uncovered() == ["More", "Share", "Delete"])


class SwipesFromTheRight(Rows):
    environment = {"LC_ALL": "C.UTF-8", "LANGUAGE": "ar"}
    towards_start = 1

    def test_names_stand_beside_their_icons(self):
        (self.drive / "\u05e9\u05dc\u05d5\u05dd.txt").write_text("read from the right")
        row = self.app.wait("\u05e9\u05dc\u05d5\u05dd", "list item")
        for row in (row, self.app.wait("Plans", "list item")):
            x, y = self.app.place(row)
            left, width = x - row[4] // 2, row[4]

            def inked(start, end):
                picture = Image.open(self.app.screenshot()).convert("L")
                part = picture.crop((left + start, y - row[5] // 2 + 4, left + end, y + row[5] // 2 - 4))
                lightest, darkest = reversed(part.getextrema())
                return lightest - darkest > 60
            wait_for(f"“{row[1]}” at its place", lambda: inked(width - 140, width - 60) and not inked(0, width // 2))

    def test_the_buttons_are_at_the_rows_end(self):
        self.swipe("Note 3.txt", 180)
        rows = wait_for("the buttons", lambda: [row for row in self.app.accessibility.showing() if row[0] == "push button" and
                                                row[3] > 46 and row[2] < 220 and row[3] < 600])
        self.assertEqual(len(rows), 3)


class Peeks(Rows):
    """The menu of a long press, with a look at the item on top."""

    def hold_and_see(self, item, text):
        x, y = self.app.place(self.app.wait(item, "list item"))
        self.hold(item)
        self.app.wait(text, "label")
        return x + 60, y + 60

    def test_a_document_shows_how_it_begins_and_a_tap_on_that_opens_it(self):
        app = self.app
        (self.drive / "Note 2.txt").write_text("The first line\nThe second\n" + "and on\n" * 50)
        place = self.hold_and_see("Note 2.txt", "The first line The second and on")
        self.assertNotIn("Firmpress", app.log(), "the finger that was lifted opened nothing")
        self.screen.tap(*place)
        app.wait_log("================= DLC Action Firmpress Pop")
        app.wait_gone("The first line The second")
        self.assertIn("================= DLC Action Firmpress Peek", app.log())

    def test_a_folder_shows_its_first_names_and_a_tap_on_them_opens_it(self):
        for name in ("b", "a", ".hidden"):
            (self.drive / "Plans" / name).write_text(name)
        place = self.hold_and_see("Plans", "a b")
        self.screen.tap(*place)
        self.app.wait_title("Plans")
        self.app.wait("a,", "list item")

    def test_its_rows_are_large_enough_for_a_finger(self):
        app = self.app
        self.hold("Note 1.txt")
        self.assertTrue(app.wait("Note 1.txt", "push button"))
        app.wait("Delete…", "menu item")
        rows = [row for row in app.accessibility.showing() if row[0] == "menu item"]
        self.assertEqual(len(rows), 8)
        for row in rows:
            self.assertGreaterEqual(row[5], 44, row[1])

    def test_a_low_window_has_room_for_the_menu_alone(self):
        app = self.app
        app.resize(640, 400)
        self.hold("Note 1.txt")
        app.wait("Delete…", "menu item")
        self.assertIsNone(app.find("Note 1.txt", "push button"))


class Selecting(Rows):
    def test_a_long_press_offers_to_begin_and_its_menu_stays(self):
        app = self.app
        self.hold("Note 4.txt")
        app.wait("Select", "menu item")
        app.key("l")
        app.wait_title("1 Item Selected")
        app.tap("Note 5.txt", "list item")
        app.wait_title("2 Items Selected")

    def test_a_finger_along_the_marks_sets_them_and_clears_them(self):
        app = self.app
        app.tap("Select", "push button")
        app.wait_title("Select Items")
        _, y = app.place(app.wait("Note 2.txt", "list item"))
        _, to_y = app.place(app.wait("Note 5.txt", "list item"))
        self.screen.drag((22, y), (22, to_y), 0.5)
        app.wait_title("4 Items Selected")
        self.screen.drag((22, to_y), (22, y + (to_y - y) // 2 + 10), 0.5)
        app.wait_title("2 Items Selected")


if __name__ == "__main__":
    unittest.main()
