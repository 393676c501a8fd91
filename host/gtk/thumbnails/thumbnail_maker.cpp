// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/thumbnails/thumbnail_maker.h"

#include <poll.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <optional>

#include "host/gtk/thumbnails/thumbnail_cache.h"
#include "host/support/glib_ptr.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

constexpr int Nice = 10;

/// Runs between fork and exec, so it may only do what is safe there.
void setUpChild(gpointer held) {
  const auto& limits = *static_cast<const ThumbnailerLimits*>(held);
  ::setpgid(0, 0);
  ::setpriority(PRIO_PROCESS, 0, Nice);
  const auto bound = [](auto resource, rlim_t most) {
    const rlimit limit{most, most};
    ::setrlimit(resource, &limit);
  };
  bound(RLIMIT_AS, limits.memory);
  bound(RLIMIT_CPU, static_cast<rlim_t>(limits.time.count() / 1000 + 1));
  bound(RLIMIT_FSIZE, LargestThumbnailFile);
  bound(RLIMIT_CORE, 0);
}

/// True when the process has ended by then.
bool waitForEnd(pid_t process, std::chrono::milliseconds time) {
  const UniqueFd handle(static_cast<int>(::syscall(SYS_pidfd_open, process, 0)));
  if (!handle) return false;
  const auto due = std::chrono::steady_clock::now() + time;
  for (;;) {
    const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(due - std::chrono::steady_clock::now());
    pollfd waiting = {handle.get(), POLLIN, 0};
    const int ready = ::poll(&waiting, 1, static_cast<int>(std::max<std::chrono::milliseconds::rep>(left.count(), 0)));
    if (ready < 0 && errno == EINTR) continue;
    return ready > 0;
  }
}

std::optional<std::int64_t> modifiedAt(const std::string& path) {
  struct stat status = {};
  if (::lstat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) return std::nullopt;
  return status.st_mtim.tv_sec;
}

/// A folder for what a thumbnailer writes, which goes with all that is in it.
class ScratchFolder {
 public:
  ScratchFolder() : path_(takeString(g_dir_make_tmp("vaelo-thumbnail-XXXXXX", nullptr))) {}
  ~ScratchFolder() {
    ::unlink(output().c_str());
    ::rmdir(path_.c_str());
  }
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;
  bool exists() const { return !path_.empty(); }
  std::string output() const { return path_ + "/thumbnail.png"; }

 private:
  const std::string path_;
};

}  // namespace

bool runBounded(const std::vector<std::string>& command, const ThumbnailerLimits& limits) {
  std::vector<char*> words;
  for (const std::string& word : command) words.push_back(g_strdup(word.c_str()));
  words.push_back(nullptr);
  constexpr auto flags = static_cast<GSpawnFlags>(G_SPAWN_SEARCH_PATH | G_SPAWN_DO_NOT_REAP_CHILD |
                                                  G_SPAWN_STDOUT_TO_DEV_NULL | G_SPAWN_STDERR_TO_DEV_NULL);
  GPid process = 0;
  ThumbnailerLimits childs = limits;
  const bool started = g_spawn_async(nullptr, words.data(), nullptr, flags, setUpChild, &childs, &process, nullptr);
  for (char* word : words) g_free(word);
  if (!started) return false;
  if (!waitForEnd(process, limits.time)) ::kill(-process, SIGKILL);
  int status = 0;
  while (::waitpid(process, &status, 0) < 0 && errno == EINTR) {
  }
  return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

bool mayHaveThumbnail(const Thumbnailers& thumbnailers, const std::string& cacheFolder, const std::string& path,
                      std::int64_t modified) {
  return thumbnailers.canShow(path.substr(path.rfind('/') + 1)) && !hasFailed(cacheFolder, path, modified);
}

bool makeThumbnail(const Thumbnailers& thumbnailers, const std::string& cacheFolder, const std::string& path, int pixels,
                   const ThumbnailerLimits& limits) {
  const std::optional<ThumbnailName> name = thumbnailNameOf(path);
  const std::optional<std::int64_t> before = modifiedAt(path);
  if (!name || !before || !mayHaveThumbnail(thumbnailers, cacheFolder, path, *before)) return false;
  if (hasThumbnail(cacheFolder, path, *before, pixels)) return true;
  const ScratchFolder scratch;
  const auto command = thumbnailers.commandFor(path, scratch.output(), thumbnailSideFor(pixels));
  if (!scratch.exists() || !command) return false;
  const bool made = runBounded(*command, limits);
  // What was made of a file that somebody is writing shows neither the old nor the new one.
  if (modifiedAt(path) != before) return false;
  const GRef<GdkPixbuf> picture(made ? readThumbnail(scratch.output()) : nullptr);
  if (!picture) {
    rememberFailure(cacheFolder, path, *before);
    return false;
  }
  return storeThumbnail(thumbnailFolderFor(cacheFolder, pixels) + "/" + name->file, picture.get(), name->uri, *before);
}

}  // namespace vaelo
