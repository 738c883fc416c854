// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/runtime/values.h"

using namespace kavell;
using namespace kavell::test;

namespace {

/// A settings record, its operations with text keys.
class Settings {
public:
    explicit Settings(const CSKavellAllocator *allocator = nullptr)
        : m_record(adopt(CSKavellAccountSettingsCreate(allocator)))
    {
    }
    explicit Settings(CSKavellAccountSettingsRef owned) : m_record(adopt(owned)) {}

    /// A record whose committed side is the dictionary.
    static Settings committed(std::initializer_list<std::pair<std::string_view, Value>> pairs)
    {
        Settings settings;
        CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary(pairs).get());
        return settings;
    }

    [[nodiscard]] CSKavellAccountSettingsRef get() const { return m_record.get(); }
    void set(std::string_view key, const Value &value) const
    {
        CSKavellAccountSettingsSetAttribute(get(), text(key).get(), value.get());
    }
    void setAll(std::initializer_list<std::pair<std::string_view, Value>> pairs) const
    {
        CSKavellAccountSettingsSetAttributes(get(), dictionary(pairs).get());
    }
    void remove(std::string_view key) const { CSKavellAccountSettingsRemoveAttribute(get(), text(key).get()); }
    void commit() const { CSKavellAccountSettingsCommitChanges(get()); }
    [[nodiscard]] bool has(std::string_view key) const
    {
        return CSKavellAccountSettingsHasAttribute(get(), text(key).get());
    }
    [[nodiscard]] Value value(std::string_view key) const
    {
        return adopt(CSKavellAccountSettingsCopyAttribute(get(), text(key).get()));
    }
    [[nodiscard]] Ref<CSKavellDictionaryRef> all() const { return adopt(CSKavellAccountSettingsCopyAttributes(get())); }
    [[nodiscard]] bool hasChanges() const { return CSKavellAccountSettingsHasChanges(get()); }
    [[nodiscard]] bool hasAttributes() const { return CSKavellAccountSettingsHasAttributes(get()); }

private:
    Ref<CSKavellAccountSettingsRef> m_record;
};

}  // namespace

TEST(CSKavellAccountSettings, AFreshRecordIsEmptyAndItsAttributesAnEmptyDictionary)
{
    const Settings settings;
    EXPECT_EQ(CSKavellGetTypeID(settings.get()), _CSKavellAccountSettingsGetTypeID());
    EXPECT_FALSE(settings.hasChanges());
    EXPECT_FALSE(settings.hasAttributes());
    ASSERT_TRUE(settings.all());
    EXPECT_EQ(CSKavellDictionaryGetCount(settings.all().get()), 0u);
    EXPECT_FALSE(settings.value("a"));
}

TEST(CSKavellAccountSettings, TheEmptyAttributesAreImmutable)
{
    const auto empty = Settings().all();
    CSKavellDictionarySetValue(const_cast<CSKavellMutableDictionaryRef>(empty.get()), text("a").get(), text("b").get());
    EXPECT_EQ(CSKavellDictionaryGetCount(empty.get()), 0u);
}

TEST(CSKavellAccountSettings, AttributesTakenBeforeAChangeStayAsTheyWere)
{
    const Settings settings;
    CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary({{"a", text("1")}, {"b", text("2")}}).get());
    const auto before = settings.all();
    settings.set("a", text("3"));
    settings.remove("b");
    settings.commit();
    EXPECT_TRUE(same(before, dictionary({{"a", text("1")}, {"b", text("2")}})));
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", text("3")}})));
}

TEST(CSKavellAccountSettings, AttributesTakenBeforeARereadStayAsTheyWere)
{
    const Settings settings;
    CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary({{"a", text("1")}}).get());
    const auto before = settings.all();
    CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary({{"a", text("2")}}).get());
    EXPECT_TRUE(same(before, dictionary({{"a", text("1")}})));
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", text("2")}})));
}

TEST(CSKavellAccountSettings, WhoeverTookTheAttributesCannotChangeTheRecordThroughThem)
{
    const Settings settings;
    CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary({{"a", text("1")}}).get());
    const auto taken = settings.all();
    CSKavellDictionarySetValue(const_cast<CSKavellMutableDictionaryRef>(taken.get()), text("a").get(), text("2").get());
    CSKavellDictionaryRemoveValue(const_cast<CSKavellMutableDictionaryRef>(taken.get()), text("a").get());
    EXPECT_TRUE(same(settings.value("a"), text("1")));
}

TEST(CSKavellAccountSettings, EqualsOnlyItselfAndHashesByItsAddress)
{
    const Settings first, second;
    EXPECT_TRUE(CSKavellEqual(first.get(), first.get()));
    EXPECT_FALSE(CSKavellEqual(first.get(), second.get()));
    EXPECT_EQ(CSKavellHash(first.get()), reinterpret_cast<uintptr_t>(first.get()) >> 2);
}

TEST(CSKavellAccountSettings, LivesInTheAllocatorsMemoryAndGivesItBack)
{
    CountingAllocator allocator;
    {
        const Settings settings(allocator.get());
        EXPECT_GT(allocator.allocated(), 0);
    }
    EXPECT_EQ(allocator.deallocated(), allocator.allocated());
    CountingAllocator failing(0);
    EXPECT_EQ(Settings(failing.get()).get(), nullptr);
}

TEST(CSKavellAccountSettings, ReleasesAllThreeFieldsAtItsEnd)
{
    CountingAllocator allocator;
    {
        const Settings settings;
        CSKavellAccountSettingsUpdateAttributes(settings.get(),
                                                dictionary({{"a", watchedText(allocator, "committed")}}).get());
        settings.set("b", watchedText(allocator, "pending"));
        CSKavellAccountSettingsRemoveAttribute(settings.get(), watchedText(allocator, "removed").get());
        EXPECT_EQ(allocator.deallocated(), 0);
    }
    EXPECT_EQ(allocator.deallocated(), 3);
}

TEST(CSKavellAccountSettings, APendingValueComesBeforeTheCommittedOne)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    EXPECT_FALSE(settings.hasChanges());
    settings.set("a", integer(3));
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_TRUE(same(settings.value("a"), integer(3)));
    EXPECT_TRUE(same(settings.value("b"), integer(2)));
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(3)}, {"b", integer(2)}})));
}

TEST(CSKavellAccountSettings, APendingRemovalHidesTheCommittedValue)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.remove("a");
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_FALSE(settings.has("a"));
    EXPECT_FALSE(settings.value("a"));
    EXPECT_TRUE(settings.has("b"));
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(2)}})));
}

TEST(CSKavellAccountSettings, SettingAKeyTakesItsRemovalBack)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.remove("a");
    settings.set("a", integer(2));
    EXPECT_TRUE(settings.has("a"));
    settings.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(2)}})));
}

TEST(CSKavellAccountSettings, SettingNoneAfterAValueLeavesTheKeyOnlyAmongTheRemovals)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.set("a", integer(2));
    settings.set("a", nullptr);
    EXPECT_FALSE(settings.has("a"));
    EXPECT_FALSE(settings.value("a"));
    EXPECT_TRUE(settings.hasChanges());
    settings.commit();
    EXPECT_FALSE(settings.has("a"));
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, AKeyWithoutAValueIsQueuedForRemovalAllTheSame)
{
    const Settings settings;
    settings.remove("a");
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_FALSE(settings.hasAttributes());
    CSKavellAccountSettingsUpdateAttributes(settings.get(), dictionary({{"a", integer(1)}}).get());
    EXPECT_FALSE(settings.has("a"));
    settings.commit();
    EXPECT_FALSE(settings.has("a"));
}

TEST(CSKavellAccountSettings, RemovingTheOnlyPendingValueStillCountsAsAChange)
{
    const Settings settings;
    settings.set("a", integer(1));
    settings.remove("a");
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, PendingRemovalsNeitherMakeNorHideAttributes)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.remove("a");
    EXPECT_TRUE(settings.hasAttributes());
    EXPECT_EQ(CSKavellDictionaryGetCount(settings.all().get()), 0u);
    settings.commit();
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, PendingValuesAloneAreAttributes)
{
    const Settings settings;
    settings.set("a", integer(1));
    EXPECT_TRUE(settings.hasAttributes());
    EXPECT_TRUE(settings.has("a"));
}

TEST(CSKavellAccountSettings, ReplacingAllMakesTheAttributesExactlyTheDictionary)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.setAll({{"b", integer(3)}, {"c", integer(4)}});
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(3)}, {"c", integer(4)}})));
    settings.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(3)}, {"c", integer(4)}})));
    EXPECT_FALSE(settings.hasChanges());
}

TEST(CSKavellAccountSettings, ReplacingAllDropsEarlierPendingChanges)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.set("x", integer(9));
    settings.remove("a");
    settings.setAll({{"a", integer(2)}});
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(2)}})));
    settings.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(2)}})));
}

TEST(CSKavellAccountSettings, ReplacingAllCopiesTheDictionary)
{
    const auto given = adopt(CSKavellDictionaryCreateMutable());
    const Settings settings;
    CSKavellAccountSettingsSetAttributes(settings.get(), given.get());
    CSKavellDictionarySetValue(given.get(), text("later").get(), integer(1).get());
    EXPECT_FALSE(settings.has("later"));
}

TEST(CSKavellAccountSettings, ReplacingAllByNothingMarksEveryCommittedKeyForRemoval)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.setAll({});
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_FALSE(settings.has("a"));
    EXPECT_FALSE(settings.has("b"));
    settings.commit();
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, ReplacingAllByNothingIsAChangeEvenWithoutCommittedKeys)
{
    const Settings settings;
    settings.setAll({});
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_TRUE(settings.hasAttributes());
    settings.commit();
    // The empty dictionary was merged into an empty slot, where it stays: present, though empty.
    EXPECT_FALSE(settings.hasChanges());
    EXPECT_TRUE(settings.hasAttributes());
    EXPECT_EQ(CSKavellDictionaryGetCount(settings.all().get()), 0u);
}

TEST(CSKavellAccountSettings, ReplacingAllDoesNotTouchAKeyThatOnlyTheFileGetsLater)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.setAll({{"b", integer(2)}});
    CSKavellAccountSettingsUpdateAttributes(settings.get(),
                                            dictionary({{"a", integer(1)}, {"theirs", integer(3)}}).get());
    settings.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"theirs", integer(3)}, {"b", integer(2)}})));
}

TEST(CSKavellAccountSettings, RemovingAllMarksEveryCommittedKeyAndDropsPendingValues)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.set("c", integer(3));
    CSKavellAccountSettingsRemoveAllAttributes(settings.get());
    EXPECT_TRUE(settings.hasChanges());
    EXPECT_EQ(CSKavellDictionaryGetCount(settings.all().get()), 0u);
    settings.commit();
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, RemovingAllOfNothingCommittedLeavesNoChange)
{
    const Settings settings;
    settings.set("a", integer(1));
    CSKavellAccountSettingsRemoveAllAttributes(settings.get());
    EXPECT_FALSE(settings.hasChanges());
    EXPECT_FALSE(settings.has("a"));
}

TEST(CSKavellAccountSettings, CommittingFoldsValuesAndRemovalsIn)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.set("c", integer(3));
    settings.remove("a");
    settings.commit();
    EXPECT_FALSE(settings.hasChanges());
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(2)}, {"c", integer(3)}})));
    CSKavellAccountSettingsCancelChanges(settings.get());
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(2)}, {"c", integer(3)}})));
}

TEST(CSKavellAccountSettings, CommittingNothingChangesNothing)
{
    const Settings settings = Settings::committed({{"a", integer(1)}}), empty;
    settings.commit();
    empty.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(1)}})));
    EXPECT_FALSE(empty.hasAttributes());
}

TEST(CSKavellAccountSettings, CancellingLeavesTheCommittedSide)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.set("a", integer(3));
    settings.set("c", integer(4));
    settings.remove("b");
    CSKavellAccountSettingsCancelChanges(settings.get());
    EXPECT_FALSE(settings.hasChanges());
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(1)}, {"b", integer(2)}})));
}

TEST(CSKavellAccountSettings, UpdatingReplacesTheCommittedSideUnderThePendingChanges)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"old", integer(2)}});
    settings.set("a", integer(3));
    settings.remove("gone");
    CSKavellAccountSettingsUpdateAttributes(
        settings.get(), dictionary({{"a", integer(4)}, {"gone", integer(5)}, {"new", integer(6)}}).get());
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(3)}, {"new", integer(6)}})));
    CSKavellAccountSettingsCancelChanges(settings.get());
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(4)}, {"gone", integer(5)}, {"new", integer(6)}})));
}

TEST(CSKavellAccountSettings, UpdatingWithNoneEmptiesTheCommittedSideOnly)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.set("b", integer(2));
    CSKavellAccountSettingsUpdateAttributes(settings.get(), nullptr);
    EXPECT_TRUE(same(settings.all(), dictionary({{"b", integer(2)}})));
    CSKavellAccountSettingsCancelChanges(settings.get());
    EXPECT_FALSE(settings.hasAttributes());
}

TEST(CSKavellAccountSettings, UpdatingWithAnEmptyDictionaryIsNotUpdatingWithNone)
{
    EXPECT_TRUE(Settings::committed({}).hasAttributes());
}

TEST(CSKavellAccountSettings, UpdatingCopiesTheDictionary)
{
    const auto given = adopt(CSKavellDictionaryCreateMutable());
    const Settings settings;
    CSKavellAccountSettingsUpdateAttributes(settings.get(), given.get());
    CSKavellDictionarySetValue(given.get(), text("later").get(), integer(1).get());
    EXPECT_FALSE(settings.has("later"));
}

TEST(CSKavellAccountSettings, TheAttributesHandedOutAreIndependentOfTheRecord)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    const auto before = settings.all();
    settings.set("a", integer(2));
    settings.commit();
    EXPECT_TRUE(same(before, dictionary({{"a", integer(1)}})));
}

TEST(CSKavellAccountSettings, AnAttributeHandedOutOutlivesItsRecord)
{
    Value value;
    {
        const Settings settings;
        settings.set("a", text("kept"));
        value = settings.value("a");
    }
    EXPECT_TRUE(same(value, text("kept")));
}

TEST(CSKavellAccountSettings, ACopyHasTheEffectiveAttributesCommittedAndNothingPending)
{
    const Settings settings = Settings::committed({{"a", integer(1)}, {"b", integer(2)}});
    settings.set("c", integer(3));
    settings.remove("a");
    const Settings copy(CSKavellAccountSettingsCreateCopy(nullptr, settings.get()));
    EXPECT_FALSE(copy.hasChanges());
    CSKavellAccountSettingsCancelChanges(copy.get());
    EXPECT_TRUE(same(copy.all(), dictionary({{"b", integer(2)}, {"c", integer(3)}})));
    copy.set("b", integer(9));
    EXPECT_TRUE(same(settings.value("b"), integer(2)));
    EXPECT_TRUE(settings.hasChanges());
}

TEST(CSKavellAccountSettings, ACopyOfNoEffectiveAttributesHasNone)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    settings.remove("a");
    EXPECT_FALSE(Settings(CSKavellAccountSettingsCreateCopy(nullptr, settings.get())).hasAttributes());
    EXPECT_FALSE(Settings(CSKavellAccountSettingsCreateCopy(nullptr, Settings::committed({}).get())).hasAttributes());
}

TEST(CSKavellAccountSettings, ACopyLivesInTheAllocatorsMemory)
{
    CountingAllocator allocator, failing(0);
    {
        const Settings copy(CSKavellAccountSettingsCreateCopy(allocator.get(), Settings().get()));
        EXPECT_GT(allocator.allocated(), 0);
    }
    EXPECT_EQ(allocator.deallocated(), allocator.allocated());
    EXPECT_EQ(Settings(CSKavellAccountSettingsCreateCopy(failing.get(), Settings().get())).get(), nullptr);
}

TEST(CSKavellAccountSettings, ANoneRecordAnswersNoneFalseOrNothing)
{
    const CSKavellAccountSettingsRef none = nullptr;
    EXPECT_FALSE(adopt(CSKavellAccountSettingsCreateCopy(nullptr, none)));
    EXPECT_FALSE(CSKavellAccountSettingsHasChanges(none));
    EXPECT_FALSE(CSKavellAccountSettingsHasAttributes(none));
    EXPECT_FALSE(CSKavellAccountSettingsHasAttribute(none, text("a").get()));
    EXPECT_FALSE(adopt(CSKavellAccountSettingsCopyAttribute(none, text("a").get())));
    EXPECT_FALSE(adopt(CSKavellAccountSettingsCopyAttributes(none)));
    CSKavellAccountSettingsSetAttribute(none, text("a").get(), text("b").get());
    CSKavellAccountSettingsRemoveAttribute(none, text("a").get());
    CSKavellAccountSettingsSetAttributes(none, dictionary({}).get());
    CSKavellAccountSettingsRemoveAllAttributes(none);
    CSKavellAccountSettingsCommitChanges(none);
    CSKavellAccountSettingsCancelChanges(none);
    CSKavellAccountSettingsUpdateAttributes(none, dictionary({}).get());
}

TEST(CSKavellAccountSettings, ANoneKeyIsNoKey)
{
    const Settings settings = Settings::committed({{"a", integer(1)}});
    EXPECT_FALSE(CSKavellAccountSettingsHasAttribute(settings.get(), nullptr));
    EXPECT_FALSE(adopt(CSKavellAccountSettingsCopyAttribute(settings.get(), nullptr)));
    CSKavellAccountSettingsSetAttribute(settings.get(), nullptr, text("b").get());
    CSKavellAccountSettingsRemoveAttribute(settings.get(), nullptr);
    CSKavellAccountSettingsSetAttributes(settings.get(), nullptr);
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(1)}})));
    settings.commit();
    EXPECT_TRUE(same(settings.all(), dictionary({{"a", integer(1)}})));
}
