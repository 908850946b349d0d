#include <algorithm>
#include <optional>

#include "host/command/Angles.h"
#include "host/command/Targets.h"
#include "host/scene/CalibrationMgr.h"
#include "host/scene/Clips.h"
#include "host/scene/Devices.h"

namespace {

class CreateCmd final : public ScriptCommand<CreateCmd> {
 public:
  static constexpr CommandInfo info = {
      .name = "create",
      .displayName = "Create Object",
      .category = "Data Editing",
      .purpose = "Creates modules of a type, one for each name.",
      .example = "create SolvingBone Foot -parent Knee -preTranslation <0 300 0>",
      .args = {"moduleType \"name1\" [\"name2\"] ...", 2, ArgsInfo::kAny, {}, Variable::String},
      .argsText =
          "moduleType is a class such as Marker, Character, SolvingBone or Clip. Taken names get a number. "
          "The new modules become the selection.",
      .options = {{"addSelect", "keeps the former selection beside the new modules"},
                  {"parent", "path of the module to make them below; without it they are roots", 1,
                   Variable::String},
                  {"positionOffset", "deprecated: the same as -preTranslation", 1, Variable::Vector},
                  {"rotationOffset", "deprecated: the same as -preRotation", 1, Variable::Vector},
                  {"preTranslation", "offset from the parent in mm, default <0 0 0>; only with -parent", 1,
                   Variable::Vector},
                  {"preRotation",
                   "rotation against the parent, XYZ in degrees, default <0 0 0>; only with -parent", 1,
                   Variable::Vector},
                  {"allClips", "adds them to every clip, not only to the active one"},
                  {"multiple", "how many to make of the first name, 1 to 1000000, default 1", 1,
                   Variable::Int}},
      .solo = Solo::no};
  static constexpr int kAddSelect = info.option("addSelect"), kParent = info.option("parent"),
                       kPositionOffset = info.option("positionOffset"),
                       kRotationOffset = info.option("rotationOffset"),
                       kPreTranslation = info.option("preTranslation"),
                       kPreRotation = info.option("preRotation"), kAllClips = info.option("allClips"),
                       kMultiple = info.option("multiple");

  bool execute(Given const& given, Args const& args, Variable&) override {
    Request request;
    if (!request.read(given)) return false;
    HString const typeName = args[0].getStringValue(-1);
    HRuntimeClass* type = typeToCreate(typeName);
    if (!type) return false;

    TSimpleArray<Module*> const created = makeModules(type, args, request);
    if (created.getCount() == 0) {
      logError("Unknown module type name: %s", typeName.GetStr());  // kept: whatever the reason was
      return false;
    }

    if (!request.addSelect) g_db->selectAllModules(false);
    for (Module* module : created) {
      for (NLEClip* clip : request.inactiveClips) module->addToClip(clip);
      module->setSelected(true);
    }
    return true;
  }

 private:
  static constexpr int kMostCopies = 1'000'000;

  // What the options ask for.
  struct Request {
    bool addSelect = false;
    Module* parent = nullptr;
    Vec3 preTranslation, preRotation;  // the rotation in degrees
    TSimpleArray<NLEClip*> inactiveClips;
    int multiple = 0;

    // In the order given. False, with a message, for a parent that is not there and a count that is too
    // large.
    bool read(Given const& given) {
      for (CommandOption const& option : given) {
        Variable const* arg = option.getArgCount() ? &option.getArg(0) : nullptr;
        switch (option.getIndex()) {
          case kAddSelect:
            addSelect = true;
            break;
          case kParent:
            parent = moduleAt(arg->getStringValue(-1), "-parent path of %s is invalid");
            if (!parent) return false;
            break;
          case kPositionOffset:
            g_db->logInfo("-positionOffset is deprecated. It has been replaced with -preTranslation.");
            [[fallthrough]];
          case kPreTranslation:
            preTranslation = arg->getVecValue(-1);
            break;
          case kRotationOffset:
            g_db->logInfo("-rotationOffset is deprecated. It has been replaced with -preRotation.");
            [[fallthrough]];
          case kPreRotation:
            preRotation = arg->getVecValue(-1);
            break;
          case kAllClips:
            for (NLEClip* clip = g_db->getHeadClip(); clip; clip = clip->getNext())
              if (!clip->isActive()) inactiveClips.add(clip);
            break;
          case kMultiple:
            multiple = arg->getIntValue(-1);
            if (multiple > kMostCopies) {
              logError("-multiple is at most %d, not %d.", kMostCopies, multiple);
              return false;
            }
            break;
          default:
            break;
        }
      }
      return true;
    }

    // kept: only below a given parent, else the offsets are passed over.
    void place(Node& node) const {
      node.setPreRotation(rotationFromDegrees(preRotation, TalixRotation::XYZ), false);
      node.setPreTranslation(preTranslation);
    }
  };

  // The class of modules of that name when the scene takes one more. Without it logs why and returns null.
  static HRuntimeClass* typeToCreate(HString const& name) {
    HRuntimeClass* type = HRuntimeClass::findClass(name.GetStr());
    if (!type || !type->isDerivedFrom(&Module::s_classModule) || !type->getCreateFunction()) {
      logError("Unknown module type name: %s", name.GetStr());
      return nullptr;
    }
    if (type->isDerivedFrom(&NLEClip::s_classNLEClip) && g_db->getNumClips() >= NLEClip::kMaximum) {
      logError("Maximum number of NLE objects has been reached. Cannot create anymore %s.", name.GetStr());
      return nullptr;
    }
    if (type->isSingleInstance() && g_db->moduleOfTypeExists(type)) {
      logError("Cannot create more than one object of type %s.", name.GetStr());
      return nullptr;
    }
    return type;
  }

  static TSimpleArray<Module*> makeModules(HRuntimeClass* type, Args const& args, Request const& request) {
    TSimpleArray<Module*> created;
    std::optional<FreeDeviceNumbers> deviceNumbers;  // once for all cameras
    // All names once, then the first one again until there are `multiple` of it.
    int const names = args.getCount() - 1;
    for (int64 i = 0; i < names + std::max<int64>(0, int64{request.multiple} - 1); ++i) {
      char const* name = args[i < names ? static_cast<int>(i) + 1 : 1].getStringValue(-1);
      Module* module = g_db->createModule(type, name, request.parent);
      if (!module) continue;
      if (auto* node = objectAs<Node>(module); node && request.parent) request.place(*node);
      if (auto* camera = objectAs<OpticalCamera>(module); camera && !request.parent) {
        g_db->getCalibrationMgr()->addToSystemGroup(camera);
        if (!deviceNumbers) deviceNumbers.emplace(*g_db);
        camera->setDeviceID(deviceNumbers->take());
      }
      created.add(module);
    }
    return created;
  }
};

}  // namespace

Command* newCreateCmd() { return new (std::nothrow) CreateCmd; }
