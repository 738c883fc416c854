// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The main function of the pane's tests: as the pane's own, with the tests' kind of account installed.

#include <QtWidgets/QApplication>

#include <gtest/gtest.h>
#include <kavellaccounts/KAPluginManager.h>

#include "pane/texts.h"

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    qputenv("VESK_FRAMEWORK_PATH", KAVELL_KIND_DIRECTORY);
    QApplication application(argc, argv);
    kavell::pane::installTexts(application);
    (void)KAPluginManager::shared();
    return RUN_ALL_TESTS();
}
