// JSON on standard output.
#pragma once

#include "output/json_writer.h"
#include "output/standard_output.h"

namespace q7r
{

// The form of all that --json prints. Raised when a member goes or changes its meaning, not when one is added.
inline constexpr int kJsonSchema = 1;

// Prints one object, which begins with its schema; `tell` tells the other members.
template <class Teller>
void PrintJson(Teller&& tell)
{
  JsonWriter json(Print);
  json.BeginObject();
  json.Member("schema", kJsonSchema);
  tell(json);
  json.EndObject();
  json.Finish();
}

} // namespace q7r
