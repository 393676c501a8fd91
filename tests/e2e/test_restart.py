# SPDX-License-Identifier: GPL-3.0-or-later
"""Ending and starting again: the next start shows what the last one ended with."""
import shutil
import unittest

from harness import App, PROGRAM, wait_for


class Restart(unittest.TestCase):
    def setUp(self):
        self.app = App(demo=True)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")
        self.app.click("Documents", "list item")
        self.app.wait_title("Documents")
        self.app.wait("Minutes 2.txt", "list item")

    def end(self):
        self.app.key("ctrl+q")
        wait_for("the end", lambda: not self.app.running())

    def start_again(self):
        self.app.process = self.app.desktop.start([PROGRAM], self.app.desktop.environment, log=self.app.log_file)
        self.app.show_window((800, 640))

    def test_shows_the_folder_that_was_shown_with_the_way_back_to_the_root(self):
        self.end()
        self.start_again()
        self.app.wait_title("Documents")
        self.app.wait("Minutes 2.txt", "list item")
        self.app.key("Escape")
        self.app.wait_title("Vaelo Drive")
        self.app.wait("Documents,", "list item")

    def test_shows_the_root_where_the_folder_is_gone(self):
        self.end()
        shutil.rmtree(self.app.drive / "Documents")
        self.start_again()
        self.app.wait_title("Vaelo Drive")
        self.app.wait("Pictures", "list item")


if __name__ == "__main__":
    unittest.main()
