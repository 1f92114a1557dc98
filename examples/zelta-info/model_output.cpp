#include <cstdio>
#include <ostream>
#include <string>

#include "model.h"
#include "summary.h"

namespace zelta_info {

namespace {

void printObjectText(std::ostream& out, const ModelObject& object, const std::string& indent, const char* prefix);

// Control characters, a string's terminator among them, as JSON escapes.
std::string visible(const std::string& text) {
  std::string out;
  for (unsigned char c : text) {
    if (c >= 0x20) {
      out += static_cast<char>(c);
      continue;
    }
    char escaped[8];
    std::snprintf(escaped, sizeof escaped, "\\u%04x", c);
    out += escaped;
  }
  return out;
}

void printValueText(std::ostream& out, const std::string& name, const ModelValue& value, const std::string& indent) {
  out << indent << name << ":";
  if (value.kind == ModelValue::object) {
    out << "\n";
    printObjectText(out, *value.nested, indent + "  ", "");
    return;
  }
  if (value.kind != ModelValue::list) {
    out << " " << visible(value.scalar) << "\n";
    return;
  }
  if (value.items.empty() || value.items.front().kind != ModelValue::object) {
    out << " [";
    for (std::size_t i = 0; i < value.items.size(); ++i) out << (i ? ", " : "") << visible(value.items[i].scalar);
    out << "]\n";
    return;
  }
  out << " " << value.items.size() << (value.items.size() == 1 ? " object\n" : " objects\n");
  for (const ModelValue& item : value.items)
    if (item.kind == ModelValue::object)
      printObjectText(out, *item.nested, indent + "  ", "");
    else
      out << indent << "  " << visible(item.scalar) << "\n";
}

void printObjectText(std::ostream& out, const ModelObject& object, const std::string& indent, const char* prefix) {
  out << indent << prefix << object.className << " " << object.instanceUID << "\n";
  if (!object.failure.empty()) out << indent << "  not coded: " << object.failure << "\n";
  for (const NamedValues::value_type& property : object.properties)
    printValueText(out, property.first, property.second, indent + "  ");
  for (const NamedValues::value_type& dark : object.dark)
    printValueText(out, "dark " + dark.first, dark.second, indent + "  ");
}

void printObjectJson(std::ostream& out, const ModelObject& object);

void printValueJson(std::ostream& out, const ModelValue& value) {
  switch (value.kind) {
    case ModelValue::literal: out << value.scalar; return;
    case ModelValue::text: out << jsonString(value.scalar); return;
    case ModelValue::object: printObjectJson(out, *value.nested); return;
    case ModelValue::list: break;
  }
  out << "[";
  for (std::size_t i = 0; i < value.items.size(); ++i) {
    out << (i ? ", " : "");
    printValueJson(out, value.items[i]);
  }
  out << "]";
}


void printObjectJson(std::ostream& out, const ModelObject& object) {
  out << "{\"class\": " << jsonString(object.className) << ", \"instanceUID\": " << jsonString(object.instanceUID);
  if (!object.failure.empty()) out << ", \"failure\": " << jsonString(object.failure);
  out << ", \"properties\": ";
  printNamedJson(out, object.properties);
  out << ", \"dark\": ";
  printNamedJson(out, object.dark);
  out << "}";
}

}  // namespace

void printNamedJson(std::ostream& out, const NamedValues& values) {
  out << "{";
  for (std::size_t i = 0; i < values.size(); ++i) {
    out << (i ? ", " : "") << jsonString(values[i].first) << ": ";
    printValueJson(out, values[i].second);
  }
  out << "}";
}

void printNamedText(std::ostream& out, const NamedValues& values, const std::string& indent) {
  for (const NamedValues::value_type& value : values) printValueText(out, value.first, value.second, indent);
}

void printModelText(std::ostream& out, const Model& model) {
  if (!model.present) {
    out << "model: no header metadata\n";
    return;
  }
  out << "model of partition at " << model.partition << ":\n";
  if (model.objects.empty()) out << "  no objects\n";
  for (std::size_t i = 0; i < model.objects.size(); ++i)
    printObjectText(out, model.objects[i], "  ", i == 0 ? "" : "unreferenced ");
}

void printModelJson(std::ostream& out, const Model& model) {
  if (!model.present) {
    out << "null";
    return;
  }
  out << "{\"partition\": " << model.partition << ", \"root\": ";
  if (model.objects.empty())
    out << "null";
  else
    printObjectJson(out, model.objects.front());
  out << ", \"unreferenced\": [";
  for (std::size_t i = 1; i < model.objects.size(); ++i) {
    out << (i > 1 ? ", " : "");
    printObjectJson(out, model.objects[i]);
  }
  out << "]}";
}

}  // namespace zelta_info
