# SPDX-License-Identifier: GPL-3.0-or-later
"""Runs the application in a real window: an X server, a window manager and a session bus of its own; finds things by name through
the accessibility tree, and uses real pointer and key events.

The application under test is $VAELO_DRIVE, else build/debug/vaelo-drive.
"""
import os
import pathlib
import select
import shutil
import signal
import subprocess
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
PROGRAM = os.environ.get("VAELO_DRIVE", str(ROOT / "build" / "debug" / "vaelo-drive"))
PATIENCE = 20


def pause(seconds):
    """Between two looks at another process, which has no event to wait for."""
    select.select([], [], [], seconds)


def wait_for(what, condition, patience=PATIENCE):
    """The first true answer of `condition`; fails with `what`, words or what answers them, after `patience` seconds."""
    end = time.monotonic() + patience
    while time.monotonic() < end:
        answer = condition()
        if answer:
            return answer
        pause(0.05)
    raise AssertionError(f"waited {patience} s for: {what() if callable(what) else what}")


class Desktop:
    """An X server with a window manager and a session bus."""

    def __init__(self, width=1280, height=800, framebuffer=False):
        self.scratch = pathlib.Path(tempfile.mkdtemp(prefix="vaelo-e2e-"))
        self.processes = []
        self.framebuffer = self.scratch  # holds the display's picture, when asked for
        runtime = self.scratch / "run"
        runtime.mkdir(mode=0o700)
        home = self.scratch / "home"
        home.mkdir()
        self.environment = {
            **{key: value for key, value in os.environ.items() if not key.startswith(("XDG_", "DBUS_", "WAYLAND", "AT_SPI"))},
            "GSK_RENDERER": "cairo", "XDG_RUNTIME_DIR": str(runtime), "HOME": str(home), "GSETTINGS_BACKEND": "memory",
            "GTK_A11Y": "atspi", "ADW_DISABLE_PORTAL": "1", "LC_ALL": "C.UTF-8", "NO_AT_BRIDGE": "0"}
        self.start_display(width, height, framebuffer)
        bus = subprocess.run(["dbus-daemon", "--session", "--fork", "--print-address=1", "--print-pid=1"], check=True,
                             capture_output=True, text=True, env=self.environment).stdout.split()
        self.environment["DBUS_SESSION_BUS_ADDRESS"] = bus[0]
        self.bus_pid = int(bus[1])
        self.start_window_manager()
        # A window that comes while it is starting may stay unseen.
        wait_for("the window manager", lambda: "window id" in self.tool("xprop", "-root", "_NET_SUPPORTING_WM_CHECK"))

    def start_display(self, width, height, framebuffer):
        reader, writer = os.pipe()
        # It would begin anew when its last client leaves, and refuse who comes just then.
        self.start(["Xvfb", "-displayfd", str(writer), "-screen", "0", f"{width}x{height}x24", "-nolisten", "tcp", "-noreset",
                    *(["-fbdir", str(self.scratch)] if framebuffer else [])], {}, (writer,))
        os.close(writer)
        with os.fdopen(reader) as display:
            self.environment.update({"DISPLAY": f":{display.readline().strip()}", "GDK_BACKEND": "x11"})

    def start_window_manager(self):
        self.start(["openbox", "--sm-disable"], self.environment)

    def start(self, command, environment, descriptors=(), log=None):
        out = open(log, "wb") if log else subprocess.DEVNULL
        process = subprocess.Popen(command, env={**os.environ, **environment} if not environment else environment, stdout=out,
                                   stderr=subprocess.STDOUT if log else subprocess.DEVNULL, pass_fds=descriptors)
        self.processes.append(process)
        return process

    def tool(self, *command):
        return subprocess.run(command, env=self.environment, check=True, capture_output=True, text=True).stdout

    def close(self):
        for process in reversed(self.processes):
            process.terminate()
            try:
                process.wait(5)
            except subprocess.TimeoutExpired:
                process.kill()
        os.kill(self.bus_pid, signal.SIGTERM)
        shutil.rmtree(self.scratch, ignore_errors=True)


class Accessibility:
    """The accessibility tree of a desktop, asked in a process of its own, since a process can see but one bus."""

    def __init__(self, desktop):
        helper = pathlib.Path(__file__).with_name("accessibility_tree.py")
        self.process = subprocess.Popen(["/usr/bin/python3", str(helper)], env=desktop.environment, stdin=subprocess.PIPE,
                                        stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, text=True)
        desktop.processes.append(self.process)

    def ask(self, question):
        """The fields of each row of the answer."""
        self.process.stdin.write(question + "\n")
        self.process.stdin.flush()
        rows = []
        for line in self.process.stdout:
            if line == "end\n":
                return rows
            rows.append(line.rstrip("\n").split("\t"))
        raise AssertionError("the accessibility helper ended")

    def showing(self):
        """(role, name, x, y, width, height, sensitive) of everything that shows in the application's window."""
        return [(role, name, *map(int, numbers)) for role, name, *numbers in self.ask("tree")]

    def controls(self):
        """(role, name, description, whether the keyboard reaches it) of everything that can be used and shows."""
        return [(role, name, description, focusable == "1") for role, name, description, focusable in self.ask("controls")]

    def focused(self):
        """(role, name) of what has the keyboard in each window."""
        return [(role, name) for role, name in self.ask("focus")]


class App:
    """The application on a data folder of its own."""

    desktop_type = Desktop

    def __init__(self, size=(800, 640), demo=False, prepare=None, arguments=(), screen=(1280, 800), **environment):
        self.desktop = self.desktop_type(*screen)
        self.base = self.desktop.scratch / "drive"
        self.data = self.base / "data" / "vaelo-drive"
        self.drive = self.data / "mirror" / "com~marrow~Kestrel"
        self.log_file = self.desktop.scratch / "log"
        if demo:
            subprocess.run([str(ROOT / "tools" / "make-demo-drive"), str(self.base)], check=True)
        for name in ("data", "config", "state", "cache"):
            (self.base / name).mkdir(parents=True, exist_ok=True)
            self.desktop.environment[f"XDG_{name.upper()}_HOME"] = str(self.base / name)
        self.desktop.environment.update({"G_MESSAGES_DEBUG": "vaelo-drive", **environment})
        if prepare:
            prepare(self)
        self.process = self.desktop.start([PROGRAM, *arguments], self.desktop.environment, log=self.log_file)
        self.show_window(size)
        self.accessibility = Accessibility(self.desktop)

    def show_window(self, size):
        self.window = wait_for("the window", self.find_window).split()[0]
        self.resize(*size)
        self.desktop.tool("xdotool", "windowmove", self.window, "0", "0")

    def resize(self, width, height):
        # A window that is narrow takes less room in its header bar, and may be narrower still.
        for _ in range(10):
            self.desktop.tool("xdotool", "windowsize", self.window, str(width), str(height))
            pause(0.1)
            geometry = self.desktop.tool("xdotool", "getwindowgeometry", self.window)
            if f"Geometry: {width}x{height}" in geometry:
                break

    def find_window(self):
        if self.process.poll() is not None:
            raise AssertionError("the application ended:\n" + self.log())
        found = subprocess.run(["xdotool", "search", "--onlyvisible", "--name", "Vaelo Drive"], env=self.desktop.environment,
                               capture_output=True, text=True)
        return found.stdout.strip()

    def close(self):
        self.desktop.close()

    def log(self):
        return self.log_file.read_text(errors="replace")

    def running(self):
        return self.process.poll() is None

    def names(self):
        return [row[1] for row in self.accessibility.showing()]

    def find(self, name, role=None):
        """The first thing that shows whose name begins so, or None."""
        return next((row for row in self.accessibility.showing() if row[1].startswith(name) and role in (None, row[0])), None)

    def wait(self, name, role=None):
        return wait_for(lambda: f"“{name}” to show; showing: {self.names()[:40]}", lambda: self.find(name, role))

    def wait_gone(self, name):
        wait_for(f"“{name}” to go", lambda: not self.find(name))

    def place(self, row):
        """The middle of a row in the display's coordinates: the window may begin with its shadow or border."""
        geometry = dict(line.split("=") for line in
                        self.desktop.tool("xdotool", "getwindowgeometry", "--shell", self.window).splitlines())
        frame = self.find("Vaelo Drive", "frame")
        left = int(geometry["X"]) + (int(geometry["WIDTH"]) - frame[4]) // 2
        top = int(geometry["Y"]) + (int(geometry["HEIGHT"]) - frame[5]) // 2
        return left + row[2] + row[4] // 2, top + row[3] + row[5] // 2

    def click(self, name, role=None, button=1):
        x, y = self.place(self.wait(name, role))
        self.desktop.tool("xdotool", "mousemove", "--sync", str(x), str(y), "click", str(button))

    def wait_title(self, title):
        """Until the header bar of the page that shows has the title."""
        wait_for(lambda: f"the title “{title}”; showing: {self.names()[:20]}",
                 lambda: any(row[0] == "label" and row[1] == title and row[3] < 46 for row in self.accessibility.showing()))

    def wait_log(self, text):
        wait_for(f"“{text}” in the log", lambda: text in self.log())

    def mouse(self, *words):
        self.desktop.tool("xdotool", *words)

    def key(self, *keys):
        self.desktop.tool("xdotool", "key", *keys)

    def type(self, text):
        self.desktop.tool("xdotool", "type", text)

    def link(self, *links):
        """Starts the application once more with links; answers its exit status and what it said."""
        done = subprocess.run([PROGRAM, *links], env=self.desktop.environment, capture_output=True, text=True, timeout=PATIENCE)
        return done.returncode, done.stdout + done.stderr

    def screenshot(self, path=None):
        path = pathlib.Path(path or self.desktop.scratch / "shot.png")
        path.parent.mkdir(parents=True, exist_ok=True)
        self.desktop.tool("import", "-silent", "-window", self.window, str(path))
        return path
