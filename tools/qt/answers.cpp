// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/qt/answers.h"

#include <stdexcept>

#include <QtCore/QJsonArray>

#include <kavellaccounts/KAAListPlugin.h>
#include <kavellaccounts/KAAccount.h>
#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KADecisionTrace.h>
#include <kavellaccounts/KADefaults.h>
#include <kavellaccounts/KAExtras.h>
#include <kavellaccounts/KAHaldenServer.h>
#include <kavellaccounts/KAPluginManager.h>
#include <kavellaccounts/KAProvider.h>

namespace kavell::tools {

namespace {

QVariantMap settingsOf(const QJsonObject &question)
{
    return KAExtras::fixUpSettings(question.value(QLatin1String("settings")).toObject().toVariantMap());
}

/// null as JSON's null, so that a missing value differs from an empty one.
QJsonValue jsonText(const QString &text)
{
    return text.isNull() ? QJsonValue() : QJsonValue(text);
}

QJsonArray jsonSteps(const KADecisionTrace &trace)
{
    QJsonArray steps;
    for (const KADecisionTrace::Step &step : trace.steps()) {
        steps += QJsonObject{{QStringLiteral("rule"), step.rule},
                             {QStringLiteral("askedAbout"), jsonText(step.source)},
                             {QStringLiteral("answer"), jsonText(step.answer)},
                             {QStringLiteral("microseconds"), static_cast<double>(step.duration.count()) / 1000}};
    }
    return steps;
}

const char *outcomeName(KAPluginManager::BundleReport::Outcome outcome)
{
    using Outcome = KAPluginManager::BundleReport::Outcome;
    switch (outcome) {
    case Outcome::Registered:
        return "loaded";
    case Outcome::Shadowed:
        return "shadowed";
    case Outcome::WrongExtension:
        return "wrong extension";
    case Outcome::NoBundle:
        return "no bundle";
    case Outcome::NoIdentifier:
        return "no identifier";
    case Outcome::UnsupportedVersion:
        return "unsupported version";
    case Outcome::NotLoaded:
        return "not loaded";
    case Outcome::NoObject:
        return "no plug-in class";
    case Outcome::Threw:
        return "failed";
    case Outcome::DirectoryMissing:
        return "no directory";
    case Outcome::DirectoryNotListed:
        return "not listed";
    }
    return "";
}

QString kindOf(KAPlugin *plugin)
{
    if (qobject_cast<KAAListPlugin *>(plugin))
        return QStringLiteral("account list");
    return qobject_cast<KADataPlugin *>(plugin) ? QStringLiteral("data") : QStringLiteral("neither kind");
}

QJsonObject jsonBundle(const KAPluginManager::BundleReport &report)
{
    QJsonObject json{{QStringLiteral("path"), report.path},
                     {QStringLiteral("identifier"), jsonText(report.identifier)},
                     {QStringLiteral("state"), QString::fromUtf8(outcomeName(report.outcome))},
                     {QStringLiteral("reason"), jsonText(report.reason)}};
    if (report.outcome == KAPluginManager::BundleReport::Outcome::Registered) {
        KAPlugin *const plugin = KAPluginManager::shared()->pluginWithIdentifier(report.identifier);
        json.insert(QStringLiteral("kind"), kindOf(plugin));
        json.insert(QStringLiteral("name"), plugin->userVisibleProviderName());
    }
    return json;
}

QJsonValue jsonAccount(const std::shared_ptr<KAAccount> &account)
{
    if (!account)
        return {};
    return QJsonObject{{QStringLiteral("provider"), account->provider()},
                       {QStringLiteral("login"), account->loginName()},
                       {QStringLiteral("uuid"), account->uid()}};
}

QJsonObject jsonChild(const QVariantMap &child)
{
    const QString uid = child.value(QStringLiteral("uid")).toString();
    const QString pluginID = child.value(QStringLiteral("pluginID")).toString();
    KAPluginManager *const manager = KAPluginManager::shared();
    auto *const plugin = qobject_cast<KADataPlugin *>(manager->pluginWithIdentifier(pluginID));
    QVariantMap settings = child;
    if (settings.contains(QStringLiteral("password")))
        settings.insert(QStringLiteral("password"), QStringLiteral("***"));
    QJsonObject json{{QStringLiteral("uid"), uid},
                     {QStringLiteral("pluginID"), jsonText(pluginID)},
                     {QStringLiteral("application"), jsonText(manager->appBundleIDForPluginID(pluginID))},
                     {QStringLiteral("settings"), QJsonObject::fromVariantMap(settings)}};
    // Whether it is active only its plug-in knows; unknown without one.
    json.insert(QStringLiteral("active"),
                plugin ? QJsonValue(!plugin->settingsForAccountUID(uid).value(QStringLiteral("inactive")).toBool())
                       : QJsonValue());
    return json;
}

}  // namespace

QJsonObject answerPlugins(const QJsonObject &)
{
    QJsonArray bundles;
    const QString unsetVariable = QStringLiteral("(null)");  // what an unset search path is taken for
    for (const KAPluginManager::BundleReport &report : KAPluginManager::shared()->surveyBundles()) {
        if (report.path != unsetVariable)
            bundles += jsonBundle(report);
    }
    return {{QStringLiteral("bundles"), bundles}};
}

QJsonObject answerIdentify(const QJsonObject &question)
{
    const QVariantMap settings = settingsOf(question);
    KADecisionTrace trace;
    const QString pluginID = KAAccount::aListPluginIDForSettings(settings, &trace);
    auto *const plugin = qobject_cast<KAAListPlugin *>(KAPluginManager::shared()->pluginWithIdentifier(pluginID));
    const std::shared_ptr<KAProvider> provider = plugin ? plugin->provider() : nullptr;
    return {{QStringLiteral("pluginID"), jsonText(pluginID)},
            {QStringLiteral("installed"), plugin != nullptr},
            {QStringLiteral("provider"), jsonText(provider ? provider->providerType() : QString())},
            {QStringLiteral("identifier"), jsonText(KAAccount::accountIdentifierForSettings(settings))},
            {QStringLiteral("brand"), jsonText(plugin ? plugin->brandName() : QString())},
            {QStringLiteral("steps"), jsonSteps(trace)}};
}

QJsonObject answerMatch(const QJsonObject &question)
{
    KADecisionTrace trace;
    const auto account = KAPluginManager::shared()->matchingAListAccountForAccountSettings(
        settingsOf(question), question.value(QLatin1String("pluginID")).toString(), &trace);
    return {{QStringLiteral("account"), jsonAccount(account)}, {QStringLiteral("steps"), jsonSteps(trace)}};
}

QJsonObject answerChildren(const QJsonObject &question)
{
    const auto provider = KAProvider::initWithProviderType(question.value(QLatin1String("provider")).toString());
    const auto account = provider->accountForLoginName(question.value(QLatin1String("login")).toString(), false);
    if (!account)
        throw std::runtime_error("the account was removed meanwhile");
    QJsonArray children;
    for (const QVariantMap &child : account->allChildAccounts())
        children += jsonChild(child);
    return {{QStringLiteral("children"), children}};
}

QJsonObject answerServers(const QJsonObject &question)
{
    if (question.contains(QLatin1String("add"))) {
        KAAddHaldenServer(question.value(QLatin1String("add")).toString(),
                          question.value(QLatin1String("services")).toArray().toVariantList());
    }
    if (question.contains(QLatin1String("remove")))
        KARemoveHaldenServer(question.value(QLatin1String("remove")).toString());
    const std::shared_ptr<KADefaults> defaults = KADefaults::shared();
    if (!defaults->synchronize())
        throw std::runtime_error("the preferences could not be saved");

    QJsonArray servers;
    const QVariantList entries = defaults->objectForKey(QStringLiteral("HaldenServers")).toList();
    for (const QVariant &entry : entries) {
        const QVariantMap pair = entry.toMap();
        for (auto server = pair.begin(); server != pair.end(); ++server) {
            servers += QJsonObject{{QStringLiteral("server"), server.key()},
                                   {QStringLiteral("services"), QJsonValue::fromVariant(server.value())}};
        }
    }
    return {{QStringLiteral("servers"), servers}};
}

}  // namespace kavell::tools
