# SPDX-License-Identifier: GPL-3.0-or-later
"""Fingers on a drive in a real window."""
import re
import time
import unittest

from harness import wait_for
from touch_display import TouchApp


class Touch(unittest.TestCase):
    def setUp(self):
        self.app = TouchApp(demo=True, size=(400, 720), screen=(800, 740))
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")

    def open_many(self):
        self.app.tap("Five thousand", "list item")
        self.app.wait_title("Five thousand")
        wait_for("the rows", lambda: self.first_row() == 1)

    def first_row(self):
        """The number of the uppermost row that shows whole, in the folder of 5,000."""
        rows = [row for row in self.app.accessibility.showing() if row[0] == "list item" and row[3] >= 40]
        return int(re.search(r"\d+", min(rows, key=lambda row: row[3])[1])[0]) if rows else None

    def test_a_tap_opens_a_folder_and_the_back_button_leaves_it(self):
        app = self.app
        app.tap("Documents,", "list item")
        app.wait_title("Documents")
        app.wait("Minutes 2.txt", "list item")
        app.tap("Back")
        app.wait_title("Vaelo Drive")

    def test_rows_and_buttons_are_large_enough_for_a_finger(self):
        for role, name, _, _, _, height, _ in self.app.accessibility.showing():
            if role == "list item":
                self.assertGreaterEqual(height, 44, name)

    def open_documents(self):
        """By a tap, until their page has slid in."""
        self.app.tap("Documents,", "list item")
        before = [None]

        def rests():
            row = self.app.find("Minutes 2.txt", "list item")
            before[0], same = row, row is not None and row == before[0]
            return same
        wait_for("the page to rest", rests)

    def test_a_swipe_from_the_edge_goes_back(self):
        app = self.app
        # Each time: a tap on a row once kept all swipes after it from being seen.
        for _ in range(2):
            self.open_documents()
            app.desktop.screen.drag((12, 400), (360, 400), 0.25)
            # Titles tell nothing: of the page below the tree says that it shows as well.
            app.wait_gone("Minutes 2.txt")
        self.assertNotIn("Selected Item (dlc)", app.log())

    def test_a_finger_or_pointer_that_leaves_its_row_is_no_tap(self):
        app = self.app
        row = app.place(app.wait("Documents,", "list item"))
        app.desktop.screen.drag(row, (row[0] + 120, row[1]), 0.25)
        app.mouse("mousemove", "--sync", *map(str, row), "mousedown", "1")
        app.mouse("mousemove", "--sync", str(row[0] + 5), str(row[1] + 60), "mouseup", "1")
        # What comes last shows that what came before opened nothing.
        app.tap("Media,", "list item")
        app.wait("Clip.avi", "list item")
        self.assertEqual(app.log().count("User selected folder"), 1)

    def test_a_swipe_that_turns_back_stays(self):
        app = self.app
        self.open_documents()
        app.desktop.screen.drag((12, 400), (90, 400), 0.6, steps=30)
        app.tap("Minutes 2.txt", "list item")
        app.wait_log("Selected Item (dlc)")

    def test_a_flick_scrolls_on_after_the_finger_is_lifted(self):
        self.open_many()
        rows_under_the_finger = 400 // 44

        def flick_goes_on():
            # On a busy machine the finger itself may be late, and what is slow is no flick.
            before = self.first_row()
            self.app.desktop.screen.drag((200, 600), (200, 200), 0.12)
            end = time.monotonic() + 2
            while time.monotonic() < end:
                if self.first_row() > before + rows_under_the_finger:
                    return True
            return False
        wait_for("the list to go on by itself", flick_goes_on, patience=40)

    def test_a_slow_drag_moves_the_list_with_the_finger_and_opens_nothing(self):
        self.open_many()
        self.app.desktop.screen.drag((200, 500), (200, 300), 1.5, steps=30)
        wait_for("the list to move", lambda: self.first_row() > 1)
        self.assertLessEqual(self.first_row(), 1 + 250 // 44)
        self.app.wait_title("Five thousand")


if __name__ == "__main__":
    unittest.main()
