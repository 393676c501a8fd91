// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/pages_pictures.h"

#include <algorithm>
#include <cmath>

#include "host/gtk/preview/shared_bytes.h"

namespace vaelo {

namespace {

constexpr double MostPixels = 6'000'000;  // of one picture
constexpr double LongestSide = 8192;
constexpr double MostKept = 40'000'000;  // pixels of all pictures, four bytes each
constexpr guint QuietAfter = 120;        // milliseconds without a new scale, until which old pictures are stretched
constexpr std::chrono::seconds RenderingTakes(10);

double scaleOfWhole(const PageSize& size, double scale) {
  const double most =
      std::min(std::sqrt(MostPixels / (size.width * size.height)), LongestSide / std::max(size.width, size.height));
  return std::min(scale, most);
}

bool sameScale(double a, double b) { return std::abs(a - b) < 1e-6 * b; }

PixelRect pixelsOf(const PageArea& area, double scale) {
  const int x = static_cast<int>(std::floor(area.x * scale));
  const int y = static_cast<int>(std::floor(area.y * scale));
  return {x, y, std::max(static_cast<int>(std::ceil((area.x + area.width) * scale)) - x, 1),
          std::max(static_cast<int>(std::ceil((area.y + area.height) * scale)) - y, 1)};
}

double pixelsIn(const PixelRect& rect) { return static_cast<double>(rect.width) * rect.height; }

}  // namespace

PagesPictures::~PagesPictures() { g_clear_handle_id(&quiet_, g_source_remove); }

void PagesPictures::want(std::vector<Wanted> wanted, double scale) {
  wanted_ = std::move(wanted);
  if (!sameScale(scale, scale_)) {
    scale_ = scale;
    zooming_ = true;
    g_clear_handle_id(&quiet_, g_source_remove);
    quiet_ = g_timeout_add(
        QuietAfter,
        +[](gpointer data) -> gboolean {
          auto* self = static_cast<PagesPictures*>(data);
          self->quiet_ = 0;
          self->zooming_ = false;
          self->next();
          return G_SOURCE_REMOVE;
        },
        this);
  }
  next();
}

void PagesPictures::hide(const std::map<int, std::vector<int>>& marks) {
  for (const auto& [number, hidden] : marks) pages_.try_emplace(number);
  for (auto& [number, page] : pages_) {
    const auto found = marks.find(number);
    const std::vector<int> hidden = found == marks.end() ? std::vector<int>() : found->second;
    if (page.hidden == hidden) continue;
    page.hidden = hidden;
    page.detail = {};
    page.isOld = true;
    ++page.version;
  }
  next();
}

std::optional<PagesPictures::Request> PagesPictures::detailFor(const Wanted& wanted) {
  if (!wanted.visible) return std::nullopt;
  const Page& page = pages_[wanted.page];
  PageArea part = *wanted.visible;
  const PixelRect needed = pixelsOf(part, scale_);
  if (page.detail.texture && sameScale(page.detail.scale, scale_) && page.detail.rect.contains(needed)) return std::nullopt;
  // A bit more, so that not every small move needs a new one.
  const double margin = 0.2;
  const double right = std::min(part.x + part.width * (1 + margin), wanted.size.width);
  const double bottom = std::min(part.y + part.height * (1 + margin), wanted.size.height);
  part.x = std::max(part.x - part.width * margin, 0.0);
  part.y = std::max(part.y - part.height * margin, 0.0);
  part.width = right - part.x;
  part.height = bottom - part.y;
  const PixelRect rect = pixelsOf(part, scale_);
  const bool tooLarge = pixelsIn(rect) > 2 * MostPixels || std::max(rect.width, rect.height) > LongestSide;
  return Request{wanted.page, scale_, tooLarge ? needed : rect, true};
}

std::optional<PagesPictures::Request> PagesPictures::mostImportant() {
  const auto wholeOf = [&](const Wanted& wanted) {
    const double scale = scaleOfWhole(wanted.size, scale_);
    return Request{wanted.page, scale, pixelsOf({0, 0, wanted.size.width, wanted.size.height}, scale), false};
  };
  for (const Wanted& wanted : wanted_) {
    const Page& page = pages_[wanted.page];
    if (wanted.visible && page.problem.empty() && !page.whole.texture) return wholeOf(wanted);
  }
  if (zooming_) return std::nullopt;
  for (const Wanted& wanted : wanted_) {
    const Page& page = pages_[wanted.page];
    if (!page.problem.empty()) continue;
    const double scale = scaleOfWhole(wanted.size, scale_);
    if (!page.whole.texture || page.isOld || !sameScale(page.whole.scale, scale)) return wholeOf(wanted);
    if (sameScale(scale, scale_)) continue;
    if (const auto detail = detailFor(wanted)) return detail;
  }
  return std::nullopt;
}

void PagesPictures::next() {
  if (asking_) return;
  const std::optional<Request> request = mostImportant();
  if (!request) return;
  asking_ = true;
  std::string words = "render " + std::to_string(request->page) + " ";
  char scale[G_ASCII_DTOSTR_BUF_SIZE];
  words += g_ascii_dtostr(scale, sizeof scale, request->scale);
  for (const int number : {request->rect.x, request->rect.y, request->rect.width, request->rect.height}) {
    words += " " + std::to_string(number);
  }
  const Page& page = pages_[request->page];
  for (const int mark : page.hidden) words += " " + std::to_string(mark);
  source_.ask(
      std::move(words),
      [this, asked = *request, version = page.version](DecoderProcess::Answer answer) {
        received(asked, version, std::move(answer));
      },
      RenderingTakes);
}

void PagesPictures::received(const Request& request, int version, DecoderProcess::Answer answer) {
  asking_ = false;
  Page& page = pages_[request.page];
  GRef<GdkTexture> texture = takeTexture(std::move(answer.file), request.rect.width, request.rect.height);
  const bool isOld = version != page.version;
  if (!texture) {
    page.problem = answer.error.empty() ? DecoderError::Damaged : answer.error;
  } else if (request.detail) {
    if (!isOld) page.detail = {std::move(texture), request.scale, request.rect};
  } else {
    page.whole = {std::move(texture), request.scale, request.rect};
    page.isOld = isOld;
    if (sameScale(request.scale, scale_)) page.detail = {};
  }
  forgetFarPages();
  arrived_();
  next();
}

// Those that are looked at stay, whatever they take.
void PagesPictures::forgetFarPages() {
  if (wanted_.empty()) return;
  const auto wants = [&](int page) {
    return std::any_of(wanted_.begin(), wanted_.end(), [&](const Wanted& wanted) { return wanted.page == page; });
  };
  double kept = 0;
  for (auto& [number, page] : pages_) {
    if (!wants(number)) page.detail = {};
    kept += pixelsIn(page.whole.rect) + pixelsIn(page.detail.rect);
  }
  const int centre = wanted_.front().page;
  while (kept > MostKept) {
    auto farthest = pages_.end();
    for (auto each = pages_.begin(); each != pages_.end(); ++each) {
      const bool farther = farthest == pages_.end() || std::abs(each->first - centre) > std::abs(farthest->first - centre);
      if (each->second.whole.texture && !wants(each->first) && farther) farthest = each;
    }
    if (farthest == pages_.end()) return;
    kept -= pixelsIn(farthest->second.whole.rect);
    farthest->second.whole = {};
  }
}

bool PagesPictures::draw(GtkSnapshot* snapshot, int page, const PageArea& area) const {
  const auto found = pages_.find(page);
  if (found == pages_.end() || !found->second.whole.texture) return false;
  const auto place = [&](const Picture& picture, double width) {
    // The whole picture may be up to a pixel larger than the page.
    const double factor = area.width / width / picture.scale;
    const graphene_rect_t rect = GRAPHENE_RECT_INIT(
        static_cast<float>(area.x + picture.rect.x * factor), static_cast<float>(area.y + picture.rect.y * factor),
        static_cast<float>(picture.rect.width * factor), static_cast<float>(picture.rect.height * factor));
    gtk_snapshot_append_texture(snapshot, picture.texture.get(), &rect);
  };
  const auto wanted = std::find_if(wanted_.begin(), wanted_.end(), [&](const Wanted& each) { return each.page == page; });
  if (wanted == wanted_.end()) return false;
  const graphene_rect_t clip = GRAPHENE_RECT_INIT(static_cast<float>(area.x), static_cast<float>(area.y),
                                                  static_cast<float>(area.width), static_cast<float>(area.height));
  gtk_snapshot_push_clip(snapshot, &clip);
  place(found->second.whole, wanted->size.width);
  if (found->second.detail.texture) place(found->second.detail, wanted->size.width);
  gtk_snapshot_pop(snapshot);
  return true;
}

std::string PagesPictures::problemOf(int page) const {
  const auto found = pages_.find(page);
  return found == pages_.end() ? "" : found->second.problem;
}

}  // namespace vaelo
