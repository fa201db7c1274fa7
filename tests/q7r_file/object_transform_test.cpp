// The transform model: what each setter stores and derives, and how matrices come apart.
#include <numbers>

#include "support/library.h"

namespace
{

constexpr double kPiValue = std::numbers::pi;
constexpr double kQuarter = kPiValue / 2;

void ExpectNear(const Vector& actual, const Vector& expected, const char* what)
{
  EXPECT_NEAR(actual.x, expected.x, 1e-12) << what;
  EXPECT_NEAR(actual.y, expected.y, 1e-12) << what;
  EXPECT_NEAR(actual.z, expected.z, 1e-12) << what;
}

void ExpectNear(const Matrix& actual, const Matrix& expected)
{
  ExpectNear(actual.off, expected.off, "off");
  ExpectNear(actual.v1, expected.v1, "v1");
  ExpectNear(actual.v2, expected.v2, "v2");
  ExpectNear(actual.v3, expected.v3, "v3");
}

// An object with all three frozen parts: at (10, 20, 30), a quarter turn about y, which takes (x, y, z) to (-z, y, x),
// and the scale (2, 4, 8).
struct FrozenObject : BaseObject
{
  FrozenObject() : BaseObject(kObjectNull)
  {
    SetFrozenPos({10, 20, 30});
    SetFrozenRot({kQuarter, 0, 0});
    SetFrozenScale({2, 4, 8});
  }
};

} // namespace

TEST(ObjectTransform, RelativeAndAbsoluteValuesAreOneWithoutAFrozenPart)
{
  BaseObject object(kObjectNull);
  object.SetRelPos({1, 2, 3});
  object.SetRelScale({2, 3, 4});
  object.SetAbsRot({kQuarter, 0, 0});
  EXPECT_TRUE(object.GetAbsPos() == Vector(1, 2, 3) && object.GetAbsScale() == Vector(2, 3, 4));
  EXPECT_EQ(object.GetRelRot(), Vector(kQuarter, 0, 0));
  ExpectNear(object.GetLocalMatrix(), Matrix({1, 2, 3}, {0, 0, 2}, {0, 3, 0}, {-4, 0, 0}));
  ExpectNear(object.GetNormalizedLocalMatrix(), Matrix({1, 2, 3}, {0, 0, 1}, {0, 1, 0}, {-1, 0, 0}));
  EXPECT_EQ(object.GetFrozenTransformMatrix(), Matrix());
  object.SetAbsPos({7, 8, 9});
  EXPECT_EQ(object.GetRelPos(), Vector(7, 8, 9));
  EXPECT_EQ(object.GetLocalMatrix().off, Vector(7, 8, 9)) << "the matrix is made anew";
}

TEST(ObjectTransform, AFrozenPartStandsUnderTheRelativeValues)
{
  FrozenObject object;
  EXPECT_EQ(object.GetFrozenFlags(), kFrozenPos | kFrozenRot | kFrozenScale);
  object.SetRelPos({1, 2, 3});
  object.SetRelScale({5, 6, 7});
  object.SetRelRot({kQuarter, 0, 0});
  ExpectNear(object.GetAbsPos(), {7, 22, 31}, "position");
  EXPECT_EQ(object.GetAbsScale(), Vector(10, 24, 56));
  ExpectNear(object.GetAbsRot(), {kPiValue, 0, 0}, "rotation");
  ExpectNear(object.GetLocalMatrix(), Matrix({7, 22, 31}, {-10, 0, 0}, {0, 24, 0}, {0, 0, -56}));
  ExpectNear(object.GetRelativeMatrix(), Matrix({1, 2, 3}, {0, 0, 5}, {0, 6, 0}, {-7, 0, 0}));
  ExpectNear(object.GetRelativeNormalizedMatrix(), Matrix({1, 2, 3}, {0, 0, 1}, {0, 1, 0}, {-1, 0, 0}));
  ExpectNear(object.GetFrozenTransformMatrix(), Matrix({10, 20, 30}, {0, 0, 1}, {0, 1, 0}, {-1, 0, 0}));
}

TEST(ObjectTransform, AbsoluteValuesAreBroughtUnderTheFrozenPartAndKeptExactly)
{
  FrozenObject object;
  object.SetAbsPos({7, 22, 31});
  object.SetAbsScale({10, 24, 56});
  object.SetAbsRot({kPiValue, 0, 0});
  ExpectNear(object.GetRelPos(), {1, 2, 3}, "position");
  EXPECT_EQ(object.GetRelScale(), Vector(5, 6, 7));
  ExpectNear(object.GetRelRot(), {kQuarter, 0, 0}, "rotation");
  EXPECT_TRUE(object.GetAbsPos() == Vector(7, 22, 31) && object.GetAbsScale() == Vector(10, 24, 56));
  EXPECT_EQ(object.GetAbsRot(), Vector(kPiValue, 0, 0));
  for (const Vector& value : {Vector(0.3, 0.2, 0.1), Vector(-2.1, 1.3, 0.7)}) { // not lost on the way there and back
    object.SetAbsPos(value);
    object.SetAbsRot(value);
    EXPECT_TRUE(object.GetAbsPos() == value && object.GetAbsRot() == value);
  }
  object.SetFrozenScale({2, 0, 8});
  object.SetAbsScale({4, 5, 16});
  EXPECT_EQ(object.GetRelScale(), Vector(2, 0, 2)) << "a quotient by 0 is 0";
  EXPECT_EQ(object.GetAbsScale(), Vector(4, 5, 16));
}

TEST(ObjectTransform, FrozenFlagsFollowTheFrozenValues)
{
  FrozenObject object;
  object.SetRelPos({1, 2, 3});
  object.SetRelScale({5, 6, 7});
  object.SetFrozenRot({0, 0, 0});
  EXPECT_EQ(object.GetFrozenFlags(), kFrozenPos | kFrozenScale);
  EXPECT_EQ(object.GetAbsPos(), Vector(11, 22, 33));
  object.SetFrozenPos({0, 0, 0});
  EXPECT_TRUE(object.GetFrozenFlags() == kFrozenScale && object.GetAbsPos() == Vector(1, 2, 3));
  object.SetFrozenScale({1, 1, 1});
  EXPECT_TRUE(object.GetFrozenFlags() == 0u && object.GetAbsScale() == Vector(5, 6, 7));
}

TEST(ObjectTransform, MatricesPassThroughParentsAndFrozenParts)
{
  BaseObject parent(kObjectNull);
  BaseObject* child = NewObj<FrozenObject>();
  child->InsertUnder(&parent);
  parent.SetRelPos({100, 0, 0});
  parent.SetRelRot({0, 0, kQuarter}); // takes (x, y, z) to (y, -x, z)
  parent.SetRelScale({2, 2, 2});
  child->SetRelPos({1, 2, 3});
  // The child's local matrix has the axes (0, 0, 2), (0, 4, 0), (-8, 0, 0) and the offset (7, 22, 31).
  const Matrix global({144, -14, 62}, {0, 0, 4}, {8, 0, 0}, {0, 16, 0});
  ExpectNear(child->GetGlobalMatrix(), global);
  ExpectNear(child->GetUpGlobalMatrix(), Matrix({100, 0, 0}, {0, -2, 0}, {2, 0, 0}, {0, 0, 2}));
  ExpectNear(child->GetNormalizedGlobalMatrix(), Matrix({144, -14, 62}, {0, 0, 1}, {1, 0, 0}, {0, 1, 0}));

  child->SetRelPos({0, 0, 0});
  child->SetRelScale({3, 3, 3});
  child->SetRelRot({0.1, 0.2, 0.3});
  child->SetGlobalMatrix(global);
  ExpectNear(child->GetRelPos(), {1, 2, 3}, "position");
  ExpectNear(child->GetRelScale(), {1, 1, 1}, "scale");
  ExpectNear(child->GetRelRot(), {0, 0, 0}, "rotation");
  ExpectNear(child->GetGlobalMatrix(), global);
}

TEST(ObjectTransform, MirroredAxesComeBackThroughTheStoredScaleAndTheHandedness)
{
  const std::tuple<const char*, Vector, Matrix, Vector, Vector> rows[] = {
      {"plain", {1, 1, 1}, {{1, 2, 3}, {2, 0, 0}, {0, 3, 0}, {0, 0, 4}}, {2, 3, 4}, {0, 0, 0}},
      {"mirrored x stays x", {-1, 1, 1}, {{}, {-2, 0, 0}, {0, 3, 0}, {0, 0, 4}}, {-2, 3, 4}, {0, 0, 0}},
      {"mirrored x becomes y", {1, 1, 1}, {{}, {-2, 0, 0}, {0, 3, 0}, {0, 0, 4}}, {2, -3, 4}, {0, 0, -kPiValue}},
      {"x and y", {-1, 1, 1}, {{}, {2, 0, 0}, {0, 3, 0}, {0, 0, 4}}, {-2, -3, 4}, {0, 0, -kPiValue}},
      {"z and y", {1, 1, -1}, {{}, {2, 0, 0}, {0, 3, 0}, {0, 0, 4}}, {2, -3, -4}, {0, -kPiValue, 0}},
      {"no scale, no angles", {0, 0, 0}, {{}, {0, 0, -2}, {0, 3, 0}, {4, 0, 0}}, {2, 3, 4}, {0, 0, 0}},
      {"collapsed", {1, 1, 1}, {{5, 6, 7}, {}, {}, {}}, {0, 0, 0}, {0, 0, 0}},
  };
  for (const auto& [name, stored, matrix, scale, angles] : rows) {
    SCOPED_TRACE(name);
    BaseObject object(kObjectNull);
    object.SetRelScale(stored);
    object.SetRelativeMatrix(matrix);
    ExpectNear(object.GetRelPos(), matrix.off, "position");
    ExpectNear(object.GetRelScale(), scale, "scale");
    if (scale != Vector())
      ExpectNear(object.GetRelRot(), angles, "angles");
    EXPECT_EQ(object.GetAbsScale(), object.GetRelScale());
    if (stored != Vector())
      ExpectNear(object.GetLocalMatrix(), matrix);
  }
}

TEST(ObjectTransform, ANewRotationOrderKeepsTheRotation)
{
  BaseObject object(kObjectNull);
  object.SetRelRot({0.4, 0.3, 0.2});
  Matrix before = object.GetLocalMatrix();
  object.SetRotationOrder(2);
  EXPECT_EQ(object.GetRotationOrder(), 2);
  EXPECT_NE(object.GetRelRot(), Vector(0.4, 0.3, 0.2));
  ExpectNear(object.GetLocalMatrix(), before);
  EXPECT_EQ(object.GetAbsRot(), object.GetRelRot());
}

TEST(ObjectTransform, AProtectionTagHoldsOffEverySetter)
{
  FrozenObject object;
  object.SetRelPos({1, 2, 3});
  ASSERT_NE(object.MakeTag(kTagProtection), nullptr);
  Matrix before = object.GetGlobalMatrix();
  const Vector v(9, 8, 7);
  object.SetRelPos(v);
  object.SetRelRot(v);
  object.SetRelScale(v);
  object.SetAbsPos(v);
  object.SetAbsRot(v);
  object.SetAbsScale(v);
  object.SetFrozenPos(v);
  object.SetFrozenRot(v);
  object.SetFrozenScale(v);
  object.SetRotationOrder(1);
  object.SetRelativeMatrix(Matrix({5, 5, 5}, {2, 0, 0}, {0, 2, 0}, {0, 0, 2}));
  object.SetLocalMatrix(Matrix());
  object.SetGlobalMatrix(Matrix());
  object.SetParameterById(kObjectGlobalPos, GeData(v));
  EXPECT_TRUE(object.GetGlobalMatrix() == before && object.GetRelPos() == Vector(1, 2, 3));
  EXPECT_TRUE(object.GetRotationOrder() == 6 && object.GetFrozenScale() == Vector(2, 4, 8));
}

TEST(ObjectTransform, GlobalParametersWorkInTheParentsSystem)
{
  BaseObject parent(kObjectNull);
  BaseObject* child = NewObj<BaseObject>(kObjectNull);
  child->InsertUnder(&parent);
  parent.SetRelPos({100, 0, 0});
  parent.SetRelRot({kQuarter, 0, 0}); // takes (x, y, z) to (-z, y, x)
  child->SetParameterById(kObjectGlobalPos, GeData(Vector(97, 2, 1)));
  ExpectNear(child->GetRelPos(), {1, 2, 3}, "position");
  child->SetParameter(ParameterPath({kObjectGlobalPos, 0, 0}, {kVectorY, 0, 0}), GeData(5.0));
  ExpectNear(child->GetRelPos(), {1, 5, 3}, "one component");
  child->SetParameterById(kObjectGlobalRot, GeData(Vector(kQuarter + 0.25, 0, 0)));
  ExpectNear(child->GetRelRot(), {0.25, 0, 0}, "rotation");
  ExpectNear(ParameterOf(*child, kObjectGlobalRot).GetVector(), {kQuarter + 0.25, 0, 0}, "rotation parameter");
}
