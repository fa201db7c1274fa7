// Values as JSON: of containers, vectors, times and links.
#pragma once

#include <string>

#include <nlohmann/json.hpp>

#include "torvane/document/base_document.h"

namespace q7r
{

using Json = nlohmann::ordered_json;

// A number with all its digits, as short as it reads back; a text in quotes.
std::string JsonText(double number);
std::string JsonText(const std::string& text);

Json ToJson(const _torvane_::Vector& vector);
Json ToJson(const _torvane_::Matrix& matrix);
Json ToJson(const _torvane_::BaseTime& time);
Json ToJson(const _torvane_::String& text);
// A link's target: the names from its root list down to it, joined by "/"; null for an empty link.
Json LinkJson(const _torvane_::GeAliasLink& link);
Json ToJson(const _torvane_::GeData& value);
// An object keyed by the ids as text. Of several entries with one id the first counts.
Json ToJson(const _torvane_::BaseContainer& container);

} // namespace q7r
