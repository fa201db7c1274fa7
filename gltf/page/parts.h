// What a page is put together from, as it lies beside this header: taken into the program when it is built.
#pragma once

#include <string_view>

namespace gltf
{

std::string_view PageTemplate(); // page.html, with a word in @ signs where each part belongs
std::string_view PageScript();   // page.js
std::string_view PageLibrary();  // three/three.min.js
std::string_view PageLicense();  // three/LICENSE

} // namespace gltf
