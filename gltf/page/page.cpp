#include "gltf/page/page.h"

#include <string_view>

#include "gltf/file/base64.h"
#include "gltf/page/parts.h"

namespace gltf
{

namespace
{

// What stands in for the signs that mean something to a browser.
std::string Escaped(const std::string& text)
{
  std::string out;
  for (const char c : text)
    out += c == '&' ? "&amp;" : c == '<' ? "&lt;" : c == '>' ? "&gt;" : std::string(1, c);
  return out;
}

class PageWriter
{
 public:
  PageWriter(const Model& model, const std::string& title, const Sink& sink)
      : model_(model), title_(Escaped(title)), sink_(sink)
  {}

  // Walks the template once, so that what looks like a placeholder in a part stays what it is.
  void Write()
  {
    std::string_view rest = PageTemplate();
    for (std::size_t open = 0; (open = rest.find('@')) != std::string_view::npos;) {
      const std::size_t close = rest.find('@', open + 1);
      Put(rest.substr(0, open));
      PutPart(rest.substr(open + 1, close - open - 1));
      rest.remove_prefix(close + 1);
    }
    Put(rest);
  }

  std::size_t Size() const
  {
    return PageTemplate().size() + title_.size() + PageLicense().size() + PageLibrary().size() + PageScript().size() +
           Base64::LengthOf(GlbSize(model_));
  }

 private:
  void Put(std::string_view text) { sink_(reinterpret_cast<const std::uint8_t*>(text.data()), text.size()); }

  void PutPart(std::string_view name)
  {
    if (name == "SCENE")
      PutScene();
    else
      Put(name == "TITLE"     ? title_
          : name == "LICENSE" ? PageLicense()
          : name == "LIBRARY" ? PageLibrary()
                              : PageScript());
  }

  void PutScene()
  {
    Base64 text;
    WriteGlb(model_, [&](const std::uint8_t* data, std::size_t size) {
      text.Append(data, size);
      Put(text.Take());
    });
    Put(text.Finish());
  }

  const Model& model_;
  const std::string title_;
  const Sink& sink_;
};

} // namespace

void WritePage(const Model& model, const std::string& title, const Sink& sink, std::size_t limit)
{
  PageWriter page(model, title, sink);
  if (page.Size() > limit)
    throw TooLarge("the page would take more than the " + std::to_string(limit >> 20) + " MB that a browser can hold");
  page.Write();
}

} // namespace gltf
