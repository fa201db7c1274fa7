#include "q7r_file/tags/tag_entries.h"

namespace _torvane_
{

namespace
{

void SetEntry(BaseContainer& data, Long id, const EntryDefault& row, Real number)
{
  switch (row.form) {
  case EntryForm::kBool:
    data.SetBool(id, number != 0.0);
    break;
  case EntryForm::kLong:
    data.SetLong(id, static_cast<Long>(number));
    break;
  case EntryForm::kReal:
    data.SetReal(id, number);
    break;
  case EntryForm::kTime:
    data.SetTime(id, BaseTime(number, 1.0));
    break;
  case EntryForm::kVector:
    data.SetVector(id, row.vector);
    break;
  case EntryForm::kString:
    data.SetString(id, String());
    break;
  }
}

} // namespace

void SetEntryDefaults(BaseContainer& data, const EntryDefault* rows, std::size_t count)
{
  for (const EntryDefault* row = rows; row != rows + count; ++row) {
    Real number = row->number;
    for (Long id = row->first; id <= row->last; ++id, number += row->step)
      SetEntry(data, id, *row, number);
  }
}

} // namespace _torvane_
