// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The fields that dumps of the plug-in classes show: names and encodings in their order, own class before base class.

#include <gmock/gmock.h>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAApplication.h>
#include <kavellaccounts/KABundle.h>
#include <kavellaccounts/KAConstants.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAFieldList.h>
#include <kavellaccounts/KAPluginManager.h>

namespace {

using testing::ElementsAre;

std::vector<KAField> fieldsOf(const KAObject &object)
{
    KAFieldList list;
    object.describeFields(list);
    return list.fields();
}

QStringList namesOf(const KAObject &object)
{
    QStringList names;
    for (const KAField &field : fieldsOf(object))
        names += field.name + ' ' + field.encoding;
    return names;
}

QString valueOf(const KAObject &object, const QString &name)
{
    for (const KAField &field : fieldsOf(object)) {
        if (field.name == name)
            return field.value;
    }
    return "no such field";
}

TEST(PluginFields, AccountListPluginShowsItsOwnThenTheBases)
{
    const KAAListPlugin plugin(nullptr);
    EXPECT_THAT(namesOf(plugin),
                ElementsAre("_appTableController @\"KAAppTableController\"", "_provisionalAccount @\"KAAccount\"",
                            "_sheetMorpher @\"KASheetMorpher\"", "_hostSheet @\"KASheetWindow\"",
                            "_cachedDomains @\"QVariantMap\"", "_validationView @\"QWidget\"",
                            "_appSelectionView @\"QWidget\"", "_appTableContainer @\"QWidget\"",
                            "_appSelectionAccountName @\"QLabel\"", "_appSelectionOKButton @\"QPushButton\"",
                            "_bundle @\"KABundle\"", "_account @\"KAAccount\"", "_provider @\"KAProvider\""));
    EXPECT_EQ(valueOf(plugin, "_cachedDomains"), "(null)");
}

TEST(PluginFields, DomainsThatWereReadAreShown)
{
    KAAListPlugin plugin(KABundle::bundleWithPath(KAVELL_TEST_BUNDLES "/good/ExampleList.kaplugin"));
    ASSERT_TRUE(plugin.domains());
    EXPECT_EQ(valueOf(plugin, "_cachedDomains"),
              "{domains = (example); exceptions = (*.corp.example.net, lone.example.net);}");
}

TEST(PluginFields, DataPluginShowsItsDelegateThenTheBases)
{
    const KADataPlugin plugin(nullptr);
    EXPECT_THAT(namesOf(plugin), ElementsAre("_delegate @\"QObject\"", "_bundle @\"KABundle\"",
                                             "_account @\"KAAccount\"", "_provider @\"KAProvider\""));
    EXPECT_EQ(valueOf(plugin, "_delegate"), "(null)");
}

TEST(PluginFields, ManagerShowsItsRegistryAndItsCaches)
{
    KAPluginManager manager;
    manager.setCachedDisplayName("Letters", kKAMailAppID);
    EXPECT_THAT(namesOf(manager), ElementsAre("_plugins @\"QVariantMap\"", "_cachedDisplayNames @\"QVariantMap\"",
                                              "_cachedImagePaths @\"QVariantMap\""));
    EXPECT_EQ(valueOf(manager, "_plugins"), "{}");
    EXPECT_EQ(valueOf(manager, "_cachedDisplayNames"), "{com.corvane.mail = Letters;}");
}

TEST(PluginFields, ApplicationShowsAllOfItsRecord)
{
    const auto application = KAApplication::initWithBundleID(kKAMailAppID);
    application->setEnabled(true);
    application->userInfo()->insert("key", 1);
    EXPECT_THAT(namesOf(*application),
                ElementsAre("_bundleID @\"QString\"", "_displayName @\"QString\"", "_imagePath @\"QString\"",
                            "_image @\"QImage\"", "_userInfo @\"QVariantMap\"", "_enabled c"));
    EXPECT_EQ(valueOf(*application, "_bundleID"), "com.corvane.mail");
    EXPECT_EQ(valueOf(*application, "_displayName"), "(null)");
    EXPECT_EQ(valueOf(*application, "_userInfo"), "{key = 1;}");
    EXPECT_EQ(valueOf(*application, "_enabled"), "true");
    application->setUserInfo(nullptr);
    EXPECT_EQ(valueOf(*application, "_userInfo"), "(null)");
}

}  // namespace
