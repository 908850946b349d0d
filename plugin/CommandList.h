// Every script command, in the order in which the host lists them: the only list. A new command is its source
// file and one word here.
#pragma once

class Command;

// clang-format off
#define COMMANDS_1_TO_70(X) \
  X(CollapseCmd) X(CopyDataCmd) X(CopyKeysCmd) X(CreateBoneVirtsCmd) X(CreateCmd) X(CreateKeyCmd) \
  X(CutKeysCmd) X(DeleteCmd) X(DeleteCharactersCmd) X(DuplicateCmd) X(ExistsCmd) X(FindPlaneCrossingCmd) \
  X(FindSelectedKeysCmd) X(GetBooleanArrayPropertyCmd) X(GetBooleanPropertyCmd) X(GetChannelsCmd) \
  X(GetChildrenCmd) X(GetColorCmd) X(GetCountCmd) X(GetDistanceCmd) X(GetEditToolCmd) \
  X(GetFloatPropertyCmd) X(GetIntArrayPropertyCmd) X(GetIntPropertyCmd) X(GetKeysCmd) \
  X(GetMarkerConnectionCmd) X(GetConstraintOffsetCmd) X(GetLabelingClusterOffsetCmd) \
  X(GetMarkerConnectionColorCmd) X(GetModuleRangeCmd) X(GetModuleCmd) X(GetModulesCmd) X(GetModuleTypeCmd) \
  X(GetNumKeysCmd) X(GetNumModulesCmd) X(GetParentCmd) X(GetPositionCmd) X(GetPriorityCmd) \
  X(GetProfileIntCmd) X(GetProfileStringCmd) X(GetPropertyCmd) X(GetRotationCmd) X(GetScaleCmd) \
  X(GetSelectedKeysCmd) X(GetSelectedTimeRangesCmd) X(GetSolversFirstCmd) X(GetStringPropertyCmd) \
  X(GetStringArrayPropertyCmd) X(GetTimeCodeOffsetCmd) X(GetVectorPropertyCmd) X(HasKeysCmd) X(HideCmd) \
  X(IsSelectedCmd) X(MakeUniqueCmd) X(PackCmd) X(ParentCmd) X(PasteKeysCmd) X(ReduceKeysCmd) \
  X(RemoveMarkerConnectionCmd) X(SetBoneLengthCmd) X(SetEditToolCmd) X(SetInterpTypeCmd) X(SetKeyCmd) \
  X(SetMarkerConnectionCmd) X(SetPositionCmd) X(SetPriorityCmd) X(UnSetPropertyCmd) X(SetRotationCmd) \
  X(TranscodeVideoCmd) X(ResampleCmd)

#define DEVELOPER_COMMANDS_71_TO_77(X) \
  X(SetRotationAngleAxisCmd) X(GetRotationAngleAxisCmd) X(SetRotationHardyCmd) X(GetRotationHardyCmd) \
  X(SetRotationHingeCmd) X(GetRotationHingeCmd) X(CreateLotsOfDataCmd)

#define COMMANDS_78_TO_91(X) \
  X(SetScaleCmd) X(SetSolvingFirstCmd) X(SetTimeCodeOffsetCmd) X(ShowCmd) X(UnpackCmd) X(UnparentCmd) \
  X(WaitCmd) X(WriteProfileIntCmd) X(WriteProfileStringCmd) X(AddNamespaceCmd) X(RemoveNamespaceCmd) \
  X(ReplaceNamespaceCmd) X(GetNamespaceCmd) X(GetNamespacesCmd)

#define DEVELOPER_COMMAND_92(X) \
  X(testSceneReadPerformanceCmd)

#define COMMANDS_93_TO_94(X) \
  X(SetPropertyCmd) X(GetRateCmd)
// clang-format on

// new<Class>() makes the command; null when memory runs out. Each is defined beside its command.
#define DECLARE_COMMAND(Class) Command* new##Class();
COMMANDS_1_TO_70(DECLARE_COMMAND)
DEVELOPER_COMMANDS_71_TO_77(DECLARE_COMMAND)
COMMANDS_78_TO_91(DECLARE_COMMAND)
DEVELOPER_COMMAND_92(DECLARE_COMMAND)
COMMANDS_93_TO_94(DECLARE_COMMAND)
#undef DECLARE_COMMAND
