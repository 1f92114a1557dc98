// The tables of the locator and descriptor classes, for the sources of
// their derived classes.
#ifndef ZELTA_METADATA_DESCRIPTOR_TABLES_H
#define ZELTA_METADATA_DESCRIPTOR_TABLES_H

#include "metadata.h"
#include "metadata/property_table.h"

namespace zelta {

// The tables of the locator and descriptor classes, declared before any
// factory of a derived class uses them.
template <>
const PropertyTable<GenericLocator>& propertyTable<GenericLocator>();
template <>
const PropertyTable<NetworkLocator>& propertyTable<NetworkLocator>();
template <>
const PropertyTable<TextLocator>& propertyTable<TextLocator>();
template <>
const PropertyTable<SubDescriptor>& propertyTable<SubDescriptor>();
template <>
const PropertyTable<ContainerConstraintsSubDescriptor>& propertyTable<ContainerConstraintsSubDescriptor>();
template <>
const PropertyTable<GenericDescriptor>& propertyTable<GenericDescriptor>();
template <>
const PropertyTable<FileDescriptor>& propertyTable<FileDescriptor>();
template <>
const PropertyTable<PictureDescriptor>& propertyTable<PictureDescriptor>();
template <>
const PropertyTable<CDCIPictureDescriptor>& propertyTable<CDCIPictureDescriptor>();
template <>
const PropertyTable<RGBAPictureDescriptor>& propertyTable<RGBAPictureDescriptor>();
template <>
const PropertyTable<SoundDescriptor>& propertyTable<SoundDescriptor>();
template <>
const PropertyTable<DataDescriptor>& propertyTable<DataDescriptor>();
template <>
const PropertyTable<MultipleDescriptor>& propertyTable<MultipleDescriptor>();

}  // namespace zelta

#endif
