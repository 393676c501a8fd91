# SPDX-License-Identifier: GPL-3.0-or-later
"""The application's layers see the standard library alone; each forbidden header must make the check fail."""
import pathlib
import subprocess
import sys
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
CHECK = ROOT / "tools" / "check_layers.py"
LAYERS = {"platform": [], "items": ["platform"], "app": ["platform", "items", "fileops", "preview"],
          "fileops": ["platform", "items", "app", "preview"], "preview": ["platform", "items", "app", "fileops"]}
FORBIDDEN = ["<gtk/gtk.h>", "<adwaita.h>", "<glib.h>", "<gio/gio.h>", "<sqlite3.h>", "<unistd.h>", "<sys/stat.h>", "<fcntl.h>",
             "<stdio.h>", '"host/host_platform.h"', '"../host/x.h"', "HEADER_MACRO"]


def check(root, layer, used):
    return subprocess.run([sys.executable, CHECK, root, layer, *used], capture_output=True, text=True)


class Layers(unittest.TestCase):
    def test_the_layers_as_they_stand_pass(self):
        for layer, used in LAYERS.items():
            with self.subTest(layer):
                result = check(ROOT, layer, used)
                self.assertEqual(result.returncode, 0, result.stderr)

    def test_each_forbidden_header_fails_in_each_layer(self):
        for layer, used in LAYERS.items():
            for header in FORBIDDEN:
                with self.subTest(layer=layer, header=header), tempfile.TemporaryDirectory() as root:
                    folder = pathlib.Path(root) / layer
                    folder.mkdir()
                    (folder / "good.h").write_text('#include <vector>\n#include "platform/url.h"\n')
                    self.assertEqual(check(root, layer, used).returncode, 0)
                    (folder / "bad.cpp").write_text(f"#include <string>\n  #  include {header}\n")
                    result = check(root, layer, used)
                    self.assertNotEqual(result.returncode, 0)
                    self.assertIn("bad.cpp:2", result.stderr)

    def test_a_real_build_with_a_forbidden_header_fails(self):
        with tempfile.TemporaryDirectory() as scratch:
            root = pathlib.Path(scratch)
            for name in ("cmake/layers.cmake", "tools/check_layers.py"):
                (root / name).parent.mkdir(exist_ok=True)
                (root / name).write_text((ROOT / name).read_text())
            (root / "items").mkdir()
            (root / "CMakeLists.txt").write_text(
                "cmake_minimum_required(VERSION 3.25)\nproject(x CXX)\nset(CMAKE_CXX_STANDARD 20)\n"
                "add_library(vaelo_warnings INTERFACE)\ninclude(cmake/layers.cmake)\nvaelo_layer(items USES)\n")
            source = root / "items" / "a.cpp"
            source.write_text("#include <vector>\nstd::vector<int> a;\n")
            subprocess.run(["cmake", "-S", root, "-B", root / "b", "-G", "Ninja"], check=True, capture_output=True)
            build = ["cmake", "--build", root / "b"]
            self.assertEqual(subprocess.run(build, capture_output=True).returncode, 0)
            source.write_text("#include <unistd.h>\nint a = 0;\n")
            result = subprocess.run(build, capture_output=True, text=True)
            self.assertNotEqual(result.returncode, 0)
            self.assertIn("<unistd.h> is not a header of the C++ standard library", result.stdout + result.stderr)


if __name__ == "__main__":
    unittest.main()
