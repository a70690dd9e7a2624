// The numbers of the instrumentation framework: node types, properties and path filters.
//
// The values are part of the binary contract between a framework and its users: both compare and pass them as
// numbers. A framework may know more values than are listed here; users must carry unknown ones unchanged.
#pragma once

namespace Oru::NodeLexicon {

/// Type of a node. Sensor types (`Instrumentation::getSensorType`) use the same numbers.
enum NodeType : int {
  BiosNode = 2,                  ///< BIOS element
  FirmwareNode = 3,              ///< firmware element of any kind; the description tells the kinds apart
  NetworkPortNode = 12,          ///< network port
  ComputerSystemNode = 40,       ///< computer system
  ApplicationSoftwareNode = 43,  ///< application software
  DriverNode = 44,               ///< device driver
  NetworkDeviceNode = 49,        ///< network device, the parent of its firmware and its ports
};

/// Property of a node.
enum Properties : int {
  ManufacturerProperty = 36,       ///< manufacturer (string)
  MajorVersionProperty = 104,      ///< major version (unsigned 32-bit)
  MinorVersionProperty = 107,      ///< minor version (unsigned 32-bit)
  NameProperty = 108,              ///< computer name, network port device identifier, element name (string)
  FirmwareRevisionProperty = 122,  ///< version of FPGA and baseboard firmware (string)
  DriverVersionProperty = 134,     ///< version of a driver (string)
  ReleaseDateProperty = 164,       ///< release date as month/day/year, "12/31/2010" (string)
  BuildIdProperty = 171,           ///< build identifier (string)
  ElementSoftwareStatusProperty = 281,  ///< element software status (list of unsigned 32-bit; written only)
  VersionStringProperty = 307,          ///< version of other firmware and of the BIOS (string)
};

/// What `Instrumentation::setFilter` narrows a walk to.
enum PathType : unsigned int {
  ExactPath = 0,     ///< only the node at exactly the given path
  ParentPath = 1,    ///< only nodes below the given path, at any depth
  ComputerPath = 2,  ///< only nodes below the computer at the given path, at any depth
};

}  // namespace Oru::NodeLexicon
