#include "qxcore/system/file/recurse_find.h"

int SRecurseFindFiles::FindFile(const WCHAR* mask, unsigned long attributes) {
  return SAttrRejectFindFilter::FindFile(mask, attributes | FILE_ATTRIBUTE_DIRECTORY);
}

int SRecurseFindFolders::FindFile(const WCHAR* mask, unsigned long) {
  return SAttrMatchFindFilter::FindFile(mask, FILE_ATTRIBUTE_DIRECTORY);
}
