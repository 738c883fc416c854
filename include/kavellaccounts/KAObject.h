// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The root class of the object layer: it knows its class's name, describes itself in one line, and lists its fields for
// dumps (KAExtras::_ivarDump). Any thread may describe an object that no other thread changes meanwhile.

#ifndef KAVELLACCOUNTS_KAOBJECT_H
#define KAVELLACCOUNTS_KAOBJECT_H

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>

class KAFieldList;

class KAVELL_ACCOUNTS_EXPORT KAObject {
public:
    KAObject() = default;
    KAObject(const KAObject &) = delete;
    KAObject &operator=(const KAObject &) = delete;
    virtual ~KAObject();

    /// The name of the object's own class, "KANimbrelAccount" for one that is handed around as a KAAccount. Never null.
    [[nodiscard]] QString className() const;

    /// One line for people: "<ClassName: 0xADDRESS>", which subclasses make richer. What it may block on, the subclass
    /// says.
    [[nodiscard]] virtual QString description() const;

    /// Appends the object's fields to the list, in declaration order: those of its own class first, then those of each
    /// base class up to this root, which has none. A subclass with fields appends them and calls its base.
    virtual void describeFields(KAFieldList &fields) const;
};

#endif
