// The command that sends the top pane one of the messages that the list framework has for panes.

#include <unordered_map>

#include "quorl-script/Commands.h"
#include "quorl-script/Naming.h"
#include "quorl-script/StandInPane.h"

namespace quorl {

namespace {

/// A message on its way, and where its arguments come from.
struct Message {
    Stage& stage;
    const Field& command;
    PSController& receiver;
};

using Send = JsonObject (*)(const Message& message);

/// For a member without arguments and without a result.
template <auto Member>
JsonObject plain(const Message& message) {
    (message.receiver.*Member)();
    return {};
}

/// A pane that some other part of the app would hand over.
std::shared_ptr<PSController> newPane(const Message& message) {
    const auto name = message.command["controller"].textOrNull();
    return name ? std::make_shared<StandInPane>(*name) : nullptr;
}

/// A pane below the receiver by its class: only such a one outlives it.
PSController* paneBelow(const Message& message) {
    const Field field = message.command["controller"];
    if (!field.isGiven()) {
        return nullptr;
    }
    for (const auto& pane : message.stage.panes.stack()) {
        auto* controller = dynamic_cast<PSController*>(pane.get());
        if (controller != &message.receiver && className(*pane) == field.text()) {
            return controller;
        }
    }
    field.refuse("the class of a pane below this one, or null");
}

JsonObject resultOf(const NSObject* object) {
    return JsonObject().set("result", classNameOrNull(object));
}

JsonObject canBeShownFromSuspendedState(const Message& message) {
    return JsonObject().set("result", message.receiver.canBeShownFromSuspendedState());
}

JsonObject handleURL(const Message& message) {
    message.receiver.handleURL(message.command["url"].text());
    return {};
}

JsonObject parentController(const Message& message) {
    return resultOf(dynamic_cast<NSObject*>(message.receiver.parentController()));
}

JsonObject readPreferenceValue(const Message& message) {
    return resultOf(message.receiver.readPreferenceValue(nullptr).get());
}

JsonObject rootController(const Message& message) {
    return resultOf(message.receiver.rootController());
}

JsonObject setParentController(const Message& message) {
    message.receiver.setParentController(paneBelow(message));
    return {};
}

JsonObject setPreferenceValue(const Message& message) {
    message.receiver.setPreferenceValue_specifier(nullptr, nullptr);
    return {};
}

JsonObject setRootController(const Message& message) {
    const bool isGiven = message.command["controller"].isGiven();
    message.receiver.setRootController(isGiven ? &message.stage.panes.navigation() : nullptr);
    return {};
}

JsonObject setSpecifier(const Message& message) {
    message.receiver.setSpecifier(nullptr);
    return {};
}

JsonObject showController(const Message& message) {
    message.receiver.showController(newPane(message));
    return {};
}

JsonObject showControllerAnimate(const Message& message) {
    const bool animate = message.command["animate"].booleanOr(false);
    message.receiver.showController_animate(newPane(message), animate);
    return {};
}

JsonObject specifier(const Message& message) {
    const auto specifier = message.receiver.specifier();
    return JsonObject().set("result", specifier ? specifier->name() : std::nullopt);
}

JsonObject statusBarWillAnimateByHeight(const Message& message) {
    message.receiver.statusBarWillAnimateByHeight(0);
    return {};
}

const std::unordered_map<std::string, Send>& members() {
    using Pane = PSController;
    static const std::unordered_map<std::string, Send> members{
        {"canBeShownFromSuspendedState", canBeShownFromSuspendedState},
        {"didLock", plain<&Pane::didLock>},
        {"didUnlock", plain<&Pane::didUnlock>},
        {"didWake", plain<&Pane::didWake>},
        {"handleURL:", handleURL},
        {"parentController", parentController},
        {"readPreferenceValue:", readPreferenceValue},
        {"rootController", rootController},
        {"setParentController:", setParentController},
        {"setPreferenceValue:specifier:", setPreferenceValue},
        {"setRootController:", setRootController},
        {"setSpecifier:", setSpecifier},
        {"showController:", showController},
        {"showController:animate:", showControllerAnimate},
        {"specifier", specifier},
        {"statusBarWillAnimateByHeight:", statusBarWillAnimateByHeight},
        {"suspend", plain<&Pane::suspend>},
        {"willBecomeActive", plain<&Pane::willBecomeActive>},
        {"willResignActive", plain<&Pane::willResignActive>},
        {"willUnlock", plain<&Pane::willUnlock>}};
    return members;
}

} // namespace

JsonObject send(Stage& stage, const Field& command) {
    const Field selector = command["selector"];
    const auto found = members().find(selector.text());
    if (found == members().end()) {
        selector.refuse("the selector of a member of PSController");
    }
    auto& receiver = dynamic_cast<PSController&>(stage.panes.top());
    return found->second({stage, command, receiver});
}

} // namespace quorl
