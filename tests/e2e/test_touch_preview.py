# SPDX-License-Identifier: GPL-3.0-or-later
"""Fingers on previews in a real window: two that pinch, and a double tap."""
import unittest

from bare_desktop import without_applications
from harness import pause, wait_for
from touch_display import BEGIN, END, UPDATE, TouchApp

MIDDLE = (200, 350)


class TouchPreview(unittest.TestCase):
    def setUp(self):
        self.app = TouchApp(demo=True, size=(400, 720), screen=(800, 740), prepare=without_applications)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")

    def open(self, folder, name):
        self.app.tap(folder + ",", "list item")
        self.app.wait_title(folder)
        self.app.tap(name, "list item")
        self.app.wait_title(name)

    def pinch(self, first, last, steps=15):
        """Two fingers beside each other, so far from the middle at first and at last."""
        screen = self.app.desktop.screen
        x, y = MIDDLE
        for finger, side in ((1, -1), (2, 1)):
            screen.touch(BEGIN, x + side * first, y, finger)
        for step in range(1, steps + 1):
            pause(0.02)
            for finger, side in ((1, -1), (2, 1)):
                screen.touch(UPDATE, x + side * (first + (last - first) * step / steps), y, finger)
        for finger, side in ((1, -1), (2, 1)):
            screen.touch(END, x + side * last, y, finger)

    def double_tap(self):
        self.app.desktop.screen.tap(*MIDDLE)
        pause(0.08)
        self.app.desktop.screen.tap(*MIDDLE)

    def percent(self):
        return next((int(row[1].split()[0]) for row in self.app.accessibility.showing() if row[1].endswith(" %")), None)

    def test_a_picture_follows_two_fingers_and_a_double_tap(self):
        self.open("Pictures", "Photo 3.jpg")
        fitting = wait_for("the picture", self.percent)
        self.pinch(30, 120)
        wait_for("four times the size", lambda: abs(self.percent() - 4 * fitting) <= 0.1 * fitting)
        self.double_tap()
        wait_for("the whole picture", lambda: self.percent() == fitting)
        pause(0.6)  # a tap that comes sooner is the third of a row
        self.double_tap()
        wait_for("a closer look", lambda: self.percent() > 1.5 * fitting)
        self.pinch(120, 30)
        wait_for("the whole picture again", lambda: self.percent() == fitting)

    def test_a_portable_document_follows_two_fingers(self):
        self.open("Documents", "Contract.pdf")
        width = wait_for("the page", lambda: (self.app.find("Page 1 ") or [0] * 5)[4])
        self.pinch(60, 120)
        wait_for("twice the width", lambda: abs(self.app.find("Page 1 ")[4] - 2 * width) <= 0.1 * width)

    def test_a_swipe_from_the_edge_leaves_a_portable_document(self):
        # A width of which the fitting page was wider by some millionths of a pixel, and the swipe scrolled that.
        self.app.resize(360, 720)
        self.open("Documents", "Contract.pdf")
        page = [None]

        def rests():
            row = self.app.find("Page 1 ")
            page[0], same = row, row is not None and row == page[0]
            return same
        wait_for("the page to rest", rests)
        self.app.desktop.screen.drag((12, 350), (330, 350), 0.25)
        self.app.wait_gone("Page 1 ")


if __name__ == "__main__":
    unittest.main()
