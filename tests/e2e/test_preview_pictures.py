# SPDX-License-Identifier: GPL-3.0-or-later
"""Pictures of each kind in a real window: upright as the camera was held, and moving where they move."""
import subprocess
import unittest

from bare_desktop import without_applications
from harness import App, wait_for
from PIL import Image

RED, BLUE = (204, 34, 34), (34, 34, 204)
TURNED_RIGHT = 6  # as EXIF numbers it: what is at the left of the file belongs to the top
SVG = """<svg xmlns="http://www.w3.org/2000/svg" width="200" height="400"><rect width="200" height="200" fill="#cc2222"/>
<rect y="200" width="200" height="200" fill="#2222cc"/></svg>"""


def upright():
    """Red above blue."""
    image = Image.new("RGB", (200, 400), RED)
    image.paste(BLUE, (0, 200, 200, 400))
    return image


def write_pictures(folder):
    for name in ("Picture.png", "Picture.jpg", "Picture.gif", "Picture.tif", "Picture.webp"):
        upright().save(folder / name)
    (folder / "Picture.svg").write_text(SVG)
    notes = Image.Exif()
    notes[0x112] = TURNED_RIGHT
    upright().rotate(90, expand=True).save(folder / "Turned.jpg", exif=notes, quality=95)
    subprocess.run(["heif-enc", folder / "Picture.png", "-o", folder / "Picture.heic"], check=True, stdout=subprocess.DEVNULL)
    frames = [Image.new("RGB", (200, 200), colour) for colour in (RED, BLUE)]
    frames[0].save(folder / "Moving.gif", save_all=True, append_images=frames[1:], duration=400, loop=0)


class Pictures(unittest.TestCase):
    """One window for them all, since it is its start that takes time."""

    @classmethod
    def setUpClass(cls):
        def prepare(app):
            without_applications(app)
            app.drive.mkdir(parents=True)
            (app.data / "account.ini").write_text("[Account]\nName=x\nToken=ab\nSignedIn=true\n")
            write_pictures(app.drive)
        cls.app = App(prepare=prepare)
        cls.addClassCleanup(cls.app.close)

    def open(self, name):
        self.app.click(name, "list item")
        self.app.wait_title(name)
        # The window is in the corner of the display, so its places are those of its picture too.
        self.middle = self.app.place(self.app.wait(name, "image"))
        self.app.mouse("mousemove", "5", "5")

    def leave(self):
        self.app.key("Escape")
        self.app.wait_title("Vaelo Drive")

    def colour(self, below):
        """Of what is so many pixels below the middle of the picture: "red", "blue" or something else."""
        x, y = self.middle
        seen = Image.open(self.app.screenshot()).convert("RGB").getpixel((x, y + below))
        near = (name for name, colour in (("red", RED), ("blue", BLUE)) if all(abs(a - b) < 30 for a, b in zip(seen, colour)))
        return next(near, seen)

    def wait_colours(self, above, below):
        wait_for(lambda: f"{above} above {below}, not {self.colour(-60)} above {self.colour(60)}",
                 lambda: (self.colour(-60), self.colour(60)) == (above, below))

    def test_every_kind_is_shown_as_it_is(self):
        for kind in ("gif", "heic", "jpg", "png", "svg", "tif", "webp"):
            with self.subTest(kind):
                self.open(f"Picture.{kind}")
                self.wait_colours("red", "blue")
                self.leave()

    def test_a_photograph_stands_as_the_camera_was_held(self):
        self.open("Turned.jpg")
        self.wait_colours("red", "blue")
        self.leave()

    def wait_percent(self, percent):
        wait_for(lambda: f"{percent} %; showing: {self.app.names()[:30]}", lambda: self.app.find(f"{percent} %"))

    def test_the_wheel_a_double_click_and_keys_look_closer(self):
        self.open("Picture.png")
        self.wait_colours("red", "blue")
        x, y = map(str, self.middle)
        self.app.mouse("mousemove", "--sync", x, y, "click", "--repeat", "2", "--delay", "80", "1")
        self.wait_percent(200)
        self.app.mouse("click", "4")
        self.wait_percent(250)
        self.app.mouse("click", "5")
        self.wait_percent(200)
        self.app.key("0")
        self.wait_percent(100)
        self.app.key("plus")
        self.wait_percent(140)
        self.leave()

    def test_an_animation_moves_for_as_long_as_it_is_seen(self):
        self.open("Moving.gif")
        for colour in ("red", "blue", "red", "blue"):
            self.wait_colours(colour, colour)
        self.leave()
        self.open("Moving.gif")
        self.wait_colours("blue", "blue")
        self.leave()


if __name__ == "__main__":
    unittest.main()
