// The commands that are a user's or the host's doing, and those that look at what came of it.

#include <unordered_map>

#include "quorl-script/Commands.h"
#include "quorl-script/Naming.h"
#include "quorl-script/Snapshot.h"

namespace quorl {

namespace {

JsonObject create(Stage& stage, const Field& /*command*/) {
    stage.panes.createRoot(stage.plugin.rootClass());
    return {};
}

JsonObject specifiers(Stage& stage, const Field& /*command*/) {
    stage.panes.askForSpecifiers();
    return {};
}

JsonObject appear(Stage& stage, const Field& command) {
    stage.panes.appear(command["animated"].booleanOr(false));
    return {};
}

JsonObject disappear(Stage& stage, const Field& command) {
    stage.panes.disappear(command["animated"].booleanOr(false));
    return {};
}

JsonObject open(Stage& stage, const Field& /*command*/) {
    stage.panes.createRoot(stage.plugin.rootClass());
    stage.panes.askForSpecifiers();
    stage.panes.appear(false);
    return {};
}

NSIndexPath pathOf(const Field& field) {
    constexpr auto largest = std::numeric_limits<std::int32_t>::max();
    const auto indices = field.elements();
    if (indices.size() != 2) {
        field.refuse("a list of a section and a row");
    }
    return {static_cast<NSInteger>(indices[0].count(largest)),
            static_cast<NSInteger>(indices[1].count(largest))};
}

JsonObject tap(Stage& stage, const Field& command) {
    const Field specifier = command["specifier"];
    if (specifier.isGiven()) {
        stage.panes.tapSpecifier(specifier.text());
    } else if (command["path"].isGiven()) {
        stage.panes.tapRow(pathOf(command["path"]));
    } else {
        specifier.refuse("the title of a row, or \"path\" its place in the table");
    }
    return {};
}

JsonObject back(Stage& stage, const Field& /*command*/) {
    stage.panes.back();
    return {};
}

JsonObject scroll(Stage& stage, const Field& command) {
    constexpr auto largest = std::numeric_limits<std::int32_t>::max();
    const auto row = static_cast<NSInteger>(command["to"].count(largest));
    stage.panes.scrollTo(row);
    return {};
}

JsonObject release(Stage& stage, const Field& /*command*/) {
    stage.panes.releaseAll();
    return {};
}

JsonObject rows(Stage& stage, const Field& command) {
    const std::int64_t section = command["section"].integer();
    if (!std::in_range<NSInteger>(section)) {
        command["section"].refuse("the index of a section");
    }
    UITableViewController& pane = stage.panes.topTable();
    return JsonObject().set("result", pane.tableView_numberOfRowsInSection(
                                          pane.tableView(), static_cast<NSInteger>(section)));
}

JsonObject query(Stage& stage, const Field& /*command*/) { return stage.plugin.status(); }

JsonObject snapshot(Stage& stage, const Field& /*command*/) {
    return JsonObject().set("stack", snapshotOf(stage.panes.stack()));
}

JsonObject trace(Stage& stage, const Field& command) {
    std::optional<std::set<std::string, std::less<>>> classes;
    if (const Field field = command["classes"]; field.isGiven()) {
        classes.emplace();
        for (const Field& element : field.elements()) {
            classes->insert(element.text());
        }
    }
    stage.trace->select(std::move(classes));
    return {};
}

CGRect frameOf(const Field& field) {
    const auto sides = field.elements();
    if (sides.size() != 4) {
        field.refuse("a list of four numbers: x, y, width, height");
    }
    const auto side = [&sides](std::size_t index) {
        return static_cast<CGFloat>(sides[index].number());
    };
    return {side(0), side(1), side(2), side(3)};
}

JsonList frameOf(const UILabel& label) {
    const CGRect frame = label.frame();
    JsonList sides;
    for (const CGFloat side : {frame.x, frame.y, frame.width, frame.height}) {
        sides.add(numberOf(static_cast<double>(side)));
    }
    return sides;
}

CellLayout layoutOf(const ScreenDouble& screen, const Field& command) {
    CellLayout layout;
    layout.title = frameOf(command["title"]);
    layout.detail = frameOf(command["detail"]);
    layout.detailWidth = static_cast<CGFloat>(command["fits"].number());
    const Field scale = command["scale"];
    layout.scale = static_cast<CGFloat>(scale.numberOr(static_cast<double>(screen.looks.scale)));
    if (!(layout.scale > 0)) {
        scale.refuse("a number above 0");
    }
    return layout;
}

JsonObject layout(Stage& stage, const Field& command) {
    ScreenDouble& screen = stage.host.screen();
    const CellLayout layout = layoutOf(screen, command);
    const auto cell = stage.plugin.newPlaylistCell();
    watchLife(*cell, className(*cell), stage.trace);
    const auto labels = screen.tryLayout(*cell, layout);
    JsonList set;
    for (const UILabel* label : labels) {
        set.add(label == &cell->textLabel() ? "title" : "detail");
    }
    return JsonObject()
        .set("title", frameOf(cell->textLabel()))
        .set("detail", frameOf(cell->detailTextLabel()))
        .set("set", set);
}

} // namespace

Command paneCommand(std::string_view name) {
    static const std::unordered_map<std::string_view, Command> commands{
        {"appear", appear},         {"back", back},       {"create", create},
        {"disappear", disappear},   {"layout", layout},   {"open", open},
        {"query", query},           {"release", release}, {"rows", rows},
        {"scroll", scroll},         {"send", send},       {"snapshot", snapshot},
        {"specifiers", specifiers}, {"tap", tap},         {"trace", trace}};
    const auto found = commands.find(name);
    return found == commands.end() ? nullptr : found->second;
}

} // namespace quorl
