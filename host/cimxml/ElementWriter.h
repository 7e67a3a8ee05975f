// The elements of DMTF DSP0201, appended to a text: the opposite of ElementReader. Nothing
// here throws but std::bad_alloc.
#pragma once

#include "Pieces.h"
#include "ResponseWriter.h"

#include <cim/Class.h>
#include <cim/Instance.h>

#include <string>
#include <string_view>

namespace qelo::cimxml {

// What stands in front of every message and behind it: the XML declaration, CIM and MESSAGE.
void beginMessage(std::string& out, std::string_view messageId);
void endMessage(std::string& out);

// VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY; nothing for null.
void appendValue(std::string& out, const cim::Value& value);
void addValue(Pieces& out, const cim::Value& value);
// What is inside of it.
void addContent(Pieces& out, const cim::Value& value);

// TYPE="..." (or another name of the attribute), with EmbeddedObject where needed.
void appendType(std::string& out, std::string_view attribute, cim::Type type);
void addType(Pieces& out, std::string_view attribute, cim::Type type);

// PARAMVALUE; without its type if that is not to be told.
void appendArgument(std::string& out, std::string_view name, const cim::Value& value, bool typed);

void appendLocalNameSpace(std::string& out, std::string_view nameSpace);

// INSTANCENAME, also for a path without keys.
void appendInstanceName(std::string& out, const cim::ObjectPath& path);
void addInstanceName(Pieces& out, const cim::ObjectPath& path);

// INSTANCEPATH, LOCALINSTANCEPATH or INSTANCENAME, or their counterparts for a class if the
// path has no keys, by what the path itself tells: host, namespace or neither.
void appendPath(std::string& out, const cim::ObjectPath& path);

// INSTANCEPATH, with what the path does not tell.
void appendInstancePath(std::string& out, const cim::ObjectPath& path, std::string_view host,
                        std::string_view nameSpace);
// CLASSPATH for a path without keys, INSTANCEPATH otherwise.
void appendFullPath(std::string& out, const cim::ObjectPath& path, std::string_view host,
                    std::string_view nameSpace);

void appendInstance(std::string& out, const cim::Instance& instance,
                    const InstanceOptions& options = {});
void addInstance(Pieces& out, const cim::Instance& instance, const InstanceOptions& options);

void appendQualifiers(std::string& out, const std::vector<cim::Qualifier>& qualifiers,
                      bool localOnly = false);
void appendClass(std::string& out, const cim::Class& declaration, const ClassOptions& options);
void appendQualifierType(std::string& out, const cim::QualifierType& type);

} // namespace qelo::cimxml
