#include "module/encoding_tables.hpp"

#include "catalogue/catalogue.hpp"

namespace nlssm::module {

void attach_encoding_tables(NLSSMHandle &handle) {
  const catalogue::TrantabRow &row = catalogue::sm_trantab[handle.encodingNumber];
  handle.lowerTable = row.lower;
  handle.upperTable = row.upper;
  handle.foldTable = row.fold;
  handle.classTable = row.classes;
  handle.dbcsTable = row.dbcs;
  handle.dbcsTableCount = row.dbcsCount;
  handle.dbcsExtTable = row.dbcsExt;
  handle.dbcsExtCount = row.dbcsExtCount;
  handle.bidiTable = handle.encodingClass == NLSSM_CLASS_SBCS
                         ? NLSGetBIDICategorySBCSTab(static_cast<int32_t>(handle.encodingNumber))
                         : nullptr;
}

}  // namespace nlssm::module
