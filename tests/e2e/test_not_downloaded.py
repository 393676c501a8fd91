# SPDX-License-Identifier: GPL-3.0-or-later
"""A document that is not on this device: says so, shows how far it has come, and opens when it is there."""
import unittest

from bare_desktop import without_applications
from document_words import words
from harness import App, wait_for

TEXT = "".join(f"Line {i} of the novel.\n" for i in range(400))


class NotDownloaded(unittest.TestCase):
    def setUp(self):
        self.app = App(demo=True, prepare=without_applications)
        self.addCleanup(self.app.close)
        self.app.wait("Documents,", "list item")
        self.folder = self.app.drive / "Documents"
        self.document = self.folder / "Novel.txt"
        self.promise = self.folder / ".Novel.txt.vlopromise"
        self.partial = self.folder / ".Novel.txt.vlopartial"
        self.promise.write_text(f"[Promise]\nName=Novel.txt\nSize={len(TEXT)}\nModified=1770000000\nPackage=false\n")
        self.app.click("Documents", "list item")
        self.app.wait_title("Documents")
        self.open("Novel.txt")

    def open(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)

    def says_not_downloaded(self):
        return any("Not downloaded" in label and "KB" in label for label in self.labels())

    def labels(self):
        return [row[1] for row in self.app.accessibility.showing() if row[0] == "label"]

    def arrive(self):
        """As a downloader ends: first the document, then the promise goes."""
        self.partial.write_text(TEXT)
        self.partial.rename(self.document)
        self.promise.unlink()

    def wait_opened(self):
        wait_for("the document", lambda: "Line 3 of the novel." in words(self.app))
        self.assertFalse(self.says_not_downloaded())
        self.assertIsNone(self.app.find("Downloading"))

    def test_says_so_shows_its_progress_and_opens_when_it_is_there(self):
        wait_for("the notice", self.says_not_downloaded)
        self.assertIsNone(self.app.find("Downloading"))
        for share in (25, 50, 99):
            self.partial.write_text(TEXT[:len(TEXT) * share // 100])
            self.app.wait(f"Downloading… {share}%")
        self.arrive()
        self.wait_opened()
        self.assertTrue(self.app.running())

    def test_a_download_that_is_given_up_leaves_it_not_downloaded(self):
        wait_for("the notice", self.says_not_downloaded)
        self.partial.write_text(TEXT[:len(TEXT) // 2])
        self.app.wait("Downloading… 50%")
        self.partial.unlink()
        self.app.wait_gone("Downloading")
        self.assertTrue(self.says_not_downloaded())
        self.arrive()
        self.wait_opened()

    def test_opens_when_it_comes_at_one_stroke(self):
        wait_for("the notice", self.says_not_downloaded)
        arriving = self.app.desktop.scratch / "arriving"
        arriving.write_text(TEXT)
        arriving.rename(self.document)
        self.promise.unlink()
        self.wait_opened()

    def test_can_be_left_while_it_comes(self):
        self.partial.write_text(TEXT[:100])
        self.app.wait("Downloading")
        self.app.key("Escape")
        self.app.wait_title("Documents")
        self.arrive()
        self.open("Novel.txt")
        self.wait_opened()

    def test_goes_away_when_the_drive_loses_it(self):
        wait_for("the notice", self.says_not_downloaded)
        self.promise.unlink()
        self.app.wait_title("Documents")
        self.app.wait_gone("Novel.txt,")


if __name__ == "__main__":
    unittest.main()
