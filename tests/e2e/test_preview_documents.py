# SPDX-License-Identifier: GPL-3.0-or-later
"""Portable documents in a real window: finding, selecting, copying, zooming and marking, and what is on the disk afterwards."""
import os
import subprocess
import unittest

from harness import App, pause, wait_for
from touch_display import BEGIN, END, TouchApp

LINES = ("The river rises in the hills", "and every river has a name", "until it meets the sea")


def portable_document(pages, lines=LINES):
    """Pages of 400 by 600 points; the lines stand 60, 100, 140 points from the top."""
    objects = ["<< /Type /Catalog /Pages 2 0 R >>",
               "<< /Type /Pages /Kids [%s] /Count %d >>" % (" ".join(f"{4 + 2 * i} 0 R" for i in range(pages)), pages),
               "<< /Type /Font /Subtype /Type1 /BaseFont /Helvetica >>"]
    for page in range(pages):
        text = "BT /F1 20 Tf 40 580 Td " + " ".join(f"0 -40 Td ({line}) Tj" for line in (*lines, f"Page {page + 1}")) + " ET"
        objects.append(f"<< /Type /Page /Parent 2 0 R /MediaBox [0 0 400 600] /Contents {5 + 2 * page} 0 R "
                       "/Resources << /Font << /F1 3 0 R >> >> >>")
        objects.append(f"<< /Length {len(text)} >>\nstream\n{text}\nendstream")
    out = b"%PDF-1.4\n"
    places = []
    for number, body in enumerate(objects, 1):
        places.append(len(out))
        out += f"{number} 0 obj\n{body}\nendobj\n".encode()
    start = len(out)
    out += f"xref\n0 {len(objects) + 1}\n0000000000 65535 f \n".encode()
    out += b"".join(b"%010d 00000 n \n" % place for place in places)
    return out + f"trailer\n<< /Size {len(objects) + 1} /Root 1 0 R >>\nstartxref\n{start}\n%%EOF\n".encode()


class Window(unittest.TestCase):
    """A window that shows a document of three pages; the tests are in what derives from it."""
    size = (800, 640)
    app_type = App

    def setUp(self):
        def prepare(app):
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            for folder in ("Desktop", "Documents"):
                (app.drive / folder).mkdir()
            (app.drive / "Rivers.pdf").write_bytes(portable_document(3))
        self.app = self.app_type(prepare=prepare, size=self.size)
        self.addCleanup(self.app.close)
        self.file = self.app.drive / "Rivers.pdf"
        self.original = self.file.read_bytes()
        self.open()

    def open(self):
        self.app.click("Rivers.pdf", "list item")
        self.app.wait_title("Rivers.pdf")
        self.app.wait("1 of 3")

    def page(self, x, y):
        """A place on the first page, which fills the width up to a most, in points; the document is scrolled to its begin."""
        gap, largest = 12, 1.75
        row = next(row for row in self.app.accessibility.showing() if row[1] == "Rivers.pdf" and row[0] != "label")
        zoom = min((row[4] - 2 * gap) / 400, largest)
        left, top = self.app.place((0, 0, row[2], row[3], 0, 0))
        return round(left + (row[4] - 400 * zoom) / 2 + x * zoom), round(top + gap + y * zoom)

    def drag(self, start, end):
        app = self.app
        (x, y), (to_x, to_y) = self.page(*start), self.page(*end)
        app.mouse("mousemove", "--sync", str(x), str(y), "mousedown", "1")
        for step in range(1, 9):
            app.mouse("mousemove", "--sync", str(x + (to_x - x) * step // 8), str(y + (to_y - y) * step // 8))
        app.mouse("mouseup", "1")

    def click_page(self, x, y, button=1):
        x, y = self.page(x, y)
        self.app.mouse("mousemove", "--sync", str(x), str(y), "click", str(button))

    def wait_for_tools(self):
        """Until they stand still."""
        last = [None]

        def stands():
            row, last[0] = last[0], self.app.find("Draw")
            pause(0.1)
            return row and row == last[0]
        wait_for("the tools", stands)
        pause(0.3)  # the tree has them where they will be before they are there

    def wait_for_marks(self, *kinds, file=None):
        file = file or self.file
        wait_for(f"{kinds} in {file.name}",
                 lambda: file.exists() and all(b"/Subtype /" + kind.encode() in file.read_bytes() for kind in kinds))
        said = subprocess.run(["pdfinfo", str(file)], capture_output=True, text=True)
        self.assertEqual((said.returncode, said.stderr), (0, ""))

    def entries(self):
        return sorted(name for name in os.listdir(self.app.drive) if name not in ("Desktop", "Documents") and
                      name != ".vaelo-container")


class PortableDocuments(Window):
    def test_finds_onwards_and_backwards_and_leaves(self):
        app = self.app
        app.key("ctrl+f")
        app.wait("Find in this document")
        app.type("RIVER")
        app.wait("1 of 6")
        app.key("Return")
        app.wait("2 of 6")
        app.key("shift+Return", "shift+Return")
        app.wait("6 of 6")
        app.wait("3 of 3")
        app.click("Find Next")
        app.wait("1 of 6")
        app.type("banks")
        app.wait("Not found")
        app.key("Escape", "Escape")  # the second one before the bar is out of sight
        app.wait_title("Vaelo Drive")

    def test_copies_what_is_dragged_over(self):
        app = self.app
        self.drag((42, 95), (390, 95))
        app.key("ctrl+c")
        app.key("ctrl+f")
        app.wait("Find in this document")
        app.key("ctrl+v")
        # Below the header bar it is the count of what was found, on the pages which page is read.
        wait_for("the line on each page", lambda: any(row[1] == "1 of 3" and row[3] < 120 for row in app.accessibility.showing()))

    def test_zooms_by_keys_and_wheel(self):
        app = self.app
        self.click_page(300, 300)
        shots = [app.screenshot(app.desktop.scratch / "a.png").read_bytes()]
        for zoom in (lambda: app.key("ctrl+plus"), lambda: app.mouse("keydown", "ctrl", "click", "4", "keyup", "ctrl"),
                     lambda: app.key("ctrl+0")):
            zoom()
            before = shots[-1]
            wait_for("another picture", lambda: app.screenshot(app.desktop.scratch / "a.png").read_bytes() != before)
            pause(0.5)  # until it is sharp
            shots.append(app.screenshot(app.desktop.scratch / "a.png").read_bytes())
        self.assertTrue(app.running())

    def test_marks_are_in_the_file(self):
        app = self.app
        app.click("Markup")
        self.wait_for_tools()
        app.click("Highlight")
        self.drag((42, 55), (390, 55))
        app.wait("Saved")
        self.wait_for_marks("Highlight")
        app.click("Draw")
        self.drag((60, 200), (300, 260))
        app.click("Note")
        self.click_page(200, 150)
        app.wait("Add Note")
        app.type("Mind the bridge")
        app.key("ctrl+Return")
        self.wait_for_marks("Highlight", "Ink", "Text")
        app.wait("Saved")
        self.assertIn(b"".join(b"%04x" % ord(letter) for letter in "Mind the bridge"), self.file.read_bytes())
        self.assertTrue(self.file.read_bytes().startswith(self.original))
        app.click("Undo Mark")
        wait_for("the note to go", lambda: b"/Subtype /Text" not in self.file.read_bytes())
        app.click("Done")
        self.assertEqual(self.entries(), ["Rivers.pdf"])
        app.key("Escape")
        app.wait_title("Vaelo Drive")
        self.open()
        self.wait_for_marks("Highlight", "Ink")
        self.assertEqual(self.entries(), ["Rivers.pdf"])

    def test_leaving_saves(self):
        app = self.app
        app.click("Markup")
        self.wait_for_tools()
        app.click("Draw")
        self.drag((60, 200), (300, 260))
        app.key("Escape", "Escape", "Escape")
        app.wait_title("Vaelo Drive")
        self.wait_for_marks("Ink")

    def test_quitting_saves(self):
        app = self.app
        app.click("Markup")
        self.wait_for_tools()
        app.click("Draw")
        self.drag((60, 200), (300, 260))
        app.key("ctrl+q")
        self.assertEqual(app.process.wait(20), 0)
        self.wait_for_marks("Ink")

    def write_note(self, text):
        app = self.app
        app.click("Markup")
        self.wait_for_tools()
        app.click("Note")
        self.click_page(200, 150)
        app.wait("Add Note")
        app.type(text)

    def test_a_note_is_kept_when_a_link_brings_another_document(self):
        app = self.app
        (app.drive / "Other.txt").write_text("Something else\n")
        self.write_note("Mind the bridge")
        status, said = app.link(f"vaelodriveapp://{app.drive}/Other.txt?mode=preview")
        self.assertEqual(status, 0, said)
        app.wait_title("Other.txt")
        self.wait_for_marks("Text")
        self.assertFalse(app.find("This document"))

    def test_a_note_is_kept_when_the_program_ends(self):
        self.write_note("Mind the bridge")
        self.app.desktop.tool("gapplication", "action", "com.marrow.VaeloDrive", "quit")
        self.assertEqual(self.app.process.wait(20), 0)
        self.wait_for_marks("Text")

    def test_what_others_wrote_stays(self):
        app = self.app
        app.click("Markup")
        self.wait_for_tools()
        app.click("Draw")
        others = portable_document(5, ("Another river",))
        (x, y) = self.page(60, 200)
        app.mouse("mousemove", "--sync", str(x), str(y), "mousedown", "1", "mousemove_relative", "--sync", "80", "60")
        new = app.drive / ".new"
        new.write_bytes(others)
        new.rename(self.file)
        app.mouse("mouseup", "1")
        app.wait("Another program changed")
        self.wait_for_marks("Ink", file=app.drive / "Rivers (marked).pdf")
        self.assertEqual(self.file.read_bytes(), others)
        app.wait("1 of 5")


class OnAPhone(Window):
    size = (360, 720)

    def test_every_tool_is_in_reach(self):
        app = self.app
        app.mouse("windowsize", app.window, "360", "720")  # which the list before may not have allowed
        wait_for("a narrow window", lambda: app.find("Vaelo Drive", "frame")[4] <= 360)
        app.key("ctrl+f")
        app.wait("Find in this document")
        app.type("river")
        app.wait("1 of 6")
        app.click("Find Next")
        app.wait("2 of 6")
        app.key("Escape")
        app.click("Find and Markup")
        pause(0.7)  # of a menu the accessibility tree tells neither that it opened nor where it is
        app.mouse("mousemove_relative", "--sync", "--", "-25", "80", "click", "1")
        self.wait_for_tools()
        app.click("Draw")
        self.drag((60, 200), (300, 260))
        app.click("Highlight")
        self.drag((42, 95), (390, 95))
        app.wait("Saved")
        self.wait_for_marks("Ink", "Highlight")
        app.click("Done")
        app.key("Escape")
        app.wait_title("Vaelo Drive")


class Fingers(Window):
    size = (520, 640)
    app_type = TouchApp

    def test_one_finger_scrolls_without_a_tool_and_draws_with_one(self):
        app = self.app
        screen = app.desktop.screen
        app.tap("Markup")
        self.wait_for_tools()
        app.tap("Draw")
        screen.drag(self.page(60, 300), self.page(300, 100), 0.4)
        self.wait_for_marks("Ink")
        self.assertTrue(app.find("1 of 3"))
        app.tap("Draw")
        for _ in range(2):
            screen.drag(self.page(60, 300), self.page(60, 20), 0.3)
        wait_for("another page", lambda: not app.find("1 of 3"))
        self.assertEqual(self.file.read_bytes().count(b"/Subtype /Ink"), 1)

    def test_a_long_press_selects_a_word(self):
        app = self.app
        place = self.page(50, 55)
        app.desktop.screen.touch(BEGIN, *place)
        pause(1)
        app.desktop.screen.touch(END, *place)
        app.wait("Copy", "menu item")
        pause(0.5)
        app.key("Escape", "ctrl+c", "ctrl+f")
        app.wait("Find in this document")
        app.key("ctrl+v")
        app.wait("1 of 9")  # "The", whatever its case


if __name__ == "__main__":
    unittest.main()
