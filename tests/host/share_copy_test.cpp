// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/desktop/copy_out.h"
#include "tests/host/drive_test_support.h"

namespace vaelo {

namespace {

class ShareCopyTest : public drive_test::DriveTest {
 protected:
  CopyOutcome copy(
      const std::string& from, const std::string& to, CopyOut::Progress progress = [](auto, auto) {}) {
    const GRef<GFile> source(g_file_new_for_path((root + "/" + from).c_str()));
    const GRef<GFile> destination(g_file_new_for_path((root + "/" + to).c_str()));
    return CopyOut(source.get(), destination.get(), cancellable.get(), std::move(progress)).run();
  }
  std::string text(const std::string& name) { return read(root + "/" + name); }
  void expectNothingHalfMade() {
    for (const auto& entry : std::filesystem::recursive_directory_iterator(root)) {
      EXPECT_FALSE(entry.path().filename().string().starts_with(".vaelo-copy")) << entry.path();
    }
  }
  GRef<GCancellable> cancellable{g_cancellable_new()};
  using Kind = CopyOutcome::Kind;
};

TEST_F(ShareCopyTest, ADocumentIsCopiedWithoutWhatTheAccountKnows) {
  write(root + "/a.txt", "content");
  setxattr((root + "/a.txt").c_str(), "user.vaelo.docid", "7", 1, 0);
  setxattr((root + "/a.txt").c_str(), "user.xdg.tags", "Red", 3, 0);
  std::uint64_t told = 0;
  EXPECT_EQ(copy("a.txt", "b.txt", [&](std::uint64_t done, std::uint64_t) { told = done; }).kind, Kind::Copied);
  EXPECT_EQ(text("b.txt"), "content");
  EXPECT_EQ(told, 7u);
  char value[8];
  EXPECT_LT(getxattr((root + "/b.txt").c_str(), "user.vaelo.docid", value, sizeof value), 0);
  EXPECT_EQ(getxattr((root + "/a.txt").c_str(), "user.vaelo.docid", value, sizeof value), 1);
  expectNothingHalfMade();
}

TEST_F(ShareCopyTest, WhatComesThereMeanwhileIsKept) {
  write(root + "/a.txt", "content");
  const CopyOutcome outcome = copy("a.txt", "b.txt", [&](auto, auto) { write(root + "/b.txt", "precious"); });
  EXPECT_EQ(outcome.kind, Kind::Failed);
  EXPECT_NE(outcome.reason.find("meanwhile"), std::string::npos) << outcome.reason;
  EXPECT_EQ(text("b.txt"), "precious");
  expectNothingHalfMade();
}

TEST_F(ShareCopyTest, ADocumentThatTheUserChoseToReplaceIsReplacedAndAFolderNever) {
  write(root + "/a.txt", "content");
  write(root + "/b.txt", "old");
  EXPECT_EQ(copy("a.txt", "b.txt").kind, Kind::Copied);
  EXPECT_EQ(text("b.txt"), "content");
  write(root + "/folder/x", "kept");
  EXPECT_EQ(copy("a.txt", "folder").kind, Kind::Failed);
  EXPECT_EQ(text("folder/x"), "kept");
}

TEST_F(ShareCopyTest, AFolderIsCopiedWithoutWhatIsNotDownloadedWhichIsCounted) {
  write(root + "/folder/inner/a.txt", "a");
  write(root + "/folder/.Thesis.pdf.vlopromise", "[Promise]\nName=Thesis.pdf\n");
  const CopyOutcome outcome = copy("folder", "copy");
  EXPECT_EQ(outcome.kind, Kind::Copied) << outcome.reason;
  EXPECT_EQ(outcome.notCopied, 1u);
  EXPECT_EQ(text("copy/inner/a.txt"), "a");
  EXPECT_FALSE(std::filesystem::exists(root + "/copy/.Thesis.pdf.vlopromise"));
}

TEST_F(ShareCopyTest, NothingGoesIntoOrOverItself) {
  write(root + "/folder/a.txt", "a");
  EXPECT_EQ(copy("folder", "folder/copy").kind, Kind::Failed);
  EXPECT_EQ(copy("folder/a.txt", "folder/a.txt").kind, Kind::Failed);
  std::filesystem::create_hard_link(root + "/folder/a.txt", root + "/same.txt");
  EXPECT_EQ(copy("folder/a.txt", "same.txt").kind, Kind::Failed);
  EXPECT_EQ(text("folder/a.txt"), "a");
  expectNothingHalfMade();
}

TEST_F(ShareCopyTest, FailuresAndStopsLeaveNothingBehind) {
  EXPECT_EQ(copy("gone.txt", "b.txt").kind, Kind::Failed);
  write(root + "/a.txt", "content");
  EXPECT_EQ(copy("a.txt", "no/such/folder.txt").kind, Kind::Failed);
  write(root + "/folder/a.txt", "a");
  write(root + "/folder/b.txt", "b");
  EXPECT_EQ(copy("folder", "copy", [&](auto, auto) { g_cancellable_cancel(cancellable.get()); }).kind, Kind::Cancelled);
  EXPECT_FALSE(std::filesystem::exists(root + "/copy"));
  expectNothingHalfMade();
}

}  // namespace

}  // namespace vaelo
