#include "translator/class/node_text.h"

#include "translator/emit/write.h"

namespace qrex {

void WriteRecalcCache(TextWriter& out, const NodeValue& value, std::string_view self,
                      const std::function<void()>& calculate) {
  const bool compares = !value.previousType.empty();
  auto keepPrevious = [&] {
    Write(out, "$type$ _prev = $value$;\n", "type"_ = value.previousType, "value"_ = value.expression);
  };
  auto updateSize = [&] {
    Write(out, "if (vesk::TypeHasAdditionalSize<$type$>()) UpdateByteSize();\n", "type"_ = value.type);
  };
  Write(out, R"(
    virtual bool RecalcCache() const
    {
        $self$
        $keepPrevious$
        $calculate$
        $updateSize$
        return $hasChanged$$value$;
    }
  )",
        "self"_ = self, "keepPrevious"_ = If(compares, keepPrevious), "calculate"_ = calculate,
        "updateSize"_ = If(!value.type.empty(), updateSize), "hasChanged"_ = compares ? "_prev != " : "true",
        "value"_ = If(compares, value.expression));
}

}  // namespace qrex
