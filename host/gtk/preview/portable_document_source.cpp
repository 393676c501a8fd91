// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/portable_document_source.h"

#include <fcntl.h>

#include <algorithm>
#include <charconv>
#include <cmath>

namespace vaelo {

namespace {

constexpr int MostRestarts = 8;
constexpr int MostPages = 200'000;
constexpr std::chrono::seconds OpeningTakes(15);

std::vector<PageSize> sizesFrom(const std::vector<double>& numbers, std::size_t begin) {
  std::vector<PageSize> sizes;
  for (std::size_t i = begin; i + 1 < numbers.size(); i += 2) {
    sizes.push_back({std::clamp(numbers[i], 1.0, 20'000.0), std::clamp(numbers[i + 1], 1.0, 20'000.0)});
  }
  return sizes;
}

}  // namespace

std::vector<double> numbersIn(const std::string& words) {
  std::vector<double> numbers;
  const char* place = words.data();
  const char* const end = place + words.size();
  while (place < end) {
    double number = 0;
    const auto [after, problem] = std::from_chars(place, end, number);
    if (problem != std::errc() || !std::isfinite(number) || (after < end && *after != ' ')) return {};
    numbers.push_back(number);
    place = std::min(after + 1, end);
  }
  return numbers;
}

std::vector<PageSize> pageSizesIn(const std::string& words) { return sizesFrom(numbersIn(words), 0); }

PortableDocumentSource::PortableDocumentSource(const std::string& path, std::chrono::milliseconds patience)
    : path_(path), patience_(patience), file_(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY)) {
  if (file_) version_ = versionOf(file_.get()).value_or(FileVersion());
}

void PortableDocumentSource::start() {
  UniqueFd given(file_ ? ::fcntl(file_.get(), F_DUPFD_CLOEXEC, 3) : -1);
  process_ = std::make_unique<DecoderProcess>("document", path_, std::move(given));
}

void PortableDocumentSource::open(const std::string& password, std::function<void(Opened)> done) {
  if (!process_) start();
  password_ = password;
  ask(
      "open " + password,
      [done = std::move(done)](const DecoderProcess::Answer& answer) {
        Opened opened;
        opened.error = answer.error;
        const std::vector<double> numbers = numbersIn(answer.text);
        if (opened.error.empty() && (numbers.size() < 2 || numbers[0] < 1 || numbers[0] > MostPages)) {
          opened.error = DecoderError::Damaged;
        }
        if (opened.error.empty()) {
          opened.pages = static_cast<int>(numbers[0]);
          opened.mayBeMarked = numbers[1] > 0;
          opened.sizes = sizesFrom(numbers, 2);
        }
        done(std::move(opened));
      },
      OpeningTakes);
}

void PortableDocumentSource::ask(std::string request, Done done, std::chrono::milliseconds limit) {
  jobs_.push_back({std::move(request), std::move(done), std::min(limit, patience_)});
  if (!asking_) next();
}

// One at a time, so that a process that ends did so on account of the request that it was given.
void PortableDocumentSource::next() {
  if (jobs_.empty()) return;
  asking_ = true;
  process_->ask(
      jobs_.front().request, [this](DecoderProcess::Answer answer) { answered(std::move(answer)); }, jobs_.front().limit);
}

void PortableDocumentSource::answered(DecoderProcess::Answer answer) {
  asking_ = false;
  const Job job = std::move(jobs_.front());
  jobs_.pop_front();
  const bool ended = answer.error == DecoderError::Crashed || answer.error == DecoderError::TooSlow;
  if (ended && job.request.compare(0, 5, "open ") != 0 && restarts_ < MostRestarts) restart();
  next();
  job.done(std::move(answer));
}

void PortableDocumentSource::restart() {
  ++restarts_;
  start();
  jobs_.push_front({"open " + password_, [](const DecoderProcess::Answer&) {},
                    std::min<std::chrono::milliseconds>(OpeningTakes, patience_)});
}

}  // namespace vaelo
