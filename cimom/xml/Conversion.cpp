#include <cimom/broker/NumberText.h>
#include <cimom/xml/Conversion.h>
#include <cimom/xml/Reader.h>

#include <variant>

namespace cimom::xml {

namespace {

[[noreturn]] void fail(CMPIrc code, const std::string& message) {
  throw ConversionError(code, message);
}
[[noreturn]] void failParameter(const std::string& message) {
  fail(CMPI_RC_ERR_INVALID_PARAMETER, message);
}

/// Makes objects of one request.
class Maker {
 public:
  Maker(Arena& arena, const ClassTable& classes, std::string_view nameSpace)
      : arena_(arena), classes_(classes), nameSpace_(nameSpace) {}

  ObjectPath* path(const ObjectName& name, unsigned depth) {
    checkDepth(depth);
    ObjectPath* const path = ObjectPath::create(
        arena_, classes_, name.nameSpace.empty() ? nameSpace_ : std::string_view(name.nameSpace),
        name.className);
    path->setHostName(name.host);
    for (const Key& key : name.keys)
      addKey(*path, key, depth);
    return path;
  }

  Instance* instance(const InstanceElement& element, unsigned depth) {
    checkDepth(depth);
    const ClassInfo* const info = classes_.find(element.className);
    if (info == nullptr)
      fail(CMPI_RC_ERR_INVALID_CLASS, "there is no class " + element.className);
    const ObjectPath* const named = element.name
                                        ? path(*element.name, depth)
                                        : ObjectPath::create(arena_, classes_, nameSpace_, info->name());
    if (named->classInfo() != info)
      failParameter("the instance of class " + element.className + " is named as one of class " +
                    element.name->className);
    Instance* const made = Instance::create(arena_, *named);
    std::vector<bool> given(info->properties().size(), false);
    for (const PropertyElement& property : element.properties) {
      const PropertyInfo& declared = declaredProperty(*info, property);
      if (given[declared.index])
        failParameter("the property " + property.name + " is given twice");
      given[declared.index] = true;
      setProperty(*made, *named, declared, property, depth);
    }
    return made;
  }

 private:
  static void checkDepth(unsigned depth) {
    if (depth == nestingDepth)
      failParameter("references and instances are nested too deeply");
  }

  void addKey(ObjectPath& path, const Key& key, unsigned depth) {
    const ClassInfo* const info = path.classInfo();
    const PropertyInfo* declared = info == nullptr ? nullptr : info->find(key.name);
    if (key.name.empty()) {
      if (info == nullptr || info->keys().size() != 1)
        failParameter("a key of class " + std::string(path.className()) + " has no name");
      declared = &info->properties()[info->keys().front()];
    }
    const std::string_view name = declared == nullptr ? std::string_view(key.name) : declared->name;
    if (path.find(name) != nullptr)
      failParameter("the key " + std::string(name) + " is given twice");
    const CMPIData data = keyValue(key, name, declared == nullptr ? CMPI_null : declared->type, depth);
    if (path.addKey(name, &data.value, data.type) != CMPI_RC_OK)
      failParameter("the key " + std::string(name) + " cannot have this value");
  }

  // What the class declares counts, as far as the text reads as that; else what the client says of it.
  CMPIData keyValue(const Key& key, std::string_view name, CMPIType declared, unsigned depth) {
    CMPIData data{};
    if (key.form == Key::Form::reference) {
      data.type = CMPI_ref;
      data.value.ref = path(key.reference.front(), depth + 1);
      return data;
    }
    for (const CMPIType type : {declared, key.type})
      if (type != CMPI_null && readAs(type, key.text, data))
        return data;
    switch (key.form) {
      case Key::Form::boolean:
        if (readAs(CMPI_boolean, key.text, data))
          return data;
        break;
      case Key::Form::numeric:
        if (readKeyNumber(key.text, declared, data))
          return data;
        break;
      default:
        return makeValue(arena_, CMPI_string, key.text);
    }
    failParameter("the key " + std::string(name) + " is no " +
                  (key.form == Key::Form::numeric ? "number" : "boolean"));
  }

  bool readAs(CMPIType type, const std::string& text, CMPIData& data) {
    try {
      data = makeValue(arena_, type, text);
      return true;
    } catch (const ConversionError&) {
      return false;
    }
  }

  static const PropertyInfo& declaredProperty(const ClassInfo& info, const PropertyElement& property) {
    const PropertyInfo* const declared = info.find(property.name);
    if (declared == nullptr)
      fail(CMPI_RC_ERR_NO_SUCH_PROPERTY,
           "class " + std::string(info.name()) + " has no property " + property.name);
    const bool isEmbedded = property.embedded != PropertyElement::Embedded::none &&
                            (declared->type & ~CMPI_ARRAY) == CMPI_instance &&
                            (property.type & CMPI_ARRAY) == (declared->type & CMPI_ARRAY);
    if (declared->type != property.type && !isEmbedded)
      fail(CMPI_RC_ERR_TYPE_MISMATCH,
           "the property " + property.name + " has another type in class " + std::string(info.name()));
    return *declared;
  }

  void setProperty(Instance& made, const ObjectPath& named, const PropertyInfo& declared,
                   const PropertyElement& property, unsigned depth) {
    const CMPIData data = propertyValue(declared, property, depth);
    const NamedValue* const key = declared.isKey ? named.find(declared.name) : nullptr;
    if (key != nullptr && !isNull(data) && !sameValue(key->data, data))
      failParameter("the key " + property.name + " has another value in the instance's name");
    const CMPIrc code = made.setProperty(declared.name, isNull(data) ? nullptr : &data.value, declared.type);
    if (code != CMPI_RC_OK)
      failParameter("the property " + property.name + " cannot have this value");
  }

  CMPIData propertyValue(const PropertyInfo& declared, const PropertyElement& property, unsigned depth) {
    try {
      if (const auto* const text = std::get_if<std::string>(&property.value))
        return single(declared.type, *text, depth);
      if (const auto* const texts = std::get_if<std::vector<ValueText>>(&property.value))
        return array(static_cast<CMPIType>(declared.type & ~CMPI_ARRAY), *texts, depth);
    } catch (const ConversionError& error) {
      fail(error.code(), "the property " + property.name + ": " + error.what());
    }
    CMPIData data = nullData(declared.type);
    if (const auto* const name = std::get_if<ObjectName>(&property.value)) {
      data = {};
      data.type = CMPI_ref;
      data.value.ref = path(*name, depth + 1);
    }
    return data;
  }

  CMPIData single(CMPIType type, const std::string& text, unsigned depth) {
    return type == CMPI_instance ? embedded(text, depth) : makeValue(arena_, type, text);
  }

  CMPIData array(CMPIType type, const std::vector<ValueText>& texts, unsigned depth) {
    if (type != CMPI_instance)
      return makeArray(arena_, type, texts);
    Array* const made = Array::create(arena_, texts.size(), type);
    if (made == nullptr)
      failParameter("an array cannot hold so many elements");
    for (std::size_t index = 0; index < texts.size(); ++index)
      if (texts[index]) {
        const CMPIData element = embedded(*texts[index], depth);
        (void)made->set(index, &element.value, element.type);  // of the array's own type: it takes it
      }
    CMPIData data{};
    data.type = CMPI_instanceA;
    data.value.array = made;
    return data;
  }

  CMPIData embedded(const std::string& text, unsigned depth) {
    CMPIData data{};
    data.type = CMPI_instance;
    try {
      data.value.inst = instance(readInstance(text), depth + 1);
    } catch (const RequestError& error) {
      failParameter(std::string("an embedded instance: ") + error.what());
    }
    return data;
  }

  Arena& arena_;
  const ClassTable& classes_;
  std::string_view nameSpace_;
};

}  // namespace

ObjectPath* makePath(Arena& arena, const ClassTable& classes, const ObjectName& name,
                     std::string_view nameSpace) {
  return Maker(arena, classes, nameSpace).path(name, 0);
}

Instance* makeInstance(Arena& arena, const ClassTable& classes, const InstanceElement& element,
                       std::string_view nameSpace) {
  return Maker(arena, classes, nameSpace).instance(element, 0);
}

}  // namespace cimom::xml
