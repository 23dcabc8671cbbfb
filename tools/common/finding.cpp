#include "tools/common/finding.h"

#include "tools/common/failure.h"
#include "tools/common/text_source.h"
#include "tools/common/utf8.h"

Finding LookAt(const std::string& name, Encoding request, SProgressIndicatorEx* progress) {
  Finding finding;
  finding.file = ShownArgument(name);
  try {
    TextSource source(name, request, progress);
    source.Select();
    finding.encoding = ShownName(source.Reader().GetFormat());
    finding.value = ShownValue(source.Reader().GetFormat());
    finding.bom = source.HasMark();
    finding.xml = (finding.value & Encodings::kXML) != 0;
    finding.warning = source.Reader().GetDetectionWarning();
    finding.bytes = source.CountBytes();
  } catch (...) {
    finding.error = ReasonOfCurrentException();
  }
  return finding;
}
