# SPDX-License-Identifier: GPL-3.0-or-later
"""Those who don't see the window, or don't reach it by hand, or need its letters large."""
import re
import subprocess
import unittest

import every_screen
from harness import App, wait_for
from test_preview_documents import LINES

LARGE_TEXT = 2
CLASS_NAME = re.compile("(Gtk|Adw|Vaelo)[A-Z]\\w+")  # the toolkit's last resort where nothing has named a thing


class EveryScreen(unittest.TestCase):
    def test_by_keyboard_every_control_has_a_name(self):
        app = App(prepare=every_screen.prepare)
        self.addCleanup(app.close)
        for screen in every_screen.every_screen(app):
            if screen == "about":
                continue  # the toolkit's own window
            controls = app.accessibility.controls()
            self.assertTrue(controls, screen)
            nameless = [(role, name) for role, name, _, focusable in controls
                        if (not name or CLASS_NAME.fullmatch(name)) and (focusable or role != "image")]
            with self.subTest(screen):
                self.assertEqual(nameless, [], f"among {[name for _, name, *_ in controls]}")
        for complaint in ("CRITICAL", "Gtk-WARNING", "GLib-GObject-WARNING"):
            self.assertNotIn(complaint, app.log())


class LargeText(unittest.TestCase):
    """As the desktop's own setting for letters of twice the size makes it."""

    def start(self, size):
        def prepare(app):
            every_screen.prepare(app)
            app.desktop.tool("xprop", "-root", "-f", "RESOURCE_MANAGER", "8s", "-set", "RESOURCE_MANAGER",
                             f"Xft.dpi:\t{LARGE_TEXT * 96}\n")
        self.app = App(prepare=prepare, size=size)
        self.addCleanup(self.app.close)

    def test_nothing_is_lost_on_a_phone(self):
        width, height = 360, 720
        least = {"label": 40}  # of which two large letters can be read; a picture takes less
        self.start((width, height))
        for screen in every_screen.every_screen(self.app):
            showing = self.app.accessibility.showing()
            with self.subTest(screen):
                windows = [row for row in showing if row[0] in ("frame", "dialog", "alert")]
                self.assertTrue(windows)
                self.assertEqual([row for row in windows if row[4] > width or row[5] > height], [])
                told = [row for row in showing if row[0] in ("label", "push button", "toggle button", "check box", "list item",
                                                             "menu item", "text") and len(row[1]) > 2]
                if screen == "name in the details":
                    heights = [row[5] for row in showing if row[:2] == ("label", "Rename File")]
                    self.assertGreater(max(heights, default=0), 45, "of two lines, for one has no room")
                self.assertEqual([row for row in told if row[4] < least.get(row[0], 20) or row[4] > width or row[2] < 0], [])

    def test_the_way_out_of_marking_stays_in_sight_on_a_phone(self):
        self.start((360, 720))
        self.app.click("Pages.pdf", "list item")
        last = [None]

        def rests():
            row, last[0] = last[0], self.app.find("Find and Markup")
            return row and row == last[0]
        wait_for("the button to rest", rests)
        self.app.click("Find and Markup")
        self.app.wait("Markup", "menu item")
        self.app.key("m")
        row = self.app.wait("Done", "push button")
        self.assertLessEqual(row[2] + row[4], 360)


class Reading(unittest.TestCase):
    """What a screen reader has to tell of a document."""

    def setUp(self):
        def prepare(app):
            every_screen.prepare(app)
            subprocess.run(["gdbus", "call", "--session", "--dest", "org.a11y.Bus", "--object-path", "/org/a11y/bus", "--method",
                            "org.freedesktop.DBus.Properties.Set", "org.a11y.Status", "ScreenReaderEnabled", "<true>"],
                           env=app.desktop.environment, check=True, stdout=subprocess.DEVNULL)
        self.app = App(prepare=prepare)
        self.addCleanup(self.app.close)
        self.app.wait("Pages.pdf", "list item")

    def told(self, role, name):
        """The description of what shows."""
        return next((described for shown_role, shown, described, _ in self.app.accessibility.controls()
                     if (shown_role, shown) == (role, name)), None)

    def test_of_a_portable_document_the_page_and_its_text(self):
        app = self.app
        app.click("Pages.pdf", "list item")
        app.wait("1 of 3")
        text = " ".join(LINES) + " Page 1"
        wait_for("the first page’s text", lambda: self.told("image", "Page 1 of 3") == text)
        wait_for("the page that is read", lambda: self.told("document text", "Pages.pdf") == f"Page 1 of 3 {text}")
        app.key("End")
        wait_for("the last page", lambda: (self.told("document text", "Pages.pdf") or "").startswith("Page 3 of 3 " + LINES[0]))
        self.assertIsNone(self.told("image", "Page 1 of 3"))


if __name__ == "__main__":
    unittest.main()
