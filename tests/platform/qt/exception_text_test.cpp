// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/qt/exception_text.h"

#include <stdexcept>

#include <gtest/gtest.h>
#include <kavellaccounts/KARequiredMethodException.h>

// Outside any namespace, so that its name is short in the text.
struct ExceptionTextTestFailure {};

namespace {

template <typename Thrown> std::string textOf(const Thrown &thrown)
{
    try {
        throw thrown;
    } catch (...) {
        return kavell::currentExceptionText().toStdString();
    }
}

}  // namespace

TEST(ExceptionTextTest, AStandardExceptionSaysWhatItSaysOfItself)
{
    EXPECT_EQ(textOf(std::runtime_error("Zo\xC3\xAB fell")), "Zo\xC3\xAB fell");
    EXPECT_EQ(textOf(KARequiredMethodException("-[KADataPlugin accountUIDs]")),
              "Subclassers must implement this method (-[KADataPlugin accountUIDs])");
}

TEST(ExceptionTextTest, AnyOtherIsNamedByItsType)
{
    EXPECT_EQ(textOf(7), "exception of type int");
    EXPECT_EQ(textOf(ExceptionTextTestFailure()), "exception of type ExceptionTextTestFailure");
}

TEST(ExceptionTextTest, TheExceptionGoesOnBeingHandled)
{
    try {
        throw std::runtime_error("first");
    } catch (...) {
        static_cast<void>(kavell::currentExceptionText());
        EXPECT_EQ(kavell::currentExceptionText().toStdString(), "first");
        EXPECT_THROW(throw, std::runtime_error);
    }
}
