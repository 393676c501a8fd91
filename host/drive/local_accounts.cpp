// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/drive/local_accounts.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/random.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <set>

#include "host/drive/cloud_container.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "host/support/unique_fd.h"

namespace vaelo {

namespace {

constexpr const char* welcomeName = N_("Welcome to Vaelo Drive");  // the name of a file: without "/"
// TRANSLATORS: this is Markdown: "#" begins a heading, "-" a point of a list.
constexpr const char* welcomeText =
    N_("# Welcome to Vaelo Drive\n\n"
       "This is your drive. Put documents and folders here, and find them on every device of yours.\n\n"
       "- Touch a document to look at it.\n"
       "- Hold a finger on an item to see what can be done with it.\n"
       "- Pull the list down to refresh it.\n\n"
       "You may delete this document whenever you like.\n");
constexpr std::string_view accountSuffix = ".ini";

/// From the kernel, so that no two processes of this or another device can come to the same.
std::string randomToken() {
  std::array<unsigned char, 16> bytes{};
  while (::getrandom(bytes.data(), bytes.size(), 0) != static_cast<ssize_t>(bytes.size())) {
  }
  std::string token;
  for (const unsigned char byte : bytes) {
    token += "0123456789abcdef"[byte >> 4];
    token += "0123456789abcdef"[byte & 15];
  }
  return token;
}

std::vector<std::string> namesIn(const std::string& folder) {
  std::vector<std::string> names;
  GDir* opened = g_dir_open(folder.c_str(), 0, nullptr);
  if (!opened) return names;
  while (const char* name = g_dir_read_name(opened)) names.emplace_back(name);
  g_dir_close(opened);
  std::sort(names.begin(), names.end());
  return names;
}

bool isEmptyFolder(const std::string& path) {
  return g_file_test(path.c_str(), G_FILE_TEST_IS_DIR) && namesIn(path).empty();
}

bool isThere(const std::optional<Error>& error) { return error && error->code == FileErrorCode::WriteFileExists; }

KeyFile newAccount(const std::string& name, const std::string& token, const std::string& mirror) {
  KeyFile file(g_key_file_new());
  g_key_file_set_string(file.get(), AccountGroup, "Name", name.c_str());
  g_key_file_set_string(file.get(), AccountGroup, "Token", token.c_str());
  g_key_file_set_boolean(file.get(), AccountGroup, "SignedIn", TRUE);
  g_key_file_set_string(file.get(), AccountGroup, "Mirror", mirror.c_str());
  return file;
}

bool isName(const std::string& name) {
  if (name.empty() || !g_utf8_validate(name.data(), static_cast<gssize>(name.size()), nullptr)) return false;
  if (static_cast<std::size_t>(g_utf8_strlen(name.c_str(), -1)) > LocalAccounts::LongestName) return false;
  for (const char* c = name.c_str(); *c; c = g_utf8_next_char(c)) {
    if (g_unichar_iscntrl(g_utf8_get_char(c))) return false;
  }
  return true;
}

/// A token names a file; one that another program wrote may be anything.
bool namesFile(const std::string& token) {
  return !token.empty() && token.size() <= 200 &&
         std::all_of(token.begin(), token.end(), [](char c) { return g_ascii_isalnum(c) || c == '-'; });
}

/// Held while accounts are read and changed, so that two processes don't undo each other.
class Turn {
 public:
  explicit Turn(const std::string& dataFolder)
      : handle_(::open((dataFolder + "/accounts.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600)) {
    while (handle_ && ::flock(handle_.get(), LOCK_EX) != 0 && errno == EINTR) {
    }
  }

 private:
  UniqueFd handle_;
};

}  // namespace

std::string LocalAccounts::fileOf(const std::string& token) const {
  return layout_.accountsFolder() + "/" + token + std::string(accountSuffix);
}

Result<KeyFile> LocalAccounts::currentFile() const { return readKeyFile(layout_.accountFile()); }

std::vector<LocalAccounts::Known> LocalAccounts::all() const {
  std::vector<Known> known;
  std::set<std::string> tokens;
  const auto add = [&](const std::string& path, bool isCurrent) {
    const Result<AccountRecord> read = readAccountFile(path, log_);
    if (read) {
      if (tokens.insert(read.value->token).second) known.push_back({*read.value, isCurrent});
    } else if (read.error->code != FileErrorCode::ReadNoSuchFile) {
      log_.write(LogType::Error, "drive: can't read an account: " + read.error->description());
    }
  };
  add(layout_.accountFile(), true);
  for (const std::string& name : namesIn(layout_.accountsFolder())) {
    if (name.ends_with(accountSuffix) && name.front() != '.') add(layout_.accountsFolder() + "/" + name, false);
  }
  std::stable_sort(known.begin(), known.end(), [](const Known& one, const Known& other) {
    return g_utf8_collate(one.record.name.c_str(), other.record.name.c_str()) < 0;
  });
  return known;
}

std::optional<Error> LocalAccounts::makeDrive(const std::string& mirror) const {
  const std::string root = realLocation(layout_.dataFolder() + "/" + mirror);
  const std::string drive = root + "/" + DriveLayout::DefaultContainer;
  for (const std::string& folder : {drive, root + "/.Trash"}) {
    if (g_mkdir_with_parents(folder.c_str(), 0700) != 0) return errorFromErrno(errno, folder, FileAccess::Write);
  }
  // A drive that outlived its account file is the user's; nothing is put into it.
  if (!isEmptyFolder(drive)) return std::nullopt;
  auto failed = writeSmallFile(drive + "/" + _(welcomeName) + ".md", _(welcomeText), false);
  if (failed && !isThere(failed)) return failed;
  failed = writeSmallFile(drive + "/" + ContainerManifestName, "[Container]\nName=Vaelo Drive\n", false);
  if (failed && !isThere(failed)) return failed;
  return std::nullopt;
}

std::optional<Error> LocalAccounts::keep(GKeyFile* account) const {
  const std::string token = keyFileBytes(account, AccountGroup, "Token").value_or("");
  if (!namesFile(token)) return std::nullopt;  // of another program's making: it is kept in the account file alone
  if (g_mkdir_with_parents(layout_.accountsFolder().c_str(), 0700) != 0) {
    return errorFromErrno(errno, layout_.accountsFolder(), FileAccess::Write);
  }
  return writeSmallFile(fileOf(token), keyFileText(account));
}

std::optional<Error> LocalAccounts::makeCurrent(GKeyFile* account) const {
  if (const Result<KeyFile> before = currentFile()) {
    if (auto failed = keep(before.value->get())) return failed;
  }
  g_key_file_set_boolean(account, AccountGroup, "SignedIn", TRUE);
  if (auto failed = keep(account)) return failed;
  return writeSmallFile(layout_.accountFile(), keyFileText(account));
}

std::optional<Error> LocalAccounts::add(const std::string& typed) {
  const std::string name = takeString(g_strstrip(g_strdup(typed.c_str())));
  if (!isName(name)) return fileError(FileErrorCode::WriteInvalidFileName, layout_.accountFile(), "no name for an account");
  const Turn turn(layout_.dataFolder());
  for (const Known& known : all()) {
    if (known.record.name == name) {
      return fileError(FileErrorCode::WriteFileExists, layout_.accountFile(), "an account of that name is there");
    }
  }
  const std::string token = randomToken();
  const std::string mirror = "accounts/" + token;
  if (auto failed = makeDrive(mirror)) return failed;
  return makeCurrent(newAccount(name, token, mirror).get());
}

std::optional<Error> LocalAccounts::signIn(const std::string& token) {
  const Turn turn(layout_.dataFolder());
  Result<KeyFile> account = currentFile();
  if (!account || keyFileBytes(account.value->get(), AccountGroup, "Token") != token) {
    if (!namesFile(token)) return fileError(FileErrorCode::NoSuchFile, layout_.accountsFolder(), "there is no such account");
    account = readKeyFile(fileOf(token));
  }
  const Result<AccountRecord> record =
      account ? accountIn(account.value->get(), fileOf(token), log_) : Result<AccountRecord>(*account.error);
  if (!record) return fileError(FileErrorCode::NoSuchFile, fileOf(token), "there is no such account");
  if (auto failed = makeDrive(record.value->mirror)) return failed;
  return makeCurrent(account.value->get());
}

std::optional<Error> LocalAccounts::signOut() {
  const Turn turn(layout_.dataFolder());
  Result<KeyFile> account = currentFile();
  if (!account) return account.error;
  if (auto failed = keep(account.value->get())) return failed;
  g_key_file_set_boolean(account.value->get(), AccountGroup, "SignedIn", FALSE);
  return writeSmallFile(layout_.accountFile(), keyFileText(account.value->get()));
}

std::optional<Error> LocalAccounts::makeFirstIfAbsent() {
  if (g_file_test(layout_.accountFile().c_str(), G_FILE_TEST_EXISTS)) return std::nullopt;
  if (auto failed = makeDrive(DriveLayout::FirstMirror)) return failed;
  KeyFile account = newAccount(g_get_real_name(), randomToken(), DriveLayout::FirstMirror);
  // The documents that are there may be of an account that was known before its file was lost.
  for (const Known& known : all()) {
    if (known.record.mirror != DriveLayout::FirstMirror || !namesFile(known.record.token)) continue;
    if (Result<KeyFile> kept = readKeyFile(fileOf(known.record.token))) account = std::move(*kept.value);
  }
  g_key_file_set_boolean(account.get(), AccountGroup, "SignedIn", TRUE);
  const auto failed = writeSmallFile(layout_.accountFile(), keyFileText(account.get()), false);
  return isThere(failed) ? std::nullopt : failed;
}

bool LocalAccounts::setDamagedFileAside() {
  const Result<AccountRecord> read = readAccountFile(layout_.accountFile(), log_);
  if (!read.error || read.error->code == FileErrorCode::ReadNoSuchFile) return false;
  log_.write(LogType::Error, "drive: can't read the account: " + read.error->description());
  const int status = setFileAside(layout_.accountFile());
  if (status != 0) log_.write(LogType::Error, std::string("drive: can't set the account aside: ") + g_strerror(status));
  return status == 0;
}

}  // namespace vaelo
