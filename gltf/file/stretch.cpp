#include "gltf/file/stretch.h"

#include <limits>
#include <stdexcept>

namespace gltf
{

bool TemporaryStore::Append(std::string_view bytes, long& place)
{
  if (takes_ && !file_)
    file_.reset(std::tmpfile());
  takes_ = takes_ && file_ && bytes.size() <= static_cast<std::size_t>(std::numeric_limits<long>::max() - size_) &&
           std::fseek(file_.get(), size_, SEEK_SET) == 0 &&
           std::fwrite(bytes.data(), 1, bytes.size(), file_.get()) == bytes.size() && std::fflush(file_.get()) == 0;
  if (takes_) {
    place = size_;
    size_ += static_cast<long>(bytes.size());
  }
  return takes_;
}

void TemporaryStore::Read(long place, char* bytes, std::size_t size) const
{
  if (std::fseek(file_.get(), place, SEEK_SET) != 0 || std::fread(bytes, 1, size, file_.get()) != size)
    throw std::runtime_error("what was put by in a temporary file can't be read again");
}

void Stretch::Append(std::string_view bytes)
{
  bytes_ += bytes;
  size_ += bytes.size();
}

void Stretch::PutBy(std::shared_ptr<TemporaryStore>& store)
{
  if (!store)
    store = std::make_shared<TemporaryStore>();
  if (store_ || !store->Append(bytes_, place_))
    return;
  store_ = store;
  std::string().swap(bytes_); // assigning an empty one keeps the block
}

std::string_view Stretch::Get(std::size_t offset, std::size_t size, std::string& buffer) const
{
  if (!store_)
    return std::string_view(bytes_).substr(offset, size);
  buffer.resize(size);
  store_->Read(place_ + static_cast<long>(offset), buffer.data(), size);
  return buffer;
}

} // namespace gltf
