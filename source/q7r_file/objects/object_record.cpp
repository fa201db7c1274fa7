#include "q7r_file/objects/object_record.h"

#include <cstring>

#include "k2v_file/stream/learned_once.h"
#include "k2v_file/stream/value_forms.h"
#include "q7r_file/nodes/node_data_chunk.h"
#include "torvane/hooks.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/texture_tag.h"

namespace _torvane_
{

namespace
{

constexpr LLong kNameHead = StoredSize(kTagString); // a tag and the size

// No marker is taken from the run that happens to come first.
void SetAnyMarker(BaseList2D& node)
{
  const NodeMarker marker = {};
  node.AddUniqueID(kMarkerAppId, marker.bytes, sizeof marker.bytes);
}

Bool AddPlainTag(BaseObject& object)
{
  TextureTag* tag = NewObj<TextureTag>();
  if (!tag)
    return false;
  SetAnyMarker(*tag);
  tag->SetName(String()); // as files hold them
  object.InsertTag(tag);
  return true;
}

} // namespace

const ObjectRecord* ObjectRecord::Get() { return GetLearned<ObjectRecord>(); }

Bool ObjectRecord::Learn()
{
  const NodeRecord* node = NodeRecord::Get();
  const TextureTagRecord* tag = TextureTagRecord::Get();
  const TransformRecord* transform = TransformRecord::Get();
  if (!node || !tag || !transform)
    return false;
  node_ = *node;
  tag_ = *tag;
  transform_ = *transform;
  if (!LearnForm(withTag_, false, true) || !LearnForm(withSum_, true, false))
    return false;
  const auto ticksOf = [](const Form& form) { return form.record.GetReadTicks({0, form.record.GetSize()}); };
  ticks_ = ticksOf(withTag_) + ticksOf(withSum_);
  return true;
}

Bool ObjectRecord::LearnForm(Form& form, Bool withSum, Bool withTag)
{
  BaseObject sample(kObjectNull);
  BaseObject copy(kObjectNull);
  SetAnyMarker(sample);
  if (withSum)
    sample.GetDataInstance().SetLong(kKeyModelCheckSum, kSumOfNothing);
  return (!withTag || AddPlainTag(sample)) && form.record.Learn(sample, copy, kObjectGeneric) &&
         FindParts(form, withTag);
}

// The names, which are empty here, stand between the parts.
Bool ObjectRecord::FindParts(Form& form, Bool withTag) const
{
  PreparedRecord& record = form.record;
  const RecordPart& rest = node_.GetRestPart();
  const LLong header = record.FindChunk(kChunkNodeHeader);
  const LLong data = record.FindChunk(kChunkNodeData); // holds the type, a number, and the name
  const LLong tag = record.FindChunk(kTagTexture);
  const LLong transform = record.FindChunk(kChunkTransform);
  if (header < 0 || data < 0 || transform < 0 || (tag >= 0) != withTag)
    return false;
  form.middle = {data - PreparedRecord::kHeadSize - rest.GetSize(), data + 2 * StoredSize(kTagLong)};
  form.start = {PreparedRecord::kHeadSize, form.middle.from - kNameHead};
  form.end = {form.middle.to + kNameHead, record.GetSize(), 1};
  form.header = header - form.start.from;
  form.type = data + 1 - form.middle.from;
  form.tag = tag - form.end.from;
  form.transform = transform - form.end.from;
  record.SetNumberField(data + 1);
  return record.TakeFieldsOf(node_.GetRecord(), node_.GetFieldsPart(), header) &&
         record.TakeFieldsOf(node_.GetRecord(), rest, form.middle.from) &&
         (!withTag || record.TakeFieldsOf(tag_.GetRecord(), tag_.GetBody(), tag)) &&
         record.TakeFieldsOf(transform_.GetRecord(), transform_.GetBody(), transform);
}

// The form of which that part stands `ahead`, at `place`; null if it is none of them.
const ObjectRecord::Form* ObjectRecord::FindForm(const HyperFile& file, RecordPart Form::*part, LLong ahead,
                                                 const UChar*& place) const
{
  for (const Form* form : {&withTag_, &withSum_}) {
    place = file.NextRecord(form->record, form->*part, ahead);
    if (place)
      return form;
  }
  return nullptr;
}

Bool ObjectRecord::Find(HyperFile& file, Found& found) const
{
  const UChar* start = nullptr;
  found.head = file.MayHoldRecords(ticks_) ? FindForm(file, &Form::start, 0, start) : nullptr;
  if (!found.head)
    return false;
  const Form& head = *found.head;
  const LLong held = file.GetFile().GetReadLeft();
  LLong ahead = head.start.GetSize() + kNameHead;
  const UChar* name = start + head.start.GetSize();
  if (held < ahead || name[0] != kTagString)
    return false;
  const LLong size = bytes::GetBig<ULong>(name + 1);
  const UChar* middle = file.NextRecord(head.record, head.middle, ahead + size);
  ahead += size + head.middle.GetSize() + kNameHead + size;
  if (!middle || held < ahead ||
      std::memcmp(name, middle + head.middle.GetSize(), static_cast<std::size_t>(kNameHead + size)) != 0)
    return false;
  found.type = static_cast<Long>(bytes::GetBig<ULong>(middle + head.type));
  found.headerStart = start + head.header;
  found.headerRest = middle;
  found.hasSum = found.head == &withSum_;
  return FindEnd(file, ahead, found);
}

Bool ObjectRecord::FindEnd(const HyperFile& file, LLong ahead, Found& found) const
{
  const UChar* end = nullptr;
  found.end = FindForm(file, &Form::end, ahead, end);
  if (!found.end)
    return false;
  found.tag = found.end == &withTag_ ? end + withTag_.tag : nullptr;
  found.transform = end + found.end->transform;
  return true;
}

Bool ObjectRecord::Pass(HyperFile& file, const Found& found, String& name)
{
  const Form& head = *found.head;
  file.PassRecord(head.record, head.start);
  if (!file.ReadString(name))
    return false;
  file.PassRecord(head.record, head.middle);
  if (!file.SkipString())
    return false;
  file.PassRecord(found.end->record, found.end->end);
  return true;
}

// ---------------------------------------------------------------------------------------------------------------

// An object whose type has something of its own to read isn't of this kind.
Bool BaseObject::ReadInOnePiece(HyperFile& file)
{
  const ObjectRecord* record = file.MayHoldRecords() ? ObjectRecord::Get() : nullptr;
  ObjectRecord::Found found;
  if (!record || !record->Find(file, found))
    return false;
  Bool known = false;
  NodeData* data = AllocNodeDataFor(*this, found.type, known);
  DeleteObj(data);
  if (known || !record->Pass(file, found, name_))
    return false;
  SetType(found.type);
  TakeHeaderStart(record->GetNode(), found.headerStart);
  if (found.hasSum)
    SetModelCheckSum(kSumOfNothing);
  TakeHeaderRest(file, record->GetNode(), found.headerRest);
  TakePlainTransform(record->GetTransform(), found.transform);
  return AttachNodeData(nullptr, {*this, objectData_, raw_}) &&
         (!found.tag || tags_.TakeTextureTag(file, record->GetTag(), found.tag));
}

} // namespace _torvane_
