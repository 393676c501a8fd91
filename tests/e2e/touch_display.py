# SPDX-License-Identifier: GPL-3.0-or-later
"""A display with a touch screen: an X server whose input driver takes its events from a socket."""
import os
import socket
import struct

from harness import App, Desktop, pause, wait_for

CONFIGURATION = """
Section "ServerFlags"
  Option "AutoAddDevices" "false"
  Option "AutoAddGPU" "false"
  Option "BlankTime" "0"
EndSection
Section "InputDevice"
  Identifier "finger"
  Driver "inputtest"
  Option "SocketPath" "{socket}"
  Option "DeviceType" "Touch"
  Option "TouchCount" "10"
EndSection
Section "InputDevice"
  Identifier "pointer"
  Driver "inputtest"
  Option "SocketPath" "{socket}-pointer"
  Option "DeviceType" "PointerAbsolute"
EndSection
Section "InputDevice"
  Identifier "keyboard"
  Driver "inputtest"
  Option "SocketPath" "{socket}-keyboard"
  Option "DeviceType" "Keyboard"
EndSection
Section "Device"
  Identifier "card"
  Driver "dummy"
  VideoRam 65536
EndSection
Section "Monitor"
  Identifier "monitor"
  HorizSync 5-1000
  VertRefresh 5-200
  Modeline "size" 100 {width} {width1} {width2} {width3} {height} {height1} {height2} {height3}
EndSection
Section "Screen"
  Identifier "screen"
  Device "card"
  Monitor "monitor"
  DefaultDepth 24
  SubSection "Display"
    Depth 24
    Modes "size"
    Virtual {width} {height}
  EndSubSection
EndSection
Section "ServerLayout"
  Identifier "layout"
  Screen "screen"
  InputDevice "finger"
  InputDevice "pointer" "CorePointer"
  InputDevice "keyboard" "CoreKeyboard"
EndSection
"""
CLIENT_VERSION, WAIT_FOR_SYNC, TOUCH_EVENT = 0, 1, 6
BEGIN, UPDATE, END = 18, 19, 20  # as the X input extension numbers them
AXES = 64
FULL_SCALE = 65536  # of an axis of the touch device


class TouchScreen:
    """What fingers do, in the display's coordinates."""

    def __init__(self, path, width, height):
        self.size = (width, height)
        self.socket = socket.socket(socket.AF_UNIX, socket.SOCK_STREAM)
        self.socket.connect(path)
        self.socket.sendall(struct.pack("<IIHH", 12, CLIENT_VERSION, 1, 1))
        self.socket.recv(12, socket.MSG_WAITALL)

    def touch(self, kind, x, y, finger=1):
        places = [(x + 0.5) * FULL_SCALE / self.size[0], (y + 0.5) * FULL_SCALE / self.size[1]] + [0.0] * (AXES - 2)
        head = struct.pack("<IIIII8s4x", 32 + 16 * AXES, TOUCH_EVENT, finger, kind, 0, bytes([3] + [0] * 7))
        self.socket.sendall(head + struct.pack(f"<{2 * AXES}d", *places, *places))
        self.socket.sendall(struct.pack("<II", 8, WAIT_FOR_SYNC))
        self.socket.recv(8, socket.MSG_WAITALL)

    def tap(self, x, y):
        self.touch(BEGIN, x, y)
        self.touch(END, x, y)

    def drag(self, start, end, seconds, steps=12):
        """A finger that goes from one place to the other and is lifted while it still moves."""
        self.touch(BEGIN, *start)
        for step in range(1, steps + 1):
            pause(seconds / steps)
            self.touch(UPDATE, *(a + (b - a) * step / steps for a, b in zip(start, end)))
        self.touch(END, *end)


class TouchDesktop(Desktop):
    def start_display(self, width, height, framebuffer):
        path = self.scratch / "finger"
        configuration = self.scratch / "xorg.conf"
        further = {f"{name}{i}": value + 20 * i for name, value in (("width", width), ("height", height)) for i in (1, 2, 3)}
        configuration.write_text(CONFIGURATION.format(socket=path, width=width, height=height, **further))
        reader, writer = os.pipe()
        # A seat of its own, so that it looks for no terminal.
        self.start(["/usr/lib/xorg/Xorg", "-displayfd", str(writer), "-config", str(configuration), "-seat", "test", "-nolisten",
                    "tcp", "-noreset", "-logfile", str(self.scratch / "xorg.log")], {}, (writer,))
        os.close(writer)
        with os.fdopen(reader) as display:
            self.environment.update({"DISPLAY": f":{display.readline().strip()}", "GDK_BACKEND": "x11"})
        wait_for("the touch screen", path.is_socket)
        self.screen = TouchScreen(str(path), width, height)

    def close(self):
        self.screen.socket.close()
        super().close()


class TouchApp(App):
    desktop_type = TouchDesktop

    def tap(self, name, role=None):
        self.desktop.screen.tap(*self.place(self.wait(name, role)))
