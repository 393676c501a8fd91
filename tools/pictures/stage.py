# SPDX-License-Identifier: GPL-3.0-or-later
"""One screen of a size and a style, on which the application fills everything as on a phone or tablet, and its pictures."""
import gettext
import pathlib
import re
import urllib.parse

import harness
from bare_desktop import without_applications
from PIL import Image, ImageChops

SIZES = ((360, 720), (800, 1280), (1280, 800))
STYLES = {"light": {}, "dark": {"ADW_DEBUG_COLOR_SCHEME": "prefer-dark"}, "rtl": {"LANGUAGE": "ar"}}

# As the shells of phones and tablets do it: windows have the whole screen, dialogs are in its middle.
WINDOWS = """<openbox_config xmlns="http://openbox.org/3.4/rc">
  <placement><policy>Smart</policy><center>yes</center></placement>
  <keyboard><keybind key="F12"><action name="Maximize"/></keybind></keyboard>
  <applications>
    <application class="*" type="normal"><decor>no</decor></application>
    <application type="dialog"><decor>no</decor></application>
  </applications>
</openbox_config>
"""


class Tablet(harness.Desktop):
    def start_window_manager(self):
        settings = self.scratch / "openbox.xml"
        settings.write_text(WINDOWS)
        self.start(["xcompmgr"], self.environment)  # without it menus stand in black rectangles
        self.start(["openbox", "--sm-disable", "--config-file", str(settings)], self.environment)


class TabletApp(harness.App):
    desktop_type = Tablet

    def show_window(self, size):
        self.window = harness.wait_for("the window", self.find_window).split()[0]
        self.key("F12")
        harness.wait_for("the window on all of the screen", lambda: f"Geometry: {size[0]}x{size[1]}" in self.desktop.tool(
            "xdotool", "getwindowgeometry", self.window))


def furnish(app):
    """Three that open documents, instead of those of this computer; and an account whose free space is known."""
    without_applications(app)
    (app.desktop.scratch / "share" / "thumbnailers").symlink_to("/usr/share/thumbnailers")
    with (app.data / "account.ini").open("a") as record:
        record.write("Allowance=20000000000\n")
    folder = app.base / "data" / "applications"
    folder.mkdir(parents=True, exist_ok=True)
    for identifier, name, icon, kinds in (("Reader", "Reader", "accessories-dictionary", "application/pdf;text/plain;"),
                                          ("Writer", "Writer", "accessories-text-editor", "text/plain;text/csv;"),
                                          ("Post", "Post", "mail-unread", "x-scheme-handler/mailto;")):
        (folder / f"org.example.{identifier}.desktop").write_text(
            f"[Desktop Entry]\nType=Application\nName={name}\nIcon={icon}\nExec=true %u\nMimeType={kinds}\n")
    (folder / "mimeinfo.cache").write_text("[MIME Cache]\nx-scheme-handler/mailto=org.example.Post.desktop;\n"
                                           "application/pdf=org.example.Reader.desktop;\n")


def reduced(picture):
    """In 256 colours: those of the large areas as they are, the rest so that a small dot keeps its own."""
    exact = [color for _, color in sorted(picture.getcolors(picture.width * picture.height), reverse=True)[:128]]
    others = picture.quantize(128, Image.Quantize.MAXCOVERAGE).getpalette()[:3 * 128]
    palette = Image.new("P", (1, 1))
    palette.putpalette([value for color in exact for value in color] + others)
    return picture.quantize(palette=palette, dither=Image.Dither.NONE)


class Stage:
    def __init__(self, style, size, wanted, folder):
        self.style, self.size, self.wanted, self.folder = style, size, wanted, folder
        self.environment = STYLES[style]
        self.app = None
        self.latest = "the start"
        locale = pathlib.Path(harness.PROGRAM).parent / "locale"
        self.translations = gettext.translation("vaelo-drive", locale, [self.environment.get("LANGUAGE", "en")], fallback=True)

    @property
    def narrow(self):
        return self.size[0] < 600

    def start(self, prepare, demo=True):
        def all_prepared(app):
            settings = app.base / "config" / "gtk-4.0" / "settings.ini"
            settings.parent.mkdir(parents=True, exist_ok=True)
            settings.write_text("[Settings]\ngtk-cursor-blink=false\n")  # two pictures that differ in it would never be alike
            # Openbox draws no shadows, and the thick frame that stands for them is seen nowhere else.
            settings.with_name("gtk.css").write_text(
                "window.solid-csd { padding: 0; border: none; box-shadow: inset 0 0 0 1px alpha(currentColor, 0.15); }\n")
            prepare(app)
        self.app = TabletApp(size=self.size, screen=self.size, demo=demo, prepare=all_prepared, **self.environment)
        return self.app

    def close(self):
        if self.app:
            self.app.close()

    def text(self, text):
        """As it stands in the window: translated, and without the mark of its key."""
        return re.sub(r"\(_\w\)", "", self.translations.gettext(text)).replace("_", "")

    def wait(self, text, role=None):
        return self.app.wait(self.text(text).split("%", 1)[0], role)

    def wait_gone(self, text):
        self.app.wait_gone(self.text(text).split("%", 1)[0])

    def click(self, text, role="push button"):
        """On something in the window."""
        self.app.click(self.text(text), role)

    def press(self, text, role="push button"):
        """On something in the dialog or menu that is in front, whose place is told within its own window."""
        name = self.text(text)
        row = harness.wait_for(f"“{name}” in front; showing: {self.app.names()[:40]}", lambda: [
            row for row in self.app.accessibility.showing() if row[1].startswith(name) and row[0] == role])[-1]
        said = self.app.desktop.tool("xdotool", "getwindowfocus", "getwindowgeometry", "--shell")
        at = dict(line.split("=") for line in said.splitlines() if "=" in line)
        self.app.mouse("mousemove", "--sync", str(int(at["X"]) + row[2] + row[4] // 2), str(int(at["Y"]) + row[3] + row[5] // 2),
                       "click", "1")

    def choose(self, text):
        """From the menu that is open. Places in it are told as if it had not been moved to be on the screen."""
        name = self.text(text)
        self.point_nowhere()  # a tooltip would lie over the menu
        self.settle()

        def found():
            rows = self.app.accessibility.showing()
            menu = next((row for row in rows if row[0] == "menu"), None)
            return menu and [(menu, row) for row in rows if "menu item" in row[0] and row[1].startswith(name)]
        menu, item = harness.wait_for(f"“{name}” in a menu; showing: {self.app.names()[-20:]}", found)[0]
        windows = self.app.desktop.tool("xwininfo", "-root", "-tree")
        x, y = map(int, re.search(rf" {menu[4]}x{menu[5]}\S+\s+\+(-?\d+)\+(-?\d+)", windows).groups())
        x, y = x + item[2] - menu[2] + item[4] // 2, y + item[3] - menu[3] + item[5] // 2
        self.app.mouse("mousemove", "--sync", str(x), str(y), "click", "1")

    def to_row(self, letters):
        """The focus goes to the row whose name begins so."""
        self.app.type(letters)
        self.settle()

    def show(self, path, mode="preview"):
        """A document or folder of the drive, as a link to it does."""
        quoted = urllib.parse.quote(urllib.parse.quote(f"{self.app.drive}/{path}"))
        status, said = self.app.link(f"vaelodriveapp:{quoted}?mode={mode}")
        if status:
            raise AssertionError(said)
        if mode == "preview":
            self.app.wait_title(pathlib.PurePath(path).name)

    def point_nowhere(self):
        self.app.mouse("mousemove", str(self.size[0] - 1), str(self.size[1] - 1))

    def capture(self):
        path = self.app.desktop.scratch / "picture.png"
        self.app.desktop.tool("import", "-silent", "-window", "root", str(path))
        with Image.open(path) as picture:
            return picture.convert("RGB")

    def settle(self):
        """Until nothing moves any more, which other processes aren't told."""
        before = self.capture()
        for _ in range(12):
            harness.pause(0.25)
            now = self.capture()
            if not ImageChops.difference(before, now).getbbox():
                break
            before = now
        return before

    def shot(self, name):
        self.latest = name
        self.point_nowhere()
        # What is done next waits for it, too.
        picture = self.settle()
        if name not in self.wanted:
            return
        picture = reduced(picture)
        self.folder.mkdir(parents=True, exist_ok=True)
        picture.save(self.folder / f"{name}-{self.size[0]}x{self.size[1]}-{self.style}.png", optimize=True)
