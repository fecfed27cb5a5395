#pragma once

#include "quorl/pages/PageServices.h"

namespace quorl::tests {

/// A stick that can be taken out, with half of its 2 GB free.
inline finding::Offer halfFullStick() {
    constexpr std::uint64_t gigabyte = 1 << 30;
    return {.name = "Walkman",
            .directory = "/media/a",
            .space = finding::Space{2 * gigabyte, gigabyte},
            .identity = finding::Identity{"ABCD", "/media/a"},
            .removal = finding::Removal()};
}

/// A state of the engine that a test makes up, and what pages ask for.
class MadeUpServices final : public PageServices {
  public:
    MadeUpServices() {
        state.isThere = true;
        state.wearable.isEmbedded = true;
        state.wearable.isConnected = true;
    }

    [[nodiscard]] const engine::EngineState& engineState() const override { return state; }

    void ask(EngineLink::Request request) override { requests.push_back(request); }

    void setOnCharger(bool isOnCharger) override { state.wearable.isOnCharger = isOnCharger; }

    [[nodiscard]] std::optional<bool> startsAtLogin() const override {
        ++loginStartReads;
        return isLoginStart;
    }

    void setStartAtLogin(bool starts) override { isLoginStart = starts; }

    [[nodiscard]] std::optional<bool> hasDesktopNotices() const override { return hasNotices; }

    void setDesktopNotices(bool areOn) override { hasNotices = areOn; }

    void findWearables(Finding finding) override { isFinding = finding == Finding::Wanted; }

    [[nodiscard]] WearableShelf wearables() const override { return shelf; }

    void chooseWearable(const std::filesystem::path& directory) override {
        asked.push_back("choose " + directory.string());
    }

    void ejectWearable(const std::filesystem::path& directory) override {
        asked.push_back("eject " + directory.string());
    }

    [[nodiscard]] bool canAskForFolder() const override { return true; }

    void chooseOtherWearable() override { asked.emplace_back("choose another"); }

    engine::EngineState state;
    std::optional<bool> isLoginStart = false;
    mutable int loginStartReads = 0;
    std::optional<bool> hasNotices = true;
    bool isFinding = false;
    WearableShelf shelf;
    std::vector<std::string> asked;
    std::vector<EngineLink::Request> requests;
};

} // namespace quorl::tests
