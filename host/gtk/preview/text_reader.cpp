// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/text_reader.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "host/gtk/preview/text_decoding.h"
#include "host/gtk/preview/text_lines.h"
#include "host/support/decoder_error.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {
constexpr std::size_t FirstPiece = 64 * 1024;
constexpr std::size_t LaterPiece = 1024 * 1024;
// So many NULs in a row are no text, but a part of the file that was never written.
constexpr std::size_t SmallestHole = 64 * 1024;

void cutHole(std::string& bytes) {
  std::size_t end = bytes.find_last_not_of('\0') + 1;
  end += end % 2;  // a character may take two bytes, the last of them NUL
  if (bytes.size() >= end + SmallestHole) bytes.resize(end);
}
}  // namespace

/// On the reader's thread, but for its construction.
struct TextReader::Reading {
  Reading(const std::string& document, const TextLimits& limits)
      : path(document), mostBytes(limits.bytes), lines(limits.lineCharacters, limits.lines) {}

  TextPiece next() {
    if (!file) {
      if (const char* error = open()) return failure(error);
    }
    const bool first = bytesRead == 0;
    const auto wanted = std::min<std::uint64_t>(first ? FirstPiece : LaterPiece, mostBytes - bytesRead);
    std::string bytes(wanted, '\0');
    const ssize_t count = fill(bytes);
    if (count < 0) return failure(errno == EISDIR ? DecoderError::Unsupported : DecoderError::Unreadable);
    bytes.resize(static_cast<std::size_t>(count));
    if (first && TextDecoding::isBinary(bytes)) return failure(DecoderError::Unsupported);
    cutHole(bytes);
    bytesRead += bytes.size();
    const bool ended = bytes.size() < wanted;
    const bool reachedMost = bytesRead >= mostBytes;
    TextPiece piece;
    piece.text = lines.arrange(decoding.decode(bytes, ended || reachedMost));
    piece.last = ended || reachedMost || lines.isFull();
    piece.shortened = piece.last && bytesRead < documentBytes;
    piece.brokeLines = lines.brokeLines();
    piece.longestLine = lines.longestLine();
    piece.bytesRead = bytesRead;
    piece.documentBytes = documentBytes;
    return piece;
  }

 private:
  static TextPiece failure(const char* error) {
    TextPiece piece;
    piece.error = error;
    piece.last = true;
    return piece;
  }

  // A pipe would be waited for without end.
  const char* open() {
    file = UniqueFd(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY));
    struct stat status = {};
    if (!file || ::fstat(file.get(), &status) != 0) return errno == ENOENT ? DecoderError::Gone : DecoderError::Unreadable;
    if (!S_ISREG(status.st_mode)) return DecoderError::Unsupported;
    documentBytes = static_cast<std::uint64_t>(status.st_size);
    return nullptr;
  }

  ssize_t fill(std::string& bytes) const {
    std::size_t filled = 0;
    while (filled < bytes.size()) {
      const ssize_t count = ::read(file.get(), bytes.data() + filled, bytes.size() - filled);
      if (count < 0 && errno == EINTR) continue;
      if (count < 0) return -1;
      if (count == 0) break;
      filled += static_cast<std::size_t>(count);
    }
    return static_cast<ssize_t>(filled);
  }

  std::string path;
  std::uint64_t mostBytes;
  UniqueFd file;
  TextDecoding decoding;
  TextLines lines;
  std::uint64_t bytesRead = 0;
  std::uint64_t documentBytes = 0;
};

TextReader::TextReader(const std::string& path, const TextLimits& limits)
    : reading_(std::make_shared<Reading>(path, limits)) {}

void TextReader::next(std::function<void(TextPiece)> received) {
  worker_.run([reading = reading_, received = std::move(received)]() -> std::function<void()> {
    auto piece = std::make_shared<TextPiece>(reading->next());
    return [piece, received] { received(std::move(*piece)); };
  });
}

}  // namespace vaelo
