// The kinds of value that a GeData holds, as the rows of one table: what making, freeing, copying, comparing, reading
// and writing a value takes is told there, and nothing else looks at a type to choose between them.
#pragma once

#include "torvane/values/ge_data.h"

namespace _torvane_
{

// How a kind stands in files.
enum class StoredAs : UChar
{
  kNever,
  kTypeAlone, // read as its type without a value, and not written
  kValue,
};

struct GeData::Kind
{
  Long type;
  StoredAs storedAs;
  // True where `copy` also takes a payload that holds a value already.
  Bool isCopiedInPlace;
  // Fills the payload of a nil value with an empty one of `type`. False when memory is short or the type unknown.
  Bool (*make)(Payload& payload, Long type);
  void (*free)(Payload& payload); // null: nothing is owned
  // Makes a payload that `make` has filled equal to another one. False when memory is short.
  Bool (*copy)(Payload& to, const Payload& from, ULong flags, TransArray* translation);
  Bool (*isEqual)(const Payload& a, const Payload& b);
  Bool (*read)(HyperFile& file, Payload& payload);
  Bool (*write)(HyperFile& file, const Payload& payload);

  // The row of a type as a value has it; that of custom values for every type from kDataFirstCustom on, and that of
  // what doesn't exist for all others.
  static const Kind& Of(Long type);

  // A link lies in the payload itself.
  static GeAliasLink& LinkOf(Payload& payload);

 private:
  template <class T, auto member>
  struct Inline;
  template <class T, auto member>
  struct Owned;
  struct Link;
  struct Nothing;
  struct Block;
  struct Custom;
  static const Kind kRows[];
};

} // namespace _torvane_
