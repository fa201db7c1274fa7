// The desktop's browser.
#pragma once

#include <filesystem>

namespace q7r
{

// Has the browser show a file. False where there is no desktop, or nothing on it that shows the file.
bool OpenInBrowser(const std::filesystem::path& file);

} // namespace q7r
