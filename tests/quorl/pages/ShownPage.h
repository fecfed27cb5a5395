#pragma once

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "quorl/content/PaneContent.h"
#include "quorl/pages/AppPage.h"
#include "quorl/terminal/PaneText.h"
#include "runtime/lists/NavigationController.h"
#include "tests/quorl/pages/MadeUpServices.h"
#include "tests/quorl/window/Window.h"

namespace quorl::tests {

/// Tests of the page that is on the top of a stack of pages.
class ShownPage : public testing::Test {
  protected:
    /// Puts `page` on the screen.
    void show(const std::shared_ptr<AppPage>& page) {
        page->setServices(services_);
        navigation_->setRootPane(page);
        navigation_->appear(false);
    }

    /// Has the page on the top look again, and draws nothing.
    void refresh() {
        const auto top = navigation_->top();
        if (!content_ || &content_->pane() != top.get()) {
            content_ = PaneContent::of(top, *navigation_);
        }
        if (auto* page = dynamic_cast<AppPage*>(top.get())) {
            page->refresh();
        }
    }

    /// What the page on the top shows now, as the terminal prints it.
    std::string text() {
        refresh();
        content_->draw(0, 100);
        std::string text;
        for (const auto& line : linesOf(*content_, {80, 100, SheetForm::Kind::Printed})) {
            text += line.text + '\n';
        }
        return text;
    }

    void tap(const std::string& title) {
        static_cast<void>(text());
        for (NSInteger row = 0; row < content_->rowCount(); ++row) {
            if (content_->cell(row)->textLabel().text() == title) {
                ASSERT_TRUE(content_->tap(row));
                return;
            }
        }
        FAIL() << "there is no row " << title;
    }

    Window window_; // its host
    MadeUpServices services_;
    std::shared_ptr<NavigationController> navigation_ = ::create<NavigationController>();
    std::unique_ptr<PaneContent> content_;
};

} // namespace quorl::tests
