#pragma once

#include <vector>

#include "platform/PreferencesList.h"
#include "quorl/pages/PageServices.h"

namespace quorl {

/// A page of the app itself: a list like any pane, made anew from how things stand. A page that is
/// opened from another one has that one's services. Main thread.
class AppPage : public PSListController {
  public:
    /// Before the page is shown, where it is not opened from another. `services` outlives the page.
    void setServices(PageServices& services) { services_ = &services; }

    void setParentController(PSController* controller) override;

    /// Shows how things stand at this moment. What has not changed stays as it is.
    void refresh();

    [[nodiscard]] NSArray<PSSpecifier> specifiers() override;
    void viewWillAppear(bool animated) override;

  protected:
    using Row = std::shared_ptr<PSSpecifier>;
    using Rows = std::vector<Row>;

    /// What the page is to show now. A row that has the name, the kind and the subject of the one
    /// that was in its place takes on its looks only.
    [[nodiscard]] virtual Rows rows() = 0;

    [[nodiscard]] PageServices& services() const { return *services_; }

    [[nodiscard]] const engine::EngineState& state() const { return services_->engineState(); }

    /// Begins a group, with a text below it; empty for none.
    [[nodiscard]] static Row group(std::optional<std::string> title, const std::string& footer);

    [[nodiscard]] Row value(std::string name, const std::string& text);

    /// With a bar that is full at 1.
    [[nodiscard]] Row progress(std::string name, const std::string& text, double share);

    [[nodiscard]] Row toggle(std::string name, bool isOn, PSSetter set);

    [[nodiscard]] Row button(std::string name, PSSetter act);

    enum class Chosen { No, Yes };

    /// One of several of which one is chosen.
    [[nodiscard]] Row choice(std::string name, const std::string& text, Chosen chosen,
                             PSSetter act);

    /// Opens a page.
    [[nodiscard]] Row link(std::string name, const std::string& text, const Class& page);

    /// The row, made to be about `subject`, so that it is another row than one of the same name
    /// that is about something else.
    [[nodiscard]] static Row about(std::string subject, Row row);

    /// Null: the row is about nothing.
    [[nodiscard]] static std::optional<std::string> subjectOf(const Row& row);

  private:
    [[nodiscard]] std::optional<std::string> valueOf(const Row& row);
    [[nodiscard]] Row make(std::string name, PSCellType cell, const std::string& text,
                           std::optional<PSSetter> set = {}, std::optional<Class> page = {});

    PageServices* services_ = nullptr;
};

} // namespace quorl
