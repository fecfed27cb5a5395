// What one program sees of the shared preferences.

#include <algorithm>
#include <array>
#include <limits>
#include <thread>

#include <gtest/gtest.h>

#include "services/preferences/Schema.h"
#include "services/preferences/Variant.h"
#include "tests/preferences/DesktopSession.h"
#include "tests/preferences/ValueText.h"

namespace {

using namespace quorl::preferences;
using namespace quorl::preferences::testing;

constexpr auto largest = std::numeric_limits<std::uint64_t>::max();

class Values : public DesktopSessionTest {};

TEST_F(Values, AreTheDefaultsAsLongAsNobodyWroteThem) {
    const auto preferences = openShared();

    forEachPreference([&](const auto& preference) {
        EXPECT_EQ(preferences->get(preference), preference.defaultValue) << preference.key;
    });
}

TEST_F(Values, AreDeclaredInTheSchemasAsInTheTable) {
    const auto [schemas, problem] = findSchemas(quorl::base::Purpose::Use);
    ASSERT_EQ(problem, "");

    std::size_t count = 0;
    forEachPreference([&, &found = schemas]<class T>(const Preference<T>& preference) {
        ++count;
        const auto schema = std::find_if(found.begin(), found.end(), [&](const auto& one) {
            return std::string_view(g_settings_schema_get_id(one.get()))
                .ends_with(preference.schema);
        });
        ASSERT_NE(schema, found.end()) << preference.schema;
        const KeyPointer key(g_settings_schema_get_key(schema->get(), preference.key));
        const VariantPointer byDefault(g_settings_schema_key_get_default_value(key.get()));
        EXPECT_STREQ(g_variant_get_type_string(byDefault.get()), Stored<T>::type);
        EXPECT_EQ(Stored<T>::unwrap(*byDefault), preference.defaultValue) << preference.key;
        EXPECT_STREQ(g_settings_schema_key_get_summary(key.get()), preference.description);
        EXPECT_STRNE(g_settings_schema_key_get_description(key.get()), nullptr) << preference.key;
    });

    for (const auto& schema : schemas) {
        const std::unique_ptr<char*, FreedWith<g_strfreev>> keys(
            g_settings_schema_list_keys(schema.get()));
        count -= g_strv_length(keys.get());
    }
    EXPECT_EQ(count, 0U) << "the schemas have keys that the table lacks";
}

TEST_F(Values, ComeBackAsTheyWereWritten) {
    const auto preferences = openShared();
    const auto comesBack = [&]<class T>(const Preference<T>& preference, T value) {
        const auto result = preferences->set(preference, value);
        EXPECT_EQ(result.problem, "") << preference.key;
        EXPECT_TRUE(result.changed) << preference.key << " " << textOf(value);
        EXPECT_EQ(preferences->get(preference), value) << preference.key;
    };

    forEachPreference([&]<class T>(const Preference<T>& preference) {
        if constexpr (std::is_same_v<T, bool>) {
            comesBack(preference, !preference.defaultValue);
            comesBack(preference, preference.defaultValue);
        } else if constexpr (std::is_same_v<T, std::string>) {
            comesBack(preference, std::string("/a folder/\xC3\xA4;'\n"));
            comesBack(preference, std::string());
        } else {
            for (const std::uint64_t number : {std::uint64_t{1}, std::uint64_t{0}, largest}) {
                comesBack(preference, T{number});
            }
        }
        if constexpr (std::is_same_v<T, std::optional<std::uint64_t>>) {
            comesBack(preference, T{});
        }
    });
}

TEST_F(Values, ThatAreNoTextAreRefusedInWords) {
    const auto preferences = openShared();
    ASSERT_TRUE(preferences->set(musicFolder, "/before").changed);

    for (const auto& text : {std::string("/m\xFFsic"), std::string("/m\0sic", 6)}) {
        const auto result = preferences->set(musicFolder, text);
        EXPECT_FALSE(result.changed);
        EXPECT_NE(result.problem.find("music-folder was not changed"), std::string::npos);
    }
    EXPECT_EQ(preferences->get(musicFolder), "/before");
}

TEST_F(Values, AreReadAndWrittenWithGsettings) {
    const auto preferences = openShared();
    forEachPreference([&]<class T>(const Preference<T>& preference) {
        const auto schema = "org.quorl.Velora." + std::string(preference.schema);
        if constexpr (std::is_same_v<T, bool>) {
            run({"gsettings", "set", schema, preference.key,
                 preference.defaultValue ? "false" : "true"});
            EXPECT_NE(preferences->get(preference), preference.defaultValue);
        } else if constexpr (std::is_same_v<T, std::string>) {
            run({"gsettings", "set", schema, preference.key, "'/Music'"});
            EXPECT_EQ(preferences->get(preference), "/Music");
        } else {
            gsettings("set", {preference.key, textOf(largest)});
            EXPECT_EQ(preferences->get(preference), largest) << preference.key;
        }
    });

    ASSERT_EQ(preferences->set(assetSyncLimit, std::nullopt).problem, "");
    EXPECT_EQ(gsettings("get", {assetSyncLimit.key}), "@mt nothing");
    ASSERT_EQ(preferences->set(assetSyncLimitType, LimitType::Songs).problem, "");
    EXPECT_EQ(gsettings("get", {assetSyncLimitType.key}), "uint64 1");
}

TEST_F(Values, AreTheDefaultsAgainAfterAReset) {
    const auto preferences = openShared();
    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);

    gsettings("reset", {assetSyncLimit.key});

    EXPECT_EQ(preferences->get(assetSyncLimit), assetSyncLimit.defaultValue);
}

TEST_F(Values, ThatAreWrittenAgainDoNotReachTheStore) {
    const auto preferences = openShared();
    Bystander bystander;
    ASSERT_TRUE(preferences->set(assetSyncLimit, 25).changed);

    const auto again = preferences->set(assetSyncLimit, 25);
    const auto defaultType = preferences->set(assetSyncLimitType, assetSyncLimitType.defaultValue);
    ASSERT_TRUE(preferences->set(assetSyncEnabled, true).changed);

    EXPECT_FALSE(again.changed);
    EXPECT_EQ(again.problem, "");
    EXPECT_FALSE(defaultType.changed);
    EXPECT_EQ(bystander.next(), assetSyncLimit.key);
    EXPECT_EQ(bystander.next(), assetSyncEnabled.key);
}

TEST_F(Values, ReadByManyThreadsWhileOthersWriteAreNeverHalf) {
    const auto preferences = openShared();
    constexpr std::uint64_t low = 0x1111'1111'1111'1111;
    constexpr std::uint64_t high = 0xEEEE'EEEE'EEEE'EEEE;
    ASSERT_TRUE(preferences->set(assetSyncLimit, low).changed);

    std::array<std::jthread, 2> readers;
    for (auto& reader : readers) {
        reader = std::jthread([&](const std::stop_token& stop) {
            while (!stop.stop_requested()) {
                const auto limit = preferences->get(assetSyncLimit);
                ASSERT_TRUE(limit == low || limit == high) << textOf(limit);
            }
        });
    }
    std::array<std::jthread, 2> writers;
    for (auto& writer : writers) {
        writer = std::jthread([&] {
            for (int round = 0; round < 50; ++round) {
                ASSERT_EQ(preferences->set(assetSyncLimit, round % 2 == 0 ? high : low).problem,
                          "");
            }
        });
    }
}

} // namespace
