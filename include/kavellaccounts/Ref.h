// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The C++ face of the store's references: a smart pointer that retains and releases, and a few shorthands for text.
// Header-only; a Ref is as thread-safe as a std::shared_ptr (the count is, one Ref object is not).
//
//     using kavell::Ref, kavell::adopt;
//     Ref<CSKavellAccountRef> account = adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderMail, name.get()));
//     Ref<CSKavellStringRef> login = adopt(_CSKavellAccountCopyLoginName(account.get()));
//     std::cout << kavell::toStringView(login.get());

#ifndef KAVELLACCOUNTS_REF_H
#define KAVELLACCOUNTS_REF_H

#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

#include <kavellaccounts/CSKavellString.h>
#include <kavellaccounts/CSKavellType.h>

namespace kavell {

/// Owns one reference of a CSKavell…Ref, or none.
template <typename Pointer> class Ref {
    static_assert(std::is_pointer_v<Pointer>, "Ref holds a CSKavell…Ref");

public:
    constexpr Ref() noexcept = default;
    constexpr Ref(std::nullptr_t) noexcept {}
    Ref(const Ref &other) noexcept : m_pointer(other.m_pointer) { CSKavellRetain(m_pointer); }
    Ref(Ref &&other) noexcept : m_pointer(std::exchange(other.m_pointer, nullptr)) {}

    /// From a reference to a more special type, such as a mutable array to an array.
    template <typename Other>
        requires std::is_convertible_v<Other, Pointer>
    Ref(Ref<Other> other) noexcept : m_pointer(other.leak())
    {
    }

    ~Ref()
    {
        // Asked here, so that the compiler leaves out what becomes of a Ref that was moved from.
        if (m_pointer)
            CSKavellRelease(m_pointer);
    }

    Ref &operator=(Ref other) noexcept
    {
        std::swap(m_pointer, other.m_pointer);
        return *this;
    }

    /// Takes over a reference that the caller owns: the result of a Create or Copy function.
    [[nodiscard]] static Ref adopt(Pointer owned) noexcept
    {
        Ref result;
        result.m_pointer = owned;
        return result;
    }

    /// Adds a reference to a borrowed object: the result of a Get function, or a constant.
    [[nodiscard]] static Ref retain(Pointer borrowed) noexcept
    {
        CSKavellRetain(borrowed);
        return adopt(borrowed);
    }

    /// The object, borrowed from this Ref.
    [[nodiscard]] Pointer get() const noexcept { return m_pointer; }

    /// Gives the reference to the caller, who releases it.
    [[nodiscard]] Pointer leak() noexcept { return std::exchange(m_pointer, nullptr); }

    explicit operator bool() const noexcept { return m_pointer != nullptr; }

    /// The object itself, inside the library, where its structure is known.
    Pointer operator->() const noexcept { return m_pointer; }

private:
    Pointer m_pointer = nullptr;
};

/// Ref::adopt with the type deduced.
template <typename Pointer> [[nodiscard]] Ref<Pointer> adopt(Pointer owned) noexcept
{
    return Ref<Pointer>::adopt(owned);
}

/// Ref::retain with the type deduced.
template <typename Pointer> [[nodiscard]] Ref<Pointer> retain(Pointer borrowed) noexcept
{
    return Ref<Pointer>::retain(borrowed);
}

/// A string object of the text; an empty Ref when it is not UTF-8.
[[nodiscard]] inline Ref<CSKavellStringRef> makeString(std::string_view text)
{
    return adopt(CSKavellStringCreateWithBytes(text.data() ? text.data() : "", text.size()));
}

/// The text, borrowed until the string is released; empty for none.
[[nodiscard]] inline std::string_view toStringView(CSKavellStringRef string) noexcept
{
    const char *text = CSKavellStringGetUTF8(string);
    return text ? std::string_view(text, CSKavellStringGetLength(string)) : std::string_view();
}

/// A copy of the text; empty for none.
[[nodiscard]] inline std::string toStdString(CSKavellStringRef string)
{
    return std::string(toStringView(string));
}

/// The object as one of the given type, borrowed, or none when it is of another: `cast<CSKavellStringRef>(value,
/// CSKavellStringGetTypeID())`.
template <typename Pointer> [[nodiscard]] Pointer cast(CSKavellTypeRef object, CSKavellTypeID typeID) noexcept
{
    return CSKavellGetTypeID(object) == typeID ? static_cast<Pointer>(object) : nullptr;
}

}  // namespace kavell

#endif
