// Package descriptors: small XML files in the style of CIM-XML (DSP0201), one property per element.
// They are read line by line: a fixed set of header lines is recognised by exact text and a value
// is taken from the line that follows.
#pragma once

#include "velk/api.h"

// Reads the descriptor at `LocalPkgURI` of package `idx` into the record and derives `OrderFlag`
// and `manufacturer`. A descriptor that cannot be opened is reported with code 12 and leaves all
// but `OrderFlag` as it was.
VELK_API void getPkgAssociation(int idx);

// In place: drops what stands before the first "<" and after the last ">". A text that begins with
// "<" stays as it is, with its line break. A text that has no such pair becomes empty.
VELK_API void trimXMLString(char *text);

// In place: drops an opening tag of 7 and a closing tag of 8 characters. A text too short to hold
// both becomes empty.
VELK_API void getXmlTagData(char *text);

// In place: turns a URI or path into a package id, the part after the last "/" without the part
// from its last "." on. The first character is never looked at.
VELK_API void trimPackageID(char *text);
