// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/office_conversion.h"

#include <fcntl.h>
#include <gio/gio.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <string_view>
#include <utility>

#include "host/support/glib_ptr.h"

namespace vaelo {

namespace {

namespace fs = std::filesystem;

constexpr rlim_t MostWritten = 512 * 1024 * 1024;  // bytes of a file

std::string program() {
  for (const char* name : {"soffice", "libreoffice"}) {
    const std::string found = takeString(g_find_program_in_path(name));
    if (!found.empty()) return found;
  }
  return "";
}

struct Child {
  const char* path;
  OfficeConversion::Form form;
};

bool isPacked(const char* path) {
  const int file = ::open(path, O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
  const std::string_view forms[] = {"PK\x03\x04", "\xd0\xcf\x11\xe0"};
  char begin[4] = {};
  const bool isRead = file >= 0 && ::read(file, begin, sizeof begin) == sizeof begin;
  if (file >= 0) ::close(file);
  return isRead && (forms[0] == std::string_view(begin, sizeof begin) || forms[1] == std::string_view(begin, sizeof begin));
}

// In the child, before it becomes the office suite, whose processes all belong to one group then. Nothing else may be done
// here than what a signal handler may do.
void prepareChild(gpointer data) {
  const auto* child = static_cast<const Child*>(data);
  if (child->form == OfficeConversion::Form::Packed && !isPacked(child->path)) ::_exit(EXIT_FAILURE);
  ::setpgid(0, 0);
  ::prctl(PR_SET_PDEATHSIG, SIGKILL);
  const rlimit written = {MostWritten, MostWritten};
  ::setrlimit(RLIMIT_FSIZE, &written);
}

std::string portableDocumentIn(const std::string& folder) {
  std::error_code problem;
  for (const fs::directory_entry& entry : fs::directory_iterator(folder, problem)) {
    if (entry.path().extension() == ".pdf" && entry.is_regular_file(problem)) return entry.path();
  }
  return "";
}

}  // namespace

/// Lives as long as the process or the object, whichever is longer, since the folder can't go before.
struct OfficeConversion::State {
  std::string folder;
  GRef<GSubprocess> process;
  pid_t group = 0;                         // zero when the process has ended
  OfficeConversion* conversion = nullptr;  // null when it is gone, or has its result

  // Where there is a folder for this session, what a crash leaves behind goes with the session.
  State() {
    const char* runtime = g_getenv("XDG_RUNTIME_DIR");
    std::string pattern = std::string(runtime ? runtime : g_get_tmp_dir()) + "/vaelo-office-XXXXXX";
    if (::mkdtemp(pattern.data())) folder = pattern;
  }

  ~State() {
    std::error_code ignored;
    if (!folder.empty()) fs::remove_all(folder, ignored);
  }

  State(const State&) = delete;
  State& operator=(const State&) = delete;

  bool start(const std::string& path, Form form) {
    if (folder.empty()) return false;
    const GRef<GSubprocessLauncher> launcher(g_subprocess_launcher_new(
        static_cast<GSubprocessFlags>(G_SUBPROCESS_FLAGS_STDOUT_SILENCE | G_SUBPROCESS_FLAGS_STDERR_SILENCE)));
    Child child = {path.c_str(), form};
    g_subprocess_launcher_set_child_setup(launcher.get(), prepareChild, &child, nullptr);
    g_subprocess_launcher_set_cwd(launcher.get(), folder.c_str());
    g_subprocess_launcher_setenv(launcher.get(), "TMPDIR", folder.c_str(), TRUE);
    const std::string profile = "-env:UserInstallation=file://" + folder + "/profile";
    const std::string out = folder + "/out";
    process.reset(g_subprocess_launcher_spawn(launcher.get(), nullptr, program().c_str(), profile.c_str(), "--headless",
                                              "--norestore", "--nolockcheck", "--convert-to", "pdf", "--outdir", out.c_str(),
                                              path.c_str(), nullptr));
    if (!process) return false;
    // One that has ended by now has none any more.
    const char* identifier = g_subprocess_get_identifier(process.get());
    group = identifier ? static_cast<pid_t>(std::atoi(identifier)) : 0;
    return true;
  }

  void stop() {
    if (group > 0) ::kill(-group, SIGKILL);
  }
};

OfficeConversion::OfficeConversion(const std::string& path, Form form, Done done, std::chrono::milliseconds limit)
    : state_(std::make_shared<State>()), done_(std::move(done)) {
  state_->conversion = this;
  const bool started = state_->start(path, form);
  timer_ = g_timeout_add(
      started ? static_cast<guint>(limit.count()) : 0,
      +[](gpointer data) -> gboolean {
        auto* self = static_cast<OfficeConversion*>(data);
        self->timer_ = 0;
        self->finish(self->state_->process ? Problem::TooSlow : Problem::Failed);
        return G_SOURCE_REMOVE;
      },
      this);
  if (!started) return;
  g_subprocess_wait_async(
      state_->process.get(), nullptr,
      +[](GObject* process, GAsyncResult* result, gpointer data) {
        const std::unique_ptr<std::shared_ptr<State>> kept(static_cast<std::shared_ptr<State>*>(data));
        State& state = **kept;
        g_subprocess_wait_finish(G_SUBPROCESS(process), result, nullptr);
        state.group = 0;
        if (state.conversion) state.conversion->finish(Problem::None);
      },
      new std::shared_ptr<State>(state_));
}

OfficeConversion::~OfficeConversion() {
  g_clear_handle_id(&timer_, g_source_remove);
  state_->conversion = nullptr;
  state_->stop();
}

void OfficeConversion::finish(Problem problem) {
  g_clear_handle_id(&timer_, g_source_remove);
  state_->conversion = nullptr;
  state_->stop();
  const std::string document = problem == Problem::None ? portableDocumentIn(state_->folder + "/out") : "";
  const Done done = std::move(done_);
  done(document, document.empty() && problem == Problem::None ? Problem::Failed : problem);
}

bool OfficeConversion::isAvailable() { return !program().empty(); }

}  // namespace vaelo
