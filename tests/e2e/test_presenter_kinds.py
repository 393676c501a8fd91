# SPDX-License-Identifier: GPL-3.0-or-later
"""A picture and a portable document are shown while other programs change, move and delete them."""
import subprocess
import unittest

from bare_desktop import without_applications
from harness import App, wait_for
from test_preview_documents import portable_document

PICTURE = """
import gi, sys
gi.require_version("GdkPixbuf", "2.0")
from gi.repository import GdkPixbuf
for path, colour in zip(sys.argv[1::2], sys.argv[2::2]):
    picture = GdkPixbuf.Pixbuf.new(GdkPixbuf.Colorspace.RGB, False, 8, 400, 400)
    picture.fill(int(colour, 16))
    picture.savev(path, "png", [], [])
"""


class Kinds(unittest.TestCase):
    def setUp(self):
        def prepare(app):
            without_applications(app)
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            (app.drive / "Plans").mkdir()
            subprocess.run(["/usr/bin/python3", "-c", PICTURE, str(app.drive / "Photo.png"), "cc2222ff",
                            str(app.desktop.scratch / "blue"), "2222ccff", str(app.desktop.scratch / "green"), "22cc22ff"],
                           check=True)
            (app.drive / "Rivers.pdf").write_bytes(portable_document(3))
        self.app = App(prepare=prepare)
        self.addCleanup(self.app.close)
        self.drive = self.app.drive
        self.scratch = self.app.desktop.scratch

    def show(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)

    def run_program(self, *command):
        subprocess.run(command, check=True, cwd=self.drive)

    def wait_colour(self, colour):
        def middle():
            path = self.app.screenshot()
            return subprocess.run(["convert", str(path), "-gravity", "center", "-crop", "1x1+0+0", "-format", "%[hex:u.p{0,0}]",
                                   "info:"], check=True, capture_output=True, text=True).stdout[:6].lower()
        wait_for(f"the colour {colour}", lambda: middle() == colour)

    def test_a_picture_is_followed_until_it_goes(self):
        self.show("Photo.png")
        self.wait_colour("cc2222")
        self.run_program("mv", str(self.scratch / "blue"), "Photo.png")
        self.wait_colour("2222cc")
        self.run_program("mv", "Photo.png", "Plans/Picture.png")
        self.app.wait_title("Picture.png")
        self.run_program("cp", str(self.scratch / "green"), "Plans/Picture.png")
        self.wait_colour("22cc22")
        self.run_program("rm", "Plans/Picture.png")
        self.app.wait_title("Vaelo Drive")
        self.app.wait_gone("Photo.png,")

    def test_a_portable_document_is_followed_until_it_goes(self):
        self.show("Rivers.pdf")
        self.app.wait("1 of 3")
        (self.scratch / "longer").write_bytes(portable_document(5))
        self.run_program("mv", str(self.scratch / "longer"), "Rivers.pdf")
        self.app.wait("1 of 5")
        self.run_program("mv", "Rivers.pdf", "Plans/Seas.pdf")
        self.app.wait_title("Seas.pdf")
        (self.scratch / "shorter").write_bytes(portable_document(2))
        self.run_program("cp", str(self.scratch / "shorter"), "Plans/Seas.pdf")
        self.app.wait("1 of 2")
        self.run_program("rm", "Plans/Seas.pdf")
        self.app.wait_title("Vaelo Drive")
        self.app.wait_gone("Rivers.pdf,")


if __name__ == "__main__":
    unittest.main()
