// SPDX-License-Identifier: GPL-3.0-or-later
// With a stand-in for the office suite: what is tested is how it is run, bounded and left.
#include <cairo-pdf.h>
#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "host/gtk/preview/office_conversion.h"
#include "tests/host/preview_view_test.h"

namespace vaelo {
namespace {

using list_test::waitUntil;

constexpr const char* LetterType = "application/vnd.oasis.opendocument.text";

class PreviewOfficeTest : public preview_test::PreviewViewTest {
 protected:
  void SetUp() override {
    PreviewViewTest::SetUp();
    path_ = std::getenv("PATH");
    bin_ = pathOf("bin");
    std::filesystem::create_directory(bin_);
    for (const char* program : {"cp", "mkdir", "bash", "tail"}) {
      std::filesystem::create_symlink("/bin/" + std::string(program), bin_ + "/" + program);
    }
    ::setenv("PATH", bin_.c_str(), 1);
    makePortableDocument();
    folder_.write("Letter.odt", "PK\x03\x04 a letter");
  }
  void TearDown() override {
    PreviewViewTest::TearDown();
    if (!path_.empty()) ::setenv("PATH", path_.c_str(), 1);
  }
  void makePortableDocument() {
    cairo_surface_t* surface = cairo_pdf_surface_create(pathOf("made.pdf").c_str(), 300, 400);
    cairo_t* cairo = cairo_create(surface);
    cairo_rectangle(cairo, 50, 50, 100, 100);
    cairo_fill(cairo);
    cairo_destroy(cairo);
    cairo_surface_destroy(surface);
  }
  /// The suite's program: arguments are kept, and then `script` runs with $out as the folder for what it makes.
  void install(const std::string& script, const std::string& name = "soffice") {
    const std::string path = bin_ + "/" + name;
    std::ofstream(path) << "#!/bin/bash\nprintf '%s\\n' \"$@\" >" << pathOf("arguments") << "\necho $$ >"
                        << pathOf("process") << "\nwhile [ \"$1\" != --outdir ]; do shift; done\nout=$2\n"
                        << script << "\n";
    ::chmod(path.c_str(), 0755);
  }
  void installOneThatWorks() { install("mkdir -p \"$out\"; cp " + pathOf("made.pdf") + " \"$out/Letter.pdf\""); }
  std::string content(const std::string& name) {
    std::ifstream file(pathOf(name));
    return {std::istreambuf_iterator<char>(file), {}};
  }
  bool isRunning(const std::string& process) {
    std::ifstream status("/proc/" + process + "/stat");
    std::string number;
    std::string name;
    std::string state;
    return status >> number >> name >> state && state != "Z" && state != "X";
  }
  /// Of the numbers in the file, which the stand-in wrote.
  bool areRunning(const std::string& name) {
    std::ifstream file(pathOf(name));
    std::string process;
    while (file >> process) {
      if (isRunning(process)) return true;
    }
    return false;
  }

  std::string path_;
  std::string bin_;
};

TEST_F(PreviewOfficeTest, WithoutASuiteThereIsNoView) {
  EXPECT_FALSE(hasDocumentView(LetterType));
  installOneThatWorks();
  for (const char* type : {LetterType, "application/msword", "application/rtf", "application/vnd.ms-excel",
                           "application/vnd.openxmlformats-officedocument.presentationml.presentation",
                           "application/vnd.openxmlformats-officedocument.wordprocessingml.document",
                           "application/vnd.oasis.opendocument.spreadsheet"}) {
    EXPECT_TRUE(hasDocumentView(type)) << type;
  }
}

TEST_F(PreviewOfficeTest, ADocumentIsShownAsPagesAndLeavesNothingBehind) {
  installOneThatWorks();
  begin("Letter.odt", LetterType);
  EXPECT_EQ(progress_, "") << "not from within the constructor";
  ASSERT_TRUE(waitUntil([this] { return shown_ > 0 || !failure_.empty(); }));
  EXPECT_EQ(failure_, "");
  EXPECT_EQ(progress_, "Preparing the document to be shown");
  const std::string arguments = content("arguments");
  const std::size_t profile = arguments.find("-env:UserInstallation=file:///");
  ASSERT_NE(profile, std::string::npos) << arguments;
  const std::size_t begins = profile + std::string("-env:UserInstallation=file://").size();
  const std::string folder =
      std::filesystem::path(arguments.substr(begins, arguments.find('\n', begins) - begins)).parent_path();
  EXPECT_NE(arguments.find("--headless\n"), std::string::npos);
  EXPECT_NE(arguments.find("\n" + pathOf("Letter.odt") + "\n"), std::string::npos);
  struct stat status = {};
  ASSERT_EQ(::stat(folder.c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777U, 0700U) << "nobody else may read it";
  leave();
  EXPECT_TRUE(waitUntil([&] {
    g_main_context_wakeup(nullptr);
    return !std::filesystem::exists(folder);
  }));
}

TEST_F(PreviewOfficeTest, TheOtherNameOfTheSuiteIsKnownToo) {
  install("mkdir -p \"$out\"; cp " + pathOf("made.pdf") + " \"$out/Letter.pdf\"", "libreoffice");
  open("Letter.odt", LetterType);
  EXPECT_EQ(failure_, "");
}

TEST_F(PreviewOfficeTest, ADocumentThatChangedIsConvertedAnew) {
  installOneThatWorks();
  open("Letter.odt", LetterType);
  ASSERT_EQ(failure_, "");
  const std::string first = content("process");
  view_->refresh();
  EXPECT_TRUE(waitUntil([&] {
    g_main_context_wakeup(nullptr);
    return content("process") != first && !content("process").empty();
  }));
  for (int i = 0; i < 50; ++i) g_main_context_iteration(nullptr, FALSE);
  EXPECT_EQ(failure_, "");
}

TEST_F(PreviewOfficeTest, ASuiteThatFailsSaysSo) {
  install("exit 1");
  open("Letter.odt", LetterType);
  EXPECT_EQ(failure_, "This document can’t be shown. It may be damaged or protected by a password.");
  install("mkdir -p \"$out\"; echo no document >\"$out/Letter.pdf\"");
  open("Letter.odt", LetterType);
  EXPECT_EQ(failure_, "This document is damaged and can’t be shown.");
}

// Which would show it as a text of odd letters.
TEST_F(PreviewOfficeTest, WhatIsNoArchiveIsNotGivenToTheSuite) {
  installOneThatWorks();
  for (const char* content : {"no letter", "PK"}) {
    folder_.write("Letter.odt", content);
    open("Letter.odt", LetterType);
    EXPECT_EQ(failure_, "This document can’t be shown. It may be damaged or protected by a password.") << content;
    EXPECT_EQ(this->content("process"), "");
  }
  open("Letter.odt", "application/msword");
  EXPECT_EQ(failure_, "") << "letters of old are of many forms";
  folder_.write("Letter.odt", "\xd0\xcf\x11\xe0 encrypted");
  open("Letter.odt", LetterType);
  EXPECT_EQ(failure_, "") << "the suite says why";
}

TEST_F(PreviewOfficeTest, LeavingEndsTheSuiteWithAllItsProcesses) {
  install("tail -f /dev/null & echo $! >>" + pathOf("process") + "; echo >" + pathOf("ready") + "; wait");
  begin("Letter.odt", LetterType);
  ASSERT_TRUE(waitUntil([this] {
    g_main_context_wakeup(nullptr);
    return content("ready") != "";
  }));
  EXPECT_TRUE(areRunning("process"));
  leave();
  EXPECT_TRUE(waitUntil([this] {
    g_main_context_wakeup(nullptr);
    return !areRunning("process");
  }));
}

TEST_F(PreviewOfficeTest, ASuiteThatHangsIsEnded) {
  install("tail -f /dev/null & echo $! >>" + pathOf("process") + "; wait");
  bool done = false;
  OfficeConversion::Problem problem = OfficeConversion::Problem::None;
  OfficeConversion conversion(
      pathOf("Letter.odt"), OfficeConversion::Form::Packed,
      [&](const std::string& document, OfficeConversion::Problem said) {
        EXPECT_EQ(document, "");
        problem = said;
        done = true;
      },
      std::chrono::milliseconds(500));
  ASSERT_TRUE(waitUntil([&] { return done; }));
  EXPECT_EQ(problem, OfficeConversion::Problem::TooSlow);
  EXPECT_TRUE(waitUntil([this] {
    g_main_context_wakeup(nullptr);
    return !areRunning("process");
  }));
}

}  // namespace
}  // namespace vaelo
