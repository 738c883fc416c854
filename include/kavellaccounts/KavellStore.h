// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The whole interface of libkavellstore. Start reading at CSKavellAccountProvider.h.

#ifndef KAVELLACCOUNTS_KAVELLSTORE_H
#define KAVELLACCOUNTS_KAVELLSTORE_H

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellAccountProvider.h>
#include <kavellaccounts/CSKavellAccountSettings.h>
#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/CSKavellBoolean.h>
#include <kavellaccounts/CSKavellCofferel.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDate.h>
#include <kavellaccounts/CSKavellDictionary.h>
#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/CSKavellNumber.h>
#include <kavellaccounts/CSKavellPropertyList.h>
#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellType.h>
#include <kavellaccounts/CSKavellURL.h>
#include <kavellaccounts/CSKavellUUID.h>

#endif
