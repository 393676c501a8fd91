# SPDX-License-Identifier: GPL-3.0-or-later
"""Previews of archives, Markdown, sound, film and office documents in a real window, one after another."""
import io
import math
import os
import pathlib
import struct
import subprocess
import unittest
import wave
import zipfile

from bare_desktop import without_applications
from harness import App, wait_for

NOTES = """# Garden

Some **strong** words and [a page](https://example.org/garden).

- Dig
- Sow
"""

# Makes a page of what it is given, slowly enough for the notice that it takes long.
SUITE = """#!/bin/bash
while [ "$1" != --outdir ]; do shift; done
mkdir -p "$2"
read -rt {pause} <> <(:)
cp {page} "$2/page.pdf"
"""
STUCK_SUITE = """#!/bin/bash
echo $$ >{process}
exec tail -f /dev/null
"""


def archive():
    content = io.BytesIO()
    with zipfile.ZipFile(content, "w", zipfile.ZIP_DEFLATED) as packed:
        for number in (1, 2, 10):
            packed.writestr(f"Letters/2023/Letter {number}.txt", "x" * 5000)
        packed.writestr("Readme.txt", "x")
    return content.getvalue()


def sound(path):
    with wave.open(str(path), "wb") as written:
        written.setparams((1, 2, 8000, 0, "NONE", ""))
        written.writeframes(b"".join(struct.pack("<h", int(9000 * math.sin(i / 6))) for i in range(8000 * 65)))


def chunk(name, content):
    return name + struct.pack("<I", len(content)) + content + b"\0" * (len(content) % 2)


def film(seconds=60, width=64, height=48):
    """Pictures that aren't compressed, two a second, each of another colour."""
    count, size = seconds * 2, width * height * 3
    head = chunk(b"avih", struct.pack("<14I", 500000, 0, 0, 0x10, count, 0, 1, size, width, height, 0, 0, 0, 0))
    stream = chunk(b"strh", b"vidsDIB " + struct.pack("<12I", 0, 0, 0, 1, 2, 0, count, size, 0, 0, 0, 0))
    form = chunk(b"strf", struct.pack("<IIIHHIIIIII", 40, width, height, 1, 24, 0, size, 0, 0, 0, 0))
    pictures, index = b"movi", b""
    for number in range(count):
        index += b"00db" + struct.pack("<III", 0x10, len(pictures), size)
        pictures += chunk(b"00db", bytes((number * 37 % 256, 90, 200 - number)) * (width * height))
    lists = chunk(b"LIST", b"hdrl" + head + chunk(b"LIST", b"strl" + stream + form)) + chunk(b"LIST", pictures)
    return chunk(b"RIFF", b"AVI " + lists + chunk(b"idx1", index))


def page():
    content = b"0 0 1 rg 40 40 100 100 re f"
    objects = [b"<</Type/Catalog/Pages 2 0 R>>", b"<</Type/Pages/Kids[3 0 R]/Count 1>>",
               b"<</Type/Page/Parent 2 0 R/MediaBox[0 0 200 200]/Contents 4 0 R>>",
               b"<</Length %d>>\nstream\n" % len(content) + content + b"\nendstream"]
    out, places = b"%PDF-1.4\n", []
    for number, written in enumerate(objects, 1):
        places.append(len(out))
        out += b"%d 0 obj\n" % number + written + b"\nendobj\n"
    start = len(out)
    table = b"xref\n0 5\n0000000000 65535 f \n" + b"".join(b"%010d 00000 n \n" % place for place in places)
    return out + table + b"trailer\n<</Size 5/Root 1 0 R>>\nstartxref\n%d\n%%%%EOF\n" % start


class Kinds(unittest.TestCase):
    """One window for them all, since it is its start that takes time."""

    @classmethod
    def setUpClass(cls):
        def prepare(app):
            without_applications(app)
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            (app.drive / "Archive.zip").write_bytes(archive())
            (app.drive / "Damaged.zip").write_bytes(b"This is no archive.")
            (app.drive / "Notes.md").write_text(NOTES)
            sound(app.drive / "Sound.wav")
            (app.drive / "Film.avi").write_bytes(film())
            (app.drive / "Noise.mp4").write_bytes(b"This is no film.")
            (app.drive / "Letter.odt").write_bytes(archive())
            (app.desktop.scratch / "page.pdf").write_bytes(page())
            bin_folder = app.desktop.scratch / "bin"
            bin_folder.mkdir()
            app.suite = bin_folder / "soffice"
            app.desktop.environment["PATH"] = f"{bin_folder}:{os.environ['PATH']}"
        cls.app = App(prepare=prepare)
        cls.addClassCleanup(cls.app.close)

    def setUp(self):
        if self.opened:  # by a test that failed
            self.leave()
        self.app.wait("Notes.md", "list item")

    def install_suite(self, script):
        self.app.suite.write_text(script)
        self.app.suite.chmod(0o755)
        self.addCleanup(self.app.suite.unlink)

    opened = None

    def open(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)
        Kinds.opened = name

    def wait_sentence(self, sentence):
        wait_for(lambda: f"“{sentence}” in {self.app.names()[:60]}", lambda: any(sentence in name for name in self.app.names()))

    def leave(self):
        self.app.key("Escape")
        self.app.mouse("mousemove", "5", "5")  # so that there is a way for it to the next thing

        # The page below is in the accessibility tree all the time.
        def is_gone():
            return not any(row[:2] == ("label", self.opened) and row[3] < 46 for row in self.app.accessibility.showing())
        wait_for(f"“{self.opened}” to be left", is_gone)
        Kinds.opened = None

    def tearDown(self):
        log = self.app.log()
        self.assertTrue(self.app.running())
        for complaint in ("CRITICAL", "Gtk-WARNING", "GLib-GObject-WARNING"):
            self.assertNotIn(complaint, log)

    def rest(self):
        """Until nothing moves in the window any more."""
        seen = []

        def rests():
            seen.append(self.app.screenshot().read_bytes())
            return len(seen) > 2 and seen[-1] == seen[-2] == seen[-3]
        wait_for("the window to rest", rests)

    def colour_of_middle(self):
        path = self.app.screenshot()
        size = subprocess.run(["identify", "-format", "%w %h", str(path)], check=True, capture_output=True, text=True).stdout
        width, height = map(int, size.split())
        place = f"%[pixel:p{{{width // 2 + 120},{height // 2}}}]"
        return subprocess.run(["convert", str(path), "-format", place, "info:"], check=True, capture_output=True, text=True).stdout

    def test_an_archive_lists_what_is_in_it_in_the_order_of_people(self):
        self.open("Archive.zip")
        self.app.wait("Letter 10.txt", "list item")
        rows = [name.split(",")[0] for role, name, *_ in self.app.accessibility.showing() if role == "list item"]
        begin = rows.index("Letters")
        self.assertEqual(rows[begin:begin + 6],
                         ["Letters", "2023", "Letter 1.txt", "Letter 2.txt", "Letter 10.txt", "Readme.txt"])
        self.app.wait("4 files, 2 folders")
        self.app.click("2023", "list item")
        self.app.wait_gone("Letter 10.txt")
        self.app.key("Return")
        self.app.wait("Letter 10.txt", "list item")
        self.leave()

    def test_a_damaged_archive_says_so_and_the_next_document_opens(self):
        self.open("Damaged.zip")
        self.wait_sentence("This document is damaged and can’t be shown.")
        self.leave()
        self.open("Archive.zip")
        self.app.wait("Readme.txt", "list item")
        self.leave()

    def test_markdown_is_shown_as_it_is_meant_and_as_its_source(self):
        self.open("Notes.md")
        self.app.wait("Show Source Text")
        meant = self.app.screenshot(self.app.desktop.scratch / "meant.png").read_bytes()
        self.app.click("Show Source Text")
        wait_for("another picture", lambda: self.app.screenshot().read_bytes() != meant)
        source = self.app.screenshot(self.app.desktop.scratch / "source.png").read_bytes()
        self.app.key("space")
        wait_for("the first picture again", lambda: self.app.screenshot().read_bytes() != source)
        self.app.key("ctrl+f")
        self.app.wait("Find in this document")
        self.app.type("strong")
        self.app.wait("1 of 1")
        self.app.key("Escape")
        self.app.wait_gone("1 of 1")
        self.rest()
        self.leave()

    def test_sound_plays_when_it_is_asked_to_and_stops_when_it_is_left(self):
        self.open("Sound.wav")
        self.app.wait("Play", "push button")
        self.app.wait("1:05")
        self.app.key("space")
        self.app.wait("Pause", "push button")
        self.app.wait("0:01")
        self.leave()
        self.open("Sound.wav")
        self.app.wait("Play", "push button")
        self.app.wait("0:00")
        self.leave()

    def test_a_film_plays_by_tap_and_fills_the_screen(self):
        self.open("Film.avi")
        self.app.wait("Play", "push button")
        first = self.colour_of_middle()
        x, y = self.app.place(self.app.wait("Film.avi", "image"))
        self.app.mouse("mousemove", "--sync", str(x), str(y), "click", "1")
        self.app.wait("Pause", "push button")
        wait_for("another picture", lambda: self.colour_of_middle() != first)
        self.app.key("f")
        self.app.wait("Leave Full Screen", "push button")
        self.app.key("Escape")
        self.app.wait_gone("Leave Full Screen")
        self.app.wait("Pause", "push button")
        self.leave()

    def test_what_is_no_film_says_so(self):
        self.open("Noise.mp4")
        self.wait_sentence("This document can’t be played.")
        self.leave()

    def test_office_documents_show_their_facts_without_a_suite_and_pages_with_one(self):
        self.open("Letter.odt")
        self.app.wait("Open With Another Application")
        self.leave()
        self.install_suite(SUITE.format(pause=1, page=self.app.desktop.scratch / "page.pdf"))
        self.open("Letter.odt")
        self.app.wait("Preparing the document to be shown")
        wait_for("the page", lambda: self.colour_of_middle() == "srgb(255,255,255)")
        self.leave()

    def test_leaving_ends_a_suite_that_hangs(self):
        process = self.app.desktop.scratch / "process"
        self.install_suite(STUCK_SUITE.format(process=process))
        self.open("Letter.odt")
        wait_for("the suite to run", process.exists)
        number = wait_for("its number", lambda: process.read_text().strip())
        self.leave()

        def ended():
            status = pathlib.Path("/proc") / number / "stat"
            return not status.exists() or status.read_text().split(")")[-1].split()[0] == "Z"
        wait_for("the suite to end", ended)


if __name__ == "__main__":
    unittest.main()
