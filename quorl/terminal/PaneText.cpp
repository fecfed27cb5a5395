#include "quorl/terminal/PaneText.h"

#include <QString>
#include <sstream>

#include "quorl/content/ButtonCell.h"
#include "quorl/content/SwitchCell.h"
#include "services/base/Utf8.h"

namespace quorl {

namespace {

constexpr const char* rowIndent = "      ";

std::string textOfLabel(const UILabel& label) { return base::printable(label.text().value_or("")); }

std::string textOfRow(NSInteger row, const UITableViewCell& cell) {
    const auto number = std::to_string(row + 1);
    std::string line(number.size() < 3 ? 3 - number.size() : 0, ' ');
    line += number + "  ";
    if (cell.accessoryType() == UITableViewCellAccessoryType::Checkmark) {
        line += "✓ ";
    }
    if (dynamic_cast<const ButtonCell*>(&cell)) {
        return line + '[' + textOfLabel(cell.textLabel()) + "]\n";
    }
    line += textOfLabel(cell.textLabel());
    if (const auto* toggle = dynamic_cast<const SwitchCell*>(&cell)) {
        return line + (toggle->isOn() ? ": on\n" : ": off\n");
    }
    const auto value = textOfLabel(cell.detailTextLabel());
    return value.empty() ? line + '\n' : line + ": " + value + '\n';
}

std::string textOfSection(const PaneContent& content, const PaneContent::Section& section,
                          NSInteger firstRow, int width) {
    std::string text;
    if (section.title && !section.title->empty()) {
        text += base::printable(*section.title) + '\n';
    }
    for (NSInteger row = firstRow; row < firstRow + section.rowCount; ++row) {
        if (const auto cell = content.cell(row)) {
            text += textOfRow(row, *cell);
        }
    }
    if (section.footer && !section.footer->empty()) {
        text += wrapped(base::printable(*section.footer), width, rowIndent);
    }
    return text;
}

/// Which rows are on the screen, empty where all are.
std::string textOfRange(const PaneContent& content) {
    const NSInteger count = content.rowCount();
    NSInteger first = 0;
    while (first < count && !content.cell(first)) {
        ++first;
    }
    NSInteger end = first;
    while (end < count && content.cell(end)) {
        ++end;
    }
    return end - first == count
               ? std::string()
               : "\nRows " + std::to_string(first + 1) + " to " + std::to_string(end) + " of " +
                     std::to_string(count) + ": + shows those after, - those before.\n";
}

} // namespace

std::string wrapped(const std::string& text, int width, const std::string& indent) {
    std::istringstream words(text);
    std::string lines;
    std::string line;
    for (std::string word; words >> word;) {
        std::string longer = line.empty() ? indent : line + ' ';
        longer += word;
        if (!line.empty() && QString::fromStdString(longer).size() > width) {
            lines += line + '\n';
            longer = indent + word;
        }
        line.swap(longer);
    }
    return line.empty() ? lines : lines + line + '\n';
}

std::string textOf(const PaneContent& content, int width) {
    std::string text = base::printable(content.pane().title().value_or("")) + '\n';
    NSInteger row = 0;
    for (const auto& section : content.sections()) {
        const auto part = textOfSection(content, section, row, width);
        text += part.empty() ? part : '\n' + part;
        row += section.rowCount;
    }
    return text + textOfRange(content);
}

} // namespace quorl
