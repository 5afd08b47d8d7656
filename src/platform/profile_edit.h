#pragma once
// The edits the profile write functions make, each giving the file's new bytes. An edit touches
// only the lines it must: every other byte of the file is copied as it was, so comments, blank
// lines, unknown lines and text in encodings the code page cannot round-trip survive. New and
// changed lines are encoded as the file is (ANSI in the document's code page, or UTF-16 LE) and
// new lines end with CR LF; a changed line keeps its own line break.
//
// Text an ANSI file's code page cannot hold (characters it lacks, lone surrogates) is refused:
// the edit gives no bytes (nullopt). Windows writes such text with '?' in place of what is
// missing, which loses it, and turns two different names into one.
//
// Section and key names are given without surrounding blanks and compare without case.

#include <optional>
#include <string>
#include <vector>

#include "profile_document.h"
#include "profile_text.h"

namespace win32::detail {

// Every edit takes the current document, or null for a file that does not exist yet (which is
// then created as ANSI text in the process code page), and gives the new bytes. Each may throw
// std::bad_alloc.
namespace profile_edit {

using Bytes = std::optional<std::string>;

// Sets the value of the first entry named key in the first section named section. An existing
// entry keeps its line, key spelling and the blanks around its '='; a new one goes after the
// section's last entry (or line without '='), a new section at the end of the file.
Bytes SetValue(const ProfileDocument* document, profile::Text section, profile::Text key,
               profile::Text value);

// Removes every entry named key from the first section named section.
Bytes DeleteKey(const ProfileDocument* document, profile::Text section, profile::Text key);

// Removes every section named section: headers, entries and lines without '='. Comments and
// blank lines stay.
Bytes DeleteSection(const ProfileDocument* document, profile::Text section);

// Replaces the entries and lines without '=' of the first section named section with lines, put
// where the first old one was (or after the header); adds the section at the end when missing.
Bytes ReplaceSection(const ProfileDocument* document, profile::Text section,
                     const std::vector<profile::Text>& lines);

}  // namespace profile_edit

}  // namespace win32::detail
