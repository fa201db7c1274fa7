// Nodes with children.
#include "torvane/nodes/base_list.h"
#include "torvane/nodes/root_list.h"

namespace _torvane_
{

BaseList4D::~BaseList4D() { DeleteObj(children_); }

void BaseList4D::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  BaseList2D::SetDocument(document);
  if (children_)
    SetDocumentOfMembers(children_, document);
}

BaseList4D* BaseList4D::GetUp() const { return listHead_ ? NodeCast<BaseList4D>(listHead_->GetOwner()) : nullptr; }

BaseList4D* BaseList4D::GetDown() const { return children_ ? NodeCast<BaseList4D>(children_->GetFirst()) : nullptr; }

BaseList4D* BaseList4D::GetDownLast() const { return children_ ? NodeCast<BaseList4D>(children_->GetLast()) : nullptr; }

void BaseList4D::InsertBefore(BaseList4D* reference)
{
  if (reference && reference->listHead_)
    reference->listHead_->InsertBefore(this, reference);
}

void BaseList4D::InsertAfter(BaseList4D* reference)
{
  if (reference && reference->listHead_)
    reference->listHead_->InsertAfter(this, reference);
}

RootList2D* BaseList4D::GetChildRoot()
{
  if (!children_ && (children_ = AllocChildRoot()))
    children_->SetOwner(this);
  return children_;
}

Bool BaseList4D::InsertUnder(BaseList4D* parent)
{
  return parent && parent->GetChildRoot() && parent->children_->InsertFirst(this);
}

Bool BaseList4D::InsertUnderLast(BaseList4D* parent)
{
  return parent && parent->GetChildRoot() && parent->children_->InsertLast(this);
}

} // namespace _torvane_
