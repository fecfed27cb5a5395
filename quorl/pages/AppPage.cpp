#include "quorl/pages/AppPage.h"

#include <algorithm>
#include <array>
#include <charconv>

#include "quorl/content/ChoiceRow.h"
#include "quorl/content/ProgressCell.h"

namespace quorl {

namespace {

/// Where a row keeps the text that it shows.
constexpr std::string_view RowValueKey = "value";

/// Where a row keeps what it is about, which need not be seen in it.
constexpr std::string_view RowSubjectKey = "subject";

bool isAlike(const std::shared_ptr<PSSpecifier>& one, const std::shared_ptr<PSSpecifier>& other) {
    return one->name() == other->name() && one->cellType() == other->cellType() &&
           one->detailControllerClass() == other->detailControllerClass() &&
           one->propertyForKey(RowSubjectKey) == other->propertyForKey(RowSubjectKey);
}

/// Takes over all in which rows that are alike can differ.
void takeLooks(PSSpecifier& row, const PSSpecifier& from) {
    for (const auto key : {RowValueKey, RowProgressKey, RowChosenKey, PSFooterTextGroupKey}) {
        row.setProperty_forKey(from.propertyForKey(key), key);
    }
}

/// Written and read the same in every language.
std::string textOfShare(double share) {
    std::array<char, 32> text{};
    const auto end = std::to_chars(text.data(), text.data() + text.size(), share).ptr;
    return {text.data(), end};
}

} // namespace

void AppPage::setParentController(PSController* controller) {
    PSListController::setParentController(controller);
    if (const auto* page = dynamic_cast<AppPage*>(controller)) {
        services_ = page->services_;
    }
}

NSArray<PSSpecifier> AppPage::specifiers() {
    if (!_specifiers) {
        _specifiers = std::make_shared<Rows>(rows());
    }
    return _specifiers;
}

void AppPage::viewWillAppear(bool animated) {
    PSListController::viewWillAppear(animated);
    refresh();
}

void AppPage::refresh() {
    const auto shown = specifiers();
    const auto now = std::make_shared<Rows>(rows());
    if (std::equal(shown->begin(), shown->end(), now->begin(), now->end(), isAlike)) {
        for (std::size_t index = 0; index < shown->size(); ++index) {
            takeLooks(*(*shown)[index], *(*now)[index]);
        }
    } else {
        _specifiers = now;
    }
    reload();
}

AppPage::Row AppPage::group(std::optional<std::string> title, const std::string& footer) {
    auto row = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(title), nullptr, {}, {}, {}, PSCellType::Group, {});
    row->setProperty_forKey(footer.empty() ? std::nullopt : std::optional(footer),
                            PSFooterTextGroupKey);
    return row;
}

AppPage::Row AppPage::value(std::string name, const std::string& text) {
    return make(std::move(name), PSCellType::TitleValue, text);
}

AppPage::Row AppPage::progress(std::string name, const std::string& text, double share) {
    auto row = make(std::move(name), PSCellType::TitleValue, text);
    row->setProperty_forKey(textOfShare(share), RowProgressKey);
    return row;
}

AppPage::Row AppPage::toggle(std::string name, bool isOn, PSSetter set) {
    return make(std::move(name), PSCellType::Switch,
                std::string(isOn ? PSSwitchOnValue : PSSwitchOffValue), set);
}

AppPage::Row AppPage::button(std::string name, PSSetter act) {
    return make(std::move(name), PSCellType::Button, "", act);
}

AppPage::Row AppPage::choice(std::string name, const std::string& text, Chosen chosen,
                             PSSetter act) {
    auto row = make(std::move(name), PSCellType::Button, text, act);
    row->setProperty_forKey(chosen == Chosen::Yes ? "yes" : "no", RowChosenKey);
    return row;
}

AppPage::Row AppPage::link(std::string name, const std::string& text, const Class& page) {
    return make(std::move(name), PSCellType::LinkList, text, {}, page);
}

AppPage::Row AppPage::make(std::string name, PSCellType cell, const std::string& text,
                           std::optional<PSSetter> set, std::optional<Class> page) {
    auto row = PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
        std::move(name), strong(this), set, PSGetter::of<&AppPage::valueOf>("valueOf:"), page, cell,
        {});
    row->setProperty_forKey(text, RowValueKey);
    return row;
}

AppPage::Row AppPage::about(std::string subject, Row row) {
    row->setProperty_forKey(std::move(subject), RowSubjectKey);
    return row;
}

std::optional<std::string> AppPage::subjectOf(const Row& row) {
    return row->propertyForKey(RowSubjectKey);
}

std::optional<std::string> AppPage::valueOf(const Row& row) {
    return row->propertyForKey(RowValueKey);
}

} // namespace quorl
