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

    /// What the page is to show now. A row that has the name and the kind of the one that was in
    /// its place takes on its looks only.
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

    /// The property of a row that tells the page what the row is about.
    static constexpr std::string_view RowSubjectKey = "subject";

    /// Opens a page.
    [[nodiscard]] Row link(std::string name, const std::string& text, const Class& page);

  private:
    [[nodiscard]] std::optional<std::string> valueOf(const Row& row);
    [[nodiscard]] Row make(std::string name, PSCellType cell, const std::string& text,
                           std::optional<PSSetter> set = {}, std::optional<Class> page = {});

    PageServices* services_ = nullptr;
};

} // namespace quorl
