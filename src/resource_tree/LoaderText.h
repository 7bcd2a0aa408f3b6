// Text rules of the resource-tree loader: booleans, names ranges, variables, localized texts,
// platform paths and the UTF-8 form handed to Expat.
#pragma once

#include "kern/Collate.h"

#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace wbhw {

// True when TEXT is "true", "yes", "1", "on" or "enable", ignoring case.
bool IsTrueWord(std::u16string_view text) noexcept;

// One name of a "names" list: the name, and the range variable and index that produced it.
struct ExpandedName {
    std::u16string name;
    std::u16string variable; // empty when the name was not produced by a range
    uint64_t index = 0;
};

// Expands a "names" value: pieces split at "," with trimming; a piece prefix[var=first..last]suffix
// gives prefix+i+suffix for i from first to last. At most LIMIT names are made; TRUNCATED tells
// whether more were asked for. Making stops, without TRUNCATED, once the names and variables made
// hold more than MAXUNITS units: the caller, which counts them, then refuses the whole list.
std::vector<ExpandedName> ExpandNames(std::u16string_view value, size_t limit, bool& truncated,
                                      size_t maxUnits = SIZE_MAX);
// The units of text that NAMES hold (names and variables).
size_t TextUnits(const std::vector<ExpandedName>& names) noexcept;

// Variables by name, ignoring case.
using VariableMap = std::map<std::u16string, std::u16string, qv::kern::LessNoCase>;

// Replaces every "#{" name "}" whose trimmed name is in VARIABLES; an "#{" without "}" ends the
// substitution. Answers whether anything was replaced.
bool SubstituteVariables(std::u16string& text, const VariableMap& variables);

// Picks the entry of a "lang=text, lang=text" list for LANGUAGE, failing that for "eng": the
// chosen text, a NUL and the whole VALUE. VALUE unchanged when no entry fits.
std::u16string LocalizeText(std::u16string_view value, std::u16string_view language);

// A "/"-separated path text rebuilt in the platform's form (pieces joined with the path join).
std::u16string PlatformPathText(std::u16string_view text);
// True when PlatformPathText would give TEXT back unchanged (no escapes, no empty pieces).
bool IsPlatformPathText(std::u16string_view text) noexcept;

// BASE and RELATIVE joined with the platform separator; RELATIVE alone when it is absolute.
std::string JoinFilePath(const std::string& base, const std::string& relative);

// The decimal text of VALUE.
std::u16string DecimalText(uint64_t value);

// UTF-16 for bytes that should be UTF-8; undecodable bytes become U+FFFD.
std::u16string FromUtf8Lenient(std::string_view bytes);

// The directory that ":Include" paths are relative to, worked out once per process: the host
// folder that the host runtime tells (the executable's directory when there is no runtime).
const std::string& HostDirectory();
// The directory that ":DeferredLoadPath" files are relative to, worked out once per process: the
// host folder that the host runtime tells, else the directory of the running executable.
const std::string& DeferredDirectory();

} // namespace wbhw
