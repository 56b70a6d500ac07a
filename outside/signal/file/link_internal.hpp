// Link documents: small ini files that name an audio file and carry the
// options of the document opened through them.  The layout is the settings
// files' own, so the document can keep its settings in the same file:
//
//   [velm]
//   link.file=take1.wav     ; relative names start at the link's folder
//   link.format=AUTO        ; format string of the named file (default AUTO)
//   link.options=NOEDITABLE ; read by the document, not here
//
// Keys may also be written whole before any section ("velm.link.file=...").
// Section names hold no dots; lines under one that does are not read.
#pragma once

#include <cstddef>
#include <string>

namespace velmsig {

// Link documents are small; anything larger is not one.
constexpr size_t kMaxLinkSize = 64 * 1024;

struct LinkTarget {
    std::string path;    // resolved against the link's folder
    std::string format;  // "AUTO" when the link does not say
};

// True when the start of a file reads as a link document.
bool looks_like_link(const char *head, size_t size);

// True when the file at `path` is a link document.
bool is_link_document(const char *path);

// Reads the link document at `path`; false with the last error set.
bool read_link(const char *path, LinkTarget *out);

}  // namespace velmsig
