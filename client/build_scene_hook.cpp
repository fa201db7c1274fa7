// Nothing is built: scenes come from files and from the program.
#include "torvane/document/base_document.h"

namespace _torvane_
{

Bool BaseDocument::BuildScene(Long) { return true; }

} // namespace _torvane_
