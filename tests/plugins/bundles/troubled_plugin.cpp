// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

// Principal classes that fail in one way each.

#include <stdexcept>

#include <kavellaccounts/KADataPlugin.h>
#include <kavellaccounts/KAPluginManager.h>

class ThrowingInFactory : public KADataPlugin {
public:
    explicit ThrowingInFactory(std::shared_ptr<KABundle> bundle) : KADataPlugin(std::move(bundle))
    {
        throw std::runtime_error("no constructor today");
    }
};

class ThrowingInDidLoad : public KADataPlugin {
public:
    explicit ThrowingInDidLoad(std::shared_ptr<KABundle> bundle) : KADataPlugin(std::move(bundle)) {}
    void pluginDidLoad() override { throw 7; }
};

/// Not in trouble, but makes some: it asks the registry while it is not registered yet.
class AskingInDidLoad : public KADataPlugin {
public:
    explicit AskingInDidLoad(std::shared_ptr<KABundle> bundle) : KADataPlugin(std::move(bundle)) {}
    void pluginDidLoad() override
    {
        setProperty("toldCount", property("toldCount").toInt() + 1);
        QStringList found;
        for (const KAPlugin *plugin : KAPluginManager::shared()->allPlugins())
            found += plugin->identifier();
        setProperty("found", found);
    }
};

class Working : public KADataPlugin {
public:
    explicit Working(std::shared_ptr<KABundle> bundle) : KADataPlugin(std::move(bundle)) {}
};

KA_EXPORT_PLUGIN(ThrowingInFactory)
KA_EXPORT_PLUGIN(ThrowingInDidLoad)
KA_EXPORT_PLUGIN(AskingInDidLoad)
KA_EXPORT_PLUGIN(Working)

extern "C" __attribute__((visibility("default"))) KAPlugin *
KAPluginFactory_AnsweringNull(const std::shared_ptr<KABundle> &)
{
    return nullptr;
}
