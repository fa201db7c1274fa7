// Values of the library as listings tell them.
#pragma once

#include <string>

#include "output/value_sink.h"
#include "torvane/document/base_document.h"
#include "torvane/stream/raw_chunk_body.h"

namespace q7r
{

// Plain numbers; `lasts` as in NumberRows.
void TellReals(ValueSink& sink, const _torvane_::Real* numbers, long long count, bool lasts = false);
// Vectors and matrices are arrays of numbers, a time is its numerator and denominator.
void Tell(ValueSink& sink, const _torvane_::Vector& vector);
void Tell(ValueSink& sink, const _torvane_::Matrix& matrix);
void Tell(ValueSink& sink, const _torvane_::BaseTime& time);
void Tell(ValueSink& sink, const _torvane_::String& text);
// The names from the target's root list down to it, joined by "/"; null for an empty link.
void Tell(ValueSink& sink, const _torvane_::GeAliasLink& link);
// An object with the type under "custom" for a custom value.
void Tell(ValueSink& sink, const _torvane_::GeData& value);

template <class Value>
void Tell(ValueSink& sink, std::string_view name, const Value& value)
{
  sink.Key(name);
  Tell(sink, value);
}

// An object keyed by the ids as text. Of several entries with one id the first counts; entries for which `skip` is true
// are left out.
using EntryFilter = bool (*)(_torvane_::Long id);
void Tell(ValueSink& sink, const _torvane_::BaseContainer& container, EntryFilter skip = nullptr);
// The same within an object that was begun.
void TellEntries(ValueSink& sink, const _torvane_::BaseContainer& container, EntryFilter skip = nullptr);

// Bytes that nobody here understands: level, size and check sum, from which the numbers of links are left out: they
// mean something within one file only.
void TellBytes(ValueSink& sink, const _torvane_::RawChunkBody& body);
void TellBytes(ValueSink& sink, _torvane_::Long level, const void* data, _torvane_::LLong size);
// The same of what `write` writes.
void TellWritten(ValueSink& sink, _torvane_::Long level, void (*write)(const void* what, _torvane_::HyperFile& file),
                 const void* what);

// "00c0ffee00c0ffee".
std::string HexText(unsigned long long number);

// The target of a link as a node with a name; null for an empty link, and for what has a goal but is no such node.
const _torvane_::BaseList2D* TargetOf(const _torvane_::GeAliasLink& link);
// The names from a node's root list down to it, joined by "/".
std::string PathText(const _torvane_::BaseList2D& node);

} // namespace q7r
