#pragma once

#include "platform/PreferencesList.h"

namespace quorl {

/// What a person sees of a list controller, as every host shows it. Main thread only.
class ListView : public NSObject {
  public:
    struct Row {
        std::shared_ptr<PSSpecifier> specifier;
        std::optional<std::string> value;  ///< as the getter last gave it
        std::optional<std::string> footer; ///< of a group
    };

    /// `controller` owns the view and answers for its rows.
    explicit ListView(PSListController& controller) : controller_(controller) {}

    /// The view of a controller.
    [[nodiscard]] static ListView& of(const PSListController& controller) {
        return static_cast<ListView&>(controller.listView());
    }

    /// The rows as last drawn, from top to bottom.
    [[nodiscard]] const std::vector<Row>& rows() const { return rows_; }

    /// Has the next drawing take all rows anew.
    void markForDrawing() { marked_ = true; }

    /// The list has been on the screen; from now on it is drawn, also while another covers it.
    void setShown() { shown_ = true; }

    /// Takes titles, footers and values of all rows anew if the list was shown and is marked.
    void draw();

    /// Takes the value of one row anew, at once.
    void update(const std::shared_ptr<PSSpecifier>& specifier);

  private:
    PSListController& controller_;
    std::vector<Row> rows_;
    bool shown_ = false;
    bool marked_ = true;
};

} // namespace quorl
