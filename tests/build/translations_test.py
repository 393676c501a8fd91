# SPDX-License-Identifier: GPL-3.0-or-later
"""Every text for people is in the template, and every language has it: each way to break that must make the checks fail."""
import pathlib
import shutil
import subprocess
import sys
import tempfile
import unittest

ROOT = pathlib.Path(__file__).resolve().parents[2]
FOLDERS = ("app", "data", "fileops", "host", "items", "platform", "po", "preview", "tools")


def translations(root):
    done = subprocess.run([sys.executable, root / "tools" / "translations", "--check"], capture_output=True, text=True)
    return done.returncode, done.stdout + done.stderr


def texts(source, folder="host/gtk"):
    with tempfile.TemporaryDirectory() as root:
        file = pathlib.Path(root) / folder / "page.cpp"
        file.parent.mkdir(parents=True)
        file.write_text(source)
        done = subprocess.run([sys.executable, ROOT / "tools" / "check_texts.py", root], capture_output=True, text=True)
        return done.returncode, done.stdout + done.stderr


class Texts(unittest.TestCase):
    def test_the_sources_as_they_stand_pass(self):
        done = subprocess.run([sys.executable, ROOT / "tools" / "check_texts.py", ROOT], capture_output=True, text=True)
        self.assertEqual(done.returncode, 0, done.stdout)

    def test_words_outside_a_mark_are_found(self):
        for source in ('gtk_label_new("Nothing found");', 'return "Back";', 'toast("“" + name + "” copied");',
                       'menu.append("_Refresh");', 'menu.append("Se_lect");', 'auto text = count + " items so far";',
                       'g_signal_connect(button, "clicked", +[](P* self) { self->toast("Link copied"); });',
                       'show({"All done"});', 'std::string text = "Downloading… ";', 'log.write(text, f("Nothing here"));'):
            with self.subTest(source):
                status, said = texts(f"void f() {{\n  {source}\n}}\n")
                self.assertEqual(status, 1)
                self.assertIn("page.cpp:2: ", said)

    def test_of_several_texts_in_a_mark_only_the_first_would_be_extracted(self):
        for source in ('set(_(full ? "Full" : "Empty"));', 'set(localized(full ? "Full" : "Empty"));'):
            with self.subTest(source):
                self.assertIn("is one of several texts", texts(f"void f() {{\n  {source}\n}}\n")[1])

    def test_marked_words_and_words_for_programs_pass(self):
        for source in ('gtk_label_new(_("Nothing found"));', 'show(full ? _("Full") : _("Empty"));',
                       'filled(ngettext("%s item", "%s items", n), {number(n)});', '// "Not found" is for people',
                       'log.write(Error, "search: can\'t read " + name);', 'g_signal_connect(a, "notify::is-active", f, b);',
                       'set("edit-clear-symbolic");', 'constexpr E all[] = {{1, N_("_Open")}, {2, N_("_Move…")}};',
                       'std::string key = "Some words"  // not for people', 'auto big = 1\'000; x("plain");'):
            with self.subTest(source):
                self.assertEqual(texts(f"void f() {{\n  {source}\n}}\n"), (0, "\n"))


class Translations(unittest.TestCase):
    """On a copy of the sources, with one thing changed in each case."""

    def setUp(self):
        scratch = tempfile.TemporaryDirectory()
        self.addCleanup(scratch.cleanup)
        self.root = pathlib.Path(scratch.name)
        for folder in FOLDERS:
            shutil.copytree(ROOT / folder, self.root / folder)

    def replace(self, file, old, new):
        path = self.root / file
        text = path.read_text()
        self.assertIn(old, text)
        path.write_text(text.replace(old, new))

    def check_says(self, *words):
        status, said = translations(self.root)
        self.assertEqual(status, 1)
        for word in words:
            self.assertIn(word, said)

    def test_as_they_stand_they_pass(self):
        self.assertEqual(translations(self.root), (0, "translations: nothing to say\n"))

    def test_a_new_text_is_missed_in_the_template(self):
        self.replace("host/gtk/screen_page.cpp", '_("Main Menu")', '_("Chief Menu")')
        self.check_says("misses “Chief Menu”")

    def test_a_new_text_of_the_application_is_missed(self):
        self.replace("app/nav_controller_edit.cpp", 'localized("Select")', 'localized("Choose")')
        self.check_says("misses “Choose”")

    def test_a_new_text_of_the_desktop_file_is_missed(self):
        self.replace("data/com.marrow.VaeloDrive.desktop", "Name=Search", "Name=Look")
        self.check_says("misses “Look”")

    def test_a_text_that_is_gone_is_told(self):
        self.replace("host/gtk/share_sheet.cpp", '_("Share %s")', 'item.kind')
        self.check_says("has “Share %s”, which is in no source any more")

    def test_a_text_without_a_translation_is_told(self):
        self.replace("po/de.po", 'msgstr "Hauptmenü"', 'msgstr ""')
        self.check_says("po/de.po: untranslated: “Main Menu”")

    def test_a_guess_is_no_translation(self):
        self.replace("po/ja.po", 'msgid "Main Menu"', '#, fuzzy\nmsgid "Main Menu"')
        self.check_says("po/ja.po: fuzzy: “Main Menu”")

    def test_a_missing_plural_form_is_told(self):
        self.replace("po/ru.po", 'msgstr[2] "%s файлов"', 'msgstr[2] ""')
        self.check_says("po/ru.po:")

    def test_what_is_filled_in_must_be_the_same(self):
        for language, old, new in (("fr", "Partager %s", "Partager"), ("ar", "«\u2068%@\u2069» بالفعل", "«%s» بالفعل"),
                                   ("ru", "%s файлов", "файлов"), ("de", "%@\u00a0MB", "%@ %@\u00a0MB")):
            with self.subTest(language):
                kept = (self.root / "po" / f"{language}.po").read_text()
                self.replace(f"po/{language}.po", old, new)
                self.check_says(f"{language}.po:")
                (self.root / "po" / f"{language}.po").write_text(kept)

    def test_a_letter_to_press_that_is_lost_is_told(self):
        self.replace("po/fr.po", 'msgstr "_Copier"', 'msgstr "Copier"')
        self.check_says("po/fr.po:")

    def test_entries_of_a_menu_have_letters_of_their_own(self):
        for file, old, new, letter in (("po/ru.po", 'msgstr "_Копировать"', 'msgstr "_Скопировать"', "с"),
                                       ("po/ja.po", 'msgstr "コピー(_C)"', 'msgstr "コピー(_H)"', "h"),
                                       ("po/vaelo-drive.pot", 'msgid "_Copy"', 'msgid "_Hopy"', "h")):
            with self.subTest(file):
                kept = (self.root / file).read_text()
                self.replace(file, old, new)
                self.check_says(f"{file}: “{letter}” is the letter of several texts of host/gtk/preview/pages_selecting.cpp")
                (self.root / file).write_text(kept)

    def test_a_language_with_other_texts_than_the_template_is_told(self):
        self.replace("po/fr.po", 'msgid "Main Menu"', 'msgid "Chief Menu"')
        self.check_says("po/fr.po: has other texts than the template")

    def test_the_list_of_files_is_kept(self):
        self.replace("po/POTFILES.in", "host/gtk/share_sheet.cpp\n", "")
        self.check_says("po/POTFILES.in: not the files that have texts")

    def test_updating_takes_new_texts_up_and_keeps_the_others(self):
        self.replace("host/gtk/upgrade_flow.cpp", '_("See Offers")', '_("Look at Offers")')
        subprocess.run([sys.executable, self.root / "tools" / "translations"], check=True)
        german = (self.root / "po" / "de.po").read_text()
        self.assertTrue('msgid "Look at Offers"\nmsgstr ""\n' in german)
        self.assertFalse("Angebote ansehen" in german)
        self.assertTrue('msgstr "Abbrechen"' in german)
        self.check_says("untranslated: “Look at Offers”")


if __name__ == "__main__":
    unittest.main()
