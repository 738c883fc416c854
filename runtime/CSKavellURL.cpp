// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellType.h>
#include <kavellaccounts/CSKavellURL.h>

#include <cstdlib>
#include <cstring>
#include <string>

#include <kavellaccounts/Ref.h>

#include "runtime/object_p.h"
#include "runtime/string_p.h"

struct CSKavellURL : kavell::Object {
    kavell::Ref<CSKavellStringRef> string;
};

namespace kavell {

namespace {

constexpr bool isLetter(char character)
{
    return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z');
}

constexpr bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

/// scheme = ALPHA *( ALPHA / DIGIT / "+" / "-" / "." ), RFC 3986, section 3.1.
bool startsWithScheme(std::string_view text)
{
    if (text.empty() || !isLetter(text[0]))
        return false;
    const size_t end = text.find_first_not_of("ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+-.");
    return end != std::string_view::npos && text[end] == ':';
}

/// What a path may hold unencoded: unreserved characters, sub-delimiters, ":" and "@" (RFC 3986, section 3.3), and "/".
bool isPathCharacter(char character)
{
    return isLetter(character) || isDigit(character) ||
           (character != '\0' && std::strchr("-._~!$&'()*+,;=:@/", character) != nullptr);
}

int hexValue(char character)
{
    if (isDigit(character))
        return character - '0';
    const char lower = static_cast<char>(character | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

/// The bytes of an encoded path; false for a broken or NUL escape.
bool decodePath(std::string_view encoded, std::string &path)
{
    for (size_t place = 0; place < encoded.size(); ++place) {
        if (encoded[place] != '%') {
            path += encoded[place];
            continue;
        }
        if (encoded.size() - place < 3)
            return false;
        const int high = hexValue(encoded[place + 1]), low = hexValue(encoded[place + 2]);
        if (high < 0 || low < 0 || (high == 0 && low == 0))
            return false;
        path += static_cast<char>(high << 4 | low);
        place += 2;
    }
    return path.find('\0') == std::string::npos;
}

bool urlsEqual(CSKavellTypeRef first, CSKavellTypeRef second)
{
    return CSKavellEqual(static_cast<CSKavellURLRef>(first)->string.get(),
                         static_cast<CSKavellURLRef>(second)->string.get());
}

uint64_t urlHash(CSKavellTypeRef object)
{
    return CSKavellHash(static_cast<CSKavellURLRef>(object)->string.get());
}

void describeURL(CSKavellTypeRef object, int, std::string &text)
{
    text += static_cast<CSKavellURLRef>(object)->string->view();
}

}  // namespace

constinit const TypeOperations urlOperations{"CSKavellURL", nullptr, destroyFields<CSKavellURL>,
                                             urlsEqual,     urlHash, describeURL};

}  // namespace kavell

using namespace kavell;

CSKavellTypeID CSKavellURLGetTypeID(void)
{
    return kTypeURL;
}

CSKavellURLRef CSKavellURLCreateWithString(CSKavellStringRef string)
{
    if (!string || !startsWithScheme(string->view()))
        return nullptr;
    return makeObject<CSKavellURL>(nullptr, kTypeURL, 0, retain(string));
}

CSKavellURLRef CSKavellURLCreateWithFileSystemPath(const char *path, bool isDirectory)
{
    if (!path || path[0] != '/')
        return nullptr;
    return guarded(CSKavellURLRef{}, [&] {
        constexpr char kDigits[] = "0123456789ABCDEF";
        std::string text = "file://";
        for (const char *next = path; *next; ++next) {
            const auto byte = static_cast<unsigned char>(*next);
            if (isPathCharacter(*next))
                text += *next;
            else
                text.append({'%', kDigits[byte >> 4], kDigits[byte & 15]});
        }
        if (isDirectory && text.back() != '/')
            text += '/';
        const auto string = adopt(makeValidString(nullptr, text));
        return CSKavellURLCreateWithString(string.get());
    });
}

CSKavellStringRef CSKavellURLGetString(CSKavellURLRef url)
{
    return url ? url->string.get() : nullptr;
}

char *CSKavellURLCopyFileSystemPath(CSKavellURLRef url)
{
    constexpr std::string_view kPrefixes[] = {"file://localhost/", "file:///"};
    if (!url)
        return nullptr;
    return guarded(static_cast<char *>(nullptr), [&]() -> char * {
        const std::string_view text = url->string->view();
        for (const std::string_view prefix : kPrefixes) {
            if (!text.starts_with(prefix))
                continue;
            std::string path = "/";
            if (!decodePath(text.substr(prefix.size()), path))
                return nullptr;
            if (path.size() > 1 && path.back() == '/')
                path.pop_back();
            return strdup(path.c_str());
        }
        return nullptr;
    });
}
