# SPDX-License-Identifier: GPL-3.0-or-later
"""Letters and sheets in a real window, made into pages by the office suite of this computer, where there is one."""
import os
import pathlib
import shutil
import subprocess
import unittest

from bare_desktop import without_applications
from harness import App, wait_for

SUITE = shutil.which("soffice") or shutil.which("libreoffice")
PATIENCE = 90  # seconds; a suite that is started with a new profile takes its time

LETTER = "Dear gardener,\n\nthe quinces are ripe.\n"
TABLE = "Fruit,Weight\nQuince,12\nMedlar,7\n"


def make_documents(folder, scratch):
    (scratch / "letter.txt").write_text(LETTER)
    (scratch / "table.csv").write_text(TABLE)
    for form, source in (("odt", "letter.txt"), ("docx", "letter.txt"), ("xlsx", "table.csv"), ("ods", "table.csv")):
        subprocess.run([SUITE, f"-env:UserInstallation=file://{scratch}/profile", "--headless", "--convert-to", form,
                        "--outdir", str(folder), str(scratch / source)], check=True, capture_output=True, timeout=PATIENCE)
    letter = (folder / "letter.docx").read_bytes()
    (folder / "cut.docx").write_bytes(letter[:len(letter) // 2])
    (folder / "noise.odt").write_bytes(os.urandom(5000))
    shutil.copy(folder / "letter.odt", folder / "changing.odt")


def conversions():
    """The processes of suites that the application started, by what they were given."""
    found = []
    for process in pathlib.Path("/proc").iterdir():
        try:
            if process.name.isdigit() and b"/vaelo-office-" in (process / "cmdline").read_bytes():
                found.append(process.name)
        except OSError:
            pass  # ended meanwhile
    return found


@unittest.skipUnless(SUITE, "there is no office suite on this computer")
class OfficeDocuments(unittest.TestCase):
    """One window for them all, since it is its start that takes time."""

    @classmethod
    def setUpClass(cls):
        def prepare(app):
            without_applications(app)
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            make_documents(app.drive, app.desktop.scratch)
            app.kept = app.desktop.scratch / "runtime"
            app.kept.mkdir(mode=0o700)
            app.desktop.environment["XDG_RUNTIME_DIR"] = str(app.kept)
        cls.app = App(prepare=prepare)
        cls.addClassCleanup(cls.app.close)

    def open(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)
        self.addCleanup(self.leave, name)

    def leave(self, name):
        self.app.click("Back", "push button")
        self.app.mouse("mousemove", "300", "300")  # so that there is a way for it to the next thing
        wait_for(f"“{name}” to be left", lambda: not any(row[:2] == ("label", name) and row[3] < 46
                                                         for row in self.app.accessibility.showing()))

    def wait_sentence(self, sentence):
        wait_for(f"“{sentence}” in {self.app.names()[:60]}",
                 lambda: any(sentence in name for name in self.app.names()), PATIENCE)

    def find(self, text):
        wait_for("the pages", lambda: self.app.find("Find in This Document"), PATIENCE)
        self.app.key("ctrl+f")
        self.app.wait("Find in this document")
        self.app.type(text)
        self.app.wait("1 of 1")
        self.app.key("Escape")
        self.app.wait_gone("1 of 1")

    def tearDown(self):
        self.assertTrue(self.app.running())
        for complaint in ("CRITICAL", "Gtk-WARNING", "GLib-GObject-WARNING"):
            self.assertNotIn(complaint, self.app.log())

    def wait_nothing_left(self):
        wait_for("the suite to end", lambda: not conversions())
        wait_for("its folder to go", lambda: not list(self.app.kept.glob("vaelo-office-*")))

    def test_letters_and_sheets_are_shown_as_pages(self):
        for name, word in (("letter.odt", "quinces"), ("letter.docx", "quinces"), ("table.xlsx", "Medlar"), ("table.ods", "Medlar")):
            with self.subTest(name):
                self.open(name)
                self.find(word)
                self.doCleanups()
        self.wait_nothing_left()

    def test_leaving_ends_the_suite(self):
        self.open("letter.odt")
        wait_for("the suite to run", conversions)
        self.app.wait("Preparing the document to be shown")
        self.doCleanups()
        self.wait_nothing_left()

    def test_what_is_damaged_says_so(self):
        for name in ("cut.docx", "noise.odt"):
            with self.subTest(name):
                self.open(name)
                self.wait_sentence("This document can’t be shown. It may be damaged or protected by a password.")
                self.doCleanups()
        self.wait_nothing_left()

    def test_a_letter_that_changes_is_shown_anew(self):
        self.open("changing.odt")
        self.find("quinces")
        shutil.copy(self.app.drive / "table.ods", self.app.desktop.scratch / "changing.odt")
        os.replace(self.app.desktop.scratch / "changing.odt", self.app.drive / "changing.odt")
        self.app.key("ctrl+f")
        self.app.wait("Find in this document")
        self.app.type("Medlar")
        wait_for("the other pages", lambda: self.app.find("1 of 1"), PATIENCE)
        self.app.key("Escape")


if __name__ == "__main__":
    unittest.main()
