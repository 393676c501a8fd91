// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/decoder/markdown_decoder.h"

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "host/decoder/markdown_text.h"
#include "host/decoder/pixel_file.h"
#include "host/gtk/preview/text_decoding.h"
#include "host/support/decoder_error.h"

namespace vaelo {

namespace {

constexpr off_t MostMarkdownBytes = 1024 * 1024;
constexpr std::size_t MostForms = 30'000;
constexpr std::size_t LongestLine = 10'000;  // in bytes; laying a paragraph out takes longer than in proportion

bool hasLongLine(const std::string& text) {
  for (std::size_t begin = 0; begin < text.size();) {
    const std::size_t end = std::min(text.find('\n', begin), text.size());
    if (end - begin > LongestLine) return true;
    begin = end + 1;
  }
  return false;
}

const char* readAll(int file, std::string& bytes) {
  struct stat status = {};
  if (::fstat(file, &status) != 0) return DecoderError::Unreadable;
  if (status.st_size > MostMarkdownBytes) return DecoderError::TooBig;
  bytes.resize(static_cast<std::size_t>(status.st_size));
  std::size_t filled = 0;
  while (filled < bytes.size()) {
    const ssize_t count = ::pread(file, bytes.data() + filled, bytes.size() - filled, static_cast<off_t>(filled));
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) return DecoderError::Unreadable;
    if (count == 0) break;
    filled += static_cast<std::size_t>(count);
  }
  bytes.resize(filled);
  return nullptr;
}

}  // namespace

DecoderMessage MarkdownDecoder::answer(const std::string& request) {
  if (request != "render") return errorAnswer(DecoderError::Unsupported);
  std::string bytes;
  if (const char* problem = readAll(document_.get(), bytes)) return errorAnswer(problem);
  if (TextDecoding::isBinary(bytes)) return errorAnswer(DecoderError::Unsupported);
  MarkdownText markdown(TextDecoding().decode(bytes, true));
  const std::vector<MarkdownText::Form>& forms = markdown.forms();
  if (forms.size() > MostForms || hasLongLine(markdown.text())) return errorAnswer(DecoderError::TooBig);
  std::string content = markdown.text();
  const std::string answer = "ok " + std::to_string(content.size()) + " " + std::to_string(markdown.characters());
  for (const MarkdownText::Form& form : forms) {
    content += std::string(form.name) + "\t" + std::to_string(form.begin) + "\t" + std::to_string(form.end) + "\t" +
               form.word + "\n";
  }
  if (content.empty()) return {answer, UniqueFd()};
  PixelFile file(content.size());
  if (!file.data()) return errorAnswer(DecoderError::TooBig);
  std::memcpy(file.data(), content.data(), content.size());
  return {answer, file.take()};
}

}  // namespace vaelo
