// SPDX-License-Identifier: GPL-3.0-or-later
// Damaged and hostile documents of every kind, one after another through one preview page as the application has it. It
// takes long, so it is a test of its own beside the host's others.
#include <sys/resource.h>

#include <chrono>
#include <cstdio>

#include "host/gtk/preview/document_view.h"
#include "tests/host/child_processes.h"
#include "tests/host/list_test_folder.h"
#include "tests/host/preview_page_support.h"

namespace vaelo {
namespace {

constexpr std::chrono::milliseconds Patience(2000);
constexpr std::chrono::seconds MostTime(9);  // on a machine that has much else to do
constexpr long Mebibyte = 1024;              // in the kernel's unit
constexpr long MostGrowth = 48 * Mebibyte;
constexpr long MostForOne = 64 * Mebibyte;
constexpr long MostForADecoder = 1536 * Mebibyte;

/// In KiB; 0 when the kernel doesn't tell.
long statusValue(const std::string& name) {
  std::ifstream status("/proc/self/status");
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with(name + ":")) return std::strtol(line.c_str() + name.size() + 1, nullptr, 10);
  }
  return 0;
}

void forgetPeak() { std::ofstream("/proc/self/clear_refs") << "5"; }

class BadInputCorpusTest : public preview_test::PreviewPageTest {
 protected:
  enum class Found { Nothing, Document, Message };

  void SetUp() override {
    PreviewPageTest::SetUp();
    if (!window) return;
    std::filesystem::create_directories(drive + "/Damaged");
    write(drive + "/Whole.txt", "A document that is as it should be.\n");
    show(drive + "/Whole.txt", Patience);
    ASSERT_TRUE(ends());
    ASSERT_EQ(found(), Found::Document) << said();
  }

  std::vector<std::string> make(const std::string& kind) {
    const std::string command = "/usr/bin/python3 '" VAELO_DAMAGED_FILES "' '" + drive + "/Damaged' " + kind;
    FILE* made = ::popen(command.c_str(), "r");
    std::vector<std::string> names;
    std::string line;
    for (int byte = std::fgetc(made); byte != EOF; byte = std::fgetc(made)) {
      if (byte != '\n') {
        line += static_cast<char>(byte);
        continue;
      }
      names.push_back(line.substr(line.find('\t') + 1));
      line.clear();
    }
    EXPECT_EQ(::pclose(made), 0) << command;
    return names;
  }

  Found found() const {
    GtkStack* stack = GTK_STACK(page->widget());
    GtkWidget* child = gtk_stack_get_visible_child(stack);
    const char* name = gtk_stack_page_get_name(gtk_stack_get_page(stack, child));
    return !name ? Found::Document : name == std::string("facts") ? Found::Message : Found::Nothing;
  }

  void load(const std::string& path) {
    // What was seen last would stay until then, and be taken for the document's own.
    gtk_stack_set_visible_child_name(GTK_STACK(page->widget()), "empty");
    source->pointTo(path);
    controller->reloadData();
  }

  bool ends() const {
    const auto begun = std::chrono::steady_clock::now();
    list_test::waitUntil([this] { return found() != Found::Nothing; });
    return found() != Found::Nothing && std::chrono::steady_clock::now() - begun < MostTime;
  }

  void waitUntilPainted() {
    bool painted = false;
    GdkFrameClock* clock = gtk_widget_get_frame_clock(window);
    const gulong handler =
        g_signal_connect(clock, "after-paint", G_CALLBACK(+[](GdkFrameClock*, bool* flag) { *flag = true; }), &painted);
    gtk_widget_queue_draw(window);
    EXPECT_TRUE(list_test::waitUntil([&] { return painted; }));
    g_signal_handler_disconnect(clock, handler);
  }

  static bool labelShows(GtkWidget* widget, const std::string& text) {
    if (GTK_IS_LABEL(widget)) return std::string(gtk_label_get_text(GTK_LABEL(widget))).starts_with(text);
    for (GtkWidget* child = gtk_widget_get_first_child(widget); child; child = gtk_widget_get_next_sibling(child)) {
      if (labelShows(child, text)) return true;
    }
    return false;
  }

  static std::string typeOf(const std::string& path) {
    const GRef<GFile> file(g_file_new_for_path(path.c_str()));
    const GRef<GFileInfo> info(
        g_file_query_info(file.get(), G_FILE_ATTRIBUTE_STANDARD_CONTENT_TYPE, G_FILE_QUERY_INFO_NONE, nullptr, nullptr));
    return info ? g_file_info_get_content_type(info.get()) : "";
  }

  void open(const std::string& name) {
    const std::string path = drive + "/Damaged/" + name;
    forgetPeak();
    const long before = statusValue("VmRSS");
    load(path);
    ASSERT_TRUE(ends()) << name;
    waitUntilPainted();
    EXPECT_LT(statusValue("VmHWM") - before, MostForOne) << name;
    if (found() == Found::Document) return;
    const std::string words = said();
    if (hasDocumentView(typeOf(path))) {
      const std::size_t sentence = words.find("\n\n");
      EXPECT_NE(sentence, std::string::npos) << name << ": " << words;
      EXPECT_TRUE(words.ends_with('.')) << name << ": " << words;
    } else {
      EXPECT_TRUE(words.starts_with(name)) << words;
    }
  }

  void openAll(const std::string& kind, std::size_t atLeast) {
    const std::vector<std::string> names = make(kind);
    ASSERT_GE(names.size(), atLeast);
    open(names.front());
    const long before = statusValue("VmRSS");
    for (const std::string& name : names) open(name);
    load(drive + "/Whole.txt");
    ASSERT_TRUE(ends());
    EXPECT_EQ(found(), Found::Document) << "the next document is not harmed";
    EXPECT_LT(statusValue("VmRSS") - before, MostGrowth);
    EXPECT_TRUE(list_test::waitUntil([] {
      g_main_context_wakeup(nullptr);
      return childProcesses().size() <= 1;  // one waits for the next document
    })) << "a decoder is left";
    rusage usage = {};
    ASSERT_EQ(::getrusage(RUSAGE_CHILDREN, &usage), 0);
    EXPECT_LT(usage.ru_maxrss, MostForADecoder);
  }
};

TEST_F(BadInputCorpusTest, Pictures) { openAll("picture", 60); }

TEST_F(BadInputCorpusTest, PortableDocuments) { openAll("document", 20); }

TEST_F(BadInputCorpusTest, Archives) { openAll("archive", 25); }

TEST_F(BadInputCorpusTest, Texts) { openAll("text", 14); }

TEST_F(BadInputCorpusTest, ATextOfTwoGibibytesEndsWhereItIsLongEnough) {
  make("text");
  forgetPeak();
  const long before = statusValue("VmRSS");
  open("Two gibibytes.txt");
  ASSERT_EQ(found(), Found::Document) << said();
  EXPECT_TRUE(list_test::waitUntil([this] { return labelShows(page->widget(), "Only the first "); }));
  EXPECT_LT(statusValue("VmHWM") - before, MostForOne);
}

TEST_F(BadInputCorpusTest, SoundAndFilm) { openAll("media", 6); }

}  // namespace
}  // namespace vaelo
