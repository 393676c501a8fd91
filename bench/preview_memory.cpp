// SPDX-License-Identifier: GPL-3.0-or-later
// The one preview screen is pointed to another document a thousand times; prints what the process has allocated, and
// what of it resides in memory, before and after. With G_SLICE=always-malloc in its environment the toolkit's pools count
// exactly.
//   preview_memory [TIMES [NAME OF ONE DOCUMENT]]
#include <cstdio>
#include <cstdlib>

#include "bench/preview_samples.h"
#include "bench/preview_window.h"

int main(int argc, char** argv) {
  using vaelo::bench::PreviewWindow;
  const int times = argc > 1 ? std::max(std::atoi(argv[1]), 1) : 1000;
  const vaelo::bench::SampleFolder folder;
  const auto window = PreviewWindow::open(folder.path());
  vaelo::bench::writePhotograph(folder.pathOf("photograph.jpg"), 1200, 900);
  vaelo::bench::writePortableDocument(folder.pathOf("document.pdf"), 12);
  vaelo::bench::writeText(folder.pathOf("text.txt"), std::size_t{100} * 1024);
  vaelo::bench::writeText(folder.pathOf("notes.md"), std::size_t{20} * 1024);
  vaelo::bench::writeText(folder.pathOf("source.cpp"), std::size_t{100} * 1024);
  std::vector<std::string> paths = {folder.pathOf("photograph.jpg"), folder.pathOf("document.pdf"),
                                    folder.pathOf("text.txt"), folder.pathOf("notes.md"), folder.pathOf("source.cpp")};
  if (argc > 2) paths = {folder.pathOf(argv[2])};
  const auto point = [&](int from, int to) {
    for (int i = from; i < to; ++i) window->show(paths[static_cast<std::size_t>(i) % paths.size()]);
    window->showNothing();
    PreviewWindow::run(500);
    return vaelo::bench::heldKibibytes();
  };
  const vaelo::bench::Held before = point(0, 200);
  const vaelo::bench::Held middle = point(0, times / 2);
  const vaelo::bench::Held after = point(times / 2, times);
  std::printf("%14s %14s %14s\n", "documents", "allocated KiB", "resident KiB");
  for (const auto& [documents, held] : {std::pair{0, before}, {times / 2, middle}, {times, after}})
    std::printf("%14d %14ld %14ld\n", documents, held.allocated, held.resident);
  return 0;
}
