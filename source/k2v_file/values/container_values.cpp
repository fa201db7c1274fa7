// The values of a container by their types, with what stands for an entry that isn't there.
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

// What `get` gives of a value, or `missing` for an entry that isn't there.
template <class Value, class Default>
Value ValueOr(const GeData* data, Value (GeData::*get)() const, const Default& missing)
{
  return data ? (data->*get)() : static_cast<Value>(missing);
}

} // namespace

Bool BaseContainer::GetBool(Long id, Bool defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetBool, defaultValue);
}
Long BaseContainer::GetLong(Long id, Long defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetLong, defaultValue);
}
LLong BaseContainer::GetLLong(Long id, LLong defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetLLong, defaultValue);
}
Real BaseContainer::GetReal(Long id, Real defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetReal, defaultValue);
}
Vector BaseContainer::GetVector(Long id, const Vector& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetVector, defaultValue);
}
Matrix BaseContainer::GetMatrix(Long id, const Matrix& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetMatrix, defaultValue);
}
BaseTime BaseContainer::GetTime(Long id, const BaseTime& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetTime, defaultValue);
}
String BaseContainer::GetString(Long id, const String& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetString, defaultValue);
}
Filename BaseContainer::GetFilename(Long id, const Filename& defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetFilename, defaultValue);
}
void* BaseContainer::GetPointer(Long id, void* defaultValue) const
{
  return ValueOr(FindData(id), &GeData::GetPointer, defaultValue);
}

BaseContainer* BaseContainer::GetContainerInstance(Long id) { return GetData(id).GetContainer(); }

const BaseContainer* BaseContainer::GetContainerInstance(Long id) const { return GetData(id).GetContainer(); }

CustomData* BaseContainer::GetCustomDataType(Long id, Long type) { return GetData(id).GetCustomDataType(type); }

const CustomData* BaseContainer::GetCustomDataType(Long id, Long type) const
{
  return GetData(id).GetCustomDataType(type);
}

} // namespace _torvane_
