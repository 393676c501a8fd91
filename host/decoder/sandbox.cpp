// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/sandbox.h"

#include <sched.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <csignal>

namespace vaelo {

namespace {

void limit(__rlimit_resource resource, rlim_t value) {
  const rlimit bound = {value, value};
  ::setrlimit(resource, &bound);
}

}  // namespace

void enterSandbox() {
  constexpr rlim_t mebibyte = 1024 * 1024;
#if !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)  // which reserve terabytes of addresses
  limit(RLIMIT_AS, 2048 * mebibyte);
#endif
  limit(RLIMIT_FSIZE, 1024 * mebibyte);
  limit(RLIMIT_CORE, 0);
  limit(RLIMIT_NOFILE, 64);
  ::prctl(PR_SET_NO_NEW_PRIVS, 1, 0, 0, 0);
  ::prctl(PR_SET_PDEATHSIG, SIGKILL, 0, 0, 0);
  // Drawing the window goes before.
  if (::nice(5) == -1) return;
  static_cast<void>(::unshare(CLONE_NEWUSER | CLONE_NEWNET));
}

}  // namespace vaelo
