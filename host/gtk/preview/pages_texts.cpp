// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_texts.h"

#include <cmath>
#include <cstring>

#include "host/gtk/preview/shared_bytes.h"

namespace vaelo {

namespace {

constexpr std::size_t BoxBytes = 4 * sizeof(float);

PageText textIn(DecoderProcess::Answer answer) {
  const std::vector<double> numbers = numbersIn(answer.text);
  constexpr double mostCharacters = 1'000'000;
  if (!answer.error.empty() || numbers.size() != 1 || !(numbers[0] >= 1) || numbers[0] > mostCharacters) return {};
  const auto count = static_cast<std::size_t>(numbers[0]);
  GBytes* bytes = takeSharedBytes(std::move(answer.file), count * BoxBytes);
  if (!bytes) return {};
  gsize size = 0;
  const auto* data = static_cast<const char*>(g_bytes_get_data(bytes, &size));
  std::vector<PageRect> boxes(count);
  for (std::size_t i = 0; i < count; ++i) {
    float edges[4];
    std::memcpy(edges, data + i * BoxBytes, BoxBytes);
    for (float& edge : edges) edge = std::isfinite(edge) ? edge : 0;
    boxes[i] = {static_cast<double>(edges[0]), static_cast<double>(edges[1]), static_cast<double>(edges[2]),
                static_cast<double>(edges[3])};
  }
  PageText text(std::move(boxes), std::string(data + count * BoxBytes, size - count * BoxBytes));
  g_bytes_unref(bytes);
  return text;
}

}  // namespace

const PageText* PagesTexts::of(int page) {
  const auto [place, isNew] = texts_.try_emplace(page);
  if (isNew) {
    source_.ask("text " + std::to_string(page), [this, page](DecoderProcess::Answer answer) {
      texts_[page] = textIn(std::move(answer));
      arrived_();
    });
  }
  return place->second ? &*place->second : nullptr;
}

}  // namespace vaelo
