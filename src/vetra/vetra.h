#ifndef VETRA_VETRA_H
#define VETRA_VETRA_H

/// Every public header.
#include "vetra/base/utils/resample/algorithm/averageresampler.h"
#include "vetra/base/utils/resample/algorithm/bilinearresampler.h"
#include "vetra/base/utils/resample/algorithm/cplxsarcoeffs.h"
#include "vetra/base/utils/resample/algorithm/cplxsarresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicpsresampler.h"
#include "vetra/base/utils/resample/algorithm/cubicresampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange4resampler.h"
#include "vetra/base/utils/resample/algorithm/lagrange8resampler.h"
#include "vetra/base/utils/resample/algorithm/medianresampler.h"
#include "vetra/base/utils/resample/algorithm/nearestresampler.h"
#include "vetra/base/utils/resample/blockplanner.h"
#include "vetra/base/utils/resample/irasterresampler.h"
#include "vetra/base/utils/resample/pixelclamp.h"
#include "vetra/base/utils/resample/postfm/bufposarraytfm.h"
#include "vetra/base/utils/resample/postfm/bufposbilineartfm.h"
#include "vetra/base/utils/resample/postfm/bufposblocktfm.h"
#include "vetra/base/utils/resample/postfm/bufposscaleofftfm.h"
#include "vetra/base/utils/resample/postfm/ibufpostfm.h"
#include "vetra/base/utils/resample/resample.h"
#include "vetra/base/utils/resample/resamplebuffer.h"
#include "vetra/base/utils/resample/resampleinfo.h"
#include "vetra/base/utils/resample/resampleutils.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/basic/gobs/raster/datatypeadapter.h"
#include "vetra/export.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/textcore/formatstring.h"
#include "vetra/version.h"

#endif  // VETRA_VETRA_H
