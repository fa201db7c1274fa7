#include "torvane/tags/weight_tag_data.h"

namespace _torvane_
{

namespace
{

GeAliasLink* NeedLink(GeAliasLink*& link)
{
  if (!link)
    link = NewObj<GeAliasLink>();
  return link;
}

Bool CopyLink(const GeAliasLink* link, GeAliasLink*& destination, TransArray* translation)
{
  return !link || (NeedLink(destination) && link->CopyLinkTo(destination, translation));
}

} // namespace

JointRecord::~JointRecord()
{
  FlushEntries();
  DeleteObj(joint);
  DeleteObj(second);
}

GeAliasLink* JointRecord::NeedJoint() { return NeedLink(joint); }

GeAliasLink* JointRecord::NeedSecond() { return NeedLink(second); }

JointEntry* JointRecord::AddEntry()
{
  JointEntry* entry = NewObj<JointEntry>();
  if (entry && !entries.Append(entry))
    DeleteObj(entry);
  return entry;
}

void JointRecord::FlushEntries()
{
  for (JointEntry* entry : entries)
    DeleteObj(entry);
  entries.Flush();
}

Bool JointRecord::CopyTo(JointRecord& destination, TransArray* translation) const
{
  static_cast<JointPose&>(destination) = *this;
  if (!CopyLink(joint, destination.joint, translation) || !CopyLink(second, destination.second, translation) ||
      !weights.CopyTo(destination.weights) || !pairs.CopyTo(destination.pairs))
    return false;
  destination.FlushEntries();
  for (const JointEntry* entry : entries) {
    JointEntry* copy = destination.AddEntry();
    if (!copy || !entry->link.CopyLinkTo(&copy->link, translation))
      return false;
    copy->number = entry->number;
    copy->value = entry->value;
  }
  return true;
}

} // namespace _torvane_
