// Who made and wrote a document, and when: entries of the document container and the texts made from them.
#pragma once

#include "torvane/values/base_container.h"

namespace _torvane_
{

// The entry whose opposite is parameter kDocumentInverseSwitch.
inline constexpr Long kSwitchedOff = 100004828;

// True for the four read-only text parameters.
Bool IsInfoText(Long id);
// The text of such a parameter; a date that isn't there gives nil. False for any other parameter.
Bool GetInfoText(const BaseContainer& container, Long id, GeData& value);

// Stores the client's name and number and the present date under these ids.
void StampInfo(BaseContainer& container, Long nameId, Long numberId, Long dateId);

} // namespace _torvane_
