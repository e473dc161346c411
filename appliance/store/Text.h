/// The text forms that the appliance's tools and its management library share: quoted fields,
/// lists, processing units and times. Pure functions on UTF-8 text; safe from any thread.
#ifndef APPLIANCE_TEXT_H
#define APPLIANCE_TEXT_H

#include <cstdint>
#include <ctime>
#include <string>
#include <string_view>
#include <vector>

namespace appliance {

/// @p value as one field of a comma-separated record: as it is, or, when it holds a comma or a
/// double quote, wrapped in double quotes with each inner quote doubled.
std::string quoted(std::string_view value);

/// One record or list: every value quoted(), with commas between them.
std::string joined(const std::vector<std::string>& values);

/// Cuts @p text at commas. A field that opens with a double quote runs to its closing quote and
/// may hold commas and doubled quotes; when no closing quote stands before a comma or the end,
/// the quote is an ordinary character. Quotes elsewhere in a field are ordinary characters too.
/// An empty text gives one empty field.
std::vector<std::string> split(std::string_view text);

/// Whether split() would read a whole quoted field at @p begin; @p end becomes the position
/// behind its closing quote.
bool quotedFieldAt(std::string_view text, std::size_t begin, std::size_t* end);

/// The content of a quoted field, without its outer quotes and with doubled quotes made single.
std::string unquoted(std::string_view field);

/// The words of a list without quotes, with commas between them, as parts of @p list.
std::vector<std::string_view> namesIn(std::string_view list);

/// Whether @p word is one of them.
bool isListed(std::string_view list, std::string_view word);

/// Processing units in hundredths: "1.25" is 125. What is no number counts as 0.
std::int64_t hundredths(std::string_view units);

/// The whole of @p text as processing units without sign, with at most two decimals.
/// @return false, with @p value untouched, when it is anything else or does not fit
bool wholeUnits(std::string_view text, std::int64_t* value);

/// Hundredths as processing units with two decimals: 125 is "1.25"; nothing at all is "0.0".
std::string units(std::int64_t hundredths);

/// The number that @p text starts with, or 0: attributes say "none" and "null" where there is none.
std::int64_t number(std::string_view text);

/// The whole of @p text as a decimal number without sign.
/// @return false, with @p value untouched, when it is anything else or does not fit
bool wholeNumber(std::string_view text, std::int64_t* value);

/// "11/22/2024 20:44:05", in universal time, which is the appliance's only clock.
std::string timeText(std::time_t time);

/// printf-style "%0<width>llX" of @p value.
std::string hex(std::int64_t value, int width);

/// How many characters there are in UTF-8 text: all bytes but those that continue one.
std::size_t characters(std::string_view text);

/// @p text with its hexadecimal digits in upper case, as DRC indexes are stored.
std::string upperHex(std::string text);

}  // namespace appliance

#endif
