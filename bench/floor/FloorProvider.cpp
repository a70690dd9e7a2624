// The least that a provider of the same instances can cost: finished texts in a flat array, handed to the
// object manager by the same CMPI calls, with no walk, no model, no framework and no trace between.
#include <agent/framework/InventoryFile.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <cstdlib>
#include <string>
#include <vector>

namespace {

const CMPIBroker* broker = nullptr;

struct Record {
  std::string instanceId;
  std::string description;
  std::string name;
  std::string version;
  std::string buildId;
  std::string manufacturer;
  std::string date;
  unsigned short majorVersion = 0;
  unsigned short minorVersion = 0;
  unsigned short classification = 0;
  const char* classificationText = "";
};

/// The CIM datetime of a month/day/year text, at UTC.
std::string dateTime(std::string_view date) {
  std::string text(date.substr(6, 4));
  return text.append(date.substr(0, 2)).append(date.substr(3, 2)).append("000000.000000+000");
}

Record recordOf(const agent::NodeTree& tree, agent::NodeTree::Index node) {
  using namespace Oru::NodeLexicon;  // NOLINT(google-build-using-namespace)
  const bool driver = tree.type(node) == DriverNode;
  const auto text = [&](int property) { return std::string(tree.text(node, property).value_or("")); };
  Record record;
  record.instanceId =
      std::to_string(tree.number(tree.parent(node))) + "@" + agent::pathText(tree.number(node));
  record.description = tree.description(node);
  record.name = text(NameProperty);
  record.version = text(driver ? DriverVersionProperty : VersionStringProperty);
  record.buildId = text(BuildIdProperty);
  record.manufacturer = text(ManufacturerProperty);
  record.date = dateTime(text(ReleaseDateProperty));
  record.majorVersion = static_cast<unsigned short>(tree.value(node, MajorVersionProperty).value_or(0));
  record.minorVersion = static_cast<unsigned short>(tree.value(node, MinorVersionProperty).value_or(0));
  record.classification = driver ? 2 : 10;
  record.classificationText = driver ? "Driver" : "Firmware";
  return record;
}

const std::vector<Record>& records() {
  static const std::vector<Record> all = [] {
    const agent::NodeTree tree = agent::readInventoryFile(std::getenv("ORU_INVENTORY"));
    std::vector<Record> made;
    for (const int type : {3, 2, 44}) {
      for (const agent::NodeTree::Index node : tree.ofType(type)) {
        made.push_back(recordOf(tree, node));
      }
    }
    return made;
  }();
  return all;
}

void setText(CMPIInstance* instance, const char* name, const std::string& text) {
  if (!text.empty()) {
    CMSetProperty(instance, name, reinterpret_cast<const CMPIValue*>(text.c_str()), CMPI_chars);
  }
}

void setNumber(CMPIInstance* instance, const char* name, unsigned short number) {
  CMPIValue value{};
  value.uint16 = number;
  CMSetProperty(instance, name, &value, CMPI_uint16);
}

void setDate(CMPIInstance* instance, const char* name, const std::string& date) {
  CMPIValue value{};
  value.dateTime = CMNewDateTimeFromChars(broker, date.c_str(), nullptr);
  CMSetProperty(instance, name, &value, CMPI_dateTime);
}

void setArray(CMPIInstance* instance, const char* name, CMPIType arrayOf, const CMPIValue* element,
              CMPIType type) {
  CMPIValue value{};
  value.array = CMNewArray(broker, 1, arrayOf, nullptr);
  CMSetArrayElementAt(value.array, 0, element, type);
  CMSetProperty(instance, name, &value, static_cast<CMPIType>(arrayOf | CMPI_ARRAY));
}

CMPIObjectPath* makePath(const Record& record, const char* nameSpace) {
  CMPIObjectPath* path = CMNewObjectPath(broker, nameSpace, "KELVO_SoftwareIdentity", nullptr);
  CMAddKey(path, "InstanceID", reinterpret_cast<const CMPIValue*>(record.instanceId.c_str()), CMPI_chars);
  return path;
}

CMPIInstance* makeInstance(const Record& record, const char* nameSpace) {
  CMPIInstance* instance = CMNewInstance(broker, makePath(record, nameSpace), nullptr);
  setText(instance, "Description", record.description);
  setDate(instance, "InstallDate", record.date);
  setText(instance, "Name", record.name);
  setText(instance, "InstanceID", record.instanceId);
  setNumber(instance, "MajorVersion", record.majorVersion);
  setNumber(instance, "MinorVersion", record.minorVersion);
  setText(instance, "VersionString", record.version);
  setText(instance, "BuildID", record.buildId);
  setText(instance, "Manufacturer", record.manufacturer);
  CMPIValue classification{};
  classification.uint16 = record.classification;
  setArray(instance, "Classifications", CMPI_uint16, &classification, CMPI_uint16);
  setArray(instance, "ClassificationDescriptions", CMPI_string,
           reinterpret_cast<const CMPIValue*>(record.classificationText), CMPI_chars);
  setDate(instance, "ReleaseDate", record.date);
  return instance;
}

CMPIStatus ok() {
  return {CMPI_RC_OK, nullptr};
}

const char* nameSpaceOf(const CMPIObjectPath* path) {
  return CMGetCharPtr(CMGetNameSpace(path, nullptr));
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean) {
  return ok();
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* path) {
  const char* nameSpace = nameSpaceOf(path);
  for (const Record& record : records()) {
    CMReturnObjectPath(result, makePath(record, nameSpace));
  }
  CMReturnDone(result);
  return ok();
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                              const CMPIObjectPath* path, const char**) {
  const char* nameSpace = nameSpaceOf(path);
  for (const Record& record : records()) {
    CMReturnInstance(result, makeInstance(record, nameSpace));
  }
  CMReturnDone(result);
  return ok();
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* path, const char**) {
  const std::string wanted(CMGetCharPtr(CMGetKey(path, "InstanceID", nullptr).value.string));
  const char* nameSpace = nameSpaceOf(path);
  for (const Record& record : records()) {
    if (record.instanceId == wanted) {
      CMReturnInstance(result, makeInstance(record, nameSpace));
    }
  }
  CMReturnDone(result);
  return ok();
}

CMPIInstanceMIFT table = {
    CMPICurrentVersion,
    CMPICurrentVersion,
    "instanceFloorProvider",
    cleanup,
    enumerateInstanceNames,
    enumerateInstances,
    getInstance,
    nullptr,
    nullptr,
    nullptr,
    nullptr,
};
CMPIInstanceMI mi = {nullptr, &table};

}  // namespace

extern "C" [[gnu::visibility("default")]] CMPIInstanceMI* FloorProvider_Create_InstanceMI(
    const CMPIBroker* newBroker, const CMPIContext*, CMPIStatus*) {
  broker = newBroker;
  return &mi;
}
