// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/decoder_starter.h"

#include <poll.h>
#include <sys/socket.h>

#include <filesystem>
#include <string>
#include <utility>

namespace vaelo {

namespace {

constexpr guint QuietAfter = 250;           // milliseconds
constexpr guint ApplicationSettles = 1500;  // after which its first screen stands

// Beside the application where it is built, one folder up for its tests, else where it is installed.
std::string decoderPath() {
  const std::filesystem::path self = takeString(g_file_read_link("/proc/self/exe", nullptr));
  for (const std::filesystem::path& folder : {self.parent_path(), self.parent_path().parent_path()}) {
    const std::filesystem::path found = folder / "vaelo-preview-decoder";
    if (g_file_test(found.c_str(), G_FILE_TEST_IS_EXECUTABLE)) return found;
  }
  return VAELO_LIBEXEC_DIR "/vaelo-preview-decoder";
}

StartedDecoder start() {
  int ends[2];
  if (::socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) != 0) return StartedDecoder();
  StartedDecoder started;
  started.socket = UniqueFd(ends[0]);
  const GRef<GSubprocessLauncher> launcher(g_subprocess_launcher_new(G_SUBPROCESS_FLAGS_NONE));
  g_subprocess_launcher_take_stdin_fd(launcher.get(), ends[1]);
  started.process.reset(g_subprocess_launcher_spawn(launcher.get(), nullptr, decoderPath().c_str(), nullptr));
  return started;
}

struct Ahead {
  StartedDecoder decoder;
  guint timer = 0;

  // One that ended while it waited has hung up.
  bool isAlive() const {
    pollfd state = {decoder.socket.get(), POLLIN, 0};
    return decoder.process && ::poll(&state, 1, 0) == 0;
  }

  void startSoon(guint after) {
    g_clear_handle_id(&timer, g_source_remove);
    timer = g_timeout_add_full(
        G_PRIORITY_LOW, after,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<Ahead*>(data);
          self->timer = 0;
          if (!self->isAlive()) self->decoder = start();
          return G_SOURCE_REMOVE;
        },
        this, nullptr);
  }
};

Ahead& ahead() {
  static Ahead one;
  return one;
}

}  // namespace

StartedDecoder takeStartedDecoder() {
  StartedDecoder taken = ahead().isAlive() ? std::exchange(ahead().decoder, StartedDecoder()) : start();
  ahead().startSoon(QuietAfter);
  return taken;
}

void startDecoderAhead() { ahead().startSoon(ApplicationSettles); }

}  // namespace vaelo
