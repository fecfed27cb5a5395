#include "quorl/terminal/PaneText.h"

#include <algorithm>
#include <limits>

#include "quorl/content/ButtonCell.h"
#include "quorl/content/SwitchCell.h"
#include "quorl/terminal/sheets/TerminalText.h"
#include "services/base/Utf8.h"
#include "services/language/Translated.h"

namespace quorl {

namespace {

constexpr const char* rowIndent = "      ";

using Lines = std::vector<TextLine>;

void append(Lines& lines, const Lines& more) {
    lines.insert(lines.end(), more.begin(), more.end());
}

std::string textOfLabel(const UILabel& label) { return base::printable(label.text().value_or("")); }

/// The value gets half the room, and what the name leaves of the rest.
std::string nameAndValue(const std::string& name, const std::string& value, int room) {
    constexpr std::string_view separator = ": ";
    const int forBoth = room - columnsOf(separator);
    const int forValue =
        std::min(columnsOf(value), std::max(forBoth / 2, forBoth - columnsOf(name)));
    return isolated(shortened(name, forBoth - forValue)).append(separator) +
           isolated(shortened(value, forValue));
}

std::string valueOf(const UITableViewCell& cell) {
    const auto* toggle = dynamic_cast<const SwitchCell*>(&cell);
    return toggle ? (toggle->isOn() ? language::translated("on") : language::translated("off"))
                  : textOfLabel(cell.detailTextLabel());
}

std::string beginningOfRow(NSInteger row, const UITableViewCell& cell) {
    constexpr std::size_t digits = 3;
    const auto number = std::to_string(row + 1);
    const bool isChecked = cell.accessoryType() == UITableViewCellAccessoryType::Checkmark;
    return std::string(digits - std::min(number.size(), digits), ' ') + number +
           (isChecked ? "  ✓ " : "  ");
}

std::string textOfRow(NSInteger row, const UITableViewCell& cell, const SheetForm& form) {
    const auto beginning = beginningOfRow(row, cell);
    const auto name = textOfLabel(cell.textLabel());
    const int room = form.kind == SheetForm::Kind::Rewritten ? form.columns - columnsOf(beginning)
                                                             : std::numeric_limits<int>::max();
    if (dynamic_cast<const ButtonCell*>(&cell)) {
        return beginning + '[' + isolated(shortened(name, room - columnsOf("[]"))) + ']';
    }
    const auto value = valueOf(cell);
    return beginning +
           (value.empty() ? isolated(shortened(name, room)) : nameAndValue(name, value, room));
}

void addSection(Lines& lines, const PaneContent& content, const PaneContent::Section& section,
                NSInteger firstRow, const SheetForm& form) {
    if (section.title && !section.title->empty()) {
        lines.push_back({base::printable(*section.title)});
    }
    for (NSInteger row = firstRow; row < firstRow + section.rowCount; ++row) {
        const auto cell = content.cell(row);
        lines.push_back({cell ? textOfRow(row, *cell, form) : std::string(), row});
    }
    append(lines, paragraphs(section.footer.value_or(""), form, rowIndent));
}

} // namespace

Lines paragraphs(const std::string& text, const SheetForm& form, const std::string& indent) {
    const auto longWords =
        form.kind == SheetForm::Kind::Rewritten ? LongWords::Broken : LongWords::Whole;
    Lines lines;
    for (std::size_t start = 0; start < text.size();) {
        const auto end = std::min(text.find('\n', start), text.size());
        const auto paragraph = base::printable(text.substr(start, end - start));
        bool goesOn = false;
        for (auto& line : wrapped(paragraph + '\n', form.columns, indent, longWords)) {
            lines.push_back({std::move(line), {}, std::exchange(goesOn, true)});
        }
        start = end + 1;
    }
    return lines;
}

Lines linesOf(const PaneContent& content, const SheetForm& form) {
    Lines lines{{base::printable(content.pane().title().value_or(""))}};
    NSInteger row = 0;
    for (const auto& section : content.sections()) {
        Lines part;
        addSection(part, content, section, row, form);
        if (!part.empty()) {
            lines.emplace_back();
            append(lines, part);
        }
        row += section.rowCount;
    }
    return lines;
}

} // namespace quorl
