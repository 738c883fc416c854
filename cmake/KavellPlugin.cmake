# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# kavell_add_plugin: builds a plug-in bundle. Included by the project itself and by the installed package.
