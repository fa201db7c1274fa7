#include "host/standalone_host.h"

#include <algorithm>
#include <new>
#include <utility>

#include "host/suites/host_state.h"
#include "host/text.h"

namespace host
{

namespace
{

constexpr AEGP_PluginID kFirstPluginId = 1; // before the plug-in registers itself
constexpr A_long kHostMajorVersion = 118;
constexpr A_long kHostMinorVersion = 0;

// A plug-in may throw its error through the host. A lack of memory of the host's own goes past the plug-in to the
// program that plays the host.
template <class Body>
A_Err CallPlugin(HostState& state, Body&& body)
{
  A_Err result = 0;
  try {
    result = body();
  } catch (int error) {
    result = error;
  }
  if (std::exchange(state.outOfMemory, false))
    throw std::bad_alloc();
  return result;
}

} // namespace

// --- State

HostState*& HostState::Current()
{
  thread_local HostState* current = nullptr;
  return current;
}

A_Err HostState::Fail(const char* operation, const char* reason, A_Err error)
{
  lastError = std::string(operation) + ": " + reason;
  return error;
}

namespace
{

AEGP_MemHandle AddBlock(HostState& state, const void* bytes, std::size_t size)
{
  auto block = std::make_unique<MemoryBlock>();
  const char* first = static_cast<const char*>(bytes);
  block->bytes.assign(first, first + size);
  MemoryBlock* handle = block.get();
  state.blocks.emplace(handle, std::move(block));
  ++state.balance.memoryHandles;
  return reinterpret_cast<AEGP_MemHandle>(handle);
}

} // namespace

AEGP_MemHandle HostState::NewUtf16(std::string_view utf8)
{
  const std::u16string text = ToUtf16(utf8);
  return AddBlock(*this, text.c_str(), (text.size() + 1) * sizeof(char16_t));
}

AEGP_MemHandle HostState::NewUtf8(std::string_view utf8)
{
  const std::string text(utf8);
  return AddBlock(*this, text.c_str(), text.size() + 1);
}

MemoryBlock* HostState::FindBlock(AEGP_MemHandle handle)
{
  const auto found = blocks.find(handle);
  return found == blocks.end() ? nullptr : found->second.get();
}

// --- The host

StandaloneHost::StandaloneHost(Project project) : state_(std::make_unique<HostState>())
{
  state_->project = std::move(project);
  if (state_->project.root)
    state_->active = state_->project.root->item;
  state_->previous = std::exchange(HostState::Current(), state_.get());
}

StandaloneHost::~StandaloneHost()
{
  // Hosts may go in any order.
  HostState** link = &HostState::Current();
  while (*link && *link != state_.get())
    link = &(*link)->previous;
  if (*link)
    *link = state_->previous;
}

const Project& StandaloneHost::GetProject() const { return state_->project; }
SPBasicSuite* StandaloneHost::Basic() const { return TheBasicSuite(); }

bool StandaloneHost::ActivateComposition(std::string_view nameOrId)
{
  const Composition* composition = FindComposition(state_->project, nameOrId);
  if (composition)
    state_->active = composition->item;
  return composition != nullptr;
}

void StandaloneHost::Activate(const Item* item) { state_->active = item; }
void StandaloneHost::SetOutputPath(std::string path) { state_->outputPath = std::move(path); }
void StandaloneHost::OnAskOverwrite(std::function<bool()> ask) { state_->askOverwrite = std::move(ask); }
void StandaloneHost::OnReport(std::function<void(const std::string&)> report) { state_->report = std::move(report); }
void StandaloneHost::OnProgress(std::function<void(double)> progress) { state_->progress.Listen(std::move(progress)); }

A_Err StandaloneHost::Start(AEGP_EntryPoint entry)
{
  AEGP_GlobalRefcon refcon = nullptr;
  return CallPlugin(*state_,
                    [&] { return entry(Basic(), kHostMajorVersion, kHostMinorVersion, kFirstPluginId, &refcon); });
}

void StandaloneHost::TakePlugin(const StandaloneHost& started) { static_cast<PluginState&>(*state_) = *started.state_; }

A_Err StandaloneHost::CallMenuHook()
{
  for (const MenuHook& hook : state_->menuHooks) {
    const A_Err error = CallPlugin(*state_, [&] { return hook.call(nullptr, hook.refcon, 0); });
    if (error)
      return error;
  }
  return 0;
}

CommandResult StandaloneHost::CallCommandHook(AEGP_Command command, bool alreadyHandled)
{
  CommandResult result;
  if (state_->active && state_->active->composition)
    state_->progress.Start(*state_->active->composition);
  for (const Hook& hook : state_->hooks) {
    if (hook.command != AEGP_Command_ALL && hook.command != command)
      continue;
    A_Boolean handled = 0;
    const A_Boolean before = alreadyHandled || result.isHandled;
    result.error =
        CallPlugin(*state_, [&] { return hook.call(nullptr, hook.refcon, command, hook.priority, before, &handled); });
    result.isHandled = result.isHandled || handled;
    if (result.error)
      break;
  }
  return result;
}

const std::vector<MenuEntry>& StandaloneHost::MenuEntries() const { return state_->menu; }

AEGP_Command StandaloneHost::FindCommand(std::string_view menuEntry) const
{
  const auto found = std::find_if(state_->menu.begin(), state_->menu.end(),
                                  [&](const MenuEntry& entry) { return entry.name == menuEntry; });
  return found == state_->menu.end() ? 0 : found->command;
}

bool StandaloneHost::IsCommandEnabled(AEGP_Command command) const
{
  const auto index = static_cast<std::size_t>(command) - 1; // a huge one for 0 and below
  return index < state_->isEnabled.size() && state_->isEnabled[index];
}

const std::string& StandaloneHost::PluginName() const { return state_->pluginName; }
AEGP_PluginID StandaloneHost::RegisteredPlugin() const { return state_->plugin; }

HostBalance StandaloneHost::Balance() const { return state_->balance; }
std::uint64_t StandaloneHost::CallCount() const { return state_->calls; }

void StandaloneHost::FailCall(std::uint64_t n, A_Err error)
{
  state_->failAt = n;
  state_->failWith = error;
}

void StandaloneHost::RefuseSuite(std::string name, std::int32_t version)
{
  state_->refused.emplace_back(std::move(name), version);
}

void StandaloneHost::WithholdCommand() { state_->withholdsCommand = true; }
const std::string& StandaloneHost::LastError() const { return state_->lastError; }
const std::vector<std::string>& StandaloneHost::Reports() const { return state_->reports; }

} // namespace host
