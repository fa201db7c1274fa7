// The host's suite tables: structs of C function pointers, one for each slot, in the host's order. Slots that the
// exporter never calls are untyped and only keep the order. Every used slot's place is asserted behind its table.
#pragma once

#include "exporter/host_api/aegp_types.h"

// Asserts that `operation` stands in slot `slot` of `suite`.
#define AEGP_ASSERT_SLOT(suite, slot, operation)                                                                       \
  static_assert(offsetof(suite, operation) == (slot) * sizeof(void*), #suite ": " #operation)
#define AEGP_ASSERT_SLOTS(suite, count) static_assert(sizeof(suite) == (count) * sizeof(void*), #suite)

// Names and versions as AcquireSuite takes them.
inline constexpr const char* kAEGPCommandSuite = "AEGP Command Suite";
inline constexpr const char* kAEGPRegisterSuite = "AEGP Register Suite";
inline constexpr const char* kAEGPUtilitySuite = "AEGP Utility Suite";
inline constexpr const char* kAEGPMemorySuite = "AEGP Memory Suite";
inline constexpr const char* kAEGPItemSuite = "AEGP Item Suite";
inline constexpr const char* kAEGPCompSuite = "AEGP Comp Suite";
inline constexpr const char* kAEGPLayerSuite = "AEGP Layer Suite";
inline constexpr const char* kAEGPStreamSuite = "AEGP Stream Suite";
inline constexpr const char* kAEGPKeyframeSuite = "AEGP Keyframe Suite";
inline constexpr const char* kAEGPFootageSuite = "AEGP Footage Suite";
inline constexpr const char* kAEGPCameraSuite = "AEGP Camera Suite";
inline constexpr const char* kAEGPLightSuite = "AEGP Light Suite";

inline constexpr std::int32_t kAEGPCommandSuiteVersion1 = 1;
inline constexpr std::int32_t kAEGPRegisterSuiteVersion6 = 6;
inline constexpr std::int32_t kAEGPUtilitySuiteVersion11 = 11;
inline constexpr std::int32_t kAEGPMemorySuiteVersion1 = 1;
inline constexpr std::int32_t kAEGPItemSuiteVersion13 = 13;
inline constexpr std::int32_t kAEGPCompSuiteVersion15 = 15;
inline constexpr std::int32_t kAEGPLayerSuiteVersion13 = 13;
inline constexpr std::int32_t kAEGPStreamSuiteVersion9 = 9;
inline constexpr std::int32_t kAEGPStreamSuiteVersion7 = 7;
inline constexpr std::int32_t kAEGPKeyframeSuiteVersion4 = 4;
inline constexpr std::int32_t kAEGPFootageSuiteVersion11 = 11;
inline constexpr std::int32_t kAEGPCameraSuiteVersion2 = 2;
inline constexpr std::int32_t kAEGPLightSuiteVersion2 = 2;

extern "C" {

// Called for every command that the hook is registered for; `*handled` is set to tell the host that it was handled.
using AEGP_CommandHook = A_Err (*)(AEGP_GlobalRefcon refcon, AEGP_CommandRefcon commandRefcon, AEGP_Command command,
                                   AEGP_HookPriority priority, A_Boolean alreadyHandled, A_Boolean* handled);
// Called before the host shows its menus.
using AEGP_UpdateMenuHook = A_Err (*)(AEGP_GlobalRefcon refcon, AEGP_UpdateMenuRefcon menuRefcon,
                                      AEGP_WindowType window);

struct SPBasicSuite
{
  SPErr (*AcquireSuite)(const char* name, std::int32_t version, const void** suite);
  SPErr (*ReleaseSuite)(const char* name, std::int32_t version);
  void* IsEqual;
  void* AllocateBlock;
  void* FreeBlock;
  void* ReallocateBlock;
  void* Undefined;
};

struct AEGP_CommandSuite1
{
  A_Err (*AEGP_GetUniqueCommand)(AEGP_Command* command);
  A_Err (*AEGP_InsertMenuCommand)(AEGP_Command command, const A_char* name, AEGP_MenuID menu, A_long afterItem);
  void* unused2To3[2];
  A_Err (*AEGP_EnableCommand)(AEGP_Command command);
  A_Err (*AEGP_DisableCommand)(AEGP_Command command);
  void* unused6To7[2];
};

struct AEGP_RegisterSuite6
{
  A_Err (*AEGP_RegisterCommandHook)(AEGP_PluginID plugin, AEGP_HookPriority priority, AEGP_Command command,
                                    AEGP_CommandHook hook, AEGP_CommandRefcon refcon);
  A_Err (*AEGP_RegisterUpdateMenuHook)(AEGP_PluginID plugin, AEGP_UpdateMenuHook hook, AEGP_UpdateMenuRefcon refcon);
  void* unused2To11[10];
};

struct AEGP_UtilitySuite11
{
  A_Err (*AEGP_ReportInfo)(AEGP_PluginID plugin, const A_char* text);
  void* unused1To7[7];
  A_Err (*AEGP_RegisterWithAEGP)(AEGP_GlobalRefcon refcon, const A_char* name, AEGP_PluginID* plugin);
  void* unused9To26[18];
  // `result` and `error` may be null. With a platform encoding of 0 the texts are UTF-8.
  A_Err (*AEGP_ExecuteScript)(AEGP_PluginID plugin, const A_char* script, A_Boolean platformEncoding,
                              AEGP_MemHandle* result, AEGP_MemHandle* error);
  void* unused28To30[3];
};

struct AEGP_MemorySuite1
{
  void* unused0;
  A_Err (*AEGP_FreeMemHandle)(AEGP_MemHandle handle);
  A_Err (*AEGP_LockMemHandle)(AEGP_MemHandle handle, void** data);
  A_Err (*AEGP_UnlockMemHandle)(AEGP_MemHandle handle);
  void* unused4To7[4];
};

struct AEGP_ItemSuite13
{
  void* unused0To1[2];
  A_Err (*AEGP_GetActiveItem)(AEGP_ItemH* item);
  void* unused3To4[2];
  A_Err (*AEGP_GetItemType)(AEGP_ItemH item, AEGP_ItemType* type);
  void* unused6;
  A_Err (*AEGP_GetItemName)(AEGP_PluginID plugin, AEGP_ItemH item, AEGP_MemHandle* utf16Name);
  void* unused8To15[8];
  A_Err (*AEGP_GetItemDimensions)(AEGP_ItemH item, A_long* width, A_long* height);
  A_Err (*AEGP_GetItemPixelAspectRatio)(AEGP_ItemH item, A_Ratio* ratio);
  void* unused18To26[9];
};

struct AEGP_CompSuite15
{
  A_Err (*AEGP_GetCompFromItem)(AEGP_ItemH item, AEGP_CompH* comp);
  void* unused1To6[6];
  A_Err (*AEGP_GetCompFramerate)(AEGP_CompH comp, A_FpLong* framesPerSecond);
  void* unused8To12[5];
  A_Err (*AEGP_GetCompWorkAreaStart)(AEGP_CompH comp, A_Time* start);
  A_Err (*AEGP_GetCompWorkAreaDuration)(AEGP_CompH comp, A_Time* duration);
  void* unused15To29[15];
  A_Err (*AEGP_GetCompFrameDuration)(AEGP_CompH comp, A_Time* duration);
  void* unused31To33[3];
};

struct AEGP_LayerSuite13
{
  A_Err (*AEGP_GetCompNumLayers)(AEGP_CompH comp, A_long* count);
  A_Err (*AEGP_GetCompLayerByIndex)(AEGP_CompH comp, A_long index, AEGP_LayerH* layer);
  void* unused2To3[2];
  A_Err (*AEGP_GetLayerSourceItem)(AEGP_LayerH layer, AEGP_ItemH* item);
  void* unused5To6[2];
  // Either name may be null.
  A_Err (*AEGP_GetLayerName)(AEGP_PluginID plugin, AEGP_LayerH layer, AEGP_MemHandle* utf16LayerName,
                             AEGP_MemHandle* utf16SourceName);
  void* unused8To9[2];
  A_Err (*AEGP_GetLayerFlags)(AEGP_LayerH layer, AEGP_LayerFlags* flags);
  void* unused11To27[17];
  A_Err (*AEGP_GetLayerObjectType)(AEGP_LayerH layer, AEGP_ObjectType* type);
  A_Err (*AEGP_IsLayer3D)(AEGP_LayerH layer, A_Boolean* is3D);
  void* unused30To36[7];
  A_Err (*AEGP_GetLayerID)(AEGP_LayerH layer, AEGP_LayerIDVal* id);
  void* unused38To40[3];
  // Null when the layer has no parent.
  A_Err (*AEGP_GetLayerParent)(AEGP_LayerH layer, AEGP_LayerH* parent);
  void* unused42To47[6];
};

struct AEGP_StreamSuite9
{
  A_Err (*AEGP_IsStreamLegal)(AEGP_LayerH layer, AEGP_LayerStream which, A_Boolean* isLegal);
  void* unused1To2[2];
  A_Err (*AEGP_GetNewLayerStream)(AEGP_PluginID plugin, AEGP_LayerH layer, AEGP_LayerStream which,
                                  AEGP_StreamRefH* stream);
  void* unused4To6[3];
  A_Err (*AEGP_DisposeStream)(AEGP_StreamRefH stream);
  void* unused8To10[3];
  A_Err (*AEGP_IsStreamTimevarying)(AEGP_StreamRefH stream, A_Boolean* isTimevarying);
  A_Err (*AEGP_GetStreamType)(AEGP_StreamRefH stream, AEGP_StreamType* type);
  A_Err (*AEGP_GetNewStreamValue)(AEGP_PluginID plugin, AEGP_StreamRefH stream, AEGP_LTimeMode mode, const A_Time* time,
                                  A_Boolean preExpression, AEGP_StreamValue2* value);
  A_Err (*AEGP_DisposeStreamValue)(AEGP_StreamValue2* value);
  void* unused15To16[2];
  A_Err (*AEGP_GetExpressionState)(AEGP_PluginID plugin, AEGP_StreamRefH stream, A_Boolean* isOn);
  void* unused18To21[4];
};

struct AEGP_StreamSuite7
{
  A_Err (*AEGP_IsStreamLegal)(AEGP_LayerH layer, AEGP_LayerStream which, A_Boolean* isLegal);
  void* unused1To21[21];
};

struct AEGP_KeyframeSuite4
{
  A_Err (*AEGP_GetStreamNumKFs)(AEGP_StreamRefH stream, A_long* count);
  void* unused1To19[19];
};

struct AEGP_FootageSuite11
{
  A_Err (*AEGP_GetMainFootageFromItem)(AEGP_ItemH item, AEGP_FootageH* footage);
  void* unused1;
  A_Err (*AEGP_GetFootageNumFiles)(AEGP_FootageH footage, A_long* mainFiles, A_long* filesPerFrame);
  A_Err (*AEGP_GetFootagePath)(AEGP_FootageH footage, A_long frame, A_long file, AEGP_MemHandle* utf16Path);
  A_Err (*AEGP_GetFootageSignature)(AEGP_FootageH footage, AEGP_FootageSignature* signature);
  void* unused5To15[11];
  A_Err (*AEGP_GetSolidFootageColor)(AEGP_ItemH item, A_Boolean proxy, AEGP_ColorVal* color);
  void* unused17To20[4];
};

struct AEGP_CameraSuite2
{
  void* unused0;
  A_Err (*AEGP_GetCameraType)(AEGP_LayerH layer, AEGP_CameraType* type);
  void* unused2;
  // The size is in pixels.
  A_Err (*AEGP_GetCameraFilmSize)(AEGP_LayerH layer, AEGP_FilmSizeUnits* units, A_FpLong* size);
  void* unused4;
};

struct AEGP_LightSuite2
{
  A_Err (*AEGP_GetLightType)(AEGP_LayerH layer, AEGP_LightType* type);
  void* unused1;
};

} // extern "C"

AEGP_ASSERT_SLOTS(SPBasicSuite, 7);
AEGP_ASSERT_SLOT(SPBasicSuite, 0, AcquireSuite);
AEGP_ASSERT_SLOT(SPBasicSuite, 1, ReleaseSuite);

AEGP_ASSERT_SLOTS(AEGP_CommandSuite1, 8);
AEGP_ASSERT_SLOT(AEGP_CommandSuite1, 0, AEGP_GetUniqueCommand);
AEGP_ASSERT_SLOT(AEGP_CommandSuite1, 1, AEGP_InsertMenuCommand);
AEGP_ASSERT_SLOT(AEGP_CommandSuite1, 4, AEGP_EnableCommand);
AEGP_ASSERT_SLOT(AEGP_CommandSuite1, 5, AEGP_DisableCommand);

AEGP_ASSERT_SLOTS(AEGP_RegisterSuite6, 12);
AEGP_ASSERT_SLOT(AEGP_RegisterSuite6, 0, AEGP_RegisterCommandHook);
AEGP_ASSERT_SLOT(AEGP_RegisterSuite6, 1, AEGP_RegisterUpdateMenuHook);

AEGP_ASSERT_SLOTS(AEGP_UtilitySuite11, 31);
AEGP_ASSERT_SLOT(AEGP_UtilitySuite11, 0, AEGP_ReportInfo);
AEGP_ASSERT_SLOT(AEGP_UtilitySuite11, 8, AEGP_RegisterWithAEGP);
AEGP_ASSERT_SLOT(AEGP_UtilitySuite11, 27, AEGP_ExecuteScript);

AEGP_ASSERT_SLOTS(AEGP_MemorySuite1, 8);
AEGP_ASSERT_SLOT(AEGP_MemorySuite1, 1, AEGP_FreeMemHandle);
AEGP_ASSERT_SLOT(AEGP_MemorySuite1, 2, AEGP_LockMemHandle);
AEGP_ASSERT_SLOT(AEGP_MemorySuite1, 3, AEGP_UnlockMemHandle);

AEGP_ASSERT_SLOTS(AEGP_ItemSuite13, 27);
AEGP_ASSERT_SLOT(AEGP_ItemSuite13, 2, AEGP_GetActiveItem);
AEGP_ASSERT_SLOT(AEGP_ItemSuite13, 5, AEGP_GetItemType);
AEGP_ASSERT_SLOT(AEGP_ItemSuite13, 7, AEGP_GetItemName);
AEGP_ASSERT_SLOT(AEGP_ItemSuite13, 16, AEGP_GetItemDimensions);
AEGP_ASSERT_SLOT(AEGP_ItemSuite13, 17, AEGP_GetItemPixelAspectRatio);

AEGP_ASSERT_SLOTS(AEGP_CompSuite15, 34);
AEGP_ASSERT_SLOT(AEGP_CompSuite15, 0, AEGP_GetCompFromItem);
AEGP_ASSERT_SLOT(AEGP_CompSuite15, 7, AEGP_GetCompFramerate);
AEGP_ASSERT_SLOT(AEGP_CompSuite15, 13, AEGP_GetCompWorkAreaStart);
AEGP_ASSERT_SLOT(AEGP_CompSuite15, 14, AEGP_GetCompWorkAreaDuration);
AEGP_ASSERT_SLOT(AEGP_CompSuite15, 30, AEGP_GetCompFrameDuration);

AEGP_ASSERT_SLOTS(AEGP_LayerSuite13, 48);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 0, AEGP_GetCompNumLayers);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 1, AEGP_GetCompLayerByIndex);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 4, AEGP_GetLayerSourceItem);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 7, AEGP_GetLayerName);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 10, AEGP_GetLayerFlags);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 28, AEGP_GetLayerObjectType);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 29, AEGP_IsLayer3D);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 37, AEGP_GetLayerID);
AEGP_ASSERT_SLOT(AEGP_LayerSuite13, 41, AEGP_GetLayerParent);

AEGP_ASSERT_SLOTS(AEGP_StreamSuite9, 22);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 0, AEGP_IsStreamLegal);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 3, AEGP_GetNewLayerStream);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 7, AEGP_DisposeStream);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 11, AEGP_IsStreamTimevarying);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 12, AEGP_GetStreamType);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 13, AEGP_GetNewStreamValue);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 14, AEGP_DisposeStreamValue);
AEGP_ASSERT_SLOT(AEGP_StreamSuite9, 17, AEGP_GetExpressionState);

AEGP_ASSERT_SLOTS(AEGP_StreamSuite7, 22);
AEGP_ASSERT_SLOT(AEGP_StreamSuite7, 0, AEGP_IsStreamLegal);

AEGP_ASSERT_SLOTS(AEGP_KeyframeSuite4, 20);
AEGP_ASSERT_SLOT(AEGP_KeyframeSuite4, 0, AEGP_GetStreamNumKFs);

AEGP_ASSERT_SLOTS(AEGP_FootageSuite11, 21);
AEGP_ASSERT_SLOT(AEGP_FootageSuite11, 0, AEGP_GetMainFootageFromItem);
AEGP_ASSERT_SLOT(AEGP_FootageSuite11, 2, AEGP_GetFootageNumFiles);
AEGP_ASSERT_SLOT(AEGP_FootageSuite11, 3, AEGP_GetFootagePath);
AEGP_ASSERT_SLOT(AEGP_FootageSuite11, 4, AEGP_GetFootageSignature);
AEGP_ASSERT_SLOT(AEGP_FootageSuite11, 16, AEGP_GetSolidFootageColor);

AEGP_ASSERT_SLOTS(AEGP_CameraSuite2, 5);
AEGP_ASSERT_SLOT(AEGP_CameraSuite2, 1, AEGP_GetCameraType);
AEGP_ASSERT_SLOT(AEGP_CameraSuite2, 3, AEGP_GetCameraFilmSize);

AEGP_ASSERT_SLOTS(AEGP_LightSuite2, 2);
AEGP_ASSERT_SLOT(AEGP_LightSuite2, 0, AEGP_GetLightType);

#undef AEGP_ASSERT_SLOT
#undef AEGP_ASSERT_SLOTS
