// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace vaelo {

/// The place of a file or folder: an absolute path of bytes (names need not be UTF-8), with a hint whether it names a
/// folder.
///
/// A value that is cheap to copy: copies share one object, which sameObject() can tell from an equal URL made elsewhere.
/// Equality is that of the paths, byte for byte; the folder hint does not count. Safe to read from any thread.
class URL {
 public:
  /// `path` is absolute; doubled and trailing slashes are dropped, "." and ".." are kept as they are.
  explicit URL(std::string_view path, bool isDirectory = false);

  /// From "file:///..." as RFC 8089 writes it, percent-decoded; nothing for another scheme, a foreign host, bad encoding or
  /// a path that holds a NUL or is not absolute.
  static std::optional<URL> fromFileURLString(std::string_view text);

  const std::string& path() const { return rep_->path; }
  bool hasDirectoryPath() const { return rep_->isDirectory; }
  /// The name after the last slash; "/" for the root.
  std::string lastPathComponent() const;
  /// What follows the last dot of the last component, without the dot; empty for none, for a name that begins with its only
  /// dot, and where a blank follows the dot.
  std::string pathExtension() const;
  /// The components from the root, "/" first, as in {"/", "a", "b"}.
  std::vector<std::string> pathComponents() const;
  URL deletingLastPathComponent() const;
  URL appendingPathComponent(std::string_view name, bool isDirectory = false) const;
  /// True when this path is `folder`'s or below it, compared component by component.
  bool isInside(const URL& folder) const;
  /// "file://" and the percent-encoded path (RFC 3986), with a trailing slash for a folder.
  std::string absoluteString() const;

  bool sameObject(const URL& other) const { return rep_ == other.rep_; }
  friend bool operator==(const URL& a, const URL& b) { return a.rep_ == b.rep_ || a.rep_->path == b.rep_->path; }
  friend bool operator<(const URL& a, const URL& b) { return a.rep_->path < b.rep_->path; }

 private:
  struct Rep {
    std::string path;
    bool isDirectory;
  };
  std::shared_ptr<const Rep> rep_;
};

/// Percent-decodes UTF-8 text (RFC 3986, section 2.1). Nothing when a percent sign is not followed by two hex digits or the
/// result is not valid UTF-8 or holds a NUL, which no path or text may.
std::optional<std::string> percentDecoded(std::string_view text);
/// Percent-encodes everything but the unreserved characters of RFC 3986 and those in `alsoAllowed`.
std::string percentEncoded(std::string_view text, std::string_view alsoAllowed = "/");

}  // namespace vaelo
