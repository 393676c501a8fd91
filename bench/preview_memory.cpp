// SPDX-License-Identifier: GPL-3.0-or-later
// The one preview screen is pointed to another document a thousand times; prints what the process holds before and after.
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
    return vaelo::bench::residentKibibytes();
  };
  const long before = point(0, 200);
  const long middle = point(0, times / 2);
  const long after = point(times / 2, times);
  std::printf("resident before %ld KiB, after %d documents %ld KiB, after %d %ld KiB\n", before, times / 2, middle, times,
              after);
  return 0;
}
