// Unicode file streams: NLS2_OpenStream, NLS2_CloseStream, NLS2_WriteString, NLS2_ReadString,
// NLS2_Fputs, NLS2_Fgets, NLS2_Fflush, NLS2_Frewind, NLS2_detectUnicodeSignature.

#include "locale/registry.h"
#include "nls2.h"
#include "trace/bounded_text.h"
#include "trace/frame.h"
#include "trace/status.h"

#include <algorithm>
#include <unicode/ucnv.h>
#include <unicode/ustdio.h>

namespace {

using nls2::failed;
using nls2::trace::BoundedText;
using nls2::trace::Frame;
using nls2::trace::low32;
using nls2::trace::text;

// All that a stream's function does with its locale object: the object is not used any further.
bool isLive(const NLS2_Locale *pLocale) { return !failed(nls2::locale::validateLocale(pLocale)); }

} // namespace

UFILE *NLS2_OpenStream(const NLS2_Locale *pLocale, const char *filename, const char *permissions,
                       const char *encoding) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_OpenStream");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, filename %s, permissions %s, encoding %s ",
             low32(pLocale), text(filename), text(permissions), text(encoding));
  return frame.result(isLive(pLocale) ? u_fopen(filename, permissions, nullptr, encoding)
                                      : nullptr);
}

int32_t NLS2_CloseStream(const NLS2_Locale *pLocale, UFILE *file) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_CloseStream");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, file %X.", low32(pLocale), low32(file));
  if (!isLive(pLocale)) {
    return frame.result(int32_t{NLS2_ERR_INVALID_LOCALE});
  }
  if (file != nullptr) {
    u_fclose(file);
  }
  return frame.result(0);
}

int32_t NLS2_WriteString(const NLS2_Locale *pLocale, const UChar *pSource, int32_t len,
                         UFILE *fileHandle) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_WriteString");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, pSource %s, len %d, fileHandle %X.",
             low32(pLocale), BoundedText(pSource, len).c_str(), len, low32(fileHandle));
  return frame.result(isLive(pLocale) ? u_file_write(pSource, len, fileHandle) : 0);
}

int32_t NLS2_ReadString(const NLS2_Locale *pLocale, UFILE *fileHandle, UChar *pDest, int32_t len) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_ReadString");
  Frame frame(anchor);
  return frame.result(isLive(pLocale) ? u_file_read(pDest, len, fileHandle) : 0);
}

int32_t NLS2_Fputs(const NLS2_Locale *pLocale, const UChar *pString, UFILE *fileHandle) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Fputs");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, pString %s, fileHandle %X.", low32(pLocale),
             BoundedText(pString, -1).c_str(), low32(fileHandle));
  return frame.result(isLive(pLocale) ? u_fputs(pString, fileHandle) : 0);
}

UChar *NLS2_Fgets(const NLS2_Locale *pLocale, UFILE *fileHandle, UChar *pDest, int32_t len) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Fgets");
  Frame frame(anchor);
  NLS2_TRACE(frame, "Input parameters: pLocale %X, fileHandle %X, pDest %s, len %d.",
             low32(pLocale), low32(fileHandle), BoundedText(pDest, std::max(len, 0)).c_str(), len);
  return frame.result(isLive(pLocale) ? u_fgets(pDest, len, fileHandle) : nullptr);
}

void NLS2_Fflush(UFILE *fileHandle) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Fflush");
  const Frame frame(anchor);
  u_fflush(fileHandle);
}

void NLS2_Frewind(UFILE *fileHandle) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_Frewind");
  const Frame frame(anchor);
  u_frewind(fileHandle);
}

const char *NLS2_detectUnicodeSignature(const char *source, int32_t sourceLength,
                                        int32_t *pSignatureLength, int32_t *pStatus) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_detectUnicodeSignature");
  Frame frame(anchor);
  UErrorCode status = U_ZERO_ERROR;
  const char *name = ucnv_detectUnicodeSignature(source, sourceLength, pSignatureLength, &status);
  NLS2_TRACE(frame, "Detected unicode signature. %d", status);
  *pStatus = status;
  return frame.result(name);
}
