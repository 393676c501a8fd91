// SPDX-License-Identifier: GPL-3.0-or-later
// What happens to a document while its name is changed on the details' screen, and what a disk refuses.
#include "tests/unit/preview_fixture.h"

namespace vaelo {
namespace {

class DetailsMeanwhileTest : public PreviewFixture {
 protected:
  /// Begins to change the document's name to `name`.
  void type(const std::string& name) {
    manager = show(1);
    details = manager->detailsViewController();
    ASSERT_TRUE(field().becomeFirstResponder());
    field().userSetText(name);
  }
  TextField& field() { return *details->filenameTextField(); }
  URL named(const char* name) { return document.deletingLastPathComponent().appendingPathComponent(name); }
  bool isThere(const URL& url) { return memory.disk.logicalItem(url.path()) != nullptr; }

  std::shared_ptr<PreviewItemManager> manager;
  std::shared_ptr<PreviewDetailsViewController> details;
};

TEST_F(DetailsMeanwhileTest, ARenamedDocumentIsFollowed) {
  type("Plan.pdf");
  EXPECT_TRUE(field().resignFirstResponder());
  runAllQueues();
  EXPECT_EQ(manager->item()->url()->path(), named("Plan.pdf").path());
  details = manager->detailsViewController();
  EXPECT_EQ(top(), details);
  EXPECT_EQ(field().text(), "Plan.pdf");
  EXPECT_EQ(details->originalFilename(), "Plan.pdf");
}

TEST_F(DetailsMeanwhileTest, WhatTheDiskRefusesIsToldAndMayBeTriedAgain) {
  type("Plan.pdf");
  memory.files.moveError = Error{FileErrorDomain, FileErrorCode::WriteVolumeReadOnly, {}, "The disk can only be read.", {}};
  EXPECT_FALSE(field().resignFirstResponder());
  EXPECT_TRUE(field().isEditing());
  EXPECT_EQ(field().text(), "Plan.pdf");
  EXPECT_EQ(details->originalFilename(), "Report.pdf");
  EXPECT_EQ(details->navigationItem().title(), "Rename File");
  ASSERT_NE(presentedAlert(), nullptr);
  EXPECT_EQ(presentedAlert()->title(), "The disk can only be read.");
  EXPECT_TRUE(isThere(document));
  details->dismissViewControllerAnimated(false);
  memory.files.moveError.reset();
  EXPECT_TRUE(field().resignFirstResponder());
  EXPECT_TRUE(isThere(named("Plan.pdf")));
}

TEST_F(DetailsMeanwhileTest, OfADocumentThatIsGoneTheNewNameIsNotMade) {
  type("Plan.pdf");
  memory.disk.remove(document.path());
  EXPECT_FALSE(field().resignFirstResponder());
  EXPECT_NE(presentedAlert(), nullptr);
  EXPECT_FALSE(isThere(named("Plan.pdf")));
  EXPECT_EQ(details->originalFilename(), "Report.pdf");
}

TEST_F(DetailsMeanwhileTest, WithoutAnItemTheEditingEndsAndNothingIsTold) {
  type("Plan.pdf");
  manager->setItemUpdatePreview(nullptr, false);
  EXPECT_TRUE(field().resignFirstResponder());
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_TRUE(isThere(document));
}

// The screen goes, its field loses the keyboard, and nobody has asked for the new name.
TEST_F(DetailsMeanwhileTest, AScreenThatGoesWithItsDocumentRenamesNothing) {
  type("Plan.pdf");
  memory.others.remove(document.path());
  runAllQueues();
  EXPECT_NE(top(), details);
  log().clear();
  field().endEditing(true);
  EXPECT_FALSE(field().isEditing());
  EXPECT_FALSE(loggedStarting("DEBUG", "Name is valid"));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(DetailsMeanwhileTest, AMoveByAnotherProgramShowsTheCurrentName) {
  type("Plan.pdf");
  memory.others.rename(document.path(), named("Moved.pdf").path());
  runAllQueues();
  details = manager->detailsViewController();
  EXPECT_EQ(field().text(), "Moved.pdf");
  EXPECT_EQ(details->originalFilename(), "Moved.pdf");
  field().endEditing(true);
  EXPECT_TRUE(isThere(named("Moved.pdf")));
  EXPECT_FALSE(isThere(named("Plan.pdf")));
}

}  // namespace
}  // namespace vaelo
