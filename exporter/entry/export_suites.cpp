#include "exporter/entry/export_suites.h"

namespace exporter
{

ExportSuites::~ExportSuites()
{
  for (const CachedSuite& cached : cache_) {
    if (cached.suite)
      basic_->ReleaseSuite(cached.entry->name, cached.entry->version);
  }
}

void ExportSuites::Acquire(const SuiteEntry& entry)
{
  const void* suite = nullptr;
  if (!basic_ || basic_->AcquireSuite(entry.name, entry.version, &suite) != 0 || !suite)
    throw kSuiteRefused;
  cache_[entry.slot] = {suite, &entry};
}

} // namespace exporter
