// Small pieces of text as JSON has them.
#pragma once

#include <nlohmann/json.hpp>
#include <string>

namespace q7r
{

// A number with all its digits, as short as it reads back; a text in quotes.
inline std::string JsonText(double number) { return nlohmann::json(number).dump(); }
inline std::string JsonText(const std::string& text)
{
  return nlohmann::json(text).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

} // namespace q7r
