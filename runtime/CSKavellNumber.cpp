// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellNumber.h>

#include <bit>
#include <charconv>
#include <cmath>

#include "runtime/number_p.h"
#include "runtime/object_p.h"

namespace {

enum class NumberKind : uint32_t { Signed, Unsigned, Real };

}  // namespace

struct CSKavellNumber : kavell::Object {
    NumberKind kind;
    /// The integer, or the real's representation. An integer that fits is always kept as Signed, so that equal integers
    /// have equal bits however they were made.
    uint64_t bits;

    [[nodiscard]] int64_t asSigned() const noexcept { return static_cast<int64_t>(bits); }
    [[nodiscard]] double asReal() const noexcept { return std::bit_cast<double>(bits); }
};

namespace kavell {

namespace {

// 2 to the 63rd and to the 64th: the first reals past the two integer ranges.
constexpr double kPastSigned = 9223372036854775808.0, kPastUnsigned = 18446744073709551616.0;

CSKavellNumberRef makeNumber(NumberKind kind, uint64_t bits) noexcept
{
    return makeObject<CSKavellNumber>(nullptr, kTypeNumber, 0, kind, bits);
}

bool numbersEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    const auto *one = static_cast<CSKavellNumberRef>(first), *other = static_cast<CSKavellNumberRef>(second);
    if (one->kind != other->kind)
        return false;
    return one->kind == NumberKind::Real ? one->asReal() == other->asReal() : one->bits == other->bits;
}

uint64_t numberHash(CSKavellTypeRef object)
{
    const auto *number = static_cast<CSKavellNumberRef>(object);
    // Minus zero equals zero.
    return number->kind == NumberKind::Real && number->asReal() == 0 ? 0 : number->bits * 0x9e3779b97f4a7c15u;
}

void describeNumber(CSKavellTypeRef object, int, std::string &text)
{
    const auto *number = static_cast<CSKavellNumberRef>(object);
    char digits[40];
    const auto written =
        number->kind == NumberKind::Real     ? std::to_chars(digits, digits + sizeof digits, number->asReal())
        : number->kind == NumberKind::Signed ? std::to_chars(digits, digits + sizeof digits, number->asSigned())
                                             : std::to_chars(digits, digits + sizeof digits, number->bits);
    text.append(digits, written.ptr);
}

}  // namespace

constinit const TypeOperations numberOperations{"CSKavellNumber", nullptr,    nullptr,
                                                numbersEqual,     numberHash, describeNumber};

}  // namespace kavell

using namespace kavell;

CSKavellNumberRef kavell::makeInteger(ObjectBlock &block, int64_t value) noexcept
{
    return makeObject<CSKavellNumber>(block, kTypeNumber, 0, NumberKind::Signed, static_cast<uint64_t>(value));
}

CSKavellTypeID CSKavellNumberGetTypeID(void)
{
    return kTypeNumber;
}

CSKavellNumberRef CSKavellNumberCreateWithInt64(int64_t value)
{
    return makeNumber(NumberKind::Signed, static_cast<uint64_t>(value));
}

CSKavellNumberRef CSKavellNumberCreateWithUInt64(uint64_t value)
{
    return makeNumber(value > INT64_MAX ? NumberKind::Unsigned : NumberKind::Signed, value);
}

CSKavellNumberRef CSKavellNumberCreateWithDouble(double value)
{
    return makeNumber(NumberKind::Real, std::bit_cast<uint64_t>(value));
}

int64_t CSKavellNumberGetInt64(CSKavellNumberRef number)
{
    if (!number)
        return 0;
    if (number->kind == NumberKind::Signed)
        return number->asSigned();
    if (number->kind == NumberKind::Unsigned)
        return INT64_MAX;
    const double real = number->asReal();
    if (std::isnan(real))
        return 0;
    if (real >= kPastSigned)
        return INT64_MAX;
    return real < -kPastSigned ? INT64_MIN : static_cast<int64_t>(real);
}

uint64_t CSKavellNumberGetUInt64(CSKavellNumberRef number)
{
    if (!number)
        return 0;
    if (number->kind == NumberKind::Signed)
        return number->asSigned() < 0 ? 0 : number->bits;
    if (number->kind == NumberKind::Unsigned)
        return number->bits;
    const double real = number->asReal();
    if (std::isnan(real) || real <= 0)
        return 0;
    return real >= kPastUnsigned ? UINT64_MAX : static_cast<uint64_t>(real);
}

double CSKavellNumberGetDouble(CSKavellNumberRef number)
{
    if (!number)
        return 0;
    if (number->kind == NumberKind::Real)
        return number->asReal();
    return number->kind == NumberKind::Signed ? static_cast<double>(number->asSigned())
                                              : static_cast<double>(number->bits);
}

bool CSKavellNumberIsReal(CSKavellNumberRef number)
{
    return number && number->kind == NumberKind::Real;
}

bool CSKavellNumberIsUnsigned(CSKavellNumberRef number)
{
    return number && number->kind == NumberKind::Unsigned;
}
