// Planes, materials and their pictures.
#include "tests/gltf/converted_scene.h"

namespace
{

using namespace gltf_test;

// A PNG of no meaning but with all that is looked at: the check sums are zero.
Bytes Png(std::uint8_t colorType, bool transparent = false, std::uint8_t width = 2)
{
  Bytes bytes = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
  auto chunk = [&bytes](const char* name, const Bytes& body) {
    bytes.insert(bytes.end(), {0, 0, 0, static_cast<std::uint8_t>(body.size())});
    bytes.insert(bytes.end(), name, name + 4);
    bytes.insert(bytes.end(), body.begin(), body.end());
    bytes.insert(bytes.end(), 4, 0);
  };
  chunk("IHDR", {0, 0, 0, width, 0, 0, 0, 2, 8, colorType, 0, 0, 0});
  if (transparent)
    chunk("tRNS", {0});
  chunk("IDAT", {1, 2, 3});
  chunk("IEND", {});
  return bytes;
}

Bytes Jpeg(std::uint8_t height = 2)
{
  return {0xFF, 0xD8, 0xFF, 0xE0, 0, 4,    1,    2, 0xFF, 0xFF, 0xC0, 0, 11,   8, 0, height, 0,
          3,    1,    1,    17,   0, 0xFF, 0xDA, 0, 3,    0,    7,    7, 0xFF, 0, 7, 0xFF,   0xD9};
}

class GltfPlanes : public GltfScene
{
 protected:
  GltfPlanes()
  {
    std::filesystem::create_directories(folder_.Path() / "out");
    options.sceneFolder = folder_.Path();
    options.outputFolder = folder_.Path();
  }
  Material* AddPicture(const char* material, const std::string& path)
  {
    Material* made = AddMaterial(material, {0.5, 0.5, 0.5});
    made->BindChannelBitmap(kMaterialColorShader, Filename(String(path.c_str(), STRINGENCODING_UTF8)));
    return made;
  }
  std::string Write(const std::string& name, const Bytes& bytes)
  {
    const std::filesystem::path path = folder_.Path() / std::u8string(name.begin(), name.end());
    std::filesystem::create_directories(path.parent_path());
    std::ofstream(path, std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
    return (folder_.Path() / "").string() + name;
  }

  TempFolder folder_;
};

TEST_F(GltfPlanes, AreQuadsThatFaceTheViewer)
{
  Material* red = AddMaterial("red", {1, 0, 0});
  AddPlane("a", 200, 100, red);
  AddPlane("b", 200, 100, red);
  AddPlane("c", 200, 50, red);
  AddPlane("other axis", 200, 100, red)->SetParameterById(1300, Long{0});
  BaseObject* nested = AddPlane("nested composition", 10, 10);
  nested->GetDataInstance().SetLong(1027565, 3);
  AddPlane("from elsewhere", 10, 10);
  const Converted scene = Convert();
  const Json& quad = scene.Primitive("a");
  ExpectNear(scene.Numbers(quad["attributes"]["POSITION"]), {-1, -0.5, 0, 1, -0.5, 0, 1, 0.5, 0, -1, 0.5, 0}, 1e-7);
  ExpectNear(scene.Numbers(quad["attributes"]["NORMAL"]), {0, 0, 1, 0, 0, 1, 0, 0, 1, 0, 0, 1});
  ExpectNear(scene.Numbers(quad["indices"]), {0, 1, 2, 0, 2, 3});
  EXPECT_FALSE(quad["attributes"].contains("TEXCOORD_0"));
  EXPECT_EQ(scene.Node("a")["mesh"], scene.Node("b")["mesh"]);
  EXPECT_EQ(scene.Node("a")["mesh"], scene.Node("other axis")["mesh"]);
  EXPECT_NE(scene.Node("a")["mesh"], scene.Node("c")["mesh"]);
  EXPECT_EQ(scene.Lost(Loss::kPlaneAxis), 1U);
  EXPECT_FALSE(scene.Node("nested composition").contains("mesh"));
  ExpectNear(scene.MaterialOf("from elsewhere")["pbrMetallicRoughness"]["baseColorFactor"],
             {0.603827338855, 0.603827338855, 0.603827338855, 1});
}

TEST_F(GltfPlanes, HaveTheColourOfTheirMaterial)
{
  const std::tuple<const char*, Vector, Real, bool, std::vector<double>> cases[] = {
      {"plain", {1, 0.5, 0.04}, 1, true, {1, 0.214041140482, 0.003095975232, 1}},
      {"half", {1, 1, 1}, 0.5, true, {0.214041140482, 0.214041140482, 0.214041140482, 1}},
      {"bright", {1, 2, -3}, 5, true, {1, 1, 0, 1}},
      {"off", {1, 1, 1}, 1, false, {0, 0, 0, 1}}};
  for (const auto& [name, color, brightness, on, linear] : cases) {
    Material* material = AddMaterial(name, color);
    material->SetParameterById(2101, brightness);
    material->SwitchChannel(0, on ? 1 : 0);
    material->SwitchChannel(8, 1);
    AddPlane(name, 1, 1, material);
  }
  AddMaterial("not used", {1, 1, 1});
  Material* many = AddMaterial("many", {1, 1, 1});
  many->SwitchChannel(5, 1);
  many->SwitchChannel(-1, 1);
  AddPlane("many", 1, 1, many);
  const Converted scene = Convert();
  for (const auto& [name, color, brightness, on, linear] : cases)
    ExpectNear(scene.MaterialOf(name)["pbrMetallicRoughness"]["baseColorFactor"], linear);
  const Json& plain = scene.MaterialOf("plain");
  EXPECT_EQ(scene.json["materials"].size(), 5U);
  EXPECT_EQ(plain["name"], "plain");
  EXPECT_EQ(plain["doubleSided"], true);
  EXPECT_EQ(plain["pbrMetallicRoughness"]["metallicFactor"], 0.0);
  EXPECT_EQ(plain["pbrMetallicRoughness"]["roughnessFactor"], 1.0);
  EXPECT_FALSE(plain.contains("alphaMode"));
  EXPECT_EQ(scene.Lost(Loss::kChannel, 5), 1U);
  EXPECT_EQ(scene.Lost(Loss::kChannel, -1), 1U);
  EXPECT_EQ(scene.Account().Lines(), (std::vector<std::string>{"1 material with channel -1 on: left out",
                                                               "1 material with channel 5 on: left out"}));
}

TEST_F(GltfPlanes, AreLitWhereALightIsSeen)
{
  AddPlane("a", 1, 1);
  auto isLit = [this] { return !Convert().MaterialOf("a").contains("extensions"); };
  EXPECT_FALSE(isLit());
  BaseObject* light = Add(kObjectLight, "light");
  EXPECT_TRUE(isLit());
  options.shading = gltf::Shading::kUnlit;
  EXPECT_FALSE(isLit());
  options.shading = gltf::Shading::kByLights;
  light->SetRenderMode(1);
  EXPECT_FALSE(isLit());
  options.shading = gltf::Shading::kLit;
  EXPECT_TRUE(isLit());
}

TEST_F(GltfPlanes, NameTheirPicturesFromWhereTheFileLies)
{
#ifdef _WIN32 // a test's narrow text is no UTF-8 there
  const std::string strange = "two words %#.png", encoded = "two%20words%20%25%23.png";
#else
  const std::string strange = "two words %#é.png", encoded = "two%20words%20%25%23%C3%A9.png";
#endif
  Write("pictures/" + strange, Png(6));
  Write("plain.jpg", Jpeg());
  options.outputFolder = folder_.Path() / "out";
  AddPlane("a", 1, 1, AddPicture("a", folder_ / ("pictures/" + strange)));
  AddPlane("b", 1, 1, AddPicture("b", "plain.jpg"));
  AddPlane("c", 1, 1, AddPicture("c", folder_ / "out/../plain.jpg"));
  AddPlane("d", 1, 1, AddPicture("d", "C:\\films\\plain.jpg"));
  Write("pictures/other.jpg", Jpeg());
  AddPlane("e", 1, 1, AddPicture("e", "pictures\\other.jpg"));
  const Converted scene = Convert();
  EXPECT_EQ(scene.json["images"], Json::parse(R"([{"uri": "../pictures/)" + encoded +
                                              R"("}, {"uri": "../plain.jpg"}, {"uri": "../pictures/other.jpg"}])"));
  EXPECT_EQ(scene.json["samplers"],
            Json::parse(R"([{"magFilter": 9729, "minFilter": 9987, "wrapS": 33071, "wrapT": 33071}])"));
  EXPECT_EQ(scene.json["textures"].size(), 3U);
  ExpectNear(scene.Numbers(scene.Primitive("a")["attributes"]["TEXCOORD_0"]), {0, 1, 1, 1, 1, 0, 0, 0});
  EXPECT_FALSE(scene.Account().HasProblems());
}

TEST_F(GltfPlanes, PackTheirPicturesInOnce)
{
  const Bytes png = Png(2);
  Write("a.png", png);
  AddPlane("a", 1, 1, AddPicture("a", "a.png"));
  AddPlane("b", 1, 1, AddPicture("b", folder_ / "a.png"));
  options.embed = true;
  const Converted whole = Convert();
  ASSERT_EQ(whole.json["images"].size(), 1U);
  EXPECT_EQ(whole.json["images"][0]["mimeType"], "image/png");
  const Json& view = whole.json["bufferViews"][whole.json["images"][0]["bufferView"].get<std::size_t>()];
  EXPECT_EQ(view["byteLength"], png.size());
  EXPECT_TRUE(whole.Model().bytes.Holds(view["byteOffset"], png.data(), png.size()));
  options.bufferName = "scene.bin";
  const Converted parts = Convert();
  EXPECT_EQ(parts.json["images"][0]["uri"].get<std::string>().substr(0, 34), "data:image/png;base64,iVBORw0KGgoA");
  EXPECT_EQ(parts.json["buffers"][0]["uri"], "scene.bin");
}

TEST_F(GltfPlanes, BlendPicturesThatLetThrough)
{
  const std::tuple<const char*, Bytes, bool> cases[] = {
      {"grey.png", Png(0), false},      {"rgb.png", Png(2), false},  {"palette.png", Png(3), false},
      {"grey-alpha.png", Png(4), true}, {"rgba.png", Png(6), true},  {"trns.png", Png(3, true), true},
      {"named-as.png", Jpeg(), false},  {"photo.jpg", Jpeg(), false}};
  for (const auto& [file, bytes, blend] : cases) {
    Write(file, bytes);
    AddPlane(file, 1, 1, AddPicture(file, file));
  }
  options.embed = true;
  const Converted scene = Convert();
  for (const auto& [file, bytes, blend] : cases)
    EXPECT_EQ(scene.MaterialOf(file).value("alphaMode", ""), blend ? "BLEND" : "") << file;
  EXPECT_EQ(scene.json["images"][6]["mimeType"], "image/jpeg");
}

TEST_F(GltfPlanes, ShowTheColourAloneWherePicturesFail)
{
  const Bytes png = Png(6), jpeg = Jpeg();
  Write("cut.png", Bytes(png.begin(), png.end() - 13));
  Write("header.png", Bytes(png.begin(), png.begin() + 20));
  Write("none.png", Png(6, false, 0));
  Write("cut.jpg", Bytes(jpeg.begin(), jpeg.end() - 1));
  Write("none.jpg", Jpeg(0));
  Write("empty.png", {});
  Write("film.mov", {1, 2, 3});
  Write("picture.bmp", {'B', 'M'});
  std::filesystem::create_directory(folder_.Path() / "folder.png");
  for (const char* name : {"cut.png", "header.png", "none.png", "cut.jpg", "none.jpg", "empty.png", "film.mov",
                           "picture.bmp", "folder.png", "missing.png", "/nowhere/missing.png", "/dev/zero"})
    AddPlane(name, 1, 1, AddPicture(name, name));
  AddPlane("again", 1, 1, AddPicture("again", "missing.png"));
  const Converted scene = Convert();
  EXPECT_FALSE(scene.json.contains("images"));
  ExpectNear(scene.MaterialOf("missing.png")["pbrMetallicRoughness"]["baseColorFactor"],
             {0.214041140482, 0.214041140482, 0.214041140482, 1});
  EXPECT_EQ(scene.MaterialOf("cut.jpg")["extras"]["q7r"]["picture"], "cut.jpg");
  EXPECT_TRUE(scene.Account().HasProblems());
  EXPECT_EQ(
      scene.Account().Lines(),
      (std::vector<std::string>{"cut.png: the picture is damaged", "header.png: the picture is damaged",
                                "none.png: the picture is damaged", "cut.jpg: the picture is damaged",
                                "none.jpg: the picture is damaged", "folder.png: the picture is missing",
                                "missing.png: the picture is missing", "/nowhere/missing.png: the picture is missing",
                                "/dev/zero: the picture is missing", "1 movie: the colour alone",
                                "2 pictures that are neither PNG nor JPEG: the colour alone"}));
#ifdef __linux__ // has a file that opens, but that can't be read from its start
  AddPlane("unreadable", 1, 1, AddPicture("unreadable", "/proc/self/mem"));
  EXPECT_EQ(Convert().Account().Lines()[9], "/proc/self/mem: the picture can't be read");
#endif
}

TEST_F(GltfPlanes, TellWhatOfAPictureIsLost)
{
  Write("a.png", Png(2));
  Material* mixed = AddPicture("mixed", "a.png");
  mixed->SetParameterById(2101, 0.25);
  mixed->SetParameterById(2102, 0.5);
  mixed->ChannelShaderOf(kMaterialColorShader)->SetParameterById(kBitmapLastFrame, Long{99});
  BaseObject* plane = AddPlane("mixed", 1, 1);
  TextureTag* tag = AddTexture(*plane, *mixed);
  tag->GetDataInstance().SetLong(1004, 0);
  tag->GetDataInstance().SetReal(1000, 0.5);
  tag->GetDataInstance().SetReal(1002, 0.25);
  Material* mode = AddPicture("mode", "a.png");
  mode->SetParameterById(2103, Long{2});
  AddPlane("mode", 1, 1, mode);
  Material* noise = AddMaterial("noise", {1, 1, 1});
  noise->BindChannelShader(kMaterialColorShader, 5832);
  AddPlane("noise", 1, 1, noise);
  BaseMaterial* foreign = MakeMaterial(1012345);
  document->InsertMaterial(foreign);
  static_cast<TextureTag*>(AddPlane("foreign", 1, 1)->MakeTag(kTagTexture))->SetMaterial(foreign);
  AddTrack(*mode, Component(2100, 0), {{0, 0}, {1, 1}});
  const Converted scene = Convert();
  const Json& material = scene.MaterialOf("mixed");
  ExpectNear(material["pbrMetallicRoughness"]["baseColorFactor"], {0.25, 0.25, 0.25, 1});
  EXPECT_EQ(material["extras"]["q7r"]["frames"], 100);
  EXPECT_EQ(material["pbrMetallicRoughness"]["baseColorTexture"]["extensions"]["KHR_texture_transform"],
            Json::parse(R"({"offset": [-2.0, 0.0], "scale": [4.0, 1.0]})"));
  EXPECT_EQ(scene.json["samplers"][0]["wrapS"], 10497);
  EXPECT_EQ(scene.json["samplers"][0]["wrapT"], 33071);
  EXPECT_EQ(scene.Lost(Loss::kMixing), 2U);
  EXPECT_EQ(scene.Lost(Loss::kTextureProjection), 1U);
  EXPECT_EQ(scene.Lost(Loss::kForeignShader), 1U);
  EXPECT_EQ(scene.Lost(Loss::kForeignMaterial), 1U);
  EXPECT_EQ(scene.Lost(Loss::kMaterialTrack), 1U);
  EXPECT_EQ(scene.Account().Lines()[4], "1 image sequence: first picture only");
}

} // namespace
