#include "q7r_file/document/document_info.h"

#include <cstdio>
#include <cstring>

#include "torvane/document/base_document.h"
#include "torvane/hooks.h"
#include "torvane/time/date_time.h"

namespace _torvane_
{

namespace
{

struct InfoText
{
  Long parameter;
  Long nameId; // 0: a date
  Long valueId;
};

constexpr InfoText kInfoTexts[] = {
    {kDocumentCreatorText, kInfoCreatorName, kInfoCreatorId},
    {kDocumentWriterText, kInfoWriterName, kInfoWriterId},
    {kDocumentCreationText, 0, kInfoCreationDate},
    {kDocumentSaveText, 0, kInfoSaveDate},
};

const InfoText* FindInfoText(Long id)
{
  for (const InfoText& text : kInfoTexts) {
    if (text.parameter == id)
      return &text;
  }
  return nullptr;
}

String ProgramText(const String& name, Long number)
{
  if (number == 0)
    return name;
  String text = String("#") + String::FromLong(number);
  return name.Content() ? name + String(" (") + text + String(")") : text;
}

String DateText(Real julianDay)
{
  DateTime date = FromJulianDay(julianDay);
  char buffer[80];
  std::snprintf(buffer, sizeof buffer, "%04d/%02d/%02d %02d:%02d:%02d", date.year, date.month, date.day, date.hour,
                date.minute, date.second);
  return String(buffer);
}

// A date stands in its LLong with the bits of a Real.
LLong BitsOfDay(Real julianDay)
{
  LLong bits = 0;
  std::memcpy(&bits, &julianDay, sizeof bits);
  return bits;
}

Real DayOfBits(LLong bits)
{
  Real julianDay = 0;
  std::memcpy(&julianDay, &bits, sizeof julianDay);
  return julianDay;
}

} // namespace

Bool IsInfoText(Long id) { return FindInfoText(id) != nullptr; }

Bool GetInfoText(const BaseContainer& container, Long id, GeData& value)
{
  const InfoText* text = FindInfoText(id);
  if (!text)
    return false;
  if (text->nameId != 0) {
    value = GeData(ProgramText(container.GetString(text->nameId), container.GetLong(text->valueId)));
    return true;
  }
  Real day = DayOfBits(container.GetLLong(text->valueId));
  if (day == 0.0)
    value.Free();
  else
    value = GeData(DateText(day));
  return true;
}

void StampInfo(BaseContainer& container, Long nameId, Long numberId, Long dateId)
{
  DateTime now;
  GetDateTimeNow(now);
  container.SetLLong(dateId, BitsOfDay(GetJulianDay(now)));
  Long id = 0;
  String client;
  GetWriterInfo(id, client);
  String name("TORVANE Saver V5");
  if (client.Content())
    name += String(" - ") + client;
  container.SetString(nameId, name);
  container.SetLong(numberId, id != 0 ? id : kMarkerAppId);
}

} // namespace _torvane_
